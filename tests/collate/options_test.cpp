// SPDX-License-Identifier: Apache-2.0
// Options: case, width and trailing blanks; and locales without a sort object.
#include <functional>

#include "collate/collation.hpp"

namespace lx::test {
namespace {

using Options = CollationTest;

constexpr uint32_t kArgument = LX_E_ARGUMENT;
constexpr uint32_t kFine = LX_OK;

// ---- Case and width ----

// Capitals as the languages of the collation directory want them.
std::u16string upper(std::u16string_view text, std::string_view language) {
  std::u16string result;
  for (size_t i = 0; i < text.size(); ++i) {
    char16_t unit = text[i];
    if (language == "German" && unit == 0xDF) {
      result += u"SS";
    } else if (language == "German" && unit == u'i' && i + 1 < text.size() && text[i + 1] == 0x307) {
      result += u'\u0130';
      ++i;
    } else if (language == "Turkish" && (unit == u'i' || unit == 0xFD)) {
      result += unit == u'i' ? u'\u0130' : u'I';
    } else {
      result += unit >= u'a' && unit <= u'z' ? static_cast<char16_t>(unit - 32) : unit;
    }
  }
  return result;
}

TEST_F(Options, CaseFollowsTheLanguage) {
  for (const char* language : {"English", "German", "Turkish"}) {
    for (auto [kind, page] :
         {std::pair(Kind::plain, "Single"), {Kind::shifted, "Mixed"}, {Kind::wide, "Single"}, {Kind::ucs2, "Single"}}) {
      TextForm form(kind, page, "Plain", language);
      std::vector<std::pair<Stored, std::string>> texts;
      for (const std::u16string& text : all_texts(kind == Kind::ucs2 ? u"aAisS\u00DF\u0307" : u"aAisS\u00DF-", 3)) {
        texts.emplace_back(form.store(text), model_key(form.sort(), upper(text, language)));
        if (text.empty()) continue;
        ASSERT_EQ(form.key(texts.back().first, LX_CMP_NOCASE), texts.back().second) << form.name() << shown(text);
      }
      for (const auto& [a, key_a] : texts) {
        for (const auto& [b, key_b] : texts) {
          ASSERT_EQ(sign(form.compare(a, b, LX_CMP_NOCASE)), sign(key_a.compare(key_b)))
              << form.name() << a.raw << b.raw;
        }
      }
    }
  }
}

// All characters may become two.
TEST_F(Options, CaseMayDoubleATextOfAnyLength) {
  for (Kind kind : {Kind::plain, Kind::wide, Kind::ucs2}) {
    TextForm form(kind, "Single", "Plain", "German");
    for (size_t length : {1u, 15u, 16u, 17u, 31u, 32u, 33u, 200u, 1000u}) {
      Stored sharp = form.store(std::u16string(length, u'\u00DF'));
      Stored two = form.store(std::u16string(2 * length, u's'));
      EXPECT_EQ(form.compare(sharp, two, LX_CMP_NOCASE), 0) << form.name() << length;
      EXPECT_EQ(form.key(sharp, LX_CMP_NOCASE), form.key(two, LX_CMP_NOCASE)) << form.name() << length;
    }
  }
}

TEST_F(Options, WidthAndCaseOfLongerCharacters) {
  struct Case {
    Kind kind;
    std::u16string_view text;
    uint32_t options;
    std::u16string_view same;  // the text that has the same key
  };
  const Case cases[] = {
      {Kind::plain, u"a\u3041\u4E00\u3044", LX_CMP_NOWIDTH, u"aA\u3042\u3044"},
      {Kind::plain, u"a\u3041\u3042", LX_CMP_NOCASE, u"A\u3040\u3042"},
      {Kind::shifted, u"a\u3040\u4E01", LX_CMP_NOWIDTH, u"a \u3043"},
      {Kind::wide, u"a\u3041\u4E00", LX_CMP_NOWIDTH, u"aA\u3042"},
      {Kind::wide, u"b\u3041\u3043", LX_CMP_NOCASE, u"B\u3040\u3042"},
      {Kind::ucs2, u"\uFF21\uFF41\u3000b", LX_CMP_NOWIDTH, u"Aa b"},
      {Kind::ucs2, u"\u3041a", LX_CMP_NOCASE, u"\u3041A"},
  };
  for (const Case& one : cases) {
    TextForm form(one.kind, "Small", "Plain");
    Stored text = form.store(one.text);
    Stored same = form.store(one.same);
    EXPECT_EQ(form.key(text, one.options), model_key(form.sort(), one.same)) << form.name() << shown(one.text);
    EXPECT_EQ(form.compare(text, same, one.options), 0) << form.name() << shown(one.text);
    EXPECT_NE(form.compare(text, same, 0), 0) << form.name() << shown(one.text);
  }
}

// ---- Trailing blanks ----

// Both texts are cut in one scratch buffer, the second to the length of the first.
void cut_in_turn(const TextForm& form, Stored& a, Stored& b) {
  std::string scratch(std::max(a.raw.size(), b.raw.size()) + 1, '\0');
  auto cut = [&](size_t length) {
    auto size = static_cast<int32_t>(length + 1);
    int32_t used = form.kind() == Kind::plain ? LXTruncateString(form.locale(), scratch.data(), size, 0x80800041)
                                              : LXTruncateStringEx(form.locale(), scratch.data(), 0, size, 0x80800041);
    return static_cast<size_t>(used - 1);
  };
  auto keep = [&](Stored& text, size_t length) {
    text.raw = scratch.substr(0, length);
    text.units = static_cast<int32_t>(length);
  };
  std::memcpy(scratch.data(), a.raw.data(), a.raw.size());
  scratch[a.raw.size()] = '\0';
  size_t length_a = cut(a.raw.size());
  keep(a, length_a);
  std::memcpy(scratch.data(), b.raw.data(), std::min(length_a, b.raw.size()));
  scratch[b.raw.size()] = '\0';
  keep(b, cut(b.raw.size()));
}

TEST_F(Options, TrailingBlanksAreCutInOneBuffer) {
  for (auto [kind, page] : {std::pair(Kind::plain, "Single"), {Kind::plain, "Small"}, {Kind::shifted, "Mixed"}}) {
    TextForm form(kind, page, "Plain");
    bool wide = std::string_view(page) != "Single";
    const auto texts = all_texts(wide ? u"ab \u3040" : u"ab A", 4);
    for (const std::u16string& x : texts) {
      for (const std::u16string& y : texts) {
        const Stored a = form.store(x), b = form.store(y);
        Stored cut_a = a, cut_b = b;
        cut_in_turn(form, cut_a, cut_b);
        int32_t wanted = form.compare(cut_a, cut_b, 0);
        ASSERT_EQ(form.compare(a, b, LX_COLL_TRIM), wanted) << form.name() << shown(x) << shown(y);
        if (x.size() > 2 || y.size() > 2) continue;
        ASSERT_EQ(sign(form.compare(a, b, LX_CMP_NOWIDTH)),
                  sign(form.key(cut_a, LX_CMP_NOWIDTH).compare(form.key(cut_b, LX_CMP_NOWIDTH))))
            << form.name() << shown(x) << shown(y);
      }
    }
  }
}

TEST_F(Options, TrailingBlanksOfEachForm) {
  struct Case {
    Kind kind;
    const char* page;
    std::u16string_view a, b;
    uint32_t options;
    int result;
    uint32_t error = LX_OK;
  };
  constexpr uint32_t kBoth = LX_CMP_NOWIDTH | LX_CMP_TRIM;
  const Case cases[] = {
      {Kind::plain, "Single", u"ab", u"abc", LX_CMP_NOWIDTH, 0},
      {Kind::plain, "Single", u"abc", u"ab", LX_CMP_NOWIDTH, 1},
      {Kind::plain, "Single", u"ab  ", u"ab", 1, 0},
      {Kind::plain, "Single", u"ab", u"aB  ", 1, -1},
      {Kind::plain, "Single", u"ab  ", u"ab", LX_CMP_TRIM | 1, 0},
      {Kind::plain, "Single", u"b", u"a", LX_CMP_TRIM, 0, kArgument},
      {Kind::plain, "Single", u"b", u"a", LX_CMP_TRIM | LX_CMP_NOCASE, 0, kArgument},
      {Kind::plain, "Single", u"b", u"a", 2, 0, kArgument},
      {Kind::plain, "Single", u"b", u"a", 0x40, 0, kArgument},
      {Kind::shifted, "Mixed", u"b", u"a", LX_CMP_TRIM, 0, kArgument},
      {Kind::shifted, "Mixed", u"\u3041  ", u"\u3041", 1, 0},
      {Kind::wide, "Small", u"ab  ", u"ab", LX_CMP_TRIM, 0},
      {Kind::wide, "Small", u"ab", u"abc", LX_CMP_TRIM, -1},
      {Kind::wide, "Small", u"ab\u3040", u"ab", LX_CMP_TRIM, 1},
      {Kind::wide, "Small", u"ab \u3040 ", u"ab", kBoth, 0},
      {Kind::wide, "Small", u"ab ", u"AB", LX_CMP_TRIM | LX_CMP_NOCASE, 0},
      {Kind::wide, "Small", u"b", u"a", 1, 0, kArgument},
      {Kind::wide, "Small", u"ab", u"abc", LX_CMP_NOWIDTH, -1},
      {Kind::ucs2, "Small", u"ab  ", u"ab", LX_CMP_TRIM, 0},
      {Kind::ucs2, "Small", u"ab\u3000", u"ab", LX_CMP_TRIM, 1},
      {Kind::ucs2, "Small", u"ab\u3000 ", u"ab", kBoth, 0},
      {Kind::ucs2, "Small", u"ab ", u"AB", LX_CMP_TRIM | LX_CMP_NOCASE, 0},
      {Kind::ucs2, "Small", u"b", u"a", 0x80000000, 0, kArgument},
  };
  for (const Case& one : cases) {
    TextForm form(one.kind, one.page, "Plain");
    Stored a = form.store(one.a), b = form.store(one.b);
    EXPECT_EQ(sign(form.compare(a, b, one.options)), one.result) << form.name() << shown(one.a) << shown(one.b);
    EXPECT_EQ(LXGetError(form.locale()), one.error) << form.name() << shown(one.a) << shown(one.b);
  }
  const LXWChar host[] = {0xC1, 0x40, 0x40};
  TextForm ebcdic(Kind::wide, "IBM930", "Plain");
  EXPECT_EQ(LXWcscoll(ebcdic.locale(), host, 3, host, 1, LX_CMP_TRIM), 0);
}

// ---- Without a sort object ----

TEST_F(Options, OfABinaryLocaleAreThoseOfTheOtherComparison) {
  const std::u16string_view texts[] = {u"", u"a", u"A", u"ab", u"aB ", u"ab  ", u"a\u3041", u"a\u3040", u"\u3041"};
  const uint32_t options[] = {
      0,    1, LX_CMP_NOCASE, LX_CMP_NOWIDTH, LX_CMP_TRIM, LX_CMP_TRIM | LX_CMP_NOCASE, LX_CMP_TRIM | LX_CMP_NOWIDTH,
      0x40, 2};
  for (const char* page : {"Small", "Mixed"}) {
    for (Kind kind : {Kind::plain, Kind::shifted, Kind::wide, Kind::ucs2}) {
      TextForm form(kind, page, "BINARY", "German");
      LXLocale* l = form.locale();
      bool masked = kind == Kind::shifted && std::string_view(page) == "Mixed";
      for (std::u16string_view x : texts) {
        for (std::u16string_view y : texts) {
          const Stored a = form.store(x), b = form.store(y);
          for (uint32_t given : options) {
            uint32_t option = given;
            if (masked) option &= (given & LX_CMP_NOWIDTH) > LX_CMP_NOCASE ? 0x80200041 : 0x80200040;
            if (kind == Kind::wide) option &= 0x80200040;
            std::u16string wide_a(a.raw.size() / 2 + 1, u'\0'), wide_b(b.raw.size() / 2 + 1, u'\0');
            std::memcpy(wide_a.data(), a.raw.data(), a.raw.size());
            std::memcpy(wide_b.data(), b.raw.data(), b.raw.size());
            std::vector<LXWChar> w_a(a.raw.size() / 4 + 1), w_b(b.raw.size() / 4 + 1);
            std::memcpy(w_a.data(), a.raw.data(), a.raw.size() / 4 * 4);
            std::memcpy(w_b.data(), b.raw.data(), b.raw.size() / 4 * 4);
            auto u_a = reinterpret_cast<const LXUChar*>(wide_a.data());
            auto u_b = reinterpret_cast<const LXUChar*>(wide_b.data());
            int32_t m = a.units, n = b.units;
            const char *s = a.raw.data(), *t = b.raw.data();
            int32_t wanted = masked               ? LXStrcmpEx(l, s, 0, m, t, 0, n, option)
                             : kind == Kind::wide ? LXWcscmp(l, w_a.data(), m, w_b.data(), n, option)
                             : kind == Kind::ucs2 ? LXStrcmpU(l, u_a, m, u_b, n, option)
                                                  : LXStrcmp(l, s, m, t, n, option);
            uint32_t error = LXGetError(l);
            ASSERT_EQ(form.compare(a, b, given), wanted) << form.name() << shown(x) << shown(y) << given;
            ASSERT_EQ(LXGetError(l), error) << form.name() << given;
          }
        }
      }
    }
  }
  TextForm form(Kind::plain, "Small", "BINARY");
  EXPECT_EQ(LXStrcoll(form.locale(), "a\x81", -1, "a", -1, 0), LXStrcmp(form.locale(), "a\x81", -1, "a", -1, 0));
}

TEST_F(Options, OfABinaryLocaleInKeys) {
  TextForm plain(Kind::plain, "Small", "BINARY");
  Stored text = plain.store(u"aB\u3041");
  EXPECT_EQ(plain.key(text), text.raw);
  EXPECT_EQ(plain.key(text, LX_CMP_NOCASE), "AB\x81\x40");
  EXPECT_EQ(plain.key(text, LX_CMP_NOWIDTH), "aBA");
  EXPECT_EQ(TextForm(Kind::plain, "Single", "BINARY", "German")
                .key(TextForm(Kind::plain, "Single", "BINARY").store(u"a\u00DF"), LX_CMP_NOCASE),
            "ASS");
  char key[5] = {};
  EXPECT_EQ(plain.transform(key, 3, text, 0), 4);
  EXPECT_EQ(plain.transform(key, 3, text, LX_CMP_NOCASE), 4);
  EXPECT_EQ(std::string_view(key, 5), std::string_view("AB\0\0\0", 5));  // as many as fit
  EXPECT_EQ(plain.transform(key, 5, text, 1), -1);
  EXPECT_EQ(LXGetError(plain.locale()), kArgument);
  EXPECT_EQ(LXStrGenSortKey(plain.locale(), key, 5, nullptr, 0), -1);
}

TEST_F(Options, NeedALocale) {
  ASSERT_EQ(lxglocale, nullptr);
  char key[8];
  EXPECT_EQ(LXStrcoll(nullptr, "b", 1, "a", 1, 0), 0);
  EXPECT_EQ(LXStrxfrm(nullptr, key, 8, "a", 1, 0), -1);
  ASSERT_EQ(LXSetLocale("English_UnitedStates.Single@Plain", 0), kFine);
  EXPECT_EQ(LXStrcoll(nullptr, "b", 1, "a", 1, 0), 2);
  EXPECT_EQ(LXStrxfrm(nullptr, key, 8, "a", 1, 0), 5);
}

// ---- Texts in texts ----

TEST_F(Options, OfTextsInTexts) {
  struct Case {
    const char* page;
    std::string_view text, wanted;
    uint32_t options;
    int found;  // -1: not
  };
  const Case cases[] = {
      {"Small", "xxAbC", "aBc", LX_CMP_NOCASE, 2},
      {"Small", "xxAbC", "aBc", 0, -1},
      {"Small", "aZ", "a0", LX_CMP_NOCASE, 0},    // both weigh nothing
      {"Single", "aZ", "a0", LX_CMP_NOCASE, -1},  // but are not the same bytes
      {"Small", "aZ", "a0", 0, -1},
      {"Small", "ab", "abc", LX_CMP_NOCASE, -1},
      {"Small", "b\x81\x41", "A", LX_CMP_NOWIDTH, 1},
      {"Small", "bA", "\x81\x41", LX_CMP_NOWIDTH, -1},  // trimming cuts what is sought to one byte
      {"Small", "b\x81\x41", "\x81\x40", LX_CMP_NOCASE, 1},
      {"Small", "b\x81\x41", "\x81\x40", 0, -1},
      {"Small", "A\x81", "A", LX_CMP_NOCASE, 0},
      {"Small", "xA", "", LX_CMP_NOCASE, 0},
      {"Single", "xA", "a", LX_CMP_NOWIDTH, -1},
      {"Single", "xAb", "aB", LX_CMP_NOCASE, 1},
  };
  for (const Case& one : cases) {
    for (const char* sort : {"Plain", "Combining"}) {
      TextForm form(Kind::plain, one.page, sort);
      Guarded text(one.text), wanted(one.wanted);
      const char* at = LXStrstr(form.locale(), text.data(), static_cast<int32_t>(one.text.size()), wanted.data(),
                                static_cast<int32_t>(one.wanted.size()), one.options);
      EXPECT_EQ(at != nullptr ? at - text.data() : -1, one.found) << one.page << ' ' << one.text << ' ' << one.wanted;
      EXPECT_EQ(LXGetError(form.locale()), kFine);
    }
  }
  TextForm form(Kind::ucs2, "Single", "Combining");
  const LXUChar text[] = {'x', 'a', 'Z'}, wanted[] = {'A', '0'};
  EXPECT_EQ(LXStrstrU(form.locale(), text, 3, wanted, 2, LX_CMP_NOCASE), text + 1);
}

}  // namespace
}  // namespace lx::test
