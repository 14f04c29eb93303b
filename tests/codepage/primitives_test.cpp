// SPDX-License-Identifier: Apache-2.0
// The primitives where they do what one would not expect, on shipped pages, on pages of the older layout, and on
// pages with a changed byte.
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "support/page_object.hpp"
#include "support/page_source.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;

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

TEST_F(Primitives, ZeroMiddleBytesAreNotUnpacked) {
  struct {
    LXWChar packed;
    const char* bytes;
  } cases[] = {
      {0x00000000, "00"},       {0x00000041, "41"},   {0x00004100, "4100"},   {0x00410041, "4141"},
      {0x00410000, "4100"},     {0x41000041, "4141"}, {0x41004100, "414100"}, {0x41410000, "414100"},
      {0x8EA2A1A1, "8EA2A1A1"}, {0xFF000000, "FF00"}, {0x00FFFFFF, "FFFFFF"}, {0x01000000, "0100"},
  };
  for (const auto& c : cases) {
    Guarded out(std::strlen(c.bytes) / 2);
    EXPECT_EQ(LXWToMb(out.data(), c.packed), out.size()) << c.bytes;
    EXPECT_EQ(hex(out.view()), c.bytes);
  }
}

TEST_F(Primitives, Utf8IsDecodedByRuleAlone) {
  const LXObjEntry* utf8 = page("UTF-8");
  struct {
    std::string bytes;
    int32_t unicode;
  } cases[] = {
      {"\x41\x42", 0x42},               // no one-byte case
      {std::string("\x00\x00", 2), 0},  // whatever the lead byte
      {"\xC0\xAF", 0x2F},               // overlong
      {"\x80\x80", 0},
      {"\xDF\x41", 0x7C1},  // continuation bytes are not looked at
      {"\xE0\x41\x42", 0x42},
      {"\xED\xA0\x80", 0xD800},
      {"\xEF\xBF\xBF", 0xFFFF},
      {"\xF1\x80\x80", 0x1000},  // from E0 on three bytes
      {"\xFF\xBF\xBF", 0xFFFF},
  };
  for (const auto& c : cases) {
    Guarded bytes{std::string_view(c.bytes)};
    EXPECT_EQ(LXCpMbToUnicode(utf8, bytes.data()), c.unicode) << hex(c.bytes);
  }
  EXPECT_EQ(LXCpMbToUnicodeW(utf8, 0x41), 0x40);  // 41 and the zero behind it
  EXPECT_EQ(LXCpUnicodeToCharW(utf8, 0x7F), 0x7Fu);
  EXPECT_EQ(LXCpUnicodeToCharW(utf8, 0x80), 0xC280u);
  EXPECT_EQ(LXCpUnicodeToCharW(utf8, 0x7FF), 0xDFBFu);
  EXPECT_EQ(LXCpUnicodeToCharW(utf8, 0x800), 0xE0A080u);
  EXPECT_EQ(LXCpUnicodeToCharW(utf8, 0xD800), 0xEDA080u);
}

TEST_F(Primitives, ByteThatBeginsNothingPacksToNothing) {
  const LXObjEntry* utf8 = page("UTF-8");
  for (char first : {'\x80', '\xBF', '\xC0', '\xF0', '\xFF'}) {
    Guarded byte{std::string_view(&first, 1)};
    EXPECT_EQ(LXMbToW(utf8, byte.data()), 0u);
    EXPECT_EQ(LXMbToWS(utf8, byte.data(), 0), static_cast<uint8_t>(first));
    // A walk over text takes it for a character of its own value.
    Locale locale = locale_of("UTF-8");
    LXWChar wide = 0;
    EXPECT_EQ(LXMbToWide(locale.get(), &wide, 1, byte.data(), 1, 0), 1);
    EXPECT_EQ(wide, static_cast<uint8_t>(first));
  }
}

TEST_F(Primitives, CharactersThatAPageLacks) {
  for (auto [name, substitution] :
       {std::pair("US-ASCII", 0x1A), {"IBM037", 0x3F}, {"IBM930", 0x3F}, {"EUC-TW", 0x1A}}) {
    const LXObjEntry* record = page(name);
    Guarded out(1);
    EXPECT_EQ(LXCpUnicodeToChar(record, 0xFFFD, out.data()), 1) << name;
    EXPECT_EQ(static_cast<uint8_t>(out.data()[0]), substitution) << name;
    EXPECT_EQ(LXCpUnicodeToCharW(record, 0xFFFD), static_cast<LXWChar>(substitution)) << name;
  }
}

// ---- Changed objects
// ----------------------------------------------------------------------------------------------------

// A data directory of its own, gone with the object.
class DataDirectory {
 public:
  DataDirectory() : path_(fs::path(testing::TempDir()) / ("lexaro-primitives-" + std::to_string(getpid()))) {
    fs::remove_all(path_);
    fs::create_directories(path_);
  }
  ~DataDirectory() { fs::remove_all(path_); }
  DataDirectory(const DataDirectory&) = delete;
  DataDirectory& operator=(const DataDirectory&) = delete;

  const fs::path& path() const { return path_; }

 private:
  fs::path path_;
};

// A manager beside that of the library.
class Manager {
 public:
  explicit Manager(const fs::path& directory) : manager_(LXInitObjManager(directory.c_str(), 0, nullptr)) {}
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

std::string file_text(const fs::path& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

uint32_t number(std::string_view bytes, size_t at, size_t size) { return packed(bytes.substr(at, size)); }

// JapanEUC with some bytes of section 1 changed.
class ChangedPage {
 public:
  ChangedPage() : file_(file_text(LEXARO_DATA "/cp_00954.nls")), section_(number(file_, 12, 4)) {}
  uint32_t get(size_t offset, size_t size) const { return number(file_, section_ + offset, size); }
  void set(size_t offset, size_t size, uint32_t value) {
    for (size_t i = 0; i < size; ++i) {
      file_[section_ + offset + i] = static_cast<char>(value >> 8 * (size - 1 - i));
    }
  }
  void save(const fs::path& directory) const {
    std::ofstream(directory / "cp_00954.nls", std::ios::binary) << file_;
    fs::copy_file(LEXARO_DATA "/control.nls", directory / "control.nls", fs::copy_options::overwrite_existing);
  }

 private:
  std::string file_;
  size_t section_;
};

constexpr size_t kPairCount = 6;
constexpr size_t kPages = 2316;
constexpr size_t kFullWidthOffset = 4366;
constexpr size_t kPairsOffset = 4368;

TEST_F(Primitives, UnknownPageKindGivesAZeroByte) {
  DataDirectory directory;
  ChangedPage changed;
  changed.set(kPages + 8 * 0x30, 1, 5);
  changed.save(directory.path());
  Manager manager(directory.path());
  const LXObjEntry* record = manager.page(954);
  Guarded out(1);
  EXPECT_EQ(LXCpUnicodeToChar(record, 0x3042, out.data()), 1);
  EXPECT_EQ(out.data()[0], 0);
  EXPECT_EQ(LXCpUnicodeToCharW(record, 0x3042), 0u);
  EXPECT_EQ(LXCpUnicodeToCharW(record, 0x4E9C), 0xB0A1u);  // other pages are as before
}

TEST_F(Primitives, OnePairIsCompared) {
  DataDirectory directory;
  ChangedPage changed;
  size_t pairs = changed.get(kPairsOffset, 2);
  ASSERT_GT(changed.get(kPairCount, 2), 1u);
  LXWChar first = changed.get(pairs, 4);
  LXWChar second = changed.get(pairs + 8, 4);
  LXWChar full = changed.get(pairs + 4, 4);
  changed.set(kPairCount, 2, 1);
  changed.save(directory.path());
  Manager manager(directory.path());
  const LXObjEntry* record = manager.page(954);
  EXPECT_EQ(LXCpMbHalfToFullW(record, first), full);
  EXPECT_EQ(LXCpMbHalfToFullW(record, second), 0u);
  EXPECT_EQ(LXCpMbHalfToFullW(record, first - 1), 0u);
}

TEST_F(Primitives, SingleByteHalfWins) {
  DataDirectory directory;
  ChangedPage changed;
  size_t pairs = changed.get(kPairsOffset, 2);
  LXWChar full = changed.get(pairs + 4, 4);
  LXWChar half = changed.get(pairs, 4);
  EXPECT_EQ(LXCpFullToHalfW(page("JapanEUC"), full), half);
  changed.set(changed.get(kFullWidthOffset, 2) + 4u * 'Q', 4, full);
  changed.set(changed.get(kFullWidthOffset, 2) + 4u * 'R', 4, full);
  changed.save(directory.path());
  Manager manager(directory.path());
  EXPECT_EQ(LXCpFullToHalfW(manager.page(954), full), LXWChar{'Q'});
}

// ---- The older layout
// ---------------------------------------------------------------------------------------------------

class OlderLayout : public Primitives {
 protected:
  void SetUp() override {
    std::string command = LEXAROC_PATH " data --layout=1 --only 37,367,970 '" LEXARO_SOURCE_DATA "' '";
    ASSERT_EQ(std::system((command + directory.path().string() + "'").c_str()), 0);
  }
  std::string section(uint16_t id, unsigned which) const {
    std::string name = "cp_00" + std::string(id < 100 ? "0" : "") + std::to_string(id) + ".nls";
    PageObject object((directory.path() / name).string());
    EXPECT_EQ(object.version(), 1u);
    return object.section(which);
  }

  DataDirectory directory;
};

TEST_F(OlderLayout, BehavesAsTheCurrentOne) {
  Manager manager(directory.path());
  for (uint16_t id : {uint16_t{37}, uint16_t{367}, uint16_t{970}}) {
    const PageSource& source = PageSource::of(id);
    const LXObjEntry* older = manager.page(id);
    const LXObjEntry* current = page(source.name.c_str());
    LXCodePageInfo older_info = {};
    LXCodePageInfo info = {};
    EXPECT_EQ(LXGetCodePageInfo(older, &older_info), LX_OK);
    EXPECT_EQ(LXGetCodePageInfo(current, &info), LX_OK);
    EXPECT_EQ(std::memcmp(&older_info, &info, sizeof info), 0) << source.name;
    size_t wrong = 0;
    for (uint32_t c = 0; c < 65536; ++c) {
      auto unicode = static_cast<LXUChar>(c);
      wrong += LXCpUnicodeToCharW(older, unicode) != packed(source.encode(unicode));
    }
    for (unsigned first = 0; first < 256; ++first) {
      auto byte = static_cast<char>(first);
      if (source.length_of(static_cast<uint8_t>(first)) != 1) continue;
      LXUChar unicode = 0;
      wrong += LXCpStrToUnicode(older, &unicode, 1, &byte, 1, 0) != 1 || unicode != source.decode({&byte, 1});
      wrong += LXCpFullToHalfW(older, first) != LXCpFullToHalfW(current, first);
      wrong += LXCpMbHalfToFullW(older, first) != LXCpMbHalfToFullW(current, first);
    }
    for (const std::string& code : source.long_codes()) {
      LXWChar value = packed(code);
      wrong += LXCpMbToUnicode(older, code.data()) != source.decode(code);
      wrong += LXCpMbToUnicodeW(older, value) != source.decode(code);
      wrong += LXMbToW(older, code.data()) != value;
      wrong += LXGetMbCtypeW(older, value)->flags != LXGetMbCtypeW(current, value)->flags;
      wrong += LXCpMbCaseConvW(older, value, LX_CT_LOWER) != LXCpMbCaseConvW(current, value, LX_CT_LOWER);
      wrong += LXCpFullToHalfW(older, value) != LXCpFullToHalfW(current, value);
      wrong += LXCpMbHalfToFullW(older, value) != LXCpMbHalfToFullW(current, value);
    }
    EXPECT_EQ(wrong, 0u) << source.name;
  }
}

// It has no bounds: every second byte reaches a value, by its low bits.
TEST_F(OlderLayout, HasNoBounds) {
  Manager manager(directory.path());
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

struct Moved {
  size_t from;
  size_t to;
  size_t size;
};
constexpr Moved kFixedPart[] = {{0, 0, 8},          {8, 10, 256},       {264, 266, 512}, {776, 778, 512},
                                {1288, 1292, 1024}, {2312, 2316, 2048}, {4360, 4364, 2}};

// Tables hang off the fixed part here; it has grown by four bytes.
constexpr size_t kNewStart = 4376;

void expect_fixed_part(std::string_view older, std::string_view current) {
  for (const Moved& part : kFixedPart) {
    EXPECT_EQ(older.substr(part.from, part.size), current.substr(part.to, part.size)) << part.to;
  }
  EXPECT_EQ(hex(current.substr(8, 2)), "0000");
  EXPECT_EQ(hex(current.substr(1290, 2)), "0000");
}

TEST_F(OlderLayout, SingleByteSection) {
  Guarded section1{std::string_view(section(37, 1))};
  uint8_t* section2 = section1.as<uint8_t>();
  uint8_t* made = LXCpV1toV2(section1.as<uint8_t>(), static_cast<uint16_t>(section1.size()), nullptr, 0, &section2);
  ASSERT_NE(made, nullptr);
  EXPECT_EQ(section2, nullptr);
  std::string_view current(reinterpret_cast<char*>(made), kNewStart);
  expect_fixed_part(section1.view(), current);
  EXPECT_EQ(hex(current.substr(4366, 10)), std::string(20, '0'));
  lxfree_cbk(nullptr, made);
}

TEST_F(OlderLayout, MultibyteSections) {
  Guarded section1{std::string_view(section(970, 1))};
  Guarded section2{std::string_view(section(970, 2))};
  uint8_t* made2 = nullptr;
  uint8_t* made1 = LXCpV1toV2(section1.as<uint8_t>(), static_cast<uint16_t>(section1.size()), section2.as<uint8_t>(),
                              static_cast<uint16_t>(section2.size()), &made2);
  ASSERT_NE(made1, nullptr);
  ASSERT_NE(made2, nullptr);
  size_t old_start = number(section1.view(), 4362, 2);
  size_t variable = section1.size() - old_start;
  std::string_view current1(reinterpret_cast<char*>(made1), kNewStart + variable);
  expect_fixed_part(section1.view(), current1);
  EXPECT_EQ(section1.view().substr(old_start), current1.substr(kNewStart));
  for (size_t i = 0; i < 4; ++i) {
    EXPECT_EQ(number(current1, 4366 + 2 * i, 2), number(section1.view(), 4362 + 2 * i, 2) + kNewStart - old_start) << i;
  }
  size_t old_array = number(section1.view(), 4370, 2);
  size_t new_array = (old_array / 4 * 6 + 3) / 4 * 4;
  EXPECT_EQ(number(current1, 4374, 2), new_array);
  std::string_view current2(reinterpret_cast<char*>(made2), new_array + section2.size() - old_array);
  EXPECT_EQ(current2.substr(new_array), section2.view().substr(old_array));
  for (size_t i = 0; i < old_array / 4; ++i) {
    std::string older(section2.view().substr(4 * i, 4));
    EXPECT_EQ(hex(current2.substr(6 * i, 6)), hex(older.substr(0, 2)) + "00FF" + hex(older.substr(2)));
  }
  lxfree_cbk(nullptr, made2);

  // Without a section 2 none is made.
  lxfree_cbk(nullptr, made1);
  made1 = LXCpV1toV2(section1.as<uint8_t>(), static_cast<uint16_t>(section1.size()), nullptr, 0, &made2);
  EXPECT_EQ(made2, nullptr);
  EXPECT_EQ(number({reinterpret_cast<char*>(made1), kNewStart}, 4374, 2), 0u);
  lxfree_cbk(nullptr, made1);
}

// Memory that ends after so many blocks.
struct Purse {
  int left = 1000000;
  int taken = 0;
};
void* take(void* context, size_t size) {
  auto& purse = *static_cast<Purse*>(context);
  if (purse.left == 0) return nullptr;
  --purse.left;
  ++purse.taken;
  return std::malloc(size);
}
int give_back(void* context, void* block) {
  --static_cast<Purse*>(context)->taken;
  std::free(block);
  return 1;
}

TEST(OlderLayoutWithoutMemory, LeavesNothingBehind) {
  DataDirectory directory;
  std::string command = LEXAROC_PATH " data --layout=1 --only 970 '" LEXARO_SOURCE_DATA "' '";
  ASSERT_EQ(std::system((command + directory.path().string() + "'").c_str()), 0);
  PageObject object((directory.path() / "cp_00970.nls").string());
  Purse purse;
  ASSERT_LE(LXInit(LEXARO_DATA, take, give_back, &purse, 0), LX_E_DEFAULTS);
  int before = purse.taken;
  for (int blocks : {0, 1}) {
    purse.left = blocks;
    uint8_t* section2 = nullptr;
    EXPECT_EQ(LXCpV1toV2(reinterpret_cast<const uint8_t*>(object.section(1).data()),
                         static_cast<uint16_t>(object.section(1).size()),
                         reinterpret_cast<const uint8_t*>(object.section(2).data()),
                         static_cast<uint16_t>(object.section(2).size()), &section2),
              nullptr);
    EXPECT_EQ(section2, nullptr);
    EXPECT_EQ(purse.taken, before);
  }
  purse.left = 1000000;
  LXTerm();
  EXPECT_EQ(purse.taken, 0);
}

}  // namespace
}  // namespace lx::test
