// SPDX-License-Identifier: Apache-2.0
// Objects with one bit flipped or their end cut off: refused with the right status, or loaded and then safe to use.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <optional>

#include "support/exercise.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

// The object that is spoilt, in a directory that serves the other parts of a locale.
class SpoiltObject {
 public:
  SpoiltObject(uint8_t type, Bytes file) : type_(type), file_(std::move(file)) {
    write_small_directory(directory_);
    std::vector<ObjectRecord> records = small_directory_records();
    auto place = records.begin();
    while (place != records.end() && place->type <= type) ++place;
    records.insert(place, {type, kId, "Subject"});
    directory_.write_control(records);
    directory_.write_object(type, kId, file_);
    descriptor_ = open(directory_.file(directory_.object_name(type, kId)).c_str(), O_RDWR | O_CLOEXEC);
    session_.emplace(directory_.path(), LX_INIT_NO_DEFAULTS);
    other_.reset(LXGetLocale("English_UnitedStates.Small@BINARY", 0, nullptr));
    uint32_t rc = 0;
    entry_ = LXGetObjFromID(LXGetObjManager(), type, kId, 1, &rc);
  }
  ~SpoiltObject() { close(descriptor_); }
  SpoiltObject(const SpoiltObject&) = delete;
  SpoiltObject& operator=(const SpoiltObject&) = delete;

  size_t size() const { return file_.size(); }

  // True: loaded, used, unloaded.
  bool flip(size_t byte, unsigned bit) {
    put(byte, file_[byte] ^ 1u << bit);
    bool loaded = use();
    put(byte, file_[byte]);
    return loaded;
  }
  bool cut(size_t size) {
    EXPECT_EQ(ftruncate(descriptor_, static_cast<off_t>(size)), 0);
    return use();
  }

 private:
  static constexpr uint16_t kId = 60000;

  // Only initialises without stand-ins.
  struct BareSession {
    BareSession(const char* directory, uint32_t options) { LXInit(directory, nullptr, nullptr, nullptr, options); }
    ~BareSession() { LXTerm(); }
  };

  void put(size_t at, unsigned value) {
    auto byte = static_cast<uint8_t>(value);
    EXPECT_EQ(pwrite(descriptor_, &byte, 1, static_cast<off_t>(at)), 1);
  }

  bool use() {
    uint32_t rc = 99;
    if (LXLoadObj(LXGetObjManager(), entry_, &rc) == nullptr) {
      EXPECT_TRUE(rc == LX_E_HEADER || rc == LX_E_FILE) << rc;
      return false;
    }
    EXPECT_STREQ(use_loaded(), nullptr);
    EXPECT_EQ(LXUnloadObj(LXGetObjManager(), entry_), LX_OK);
    return true;
  }

  const char* use_loaded() {
    static const char* const kNames[] = {"Subject_UnitedStates.US-ASCII@BINARY", "English_Subject.Small@BINARY",
                                         "English_Germany.Subject@BINARY"};
    uint32_t rc = 99;
    Locale locale(LXGetLocale(kNames[type_], 0, &rc));
    if (locale == nullptr || LXLocaleSetModifiable(locale.get()) != LX_OK) return "LXGetLocale";
    if (type_ == LX_LANGUAGE) return exercise_language(entry_);
    if (type_ == LX_TERRITORY) return nullptr;
    const char* wrong = exercise_page(entry_);
    return wrong != nullptr ? wrong : exercise_conversions(locale.get(), other_.get());
  }

  uint8_t type_;
  Bytes file_;
  DataDirectory directory_;
  int descriptor_;
  std::optional<BareSession> session_;
  Locale other_;
  LXObjEntry* entry_ = nullptr;
};

// Bytes of a file that are flipped: all, or in places where every value is as good as another only some.
struct Range {
  size_t begin, end, stride;
};

void flip_all(uint8_t type, const Bytes& file, const std::vector<Range>& ranges) {
  SpoiltObject object(type, file);
  size_t loaded = 0;
  size_t refused = 0;
  for (const Range& range : ranges) {
    for (size_t byte = range.begin; byte < std::min(range.end, object.size()); byte += range.stride) {
      for (unsigned bit = 0; bit < 8; ++bit) {
        // Long stretches of plain values are covered by a bit a byte.
        if (range.stride > 1 && bit != (byte / range.stride) % 8) continue;
        ++(object.flip(byte, bit) ? loaded : refused);
        ASSERT_FALSE(testing::Test::HasFailure()) << "byte " << byte << ", bit " << bit;
      }
    }
  }
  EXPECT_GT(loaded, 0u);
  EXPECT_GT(refused, 0u);
}

void cut_all(uint8_t type, const Bytes& file, size_t stride) {
  SpoiltObject object(type, file);
  EXPECT_TRUE(object.cut(file.size()));
  for (size_t size = file.size() - 1;; size -= std::min(size, stride)) {
    ASSERT_FALSE(object.cut(size)) << size;
    if (size == 0) break;
  }
}

// In a file of a code page: the header and what precedes the tables of bytes; the tables of bytes, where only lengths
// matter; the pages from Unicode; all else. Single steps where the check has something to decide.
std::vector<Range> page_ranges(const Bytes& file, bool older_layout) {
  size_t start = 76 + (older_layout ? 8 : 10);
  size_t cases = start + 256;
  size_t pages = 76 + (older_layout ? 2312 : 2316);
  size_t flags = pages + 2048;
  return {{0, start, 1},
          {start, start + 0x80, 16},
          {start + 0x80, start + 0x90, 1},
          {start + 0x90, cases, 16},
          {cases, pages, 31},
          {pages, pages + 8, 1},
          {pages + 8, flags, 37},
          {pages + 8 * 0x30, pages + 8 * 0x32, 1},
          {pages + 8 * 0x4E, pages + 8 * 0x4F, 1},
          {pages + 8 * 0x50, pages + 8 * 0x51, 1},
          {flags, flags + 12, 1},
          {flags + 12, flags + 12 + 1024, 61},
          {flags + 12 + 1024, file.size(), 1}};
}

Bytes special_language() {
  return language_file({1, 367, 0, {{'a', 0, 'b', 'c'}, {'d', 0, 'e', 0}}, {{'f', 0, 'g', 0}}});
}

TEST(Corruption, Language) {
  flip_all(LX_LANGUAGE, special_language(), {{0, 1000, 1}});
  cut_all(LX_LANGUAGE, special_language(), 1);
}

TEST(Corruption, Territory) {
  flip_all(LX_TERRITORY, territory_file(), {{0, 1000, 1}});
  cut_all(LX_TERRITORY, territory_file(), 1);
}

TEST(Corruption, SingleBytePage) {
  Bytes file = single_byte_page_file();
  flip_all(LX_CODEPAGE, file, page_ranges(file, false));
  cut_all(LX_CODEPAGE, file, 7);
}

TEST(Corruption, MultibytePage) {
  Bytes file = multibyte_page_file();
  flip_all(LX_CODEPAGE, file, page_ranges(file, false));
  cut_all(LX_CODEPAGE, file, 7);
}

TEST(Corruption, MixedPage) {
  Bytes file = mixed_page_file();
  flip_all(LX_CODEPAGE, file, page_ranges(file, false));
  cut_all(LX_CODEPAGE, file, 7);
}

TEST(Corruption, PagesOfTheOlderLayout) {
  for (const Bytes& file : {multibyte_page_file(true), single_byte_page_file(true)}) {
    flip_all(LX_CODEPAGE, file, page_ranges(file, true));
    cut_all(LX_CODEPAGE, file, 7);
  }
}

// ---- The control file
// -------------------------------------------------------------------------------------------------

class SpoiltControlFile {
 public:
  SpoiltControlFile() : file_(control_file(records())), session_("/does/not/exist") {
    write_small_directory(directory_);
    directory_.write("control.nls", file_);
    descriptor_ = open(directory_.file("control.nls").c_str(), O_RDWR | O_CLOEXEC);
  }
  ~SpoiltControlFile() { close(descriptor_); }
  SpoiltControlFile(const SpoiltControlFile&) = delete;
  SpoiltControlFile& operator=(const SpoiltControlFile&) = delete;

  size_t size() const { return file_.size(); }
  void flip(size_t byte, unsigned bit) {
    put(byte, file_[byte] ^ 1u << bit);
    use();
    put(byte, file_[byte]);
  }
  uint32_t cut(size_t size) {
    EXPECT_EQ(ftruncate(descriptor_, static_cast<off_t>(size)), 0);
    return use();
  }

 private:
  static std::vector<ObjectRecord> records() {
    return {{LX_LANGUAGE, 1, "English"},    {LX_TERRITORY, 1, "UnitedStates"}, {LX_TERRITORY, 2, "Germany"},
            {LX_CODEPAGE, 367, "US-ASCII"}, {LX_CODEPAGE, 900, "Small"},       {LX_SORT, 3, "Sort"}};
  }
  void put(size_t at, unsigned value) {
    auto byte = static_cast<uint8_t>(value);
    EXPECT_EQ(pwrite(descriptor_, &byte, 1, static_cast<off_t>(at)), 1);
  }
  uint32_t use() {
    uint32_t rc = 99;
    LXObjMgr* manager = LXInitObjManager(directory_.path(), LX_INIT_NO_DEFAULTS, &rc);
    EXPECT_TRUE(rc == LX_OK || rc == LX_E_HEADER || rc == LX_E_FILE) << rc;
    for (uint8_t type = 0; type < 5; ++type) {
      uint32_t ignored = 0;
      for (const ObjectRecord& record : records()) {
        LXGetObjFromName(manager, type, record.name.c_str(), -1, 0, &ignored);
        LXGetObjFromID(manager, type, record.id, 0, &ignored);
      }
    }
    EXPECT_EQ(LXTermObjManager(manager), LX_OK);
    return rc;
  }

  DataDirectory directory_;
  Bytes file_;
  Session session_;
  int descriptor_;
};

TEST(Corruption, ControlFile) {
  SpoiltControlFile file;
  for (size_t byte = 0; byte < file.size(); ++byte) {
    for (unsigned bit = 0; bit < 8; ++bit) file.flip(byte, bit);
    ASSERT_FALSE(HasFailure()) << "byte " << byte;
  }
  EXPECT_EQ(file.cut(file.size()), LX_OK);
  for (size_t size = file.size(); size-- > 0;) ASSERT_EQ(file.cut(size), LX_E_FILE) << size;
}

}  // namespace
}  // namespace lx::test
