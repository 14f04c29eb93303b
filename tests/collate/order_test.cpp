// SPDX-License-Identifier: Apache-2.0
// Texts compared directly, against a slow reading of the same rules and against their keys.
#include <random>

#include "collate/collation.hpp"

namespace lx::test {
namespace {

using Order = CollationTest;

struct Text {
  std::u16string characters;
  std::vector<Stored> stored;  // a form each
};

void expect_order(const std::vector<TextForm>& forms, const Text& a, const Text& b) {
  ModelResult wanted = model_compare(forms.back().reader(a.stored.back()), forms.back().reader(b.stored.back()));
  for (size_t i = 0; i < forms.size(); ++i) {
    int32_t got = forms[i].compare(a.stored[i], b.stored[i]);
    ASSERT_EQ(wanted.exact ? got : sign(got), wanted.value)
        << forms[i].name() << ' ' << shown(a.characters) << ' ' << shown(b.characters);
  }
}

std::vector<Text> stored(const std::vector<TextForm>& forms, const std::vector<std::u16string>& texts) {
  std::vector<Text> result;
  for (const std::u16string& text : texts) {
    result.push_back({text, {}});
    for (const TextForm& form : forms) result.back().stored.push_back(form.store(text));
  }
  return result;
}

TEST_F(Order, OfAllPairsOfShortTexts) {
  for (const char* sort : {"Plain", "Combining"}) {
    const std::vector<TextForm> forms = own_forms(sort);
    for (const auto& [letters, length] : {std::pair(u"aABcefpqQ-*mntdxyzw0", 2), {u"ab-c", 3}, {u"ap-y", 3}}) {
      const std::vector<Text> texts = stored(forms, all_texts(letters, static_cast<size_t>(length)));
      for (const Text& a : texts) {
        for (const Text& b : texts) {
          expect_order(forms, a, b);
          if (HasFatalFailure()) return;
        }
      }
    }
  }
}

TEST_F(Order, OfLongerTexts) {
  constexpr std::u16string_view kLetters = u"aAbBcefpqQ-+*mntdxyzw0\u3041\u3042";
  std::mt19937 random(7);
  for (const char* sort : {"Plain", "Combining"}) {
    const std::vector<TextForm> forms = own_forms(sort);
    for (int round = 0; round < 4000; ++round) {
      // A text and one that differs from it in few places.
      std::u16string a(random() % (round % 50 == 0 ? 400 : 20), u'a');
      size_t choice = round % 3 == 0 ? 3 : kLetters.size();
      for (char16_t& letter : a) letter = kLetters[random() % choice];
      std::u16string b = a;
      for (unsigned change = random() % 4; change-- > 0;) {
        size_t at = random() % (b.size() + 1);
        size_t gone = std::min<size_t>(random() % 3, b.size() - at);
        b.replace(at, gone, random() % 3, kLetters[random() % kLetters.size()]);
      }
      const std::vector<Text> texts = stored(forms, {a, b});
      expect_order(forms, texts[0], texts[1]);
      expect_order(forms, texts[1], texts[0]);
      if (HasFatalFailure()) return;
    }
  }
}

// As long as the primary weights stand in order, and what is left out of keys has no part, keys say the same.
TEST_F(Order, IsThatOfTheKeys) {
  auto expect_agreement = [](const TextForm& form, std::u16string_view letters, size_t length) {
    std::vector<std::pair<Stored, std::string>> texts;
    for (const std::u16string& text : all_texts(letters, length)) {
      texts.emplace_back(form.store(text), model_key(form.sort(), text));
    }
    for (const auto& [a, key_a] : texts) {
      for (const auto& [b, key_b] : texts) {
        ASSERT_EQ(sign(form.compare(a, b)), sign(key_a.compare(key_b))) << form.name() << ' ' << a.raw << ' ' << b.raw;
      }
    }
  };
  expect_agreement(TextForm(Kind::plain, "Single", "Plain"), u"aAbBef-m", 3);
  expect_agreement(TextForm(Kind::plain, "Single", "Plain"), u"ab-+mx", 3);
  // Where pairs combine only without special weights, whose positions the readers count in their own way.
  expect_agreement(TextForm(Kind::plain, "Single", "Combining"), u"aAbBcm", 3);
}

// And here is where they do not.
TEST_F(Order, DiffersFromThatOfTheKeys) {
  struct Case {
    const char* sort;
    std::u16string_view a, b;
    int direct, keys;
  };
  const Case cases[] = {
      {"Plain", u"am", u"amd", -1, 0},       // a default weight at the end of a level
      {"Plain", u"p", u"pa", -1, -1},        // not in order: the longer one goes on with the secondary weights
      {"Plain", u"pm", u"pa", 1, -1},        // where the shorter one may be the greater
      {"Plain", u"0-", u"-", 1, 0},          // alone, special weights have no positions in keys
      {"Combining", u"a-b", u"ab-", 0, -1},  // characters looked at ahead are not counted
  };
  for (const Case& one : cases) {
    TextForm form(Kind::plain, "Single", one.sort);
    Stored a = form.store(one.a), b = form.store(one.b);
    EXPECT_EQ(sign(form.compare(a, b)), one.direct) << shown(one.a) << shown(one.b);
    EXPECT_EQ(sign(form.key(a).compare(form.key(b))), one.keys) << shown(one.a) << shown(one.b);
  }
}

TEST_F(Order, GivesTheDifferenceOfPrimaryWeights) {
  struct Case {
    std::u16string_view a, b;
    int32_t result;
  };
  const Case cases[] = {{u"b", u"a", 2},   {u"a", u"b", -2}, {u"aa", u"a", 1},          {u"a", u"aa", -1},
                        {u"-b", u"a-", 2}, {u"B", u"ab", 2}, {u"\u3041", u"a", 0x2F31}, {u"x", u"aB", 0},
                        {u"", u"", 0},     {u"", u"a", -1},  {u"z0", u"", 0},           {u"Ab", u"ab", 1}};
  for (const TextForm& form : own_forms("Plain")) {
    for (const Case& one : cases) {
      EXPECT_EQ(form.compare(form.store(one.a), form.store(one.b)), one.result)
          << form.name() << shown(one.a) << shown(one.b);
    }
  }
}

TEST_F(Order, OfMeasuredAndCutTexts) {
  TextForm form(Kind::plain, "Small", "Plain");
  EdgeBuffer edge(64);
  const char* a = edge.text({"ab\x81", 3});
  EXPECT_EQ(LXStrcoll(form.locale(), a, 3, "ab", -1, 0), 0);
  EXPECT_EQ(LXStrcoll(form.locale(), "ab\0c", -1, "ab", 2, 0), 0);
  EXPECT_EQ(LXStrcoll(form.locale(), "ab", -7, "ab", -2, 0), 0);
  // Characters: three of six bytes, against the same text whole.
  EXPECT_EQ(LXStrcoll(form.locale(), "\x81\x41\x81\x42\x81\x43-", 3, "\x81\x41\x81\x42\x81\x43", 3, LX_OPT_CHARS), 0);
  EXPECT_EQ(LXStrcoll(form.locale(), "\x81\x41\x81\x42", 2, "\x81\x41\x81\x42", 1, LX_OPT_CHARS), 1);
  TextForm mixed(Kind::shifted, "Mixed", "Plain");
  EXPECT_EQ(LXStrcollEx(mixed.locale(),
                        "\x41\x40\x0F"
                        "a",
                        4, 1,
                        "\x0F\x0E\x41\x40\x0F\x0E\x0F"
                        "a",
                        8, 1, 0),
            0);
  EXPECT_EQ(LXStrcollEx(mixed.locale(), "\x0E\x41\x40\x41\x41", 2, 0, "\x0E\x41\x40\x41\x42", 1, 0, LX_OPT_CHARS), 1);
}

// On pages with larger tables all forms agree with UCS-2.
TEST_F(Order, IsTheSameOnOtherPages) {
  constexpr std::u16string_view kLetters = u"aABcefpQ-*mxyz0\u3041\u3042\u4E00";
  std::mt19937 random(3);
  for (const char* sort : {"Plain", "Combining"}) {
    TextForm ucs2(Kind::ucs2, "Single", sort);
    for (const char* page : {"IBM930", "UTF8"}) {
      TextForm bytes(Kind::shifted, page, sort);
      TextForm wide(Kind::wide, page, sort);
      auto convert = [&](const std::u16string& text, Stored& a, Stored& b) {
        auto at = reinterpret_cast<const LXUChar*>(text.data());
        auto length = static_cast<int32_t>(text.size());
        char out[256];
        LXWChar out_wide[64];
        a.units = LXUnicodeToStringEx(bytes.locale(), out, 0, 256, at, length, 0);
        b.units = LXUnicodeToStringW(wide.locale(), out_wide, 64, at, length, 0);
        a.raw.assign(out, static_cast<size_t>(a.units));
        b.raw.assign(reinterpret_cast<const char*>(out_wide), static_cast<size_t>(b.units) * sizeof(LXWChar));
      };
      for (int round = 0; round < 5000; ++round) {
        std::u16string a(1 + random() % 8, u'a');
        for (char16_t& letter : a) letter = kLetters[random() % kLetters.size()];
        std::u16string b = a;
        b[random() % b.size()] = kLetters[random() % kLetters.size()];
        Stored bytes_a, bytes_b, wide_a, wide_b;
        convert(a, bytes_a, wide_a);
        convert(b, bytes_b, wide_b);
        int32_t wanted = ucs2.compare(ucs2.store(a), ucs2.store(b));
        ASSERT_EQ(bytes.compare(bytes_a, bytes_b), wanted) << bytes.name() << shown(a) << shown(b);
        ASSERT_EQ(wide.compare(wide_a, wide_b), wanted) << wide.name() << shown(a) << shown(b);
        ASSERT_EQ(bytes.key(bytes_a), model_key(ucs2.sort(), a)) << bytes.name() << shown(a);
        ASSERT_EQ(wide.key(wide_b), model_key(ucs2.sort(), b)) << wide.name() << shown(b);
      }
    }
  }
}

}  // namespace
}  // namespace lx::test
