// SPDX-License-Identifier: Apache-2.0
// Every byte sequence and every UCS-2 value of every shipped code page, against its readable source; types, case and
// widths of every multibyte character, against the compiled object read by a second reader.
#include <filesystem>
#include <functional>
#include <sstream>

#include "support/page_object.hpp"
#include "support/page_source.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

// Says how many values are wrong and which came first, instead of one failure for each.
class Wrong {
 public:
  void expect(bool right, const std::function<std::string()>& what) {
    if (right) return;
    if (++count_ <= 5) first_ += "\n  " + what();
  }
  ~Wrong() { EXPECT_EQ(count_, 0u) << first_; }

 private:
  size_t count_ = 0;
  std::string first_;
};

std::string number(uint32_t value) {
  std::ostringstream text;
  text << std::hex << std::uppercase << value;
  return text.str();
}

std::string bytes(std::initializer_list<unsigned> values) {
  std::string text;
  for (unsigned value : values) text += static_cast<char>(value);
  return text;
}

// What begins with these bytes, with all trail bytes or with samples of them.
void add_sequences(std::vector<std::string>& all, const std::string& lead, size_t length, bool samples = false) {
  static constexpr unsigned kSamples[] = {0x00, 0x0A, 0x40, 0x7F, 0x80, 0xA1, 0xFE, 0xFF};
  if (lead.size() == length) {
    all.push_back(lead);
  } else if (samples) {
    for (unsigned byte : kSamples) add_sequences(all, lead + static_cast<char>(byte), length, true);
  } else {
    for (unsigned byte = 0; byte < 256; ++byte) add_sequences(all, lead + static_cast<char>(byte), length);
  }
}

// All sequences of two and three bytes that the first byte allows; of the four-byte ones those of the planes in use,
// and samples of the others.
std::vector<std::string> long_sequences(const PageSource& page) {
  std::vector<std::string> all;
  std::string plane_in_use;
  for (const std::string& code : page.long_codes()) {
    if (code.size() == 4) plane_in_use = code.substr(0, 2);
  }
  for (unsigned first = 0; first < 256; ++first) {
    std::string lead = bytes({first});
    size_t length = page.mixed() ? 2 : page.length_of(static_cast<uint8_t>(first));
    if (length == 2 || length == 3) add_sequences(all, lead, length);
    if (length != 4) continue;
    for (unsigned second = 0; second < 256; ++second) {
      std::string plane = lead + static_cast<char>(second);
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
  EXPECT_EQ(info.id, page.id);
  EXPECT_EQ(info.max_length, page.max_length);
  EXPECT_EQ(info.substitution, page.substitution);
  for (size_t i = 0; i < 4; ++i) EXPECT_EQ(info.line_bytes[i], page.line_ends[i]);
  EXPECT_EQ(info.ascii_family, page.ascii_family ? 1 : 0);
  EXPECT_EQ(info.shift_sensitive, page.mixed() ? 1 : 0);
  EXPECT_EQ(info.enter_byte, page.enter);
  EXPECT_EQ(info.leave_byte, page.leave);
  EXPECT_STREQ(LXGetObjName(record), page.name.c_str());
}

TEST_P(Mapping, SingleBytesToUnicode) {
  Wrong wrong;
  for (unsigned first = 0; first < 256; ++first) {
    std::string text = bytes({first});
    auto length = page.lengths[first];
    std::string longest = text + "\1\2\3";
    LXWChar expected = packed(std::string_view(longest).substr(0, length));
    wrong.expect(LXMbToW(record, longest.data()) == expected, [&] { return "LXMbToW " + number(first); });
    wrong.expect(LXMbToWS(record, longest.data(), 0) == first, [&] { return "LXMbToWS " + number(first); });
    if (page.length_of(static_cast<uint8_t>(first)) != 1) continue;
    LXUChar unicode = 0;
    int32_t count = LXStringToUnicode(locale.get(), &unicode, 1, text.data(), 1, 0);
    wrong.expect(count == 1 && unicode == page.decode(text), [&] { return hex(text) + " " + number(unicode); });
    count = LXCpStrToUnicode(record, &unicode, 1, text.data(), 1, 0);
    wrong.expect(count == 1 && unicode == page.decode(text), [&] { return hex(text) + " " + number(unicode); });
    LXWChar wide = first;
    count = LXStringToUnicodeW(locale.get(), &unicode, 1, &wide, 1, 0);
    wrong.expect(count == 1 && unicode == page.decode(text), [&] { return "W " + hex(text) + " " + number(unicode); });
  }
}

TEST_P(Mapping, LongSequencesToUnicode) {
  Wrong wrong;
  std::string text;
  std::vector<LXUChar> expected;
  for (const std::string& sequence : long_sequences(page)) {
    char whole[4] = {};
    sequence.copy(whole, sizeof whole);
    uint16_t unicode = page.decode(sequence);
    LXWChar value = packed(sequence);
    wrong.expect(LXCpMbToUnicode(record, whole) == unicode,
                 [&] { return hex(sequence) + " is not " + number(unicode); });
    bool zero_inside = sequence.find('\0') < sequence.size() - 1;
    if (!zero_inside) {
      wrong.expect(LXCpMbToUnicodeW(record, value) == unicode, [&] { return "W of " + hex(sequence); });
    }
    if (!page.mixed()) wrong.expect(LXMbToW(record, whole) == value, [&] { return "LXMbToW of " + hex(sequence); });
    if (sequence.size() == page.max_length) {
      wrong.expect(LXMbToWS(record, whole, 1) == value, [&] { return "LXMbToWS of " + hex(sequence); });
    }
    // Zero bytes before the last are not written.
    std::string written;
    for (char byte : sequence.substr(0, sequence.size() - 1)) {
      if (byte != 0) written += byte;
    }
    written += sequence.back();
    char out[4];
    bool right = LXWToMb(out, value) == written.size() && std::string_view(out, written.size()) == written;
    wrong.expect(right, [&] { return "LXWToMb of " + hex(sequence); });
    bool shift =
        page.mixed() && (sequence[0] == static_cast<char>(page.enter) || sequence[0] == static_cast<char>(page.leave));
    if (shift) continue;
    text += sequence;
    expected.push_back(unicode);
  }
  std::vector<LXUChar> converted(expected.size() + 1, 0xABCD);
  auto length = static_cast<int32_t>(text.size());
  auto room = static_cast<int32_t>(converted.size());
  int32_t count = page.mixed() ? LXStringToUnicodeEx(locale.get(), converted.data(), room, text.data(), 1, length, 0)
                               : LXStringToUnicode(locale.get(), converted.data(), room, text.data(), length, 0);
  ASSERT_EQ(static_cast<size_t>(count), expected.size());
  for (size_t i = 0; i < expected.size(); ++i) {
    wrong.expect(converted[i] == expected[i],
                 [&] { return "character " + std::to_string(i) + " of the text: " + number(converted[i]); });
  }
  wrong.expect(converted.back() == 0xABCD, [] { return std::string("written past the text"); });
}

TEST_P(Mapping, UnicodeToBytes) {
  Wrong wrong;
  std::string text;
  std::string shifted;
  bool inside = false;
  std::vector<LXUChar> all(65536);
  std::vector<LXWChar> values(65536);
  for (uint32_t unicode = 0; unicode < 65536; ++unicode) {
    auto character = static_cast<LXUChar>(unicode);
    all[unicode] = character;
    std::string code = page.encode(character);
    char out[4] = {};
    int32_t count = LXCpUnicodeToChar(record, character, out);
    bool right = count == static_cast<int32_t>(code.size()) && code == std::string_view(out, code.size());
    wrong.expect(right, [&] { return "U+" + number(unicode) + " is not " + hex(code); });
    values[unicode] = packed(code);
    wrong.expect(LXCpUnicodeToCharW(record, character) == values[unicode], [&] { return "W of U+" + number(unicode); });
    text += code;
    if (inside != (code.size() > 1)) shifted += static_cast<char>(inside ? page.leave : page.enter);
    inside = code.size() > 1;
    shifted += code;
  }
  if (inside) shifted += static_cast<char>(page.leave);

  std::string out(shifted.size() + text.size(), '\x5A');
  auto room = static_cast<int32_t>(out.size());
  int32_t count = LXUnicodeToString(locale.get(), out.data(), room, all.data(), 65536, 0);
  EXPECT_TRUE(out.substr(0, static_cast<size_t>(count)) == text) << "LXUnicodeToString";
  count = LXUnicodeToStringEx(locale.get(), out.data(), 0, room, all.data(), 65536, 0);
  EXPECT_TRUE(out.substr(0, static_cast<size_t>(count)) == (page.mixed() ? shifted : text)) << "LXUnicodeToStringEx";
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
    LXWChar value = packed(code);
    char source[4] = {};
    code.copy(source, sizeof source);
    const LXCharType* type = LXGetMbCtype(record, source);
    wrong.expect(type->flags == flags && type->delta == delta, [&] { return "type of " + hex(code); });
    type = LXGetMbCtypeW(record, value);
    wrong.expect(type->flags == flags && type->delta == delta, [&] { return "W type of " + hex(code); });
    for (uint32_t mask : {LX_CT_LOWER, LX_CT_UPPER, LX_CT_LOWER | LX_CT_UPPER, LX_CT_DIGIT, 0u}) {
      LXWChar partner = (flags & mask) == 0 ? value : value + static_cast<uint32_t>(delta);
      std::string expected = (flags & mask) == 0 ? code : unpacked(partner);
      wrong.expect(LXCpMbCaseConvW(record, value, mask) == partner, [&] { return "W case of " + hex(code); });
      char out[4] = {};
      if (!page.mixed()) {  // there the first byte does not tell the length
        LXCpMbCaseConv(record, source, out, mask);
        wrong.expect(expected == std::string_view(out, expected.size()), [&] { return "case of " + hex(code); });
      }
      if (code.size() != page.max_length) continue;
      bool right = LXCpMbCaseConvS(record, source, out, mask) == static_cast<int32_t>(expected.size()) &&
                   expected == std::string_view(out, expected.size());
      wrong.expect(right, [&] { return "fixed-length case of " + hex(code); });
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
    wrong.expect(LXCpMbHalfToFullW(record, value) == object.full_width(value), [&] { return "full " + number(value); });
    wrong.expect(LXCpFullToHalfW(record, value) == object.half_width(value), [&] { return "half " + number(value); });
    if (object.half_width(value) != 0) ++pairs;
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
