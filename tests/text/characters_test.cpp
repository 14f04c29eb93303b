// SPDX-License-Identifier: Apache-2.0
// Types and other forms of all UCS-2 characters; and every character of every shipped code page has those that it has
// in Unicode, but for what is listed with its reason.
#include <clocale>
#include <cwctype>
#include <map>

#include "support/environment.hpp"
#include "support/session.hpp"
#include "text/text_functions.hpp"

namespace lx::test {
namespace {

// ---- Unicode ----

// What users have sorted and stored depends on these: they never change. The tables have tests of their own.
TEST(UnicodeCharacters, AreWhatTheyAlwaysWere) {
  const Session session;
  uint64_t types = 0, lower = 0, upper = 0, full = 0, half = 0, digits = 0;
  for (uint32_t c = 0; c < 0x10000; ++c) {
    types = types * 31 + type_model(c);
    lower = lower * 31 + lower_model(c);
    upper = upper * 31 + upper_model(c);
    full = full * 31 + full_model(c);
    half = half * 31 + half_model(c);
    digits = digits * 31 + digit_model(c);
  }
  EXPECT_EQ(types, 12691385284841874353u);
  EXPECT_EQ(lower, 1559826209838232047u);
  EXPECT_EQ(upper, 4452857200764224391u);
  EXPECT_EQ(full, 11444270730570367853u);
  EXPECT_EQ(half, 5491428112064399797u);
  EXPECT_EQ(digits, 9788432566114294218u);
}

// The others clear the status, these leave it.
TEST(UnicodeCharacters, WidthsKeepTheStatus) {
  const Session session;
  const Locale locale = locale_of("Latin1");
  for (auto map : {LXUnicodeToH2F, LXUnicodeToF2H}) {
    LXStrcpyU(locale.get(), nullptr, 0, nullptr, 0, 1);  // an error
    map(locale.get(), 0xFF21);
    EXPECT_EQ(LXGetError(locale.get()), LX_E_ARGUMENT);
  }
}

// The C library follows later versions of Unicode: digits of other scripts, marks, numerals and circled letters are
// letters there, no-break spaces no spaces, and it knows letters and symbols that came later.
TEST(UnicodeCharacters, AgreeWithTheCLibrary) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  const Session session;
  const Locale locale = locale_of("Latin1");
  LXLocale* l = locale.get();
  locale_t utf8 = newlocale(LC_ALL_MASK, "C.UTF-8", nullptr);
  if (utf8 == nullptr) GTEST_SKIP() << "the system has no C.UTF-8";
  const struct {
    const char* name;
    uint32_t bit;
    int (*theirs)(wint_t, locale_t);
    size_t ours_only, theirs_only;  // at most
  } classes[] = {{"alpha", LX_CT_ALPHA, iswalpha_l, 2, 455},   {"upper", LX_CT_UPPER, iswupper_l, 0, 2},
                 {"lower", LX_CT_LOWER, iswlower_l, 3, 22},    {"digit", LX_CT_DIGIT, iswdigit_l, 159, 0},
                 {"xdigit", LX_CT_XDIGIT, iswxdigit_l, 22, 0}, {"punct", LX_CT_PUNCT, iswpunct_l, 66, 353},
                 {"space", LX_CT_SPACE, iswspace_l, 3, 0},     {"blank", LX_CT_BLANK, iswblank_l, 3, 0},
                 {"cntrl", LX_CT_CNTRL, iswcntrl_l, 0, 2}};
  std::map<std::string, std::pair<size_t, size_t>> found;
  auto note = [&](const std::string& name, bool ours, bool theirs) {
    found[name].first += ours && !theirs;
    found[name].second += theirs && !ours;
  };
  for (uint32_t c = 0; c < 0x10000; ++c) {
    if (type_model(c) == 0x400) continue;  // unknown to us: came later, or private
    for (const auto& row : classes) {
      note(row.name, (type_model(c) & row.bit) != 0, row.theirs(c, utf8) != 0);
    }
    uint32_t lower = LXUnicodeToLower(l, static_cast<LXUChar>(c)), upper = LXUnicodeToUpper(l, static_cast<LXUChar>(c));
    if (lower != towlower_l(c, utf8)) note("tolower", lower != c, lower == c);
    if (upper != towupper_l(c, utf8)) note("toupper", upper != c, upper == c);
  }
  for (const auto& row : classes) {
    EXPECT_LE(found[row.name].first, row.ours_only) << row.name;
    EXPECT_LE(found[row.name].second, row.theirs_only) << row.name;
  }
  EXPECT_LE(found["tolower"].first, 38u) << "Georgian got capitals of its own";
  EXPECT_LE(found["tolower"].second, 9u);
  EXPECT_EQ(found["toupper"].first, 0u);
  EXPECT_LE(found["toupper"].second, 66u);
  freelocale(utf8);
}

// ---- Code pages ----

struct Operation {
  const char* name;
  uint32_t flags;
  uint16_t (*unicode)(uint32_t);
};
uint16_t digit_or_same(uint32_t c) {
  uint16_t digit = (type_model(c) & LX_CT_DIGIT) != 0 ? digit_model(c) : uint16_t{0};
  return digit != 0 ? digit : static_cast<uint16_t>(c);
}
const Operation kOperations[] = {
    {"upper", LX_MAP_UPPER, upper_model}, {"lower", LX_MAP_LOWER, lower_model},    {"full", LX_MAP_H2F, full_model},
    {"half", LX_MAP_F2H, half_model},     {"digit", LX_MAP_DIGITS, digit_or_same},
};

// A character that is capital and small at once.
bool is_title(uint16_t c) { return (type_model(c) & (LX_CT_UPPER | LX_CT_LOWER)) == (LX_CT_UPPER | LX_CT_LOWER); }

// A character, and what Unicode wants of it.
struct Expectation {
  const PageSource& page;
  const std::string& code;
  uint16_t unicode;
  std::string_view operation;
};
const struct Exception {
  const char* operation;
  const char* reason;
  size_t count;  // in all pages
  bool (*holds)(const Expectation& e);
} kExceptions[] = {
    {"type", "a title case letter has one partner, the capital, and counts as small", 4,
     [](const Expectation& e) { return is_title(e.unicode); }},
    {"lower", "so it has no small letter", 4, [](const Expectation& e) { return is_title(e.unicode); }},
    {"type", "halves of surrogate pairs are no characters; their rows are shared with Hangul", 0x7A4,
     [](const Expectation& e) { return e.unicode >= 0xD800 && e.unicode < 0xE000; }},
    {"half", "only the preferred code of a character has widths", 4,
     [](const Expectation& e) { return e.page.encode(e.unicode) != e.code; }},
    {"half", "the spacing voice marks are those that have half-width forms", 2,
     [](const Expectation& e) { return e.unicode == 0x3099 || e.unicode == 0x309A; }},
    {"full", "IBM-930 and 939 have the wide minus and tilde under other names", 4,
     [](const Expectation& e) { return e.unicode == '-' || e.unicode == '~'; }},
    {"half", "and find them again", 4, [](const Expectation& e) { return e.unicode == 0x2212 || e.unicode == 0x301C; }},
};

class PageCharacters : public testing::Test {
 protected:
  void check(LXLocale* l, const PageSource& page, const std::string& code) {
    const uint16_t unicode = page.decode(code);
    const bool assigned = unicode != kNoCharacter || code == page.encode(kNoCharacter);
    ++characters_;
    expect({page, code, unicode, "type"}, type_of(l, page, code, false), type_of(l, page, code, true),
           unpacked(assigned ? type_model(unicode) : 0x400));
    for (const Operation& operation : kOperations) {
      const uint16_t mapped = operation.unicode(unicode);
      const bool there = mapped != unicode && page.has(mapped) && page.decode(page.encode(mapped)) == mapped;
      expect({page, code, unicode, operation.name}, map(l, page, code, operation.flags, false),
             map(l, page, code, operation.flags, true), there ? page.encode(mapped) : code);
    }
  }

  Session session_;
  std::map<const Exception*, size_t> found_;
  size_t characters_ = 0;

 private:
  static std::string type_of(LXLocale* l, const PageSource& page, const std::string& code, bool wide) {
    auto bits = [&](uint32_t part) {
      return wide           ? LXGetCharTypeW(l, packed(code), part)
             : page.mixed() ? LXGetCharTypeEx(l, code.data(), code.size() > 1, part)
                            : LXGetCharType(l, code.data(), part);
    };
    return unpacked(bits(LX_CTYPE_1) | bits(LX_CTYPE_2) << 10 | bits(LX_CTYPE_3) << 22);
  }
  // The bytes of the other form.
  static std::string map(LXLocale* l, const PageSource& page, const std::string& code, uint32_t flags, bool wide) {
    if (wide) {
      LXWChar in = packed(code), out = 0;
      EXPECT_EQ(LXMapStringW(l, &out, 1, &in, 1, flags), 1);
      return unpacked(out);
    }
    char out[8];
    auto length = static_cast<int32_t>(code.size());
    int32_t count = page.mixed() ? LXMapStringEx(l, out, 8, code.data(), length > 1, length, flags)
                                 : LXMapString(l, out, 8, code.data(), length, flags);
    std::string text(out, static_cast<size_t>(count));
    bool shifts = page.mixed() && text.size() > 2;  // of the other width, between its shift bytes
    return shifts ? text.substr(1, text.size() - 2) : text;
  }
  void expect(const Expectation& e, const std::string& got, const std::string& got_wide, const std::string& wanted) {
    if (got != got_wide) ADD_FAILURE() << e.page.name << " " << hex(e.code);
    if (got == wanted) return;
    for (const Exception& exception : kExceptions) {
      if (e.operation != exception.operation || !exception.holds(e)) continue;
      ++found_[&exception];
      return;
    }
    ADD_FAILURE() << e.page.name << ": " << e.operation << " of " << hex(e.code) << " is " << hex(got) << ", not "
                  << hex(wanted);
  }
};

TEST_F(PageCharacters, AreAsInUnicode) {
  std::vector<std::string> files = PageSource::all_files();
  EXPECT_EQ(files.size(), 100u);
  for (const std::string& file : files) {
    const PageSource page(file);
    Locale locale = locale_of(page.name);
    for (unsigned byte = 0; byte < 256; ++byte) {
      bool shift = page.mixed() && (byte == page.enter || byte == page.leave);
      bool alone = page.length_of(static_cast<uint8_t>(byte)) == 1;
      if (alone && !shift) check(locale.get(), page, std::string(1, static_cast<char>(byte)));
    }
    for (const std::string& code : page.long_codes()) check(locale.get(), page, code);
    ASSERT_FALSE(HasFailure()) << page.name;
  }
  for (const Exception& exception : kExceptions) {
    EXPECT_EQ(found_[&exception], exception.count) << exception.operation << ": " << exception.reason;
  }
  EXPECT_GT(characters_, 380000u);
}

}  // namespace
}  // namespace lx::test
