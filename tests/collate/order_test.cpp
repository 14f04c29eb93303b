// SPDX-License-Identifier: Apache-2.0
// Texts compared directly, against a slow reading of the same rules and against their keys; options.
#include <random>

#include "collate/sort_model.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

using Order = CollationTest;

using Stored = std::vector<Units>;  // a text in each of the forms
std::vector<Stored> stored(const std::vector<Collation>& forms, const std::vector<std::u16string>& texts) {
  std::vector<Stored> result(texts.size());
  for (size_t i = 0; i < texts.size(); ++i) {
    for (const Collation& form : forms) result[i].push_back(form.store(texts[i]));
  }
  return result;
}
void expect_order(const std::vector<Collation>& forms, const Stored& a, const Stored& b) {
  const int wanted = model_compare(forms.back().reader(a.back()), forms.back().reader(b.back()));
  for (size_t i = 0; i < forms.size(); ++i) {
    const int32_t got = forms[i].compare(a[i], b[i]);
    ASSERT_EQ(std::abs(wanted) > 1 ? got : sign(got), wanted)
        << forms[i].name << ' ' << hex_units(a[i]) << "| " << hex_units(b[i]);
  }
}

TEST_F(Order, OfAllPairsOfShortTexts) {
  for (const char* sort : {"Plain", "Combining", "Forward"}) {
    const std::vector<Collation> forms = own_forms(sort);
    for (const auto& [letters, length] : {std::pair(u"aABcefpqQ-*mntdxyzw0", 2), {u"ab-c", 3}, {u"ap-y", 3}}) {
      const std::vector<Stored> texts = stored(forms, all_texts(letters, static_cast<size_t>(length)));
      for (const Stored& a : texts) {
        for (const Stored& b : texts) expect_order(forms, a, b);
        if (HasFatalFailure()) return;
      }
    }
  }
}

TEST_F(Order, OfLongerTexts) {
  constexpr std::u16string_view kLetters = u"aAbBcefpqQ-+*mntdxyzw0\u3041\u3042";
  std::mt19937 random(7);
  for (const char* sort : {"Plain", "Combining", "Forward"}) {
    const std::vector<Collation> forms = own_forms(sort);
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
      if (round % 8 == 1) {  // what both begin with ends with what may be half of a pair
        a.assign(8 + random() % 9, u'a') += u'c';
        b = a;
        for (std::u16string* text : {&a, &b}) (*text += kLetters[random() % kLetters.size()]).append(8, u'a');
      }
      const std::vector<Stored> texts = stored(forms, {a, b});
      expect_order(forms, texts[0], texts[1]);
      expect_order(forms, texts[1], texts[0]);
      if (HasFatalFailure()) return;
    }
  }
}

// Keys say the same as long as the primary weights stand in order, and what is left out of keys has no part. Here is
// where they do not.
TEST_F(Order, DiffersFromThatOfTheKeys) {
  const struct {
    const char* sort;
    std::u16string_view a, b;
    int direct, keys;
  } cases[] = {
      {"Plain", u"am", u"amd", -1, 0},       // a default weight at the end of a level
      {"Plain", u"p", u"pa", -1, -1},        // not in order: the longer one goes on with the secondary weights
      {"Plain", u"pm", u"pa", 1, -1},        // where the shorter one may be the greater
      {"Plain", u"0-", u"-", 1, 0},          // alone, special weights have no positions in keys
      {"Combining", u"a-b", u"ab-", 0, -1},  // characters looked at ahead are not counted
  };
  for (const auto& one : cases) {
    Collation form(Form::plain, 819, one.sort);
    Units a = form.store(one.a), b = form.store(one.b);
    EXPECT_EQ(sign(form.compare(a, b)), one.direct) << hex_units(a) << hex_units(b);
    EXPECT_EQ(sign(form.key(a).compare(form.key(b))), one.keys) << hex_units(a) << hex_units(b);
  }
}

TEST_F(Order, OfMeasuredAndCutTexts) {
  Collation form(Form::plain, 954, "Plain");
  EdgeBuffer edge(64);
  LXLocale* l = form.locale();
  EXPECT_EQ(LXStrcoll(l, edge.text("ab\xA4"), 3, "ab", -1, 0), 0);
  EXPECT_EQ(LXStrcoll(l, "ab\0c", -1, "ab", -7, 0), 0);
  EXPECT_EQ(LXStrcoll(l, edge.text("\xA4\xA1\xA4\xA2\xA4\xA3-"), 3, "\xA4\xA1\xA4\xA2\xA4\xA3", 3, LX_OPT_CHARS), 0);
  EXPECT_EQ(LXStrcoll(l, "\xA4\xA1\xA4\xA2", 2, "\xA4\xA1\xA4\xA2", 1, LX_OPT_CHARS), 1);
  Collation mixed(Form::shifted, 930, "Plain");
  EXPECT_EQ(LXStrcollEx(mixed.locale(), "\x44\x81\x0F\x62", 4, 1, "\x0F\x0E\x44\x81\x0F\x0E\x0F\x62", 8, 1, 0), 0);
  EXPECT_EQ(LXStrcollEx(mixed.locale(), "\x0E\x44\x81\x44\x82", 2, 0, "\x0E\x44\x81\x44\x83", 1, 0, LX_OPT_CHARS), 1);
  // The first text, whose blanks are cut, has the length that it needs with a shift byte at its end.
  EXPECT_EQ(LXStrcollEx(mixed.locale(), "\x0E\x44\x47\x40\x40\x0F", 6, 0, "\x0F\x0E\x44\x47", 4, 0, LX_COLL_TRIM), 0);
}

// ---- Keys ----

const LXUChar* units_at(std::u16string_view text) { return reinterpret_cast<const LXUChar*>(text.data()); }

TEST_F(Order, KeysFillBuffersOfEverySize) {
  const Collation form(Form::ucs2, 819, "Combining");
  EdgeBuffer edge(1024);
  for (std::u16string_view text : {u"a", u"aaabBB", u"efefa", u"-+*", u"a-b*c-cbcc", u"xyzwx", u"mntd0m", u"Qpqaq",
                                   u"\u51FFz00", u"\u3041\u4E03\u50FF-"}) {
    const std::string wanted = model_key(form.sort, text);
    const auto n = static_cast<int32_t>(text.size()), length = static_cast<int32_t>(wanted.size());
    const size_t work = (8 * text.size() + 3 + 3) / 4 * 4 + 8 * text.size();
    for (size_t i = 0; i < 8 * (work + 9); ++i) {  // each room, at each distance from the edge, for both functions
      const size_t size = i / 8, behind = i / 2 % 4;
      char* key = edge.room(size + behind);
      const size_t gap = (4 - reinterpret_cast<uintptr_t>(key) % 4) % 4;
      std::string expected(size + behind, '\x5A');
      if (wanted.size() <= size) {
        expected.replace(0, wanted.size(), wanted);
        if (size >= gap + work) expected.replace(wanted.size(), size - wanted.size(), size - wanted.size(), '\0');
      }
      const auto room = static_cast<int32_t>(size);
      ASSERT_EQ(i % 2 == 0 ? LXStrGenSortKey(form.locale(), key, room, units_at(text), n)
                           : LXStrxfrmU(form.locale(), key, room, units_at(text), n, 0),
                length);
      ASSERT_EQ(std::string_view(key, expected.size()), expected) << length << ' ' << size << ' ' << behind;
    }
    EXPECT_EQ(LXStrGenSortKey(form.locale(), nullptr, 0, units_at(text), n), length);
  }
}

// As much as fits of three zeros, or all or nothing.
TEST_F(Order, KeysOfAnEmptyText) {
  for (const char* sort : {"Plain", "BINARY"}) {
    const Collation form(Form::plain, 819, sort);
    for (int32_t size = 0; size < 6; ++size) {
      char key[] = "\x9\x9\x9\x9\x9", generated[] = "\x9\x9\x9\x9\x9";
      EXPECT_EQ(LXStrxfrm(form.locale(), key, size, "", 0, 0), size == 0 ? 0 : 3);
      EXPECT_EQ(LXStrGenSortKey(form.locale(), generated, size, nullptr, 0), 3);
      for (int32_t i = 0; i < 5; ++i) {
        EXPECT_EQ(key[i], i < std::min(size, 3) ? 0 : 9) << sort << size;
        EXPECT_EQ(generated[i], size >= 3 && i < 3 ? 0 : 9) << sort << size;
      }
    }
  }
}

// Positions and lengths beyond sixteen bits wrap round.
TEST_F(Order, KeysOfLongTexts) {
  Collation form(Form::ucs2, 819, "Plain");
  std::u16string text(69999, u'a');
  text += u'-';
  std::string key(text.size() * 16 + 16, '\x5A');
  int32_t length = LXStrGenSortKey(form.locale(), key.data(), static_cast<int32_t>(key.size()), units_at(text), 70000);
  ASSERT_EQ(length, 2 * 69999 + 3 + 4);
  EXPECT_EQ(key.substr(2 * 69999, 7), std::string("\0\0\0\x11\x70\0\x11", 7));
  text.assign(70000, u'f')[0] = u'e';  // one run, stored backwards
  length = LXStrGenSortKey(form.locale(), key.data(), static_cast<int32_t>(key.size()), units_at(text), 70000);
  ASSERT_EQ(length, 4 * 70000 + 3);
  EXPECT_EQ(key.substr(2 * 70000, 70002), std::string(1, '\0') + std::string(69999, '\x25') + std::string("\x24\0", 2));
}

TEST_F(Order, KeysNeedGoodOptions) {
  for (const Collation& form : own_forms("Plain")) {
    const Units text = form.store(u"ab");
    char key[64];
    for (uint32_t options : {1u, 0x40u, 0x80000000u, LX_CMP_TRIM, LX_CMP_NOCASE | 2, LX_CMP_NOWIDTH | LX_CMP_TRIM}) {
      EXPECT_EQ(form.transform(key, 64, text, 2, options), -1) << form.name << ' ' << options;
      EXPECT_EQ(LXGetError(form.locale()), LX_E_ARGUMENT);
    }
    EXPECT_EQ(form.transform(key, 64, text, 2, LX_OPT_CHARS), 2 * 2 + 3) << form.name;
    EXPECT_EQ(LXGetError(form.locale()), LX_OK);
    EXPECT_EQ(form.transform(key, 64, text, -1, 0), 7) << "measured; the terminator is no part of the text";
  }
}

// ---- Case, width and blanks ----

TEST_F(Order, KeysAreThoseOfTheMappedText) {
  for (const char* sort : {"Plain", "Combining"}) {
    for (LanguageIndex language : {kEnglish, kGerman, kTurkish, kLithuanian}) {
      std::vector<Collation> forms = own_forms(sort, language);
      forms.emplace_back(Form::plain, 819, sort, language);
      for (const Collation& form : forms) {
        std::u16string letters;
        for (char16_t c : std::u16string_view(u"aAisS\u00DF\u0307-c\uFF41\uFF21\u3000 \u3041")) {
          if (form.form.kind == Form::ucs2 || form.form.page->has(c)) letters += c;
        }
        std::vector<std::pair<Units, std::string>> texts;
        for (const std::u16string& text : all_texts(letters, 3)) {
          const Units units = form.store(text);
          if (text.empty()) continue;
          const std::string upper = model_key(form.sort, form.mapped({Form::ucs2, nullptr}, text, LX_MAP_UPPER));
          ASSERT_EQ(form.key(units), model_key(form.sort, text)) << form.name << hex_units(units);
          ASSERT_EQ(form.key(units, LX_CMP_NOCASE), upper) << form.name << hex_units(units);
          ASSERT_EQ(form.key(units, LX_CMP_NOWIDTH), model_key(form.sort, form.mapped(form.form, text, LX_MAP_F2H)))
              << form.name << hex_units(units);
          if (text.size() < 3 && text.find(u'-') == text.npos) texts.emplace_back(units, upper);
        }
        for (const auto& [a, key_a] : texts) {
          for (const auto& [b, key_b] : texts) {
            ASSERT_EQ(sign(form.compare(a, b, LX_CMP_NOCASE)), sign(key_a.compare(key_b)))
                << form.name << hex_units(a) << hex_units(b);
          }
        }
      }
    }
  }
}

// All characters may become two.
TEST_F(Order, CaseMayDoubleATextOfAnyLength) {
  for (Form::Kind kind : {Form::plain, Form::wide, Form::ucs2}) {
    Collation form(kind, 819, "Plain", kGerman);
    for (size_t length : {1u, 15u, 16u, 17u, 31u, 32u, 33u, 200u, 1000u}) {
      Units sharp = form.store(std::u16string(length, u'\u00DF')), two = form.store(std::u16string(2 * length, u's'));
      EXPECT_EQ(form.compare(sharp, two, LX_CMP_NOCASE), 0) << form.name << length;
      EXPECT_EQ(form.key(sharp, LX_CMP_NOCASE), form.key(two, LX_CMP_NOCASE)) << form.name << length;
    }
  }
}

TEST_F(Order, TrailingBlanksOfEachForm) {
  constexpr uint32_t kBoth = LX_CMP_NOWIDTH | LX_CMP_TRIM;
  const struct {
    Form::Kind kind;
    uint16_t page;
    std::u16string_view a, b;
    uint32_t options;
    int result;
    uint32_t error = LX_OK;
  } cases[] = {
      // Of bytes, the second text is cut to the length of the first before its own blanks are.
      {Form::plain, 819, u"ab", u"abc", LX_COLL_TRIM, 0},
      {Form::plain, 819, u"ab", u"abc", LX_CMP_NOWIDTH, 0},
      {Form::plain, 819, u"abc", u"ab", LX_COLL_TRIM, 1},
      {Form::plain, 819, u"ab  ", u"ab c", LX_COLL_TRIM, 0},
      {Form::plain, 819, u"  ", u"a", LX_COLL_TRIM, 0},
      {Form::plain, 954, u"ab \u3000 ", u"ab", LX_COLL_TRIM, 0},
      {Form::plain, 954, u"ab", u"a\u3042", LX_COLL_TRIM, 1},
      {Form::plain, 954, u"abb", u"ab\u3000", LX_CMP_NOWIDTH, 1},
      {Form::plain, 954, u"b  A", u"b", LX_COLL_TRIM, 0},
      {Form::shifted, 930, u"ab\u3000 ", u"ab", LX_COLL_TRIM, 0},
      {Form::shifted, 930, u"ab", u"ab\u3042", LX_COLL_TRIM, 0},
      {Form::shifted, 930, u"\u3041\u3000", u"\u3041", LX_COLL_TRIM, 0},
      {Form::shifted, 930, u"\u3041", u"\u3041a", LX_CMP_NOWIDTH, 0},
      {Form::plain, 819, u"ab", u"aB  ", 1, -1},
      {Form::plain, 819, u"ab  ", u"ab", LX_CMP_TRIM | 1, 0},
      {Form::plain, 819, u"b", u"a", LX_CMP_TRIM, 0, LX_E_ARGUMENT},
      {Form::plain, 819, u"b", u"a", LX_CMP_TRIM | LX_CMP_NOCASE, 0, LX_E_ARGUMENT},
      {Form::plain, 819, u"b", u"a", 2, 0, LX_E_ARGUMENT},
      {Form::shifted, 930, u"b", u"a", LX_CMP_TRIM, 0, LX_E_ARGUMENT},
      {Form::wide, 930, u"ab  ", u"ab", LX_CMP_TRIM, 0},
      {Form::wide, 954, u"ab\u3000", u"ab", LX_CMP_TRIM, 1},
      {Form::wide, 954, u"ab \u3000 ", u"ab", kBoth, 0},
      {Form::wide, 954, u"ab ", u"AB", LX_CMP_TRIM | LX_CMP_NOCASE, 0},
      {Form::wide, 954, u"b", u"a", 1, 0, LX_E_ARGUMENT},
      {Form::ucs2, 954, u"ab\u3000", u"ab", LX_CMP_TRIM, 1},
      {Form::ucs2, 954, u"ab\u3000 ", u"ab", kBoth, 0},
      {Form::ucs2, 954, u"b", u"a", 0x80000000, 0, LX_E_ARGUMENT},
  };
  for (const auto& one : cases) {
    Collation form(one.kind, one.page, "Plain");
    Units a = form.store(one.a), b = form.store(one.b);
    EXPECT_EQ(sign(form.compare(a, b, one.options)), one.result) << form.name << hex_units(a) << hex_units(b);
    EXPECT_EQ(LXGetError(form.locale()), one.error) << form.name << hex_units(a) << hex_units(b);
  }
}

// ---- Without a sort object ----

TEST_F(Order, OfABinaryLocaleIsThatOfTheOtherComparison) {
  const auto texts = {u"", u"a", u"A", u"ab", u"aB ", u"ab  ", u"a\uFF21", u"a\uFF41", u"\uFF21"};
  EdgeBuffer edge_a(64), edge_b(64);
  for (const Collation& form : own_forms("BINARY", kGerman)) {
    for (size_t i = 0; i < texts.size() * texts.size(); ++i) {
      const Units a = form.store(texts.begin()[i / texts.size()]), b = form.store(texts.begin()[i % texts.size()]);
      for (uint32_t given : {0u, 1u, 2u, 0x40u, LX_CMP_NOCASE, LX_CMP_NOWIDTH, LX_CMP_TRIM, LX_CMP_TRIM | LX_CMP_NOCASE,
                             LX_CMP_TRIM | LX_CMP_NOWIDTH}) {
        uint32_t option = given;
        if (form.form.follows_shifts()) option &= (given & LX_CMP_NOWIDTH) > LX_CMP_NOCASE ? 0x80200041 : 0x80200040;
        if (form.form.kind == Form::wide) option &= 0x80200040;
        const int32_t wanted = with_calls(form.form, [&](auto calls) {
          using U = typename decltype(calls)::Unit;
          return calls(kStrcmp, form.locale(), place<U>(edge_a, a, 0), State{0}, static_cast<int32_t>(a.size()),
                       place<U>(edge_b, b, 0), State{0}, static_cast<int32_t>(b.size()), option);
        });
        const uint32_t error = LXGetError(form.locale());
        ASSERT_EQ(form.compare(a, b, given), wanted) << form.name << hex_units(a) << hex_units(b) << given;
        ASSERT_EQ(LXGetError(form.locale()), error) << form.name << given;
      }
    }
  }
}

TEST_F(Order, KeysOfABinaryLocaleAreTheText) {
  const Collation form(Form::plain, 954, "BINARY"), mixed(Form::shifted, 930, "BINARY");
  const Units text = form.store(u"aB\uFF21");
  EXPECT_EQ(form.key(text), bytes_of_units(text));
  EXPECT_EQ(form.key(form.store(u"aB\uFF41"), LX_CMP_NOCASE), "AB\xA3\xC1");
  EXPECT_EQ(form.key(text, LX_CMP_NOWIDTH), "aBA");
  char key[5] = {};
  EXPECT_EQ(form.transform(key, 3, text, 4, 0), 4);
  EXPECT_EQ(form.transform(key, 3, text, 4, LX_CMP_NOCASE), 4);
  EXPECT_EQ(std::string_view(key, 5), std::string_view("AB\0\0\0", 5)) << "as many as fit";
  EXPECT_EQ(form.transform(key, 5, text, 4, 1), -1);
  EXPECT_EQ(LXGetError(form.locale()), LX_E_ARGUMENT);
  EXPECT_EQ(LXStrGenSortKey(form.locale(), key, 5, units_at(u"a"), 1), -1);
  EXPECT_EQ(LXGetError(form.locale()), LX_E_ARGUMENT);
  EXPECT_EQ(LXStrxfrmEx(mixed.locale(), key, 5, "\x0E\x44\x81\x0F", 1, 0, LX_OPT_CHARS), 4);
  // Without room the text is not looked at, only its length.
  const LXWChar wide = 'a';
  EXPECT_EQ(LXWcsxfrm(form.locale(), nullptr, 0, &wide, (1 << 29) - 1, 0), INT32_MAX - 3);
  for (int32_t length : {1 << 29, 1 << 30, INT32_MAX}) {
    EXPECT_EQ(LXWcsxfrm(form.locale(), nullptr, 0, &wide, length, 0), -1);
    EXPECT_EQ(LXGetError(form.locale()), LX_E_MEMORY);
  }
}

// ---- Texts in texts ----

TEST_F(Order, OfTextsInTexts) {
  const struct {
    uint16_t page;
    std::string_view text, wanted;
    uint32_t options;
    int found;  // -1: not
  } cases[] = {
      {954, "xxAbC", "aBc", LX_CMP_NOCASE, 2},
      {954, "xxAbC", "aBc", 0, -1},
      {954, "aZ", "a0", LX_CMP_NOCASE, 0},   // both weigh nothing
      {819, "aZ", "a0", LX_CMP_NOCASE, -1},  // but are not the same bytes
      {954, "ab", "abc", LX_CMP_NOCASE, -1},
      {954, "ab", "bx", LX_CMP_NOWIDTH, -1},
      {954, "b\xA3\xC1", "A", LX_CMP_NOWIDTH, 1},
      {954, "bA", "\xA3\xC1", LX_CMP_NOWIDTH, -1},  // trimming cuts what is sought to one byte
      {954, "b\xA3\xE1", "\xA3\xC1", LX_CMP_NOCASE, 1},
      {954, "A\xA4", "A", LX_CMP_NOCASE, 0},
      {954, "xA", "", LX_CMP_NOCASE, 0},
      {819, "xA", "a", LX_CMP_NOWIDTH, -1},
  };
  for (const auto& one : cases) {
    for (const char* sort : {"Plain", "Combining"}) {
      const Collation form(Form::plain, one.page, sort);
      const Guarded text(one.text), wanted(one.wanted);
      const char* at = LXStrstr(form.locale(), text.view().data(), static_cast<int32_t>(one.text.size()),
                                wanted.view().data(), static_cast<int32_t>(one.wanted.size()), one.options);
      EXPECT_EQ(at != nullptr ? at - text.view().data() : -1, one.found) << one.page << one.text << one.wanted;
      EXPECT_EQ(LXGetError(form.locale()), LX_OK);
    }
  }
  Collation form(Form::ucs2, 819, "Combining");
  const LXUChar text[] = {'x', 'a', 'Z'}, wanted[] = {'A', '0'};
  EXPECT_EQ(LXStrstrU(form.locale(), text, 3, wanted, 2, LX_CMP_NOCASE), text + 1);
}

// ---- What comparisons of mixed text say about themselves ----

TEST_F(Order, IsTraced) {
  const struct {
    std::string_view b;
    uint32_t options;
    std::vector<std::string> messages;  // between entry and exit
  } cases[] = {
      {"\x81", 2, {"Options = 00000002"}},
      {"\x0E\x44\x81\x0F",
       LX_CMP_NOCASE,
       {"Options = 80000040", "len1 = 1, str1state = 0, len2 = 3, str2state = 1", "String1: 1 bytes",
        "String2: 3 bytes", "Strings are unequal: len1 = 1, len2 = 3", "String1: 1 bytes", "String2: 3 bytes"}},
  };
  const Collation form(Form::shifted, 930, "BINARY");
  for (const auto& one : cases) {
    TraceCapture trace;
    LXStrcmpEx(form.locale(), "\x81", 0, 1, one.b.data(), 0, static_cast<int32_t>(one.b.size()), one.options);
    const auto& all = trace.messages();
    ASSERT_GE(all.size(), 2u);
    EXPECT_EQ(std::vector<std::string>(all.begin() + 1, all.end() - 1), one.messages) << trace.all();
  }
}

}  // namespace
}  // namespace lx::test
