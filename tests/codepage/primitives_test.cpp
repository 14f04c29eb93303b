// SPDX-License-Identifier: Apache-2.0
// The primitives where they do what one would not expect: in UTF-8, on a page with changed bytes, and on pages of the
// older layout.
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>

#include "support/object_builder.hpp"
#include "support/page_source.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

class Primitives : public testing::Test {
 protected:
  const LXObjEntry* page(const char* name) {
    locales_.push_back(locale_of(name));
    return LXGetLocaleObject(locales_.back().get(), LX_CODEPAGE);
  }

 private:
  Session session_;
  std::vector<Locale> locales_;
};

TEST_F(Primitives, Utf8IsDecodedByRuleAlone) {
  const LXObjEntry* utf8 = page("UTF-8");
  const std::pair<std::string_view, int32_t> cases[] = {
      {"\x41\x42", 0x42},                    // no one-byte case
      {std::string_view("\x00\x00", 2), 0},  // whatever the lead byte
      {"\xC0\xAF", 0x2F},                    // overlong
      {"\xDF\x41", 0x7C1},                   // continuation bytes are not looked at
      {"\xED\xA0\x80", 0xD800},
      {"\xF1\x80\x80", 0x1000},  // from E0 on three bytes
      {"\xFF\xBF\xBF", 0xFFFF},
  };
  for (const auto& [text, unicode] : cases) {
    Guarded bytes(text);
    EXPECT_EQ(LXCpMbToUnicode(utf8, bytes.data()), unicode) << hex(text);
  }
  EXPECT_EQ(LXCpMbToUnicodeW(utf8, 0x41), 0x40);  // 41 and the zero behind it
}

// A manager of that directory, beside that of the library.
class Manager {
 public:
  explicit Manager(const DataDirectory& directory) : manager_(LXInitObjManager(directory.path(), 0, nullptr)) {}
  ~Manager() { LXTermObjManager(manager_); }
  Manager(const Manager&) = delete;
  Manager& operator=(const Manager&) = delete;

  const LXObjEntry* page(uint16_t id) {
    uint32_t rc = LX_OK;
    const LXObjEntry* entry = LXGetObjFromID(manager_, LX_CODEPAGE, id, 0, &rc);
    EXPECT_EQ(rc, LX_OK) << id;
    return entry;
  }

 private:
  LXObjMgr* manager_;
};

std::string file_text(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

constexpr size_t kPairCount = 6;
constexpr size_t kPages = 2316;
constexpr size_t kFullWidthOffset = 4366;
constexpr size_t kPairsOffset = 4368;

// JapanEUC with an unknown kind of page for U+30xx, a single pair of widths, and bytes that have its full-width form.
TEST_F(Primitives, ChangedTables) {
  std::string file = file_text(LEXARO_DATA "/cp_00954.nls");
  auto get = [&](size_t at, size_t size) { return packed(std::string_view(file).substr(at, size)); };
  size_t section = get(12, 4);
  size_t pairs = section + get(section + kPairsOffset, 2);
  LXWChar first = get(pairs, 4);
  LXWChar full = get(pairs + 4, 4);
  LXWChar second = get(pairs + 8, 4);
  ASSERT_GT(get(section + kPairCount, 2), 1u);
  EXPECT_EQ(LXCpFullToHalfW(page("JapanEUC"), full), first);
  file[section + kPages + 8 * 0x30] = 5;
  file.replace(section + kPairCount, 2, std::string("\0\1", 2));
  for (char half : {'Q', 'R'}) {
    file.replace(section + get(section + kFullWidthOffset, 2) + 4u * static_cast<uint8_t>(half), 4,
                 std::string(2, '\0') + unpacked(full));
  }
  DataDirectory directory;
  directory.write("cp_00954.nls", std::string_view(file));
  directory.write("control.nls", std::string_view(file_text(LEXARO_DATA "/control.nls")));
  Manager manager(directory);
  const LXObjEntry* record = manager.page(954);

  Guarded out(1);
  EXPECT_EQ(LXCpUnicodeToChar(record, 0x3042, out.data()), 1);
  EXPECT_EQ(out.data()[0], 0);
  EXPECT_EQ(LXCpUnicodeToCharW(record, 0x3042), 0u);
  EXPECT_EQ(LXCpUnicodeToCharW(record, 0x4E9C), 0xB0A1u);  // other pages are as before
  EXPECT_EQ(LXCpMbHalfToFullW(record, first), full);       // one pair is compared too
  EXPECT_EQ(LXCpMbHalfToFullW(record, second), 0u);
  EXPECT_EQ(LXCpMbHalfToFullW(record, first - 1), 0u);
  EXPECT_EQ(LXCpFullToHalfW(record, full), LXWChar{'Q'});  // the first single byte wins
}

// The minus sign and the wave dash are full-width forms on pages that read them so; what only looks alike is none.
TEST_F(Primitives, FullWidthFormsOfTwoReadings) {
  const struct {
    const char* name;
    LXWChar full, half;
  } cases[] = {{"IBM930", 0x4260, 0x60}, {"IBM930", 0x43A1, 0xA0}, {"IBM939", 0x4260, 0x60}, {"IBM939", 0x43A1, 0xA1},
               {"MS932", 0x817C, '-'},   {"IBM933", 0x43A1, 0},    {"MS950", 0xA1A8, 0}};
  for (const auto& c : cases) EXPECT_EQ(LXCpFullToHalfW(page(c.name), c.full), c.half) << c.name << std::hex << c.full;
}

class OlderLayout : public Primitives {
 protected:
  void SetUp() override {
    std::string command = LEXAROC_PATH " data --layout=1 --only 970 '" LEXARO_SOURCE_DATA "' '";
    ASSERT_EQ(std::system((command + directory.path() + "'").c_str()), 0);
  }

  DataDirectory directory;
};

// It has no bounds: every second byte reaches a value, by its low bits.
TEST_F(OlderLayout, HasNoBounds) {
  Manager manager(directory);
  const LXObjEntry* older = manager.page(970);
  const LXObjEntry* current = page("EUC-KR");
  EXPECT_EQ(LXCpMbToUnicode(current, "\xB0\xA1"), 0xAC00);
  EXPECT_EQ(LXCpMbToUnicode(older, "\xB0\xA1"), 0xAC00);
  EXPECT_EQ(LXCpMbToUnicode(current, "\xB0\x21"), 0xFFFD);
  EXPECT_EQ(LXCpMbToUnicode(older, "\xB0\x21"), 0xAC00);
  for (uint32_t pair = 0; pair < 65536; ++pair) {  // none leaves the tables
    char bytes[4] = {static_cast<char>(pair >> 8), static_cast<char>(pair)};
    LXCpMbToUnicode(older, bytes);
    LXGetMbCtype(older, bytes);
  }
}

// Sections of one's own, at the edge of memory: without a section 2 none is made.
TEST_F(OlderLayout, WithoutASecondSection) {
  const std::string file = file_text(directory.file("cp_00970.nls"));
  const std::string_view bytes(file);
  Guarded section1(bytes.substr(packed(bytes.substr(12, 4)), packed(bytes.substr(10, 2))));
  uint8_t* section2 = section1.as<uint8_t>();
  uint8_t* made = LXCpV1toV2(section1.as<uint8_t>(), static_cast<uint16_t>(section1.size()), nullptr, 0, &section2);
  ASSERT_NE(made, nullptr);
  EXPECT_EQ(section2, nullptr);
  EXPECT_EQ(hex({reinterpret_cast<char*>(made) + 4374, 2}), "0000") << "no table to Unicode";
  LXUnloadFile(made);
}

}  // namespace
}  // namespace lx::test
