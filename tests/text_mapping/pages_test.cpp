// SPDX-License-Identifier: Apache-2.0
// Every character of every shipped code page has the type, the case and the widths that it has in Unicode; what has
// not is listed with its reason.
#include <algorithm>
#include <map>

#include <lexaro/lexaro.h>

#include "support/page_source.hpp"
#include "support/session.hpp"
#include "text_mapping/unicode_model.hpp"

namespace lx::test {
namespace {

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

// A character, and what Unicode wants of it.
struct Expectation {
  const PageSource& page;
  const std::string& code;
  uint16_t unicode;
  std::string_view operation;
  std::string wanted;
};

constexpr uint32_t kUnassigned = 0x400;
// A character that is capital and small at once.
bool is_title(uint16_t c) { return (type_model(c) & (LX_CT_UPPER | LX_CT_LOWER)) == (LX_CT_UPPER | LX_CT_LOWER); }

struct Exception {
  const char* operation;
  const char* reason;
  size_t count;  // in all pages
  bool (*holds)(const Expectation& e);
};
const Exception kExceptions[] = {
    {"type", "a title case letter has one partner, the capital, and counts as small", 4,
     [](const Expectation& e) { return is_title(e.unicode); }},
    {"lower", "so it has no small letter", 4, [](const Expectation& e) { return is_title(e.unicode); }},
    {"type", "halves of surrogate pairs are no characters; their rows are shared with Hangul", 0x7A4,
     [](const Expectation& e) { return e.unicode >= 0xD800 && e.unicode < 0xE000; }},
    {"half", "only the preferred code of a character has widths", 4,
     [](const Expectation& e) { return e.page.encode(e.unicode) != e.code; }},
    {"half", "the spacing voice marks are those that have half-width forms", 2,
     [](const Expectation& e) { return e.unicode == 0x3099 || e.unicode == 0x309A; }},
};

class PageCharacters : public testing::Test {
 protected:
  void check_page(const PageSource& page) {
    Locale locale = locale_of(page.name);
    for (unsigned byte = 0; byte < 256; ++byte) {
      bool shift = page.mixed() && (byte == page.enter || byte == page.leave);
      bool alone = page.length_of(static_cast<uint8_t>(byte)) == 1;
      if (alone && !shift) check(locale.get(), page, std::string(1, static_cast<char>(byte)));
    }
    for (const std::string& code : page.long_codes()) check(locale.get(), page, code);
  }

 private:
  void check(LXLocale* l, const PageSource& page, const std::string& code) {
    uint16_t unicode = page.decode(code);
    ++characters_;
    uint32_t type = type_of(l, page, code, false);
    bool assigned = unicode != kNoCharacter || code == page.encode(kNoCharacter);
    uint32_t wanted_type = assigned ? type_model(unicode) : kUnassigned;
    EXPECT_EQ(type, type_of(l, page, code, true)) << page.name << " " << hex(code);
    if (type != wanted_type) explain({page, code, unicode, "type", unpacked(wanted_type)}, hex(unpacked(type)));
    for (const Operation& operation : kOperations) {
      uint16_t mapped = operation.unicode(unicode);
      bool there = mapped != unicode && page.has(mapped) && page.decode(page.encode(mapped)) == mapped;
      std::string wanted = there ? page.encode(mapped) : code;
      std::string got = map(l, page, code, operation.flags, false);
      EXPECT_EQ(got, map(l, page, code, operation.flags, true)) << page.name << " " << hex(code);
      if (got != wanted) explain({page, code, unicode, operation.name, wanted}, hex(got));
    }
  }
  static uint32_t type_of(LXLocale* l, const PageSource& page, const std::string& code, bool wide) {
    uint32_t word = 0;
    const uint32_t shifts[] = {0, 10, 22};
    for (uint32_t i = 0; i < 3; ++i) {
      uint32_t class_id = LX_CTYPE_1 + i;
      uint32_t bits = wide           ? LXGetCharTypeW(l, packed(code), class_id)
                      : page.mixed() ? LXGetCharTypeEx(l, code.data(), code.size() > 1, class_id)
                                     : LXGetCharType(l, code.data(), class_id);
      word |= bits << shifts[i];
    }
    return word;
  }
  // The bytes of the other form.
  static std::string map(LXLocale* l, const PageSource& page, const std::string& code, uint32_t flags, bool wide) {
    if (wide) {
      LXWChar in = packed(code);
      LXWChar out = 0;
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
  void explain(const Expectation& e, const std::string& got) {
    for (const Exception& exception : kExceptions) {
      if (e.operation != exception.operation || !exception.holds(e)) continue;
      ++found_[&exception];
      return;
    }
    if (++unexplained_ > 10) return;
    ADD_FAILURE() << e.page.name << ": " << e.operation << " of " << hex(e.code) << " is " << got << ", not "
                  << hex(e.wanted);
  }

 protected:
  Session session_;
  std::map<const Exception*, size_t> found_;
  size_t characters_ = 0;

 private:
  size_t unexplained_ = 0;
};

TEST_F(PageCharacters, AreAsInUnicode) {
  std::vector<std::string> files = PageSource::all_files();
  EXPECT_EQ(files.size(), 100u);
  for (const std::string& file : files) check_page(PageSource(file));
  for (const Exception& exception : kExceptions) {
    EXPECT_EQ(found_[&exception], exception.count) << exception.operation << ": " << exception.reason;
  }
  EXPECT_GT(characters_, 380000u);
}

}  // namespace
}  // namespace lx::test
