// SPDX-License-Identifier: Apache-2.0
// Every byte sequence and every UCS-2 value of every shipped code page, against its readable source; types, case and
// widths of every multibyte character, against the compiled object read by a second reader.
#include <algorithm>
#include <filesystem>

#include "support/page_object.hpp"
#include "support/session.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

// Says how many values are wrong and which came first, instead of one failure for each.
class Wrong {
 public:
  void expect(bool right, const char* what, uint32_t of) {
    if (!right && ++count_ <= 5) first_ += std::string("\n  ") + what + " of " + hex(unpacked(of));
  }
  ~Wrong() { EXPECT_EQ(count_, 0u) << first_; }

 private:
  size_t count_ = 0;
  std::string first_;
};

std::string bytes(std::initializer_list<unsigned> values) {
  std::string text;
  for (unsigned value : values) text += static_cast<char>(value);
  return text;
}

// What begins with these bytes, with all trail bytes or with samples of them.
void add_sequences(std::vector<std::string>& all, const std::string& lead, size_t length, bool samples = false) {
  static const std::string kSamples("\x00\x0A\x40\x7F\x80\xA1\xFE\xFF", 8);
  if (lead.size() == length) return all.push_back(lead);
  for (size_t i = 0; i < (samples ? kSamples.size() : 256); ++i) {
    add_sequences(all, lead + (samples ? kSamples[i] : static_cast<char>(i)), length, samples);
  }
}

// All sequences of two and three bytes that the first byte allows; of the four-byte ones those of the plane in use,
// and samples of the others.
std::vector<std::string> long_sequences(const PageSource& page) {
  std::vector<std::string> all;
  std::string plane_in_use;
  for (const std::string& code : page.long_codes()) {
    if (code.size() == 4) plane_in_use = code.substr(0, 2);
  }
  for (unsigned first = 0; first < 256; ++first) {
    const size_t length = page.mixed() ? 2 : page.length_of(static_cast<uint8_t>(first));
    if (length == 2 || length == 3) add_sequences(all, bytes({first}), length);
    for (unsigned second = 0; second < 256 && length == 4; ++second) {
      const std::string plane = bytes({first, second});
      add_sequences(all, plane, length, plane != plane_in_use);
    }
  }
  return all;
}

class Mapping : public testing::TestWithParam<std::string> {
 protected:
  static void SetUpTestSuite() { session = std::make_unique<Session>(); }
  static void TearDownTestSuite() { session.reset(); }

  Mapping() : page(GetParam()), locale(locale_of(page.name)) {
    record = LXGetLocaleObject(locale.get(), LX_CODEPAGE);
    EXPECT_EQ(LXGetObjId(record), page.id);
  }

  static std::unique_ptr<Session> session;
  PageSource page;
  Locale locale;
  LXObjEntry* record;
};
std::unique_ptr<Session> Mapping::session;

TEST_P(Mapping, Header) {
  LXCodePageInfo info = {};
  ASSERT_EQ(LXGetCodePageInfo(record, &info), LX_OK);
  const std::vector<uint32_t> found = {info.id,           info.max_length,      info.substitution,
                                       info.ascii_family, info.shift_sensitive, info.enter_byte,
                                       info.leave_byte};
  EXPECT_EQ(found, (std::vector<uint32_t>{page.id, page.max_length, page.substitution, page.ascii_family, page.mixed(),
                                          page.enter, page.leave}));
  EXPECT_TRUE(std::equal(info.line_bytes, info.line_bytes + 4, page.line_ends.begin()));
  EXPECT_STREQ(LXGetObjName(record), page.name.c_str());
}

TEST_P(Mapping, SingleBytesToUnicode) {
  Wrong wrong;
  for (unsigned first = 0; first < 256; ++first) {
    std::string text = bytes({first}), longest = text + "\1\2\3";
    LXWChar expected = packed(std::string_view(longest).substr(0, page.lengths[first]));
    wrong.expect(LXMbToW(record, longest.data()) == expected, "LXMbToW", first);
    wrong.expect(LXMbToWS(record, longest.data(), 0) == first, "LXMbToWS", first);
    if (page.length_of(static_cast<uint8_t>(first)) != 1) continue;
    LXWChar wide = first;
    LXUChar units[3] = {};
    int32_t count = LXStringToUnicode(locale.get(), &units[0], 1, text.data(), 1, 0) +
                    LXCpStrToUnicode(record, &units[1], 1, text.data(), 1, 0) +
                    LXStringToUnicodeW(locale.get(), &units[2], 1, &wide, 1, 0);
    wrong.expect(count == 3 && std::count(units, units + 3, page.decode(text)) == 3, "Unicode", first);
  }
}

TEST_P(Mapping, LongSequencesToUnicode) {
  Wrong wrong;
  std::string text;
  std::vector<LXUChar> expected;
  for (const std::string& sequence : long_sequences(page)) {
    char whole[4] = {}, out[4];
    sequence.copy(whole, sizeof whole);
    const uint16_t unicode = page.decode(sequence);
    const LXWChar value = packed(sequence);
    wrong.expect(LXCpMbToUnicode(record, whole) == unicode, "LXCpMbToUnicode", value);
    const bool zero_inside = sequence.find('\0') < sequence.size() - 1;
    wrong.expect(zero_inside || LXCpMbToUnicodeW(record, value) == unicode, "LXCpMbToUnicodeW", value);
    wrong.expect(page.mixed() || LXMbToW(record, whole) == value, "LXMbToW", value);
    wrong.expect(sequence.size() != page.max_length || LXMbToWS(record, whole, 1) == value, "LXMbToWS", value);
    const std::string written = written_bytes(value);
    const bool right = LXWToMb(out, value) == written.size() && std::string_view(out, written.size()) == written;
    wrong.expect(right, "LXWToMb", value);
    const auto lead = static_cast<uint8_t>(sequence[0]);
    if (page.mixed() && (lead == page.enter || lead == page.leave)) continue;
    text += sequence;
    expected.push_back(unicode);
  }
  std::vector<LXUChar> converted(expected.size() + 1, 0xABCD);
  auto length = static_cast<int32_t>(text.size());
  auto room = static_cast<int32_t>(converted.size());
  int32_t count = page.mixed() ? LXStringToUnicodeEx(locale.get(), converted.data(), room, text.data(), 1, length, 0)
                               : LXStringToUnicode(locale.get(), converted.data(), room, text.data(), length, 0);
  ASSERT_EQ(static_cast<size_t>(count), expected.size());
  expected.push_back(0xABCD);
  const auto [got, wanted] = std::mismatch(converted.begin(), converted.end(), expected.begin());
  EXPECT_EQ(got, converted.end()) << "character " << got - converted.begin() << " of the text";
}

TEST_P(Mapping, UnicodeToBytes) {
  Wrong wrong;
  std::string text;
  std::vector<LXUChar> all(65536);
  std::vector<LXWChar> values(65536);
  Writer shifted{{Form::shifted, &page}};
  for (uint32_t unicode = 0; unicode < 65536; ++unicode) {
    auto character = static_cast<LXUChar>(unicode);
    all[unicode] = character;
    const std::string code = page.encode(character);
    char out[4] = {};
    int32_t count = LXCpUnicodeToChar(record, character, out);
    wrong.expect(count == static_cast<int32_t>(code.size()) && code == std::string_view(out, code.size()),
                 "LXCpUnicodeToChar", unicode);
    values[unicode] = packed(code);
    wrong.expect(LXCpUnicodeToCharW(record, character) == values[unicode], "LXCpUnicodeToCharW", unicode);
    text += code;
    shifted.add(shifted.piece_of_bytes(code));
  }
  if (shifted.inside) shifted.units.push_back(page.leave);

  std::string out(shifted.units.size() + text.size(), '\x5A');
  auto room = static_cast<int32_t>(out.size());
  int32_t count = LXUnicodeToString(locale.get(), out.data(), room, all.data(), 65536, 0);
  EXPECT_TRUE(out.substr(0, static_cast<size_t>(count)) == text) << "LXUnicodeToString";
  count = LXUnicodeToStringEx(locale.get(), out.data(), 0, room, all.data(), 65536, 0);
  EXPECT_TRUE(out.substr(0, static_cast<size_t>(count)) == bytes_of_units(shifted.units)) << "LXUnicodeToStringEx";
  std::vector<LXWChar> wide(65536);
  EXPECT_EQ(LXUnicodeToStringW(locale.get(), wide.data(), 65536, all.data(), 65536, 0), 65536);
  EXPECT_TRUE(wide == values) << "LXUnicodeToStringW";
}

std::string page_name(const testing::TestParamInfo<std::string>& info) {
  return std::filesystem::path(info.param).stem().string();
}

INSTANTIATE_TEST_SUITE_P(CodePages, Mapping, testing::ValuesIn(PageSource::all_files()), page_name);

// ---- Types, case and widths of multibyte characters
// -------------------------------------------------------------------

class Characters : public Mapping {
 protected:
  Characters() : object(LEXARO_DATA "/" + std::filesystem::path(GetParam()).stem().string() + ".nls") {}
  PageObject object;
};

TEST_P(Characters, TypesAndCase) {
  Wrong wrong;
  for (const std::string& code : page.long_codes()) {
    auto [flags, delta] = object.type(code);
    const LXWChar value = packed(code);
    char source[4] = {}, out[4] = {};
    code.copy(source, sizeof source);
    for (const LXCharType* type : {LXGetMbCtype(record, source), LXGetMbCtypeW(record, value)}) {
      wrong.expect(type->flags == flags && type->delta == delta, "type", value);
    }
    for (uint32_t mask : {LX_CT_LOWER, LX_CT_UPPER, LX_CT_LOWER | LX_CT_UPPER, LX_CT_DIGIT, 0u}) {
      const LXWChar partner = (flags & mask) == 0 ? value : value + static_cast<uint32_t>(delta);
      const std::string expected = (flags & mask) == 0 ? code : unpacked(partner);
      wrong.expect(LXCpMbCaseConvW(record, value, mask) == partner, "W case", value);
      if (!page.mixed()) {  // there the first byte does not tell the length
        LXCpMbCaseConv(record, source, out, mask);
        wrong.expect(expected == std::string_view(out, expected.size()), "case", value);
      }
      if (code.size() != page.max_length) continue;
      const bool right = LXCpMbCaseConvS(record, source, out, mask) == static_cast<int32_t>(expected.size()) &&
                         expected == std::string_view(out, expected.size());
      wrong.expect(right, "fixed-length case", value);
    }
  }
}

TEST_P(Characters, Widths) {
  Wrong wrong;
  std::vector<LXWChar> values = {0x100, 0xFFFF, 0x10000, 0xFFFFFF, 0xFFFFFFFF};
  for (unsigned byte = 0; byte < 256; ++byte) values.push_back(byte);
  for (const std::string& code : page.long_codes()) values.push_back(packed(code));
  size_t pairs = 0;
  for (LXWChar value : values) {
    wrong.expect(LXCpMbHalfToFullW(record, value) == object.full_width(value), "full width", value);
    wrong.expect(LXCpFullToHalfW(record, value) == object.half_width(value), "half width", value);
    pairs += object.half_width(value) != 0;
  }
  EXPECT_GT(pairs, 0u);
}

std::vector<std::string> multibyte_pages() {
  std::vector<std::string> files;
  for (const std::string& file : PageSource::all_files()) {
    if (PageSource(file).max_length > 1) files.push_back(file);
  }
  return files;
}

INSTANTIATE_TEST_SUITE_P(CodePages, Characters, testing::ValuesIn(multibyte_pages()), page_name);

// On single-byte pages no tables of multibyte characters are there to be read.
TEST(SingleBytePage, HasNoMultibyteTables) {
  Session session;
  Locale locale = locale_of("Latin1");
  LXObjEntry* record = LXGetLocaleObject(locale.get(), LX_CODEPAGE);
  for (unsigned first : {0x00u, 0x41u, 0x80u, 0xFFu}) {
    std::string text = bytes({first, 0x41, 0x41, 0x41});
    EXPECT_EQ(LXCpMbToUnicode(record, text.data()), 0xFFFD);
    EXPECT_EQ(LXGetMbCtype(record, text.data())->flags, 1024u);
    EXPECT_EQ(LXGetMbCtype(record, text.data())->delta, 0);
    EXPECT_EQ(LXCpMbHalfToFullW(record, first), 0u);
    EXPECT_EQ(LXCpFullToHalfW(record, first), 0u);
  }
}

}  // namespace
}  // namespace lx::test
