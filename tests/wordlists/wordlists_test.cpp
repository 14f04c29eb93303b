// SPDX-License-Identifier: Apache-2.0
// Real words sorted by the library, and each pair of neighbours compared by ICU. Both look at three levels here:
// letters, accents and case; which place punctuation has behind them is a matter of taste that the two do not share.
#include <gtest/gtest.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <memory>

#include "support/page_source.hpp"
#include "wordlists/keys.hpp"

namespace lx::test {
namespace {

constexpr size_t kMostWords = 250000;
constexpr double kUsual = 99.97;
constexpr double kHungarian = 99.5;  // doubled letters of two signs are written short there: ccs stands for cs and cs

struct Language {
  const char* locale;  // with its page and sort
  const char* icu_locale;
  const char* file;  // a word a line, or a dictionary of a spelling checker
  uint16_t page = LX_CP_UTF8;
  double percent = kUsual;  // of the pairs that agree
};

constexpr Language kLanguages[] = {
    {"English.UTF-8", "en", "/usr/share/dict/american-english"},
    {"German.UTF-8", "de", "/usr/share/dict/ngerman"},
    {"French.UTF-8", "fr", "/usr/share/dict/french"},
    {"CanadianFrench.UTF-8@CanadianFrench", "fr_CA", "/usr/share/dict/french"},
    {"Spanish.UTF-8", "es", "/usr/share/dict/spanish"},
    {"Swedish.UTF-8", "sv", "/usr/share/dict/swedish", 819},
    {"Danish.UTF-8", "da", "/usr/share/dict/danish"},
    {"Norwegian.UTF-8", "nb", "/usr/share/dict/bokmaal", 819},
    {"Polish.UTF-8@Polish", "pl", "/usr/share/dict/polish"},
    {"Portuguese.UTF-8", "pt", "/usr/share/dict/portuguese"},
    {"Italian.UTF-8", "it", "/usr/share/dict/italian"},
    {"Dutch.UTF-8", "nl", "/usr/share/dict/dutch"},
    {"Czech.UTF-8", "cs", "/usr/share/hunspell/cs_CZ.dic"},
    {"Hungarian.UTF-8", "hu", "/usr/share/hunspell/hu_HU.dic", LX_CP_UTF8, kHungarian},
    {"Estonian.UTF-8", "et", "/usr/share/hunspell/et_EE.dic", 923},
    {"Latvian.UTF-8", "lv", "/usr/share/hunspell/lv_LV.dic"},
    {"Lithuanian.UTF-8", "lt", "/usr/share/hunspell/lt_LT.dic", 921},
    {"Russian.UTF-8", "ru", "/usr/share/hunspell/ru_RU.dic"},
    {"Greek.UTF-8", "el", "/usr/share/hunspell/el_GR.dic", 813},
    {"Turkish.UTF-8", "tr", "/usr/share/hunspell/tr_TR.dic"},
};

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

// The different words of a list, some evenly chosen ones of a very long one; none where the list is not installed.
std::vector<std::string> read_words(const Language& language) {
  std::vector<std::string> words;
  std::ifstream in(language.file, std::ios::binary);
  const bool dictionary = std::string_view(language.file).ends_with(".dic");
  for (std::string word; std::getline(in, word);) {
    // Dictionaries have a count first, and behind each word what is known about it.
    if (dictionary && word.find_first_not_of("0123456789\r") == std::string::npos) continue;
    if (dictionary) word.resize(std::min(word.find_first_of("/ \t\r"), word.size()));
    if (language.page != LX_CP_UTF8) {
      std::string utf8;
      for (char byte : word) {
        utf8 += PageSource::of(LX_CP_UTF8).encode(PageSource::of(language.page).decode({&byte, 1}));
      }
      word = utf8;
    }
    if (!word.empty()) words.push_back(word);
  }
  const size_t all = words.size();
  for (size_t i = 0; i < kMostWords && all > kMostWords; ++i) words[i].swap(words[i * all / kMostWords]);
  words.resize(std::min(all, kMostWords));
  std::sort(words.begin(), words.end());
  words.erase(std::unique(words.begin(), words.end()), words.end());
  return words;
}

std::vector<Word> words_with_keys(LXLocale* locale, const std::vector<std::string>& texts) {
  std::vector<Word> words;
  for (const std::string& text : texts) {
    std::string key = key_of(locale, text);
    EXPECT_GE(key.size(), 3u) << text;
    if (key.size() >= 3) words.push_back({text, key, length_of_three_levels(key)});
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

class WordLists : public testing::TestWithParam<Language> {};

TEST_P(WordLists, NeighboursAgreeWithIcu) {
  const Language& language = GetParam();
  const auto texts = read_words(language);
  if (texts.empty()) GTEST_SKIP() << "not installed: " << language.file;
  const Session session;
  uint32_t rc = LX_OK;
  const Locale locale(LXGetLocale(language.locale, 0, &rc));
  ASSERT_NE(locale, nullptr) << rc;
  const Collator collator = open_collator(language.icu_locale);

  const std::vector<Word> words = words_with_keys(locale.get(), texts);
  size_t misses = 0;
  std::string examples;
  for (size_t i = 1; i < words.size(); ++i) {
    const Word &a = words[i - 1], &b = words[i];
    const int ours = sign(a.short_key().compare(b.short_key()));
    EXPECT_TRUE(i % 4 != 0 || ours == 0 || order_of(locale.get(), a.text, b.text) == ours) << a.text << " " << b.text;
    UErrorCode error = U_ZERO_ERROR;
    const int icu = ucol_strcollUTF8(collator.get(), a.text.data(), static_cast<int32_t>(a.text.size()), b.text.data(),
                                     static_cast<int32_t>(b.text.size()), &error);
    ASSERT_TRUE(U_SUCCESS(error)) << a.text << " " << b.text;
    if (icu == ours) continue;
    if (++misses <= 12) examples += "  " + a.text + " " + b.text + " (ICU: " + std::to_string(icu) + ")\n";
  }
  const double percent = 100 * (1 - static_cast<double>(misses) / static_cast<double>(words.size() - 1));
  std::printf("%s: %zu words, %zu misses, %.4f %% agree\n%s", language.locale, words.size(), misses, percent,
              examples.c_str());
  EXPECT_GE(percent, language.percent);
}

INSTANTIATE_TEST_SUITE_P(Languages, WordLists, testing::ValuesIn(kLanguages),
                         [](const auto& one) { return std::string(one.param.icu_locale); });

}  // namespace
}  // namespace lx::test
