// SPDX-License-Identifier: Apache-2.0
// Real words sorted by the library, and each pair of neighbours compared by ICU. Both look at three levels here:
// letters, accents and case; which place punctuation has behind them is a matter of taste that the two do not share.
#include <gtest/gtest.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>

#include <algorithm>
#include <cstdio>
#include <memory>

#include "support/session.hpp"
#include "wordlists/word_list.hpp"

namespace lx::test {
namespace {

constexpr size_t kMostWords = 250000;
constexpr double kUsual = 99.97;
constexpr double kHungarian = 99.5;  // doubled letters of two signs are written short there: ccs stands for cs and cs

struct Language {
  const char* name;
  const char* locale;
  const char* icu_locale;
  WordListFile file;
  double percent = kUsual;  // of the pairs that agree
};

constexpr Language kLanguages[] = {
    {"English", "English.UTF-8", "en", {"wamerican", "/usr/share/dict/american-english", "UTF-8"}},
    {"German", "German.UTF-8", "de", {"wngerman", "/usr/share/dict/ngerman", "UTF-8"}},
    {"French", "French.UTF-8", "fr", {"wfrench", "/usr/share/dict/french", "UTF-8"}},
    {"CanadianFrench", "CanadianFrench.UTF-8@CanadianFrench", "fr_CA", {"wfrench", "/usr/share/dict/french", "UTF-8"}},
    {"Spanish", "Spanish.UTF-8", "es", {"wspanish", "/usr/share/dict/spanish", "UTF-8"}},
    {"Swedish", "Swedish.UTF-8", "sv", {"wswedish", "/usr/share/dict/swedish", "ISO-8859-1"}},
    {"Danish", "Danish.UTF-8", "da", {"wdanish", "/usr/share/dict/danish", "UTF-8"}},
    {"Norwegian", "Norwegian.UTF-8", "nb", {"wnorwegian", "/usr/share/dict/bokmaal", "ISO-8859-1"}},
    {"Polish", "Polish.UTF-8@Polish", "pl", {"wpolish", "/usr/share/dict/polish", "UTF-8"}},
    {"Portuguese", "Portuguese.UTF-8", "pt", {"wportuguese", "/usr/share/dict/portuguese", "UTF-8"}},
    {"Italian", "Italian.UTF-8", "it", {"witalian", "/usr/share/dict/italian", "UTF-8"}},
    {"Dutch", "Dutch.UTF-8", "nl", {"wdutch", "/usr/share/dict/dutch", "UTF-8"}},
    {"Czech", "Czech.UTF-8", "cs", {"hunspell-cs", "/usr/share/hunspell/cs_CZ.dic", "UTF-8"}},
    {"Hungarian", "Hungarian.UTF-8", "hu", {"hunspell-hu", "/usr/share/hunspell/hu_HU.dic", "UTF-8"}, kHungarian},
    {"Estonian", "Estonian.UTF-8", "et", {"myspell-et", "/usr/share/hunspell/et_EE.dic", "ISO-8859-15"}},
    {"Latvian", "Latvian.UTF-8", "lv", {"hunspell-lv", "/usr/share/hunspell/lv_LV.dic", "UTF-8"}},
    {"Lithuanian", "Lithuanian.UTF-8", "lt", {"hunspell-lt", "/usr/share/hunspell/lt_LT.dic", "ISO-8859-13"}},
    {"Russian", "Russian.UTF-8", "ru", {"hunspell-ru", "/usr/share/hunspell/ru_RU.dic", "UTF-8"}},
    {"Greek", "Greek.UTF-8", "el", {"hunspell-el", "/usr/share/hunspell/el_GR.dic", "ISO-8859-7"}},
    {"Turkish", "Turkish.UTF-8", "tr", {"hunspell-tr", "/usr/share/hunspell/tr_TR.dic", "UTF-8"}},
};

void PrintTo(const Language& language, std::ostream* out) { *out << language.name; }

struct Word {
  std::string text;
  std::string key;
  size_t three_levels;  // length of the key's part for these

  std::string_view short_key() const { return std::string_view(key).substr(0, three_levels); }
};

// A zero byte ends each level; primary weights are two bytes, the first of them not zero.
size_t length_of_three_levels(std::string_view key) {
  size_t at = 0;
  while (key[at] != '\0') at += 2;
  at = key.find('\0', at + 1);
  return key.find('\0', at + 1) + 1;
}

std::vector<Word> words_with_keys(LXLocale* locale, const std::vector<std::string>& texts) {
  std::vector<Word> words;
  for (const std::string& text : texts) {
    std::string key(text.size() * 8 + 3, '\0');
    const int32_t length = LXStrxfrm(locale, key.data(), static_cast<int32_t>(key.size()), text.data(),
                                     static_cast<int32_t>(text.size()), 0);
    EXPECT_GE(length, 3) << text;
    if (length < 3) continue;
    key.resize(static_cast<size_t>(length));
    words.push_back({text, key, length_of_three_levels(key)});
  }
  std::sort(words.begin(), words.end(), [](const Word& a, const Word& b) { return a.key < b.key; });
  return words;
}

struct CloseCollator {
  void operator()(UCollator* collator) const { ucol_close(collator); }
};
using Collator = std::unique_ptr<UCollator, CloseCollator>;

Collator open_collator(const char* locale) {
  UErrorCode error = U_ZERO_ERROR;
  Collator collator(ucol_open(locale, &error));
  ucol_setAttribute(collator.get(), UCOL_ALTERNATE_HANDLING, UCOL_SHIFTED, &error);
  ucol_setAttribute(collator.get(), UCOL_STRENGTH, UCOL_TERTIARY, &error);
  EXPECT_TRUE(U_SUCCESS(error)) << u_errorName(error);
  return collator;
}

int sign(int value) { return (value > 0) - (value < 0); }

class WordLists : public testing::TestWithParam<Language> {};

TEST_P(WordLists, NeighboursAgreeWithIcu) {
  const Language& language = GetParam();
  const auto texts = read_words(language.file, kMostWords);
  if (texts.empty()) GTEST_SKIP() << language.file.package << " is not installed: no " << language.file.path;
  const Session session;
  uint32_t rc = LX_OK;
  const Locale locale(LXGetLocale(language.locale, 0, &rc));
  ASSERT_NE(locale, nullptr) << rc;
  const Collator collator = open_collator(language.icu_locale);

  const std::vector<Word> words = words_with_keys(locale.get(), texts);
  size_t misses = 0;
  std::string examples;
  for (size_t i = 1; i < words.size(); ++i) {
    const Word& a = words[i - 1];
    const Word& b = words[i];
    UErrorCode error = U_ZERO_ERROR;
    const int icu = ucol_strcollUTF8(collator.get(), a.text.data(), static_cast<int32_t>(a.text.size()), b.text.data(),
                                     static_cast<int32_t>(b.text.size()), &error);
    ASSERT_TRUE(U_SUCCESS(error)) << a.text << " " << b.text;
    if (icu == sign(a.short_key().compare(b.short_key()))) continue;
    constexpr size_t kExamples = 12;
    if (++misses <= kExamples) examples += "  " + a.text + " " + b.text + " (ICU: " + std::to_string(icu) + ")\n";
  }
  const auto pairs = static_cast<double>(words.size() - 1);
  const double percent = 100 * (1 - static_cast<double>(misses) / pairs);
  std::printf("%s: %zu words, %zu misses, %.4f %% agree\n%s", language.name, words.size(), misses, percent,
              examples.c_str());
  EXPECT_GE(percent, language.percent);
}

INSTANTIATE_TEST_SUITE_P(Languages, WordLists, testing::ValuesIn(kLanguages),
                         [](const auto& one) { return std::string(one.param.name); });

}  // namespace
}  // namespace lx::test
