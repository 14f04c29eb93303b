// SPDX-License-Identifier: Apache-2.0
// Objects with one bit flipped or their end cut off: refused with the right status, or loaded and then safe to use.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "support/exercise.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kId = 60000;

// An object whose file is changed, in a directory that serves the other parts of a locale. What loads is used and
// unloaded.
class SpoiltObject {
 public:
  SpoiltObject(uint8_t type, const Bytes& file) : type_(type), file_(file) {
    write_small_directory(directory_);
    std::vector<ObjectRecord> records = small_directory_records();
    auto place = records.begin();
    while (place != records.end() && place->type <= type) ++place;
    records.insert(place, {type, kId, "Subject"});
    directory_.write_control(records);
    directory_.write_object(type, kId, file_);
    descriptor_ = open(directory_.file(directory_.object_name(type, kId)).c_str(), O_RDWR | O_CLOEXEC);
    LXInit(directory_.path(), nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS);
    other_.reset(LXGetLocale("English_UnitedStates.Small@BINARY", 0, nullptr));
    entry_ = LXGetObjFromID(LXGetObjManager(), type, kId, 1, nullptr);
  }
  ~SpoiltObject() {
    other_.reset();
    LXTerm();
    close(descriptor_);
  }
  SpoiltObject(const SpoiltObject&) = delete;
  SpoiltObject& operator=(const SpoiltObject&) = delete;

  size_t size() const { return file_.size(); }
  uint32_t flip(size_t byte, unsigned bit) {
    put(byte, file_[byte] ^ 1u << bit);
    const uint32_t status = use();
    put(byte, file_[byte]);
    return status;
  }
  uint32_t cut(size_t size) {
    EXPECT_EQ(ftruncate(descriptor_, static_cast<off_t>(size)), 0);
    return use();
  }

 private:
  void put(size_t at, unsigned value) {
    auto byte = static_cast<uint8_t>(value);
    EXPECT_EQ(pwrite(descriptor_, &byte, 1, static_cast<off_t>(at)), 1);
  }

  uint32_t use() {
    uint32_t rc = 99;
    if (LXLoadObj(LXGetObjManager(), entry_, &rc) == nullptr) {
      EXPECT_TRUE(rc == LX_E_HEADER || rc == LX_E_FILE) << rc;
      return rc;
    }
    EXPECT_STREQ(use_loaded(), nullptr);
    EXPECT_EQ(LXUnloadObj(LXGetObjManager(), entry_), LX_OK);
    return rc;
  }

  const char* use_loaded() {
    static const char* const kNames[] = {"Subject_UnitedStates.US-ASCII@BINARY", "English_Subject.Small@BINARY",
                                         "English_Germany.Subject@BINARY"};
    Locale locale(LXGetLocale(kNames[type_], 0, nullptr));
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
  Locale other_;
  LXObjEntry* entry_ = nullptr;
};

// Bytes of a file that are flipped: all, or in places where every value is as good as another only some.
struct Range {
  size_t begin, end, stride;
};

void spoil(uint8_t type, const Bytes& bytes, const std::vector<Range>& ranges, size_t stride) {
  SpoiltObject file(type, bytes);
  size_t loaded = 0;
  size_t refused = 0;
  for (const Range& range : ranges) {
    for (size_t byte = range.begin; byte < std::min(range.end, file.size()); byte += range.stride) {
      for (unsigned bit = 0; bit < 8; ++bit) {
        // Long stretches of plain values are covered by a bit a byte.
        if (range.stride > 1 && bit != (byte / range.stride) % 8) continue;
        ++(file.flip(byte, bit) == LX_OK ? loaded : refused);
        ASSERT_FALSE(testing::Test::HasFailure()) << "byte " << byte << ", bit " << bit;
      }
    }
  }
  EXPECT_GT(loaded, 0u);
  EXPECT_GT(refused, 0u);
  EXPECT_EQ(file.cut(file.size()), LX_OK);
  for (size_t size = file.size() - 1;; size -= std::min(size, stride)) {
    ASSERT_NE(file.cut(size), LX_OK) << size;
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

TEST(Corruption, OfPages) {
  for (const Bytes& file : {single_byte_page_file(), multibyte_page_file(), mixed_page_file()}) {
    spoil(LX_CODEPAGE, file, page_ranges(file, false), 7);
  }
  for (const Bytes& file : {multibyte_page_file(true), single_byte_page_file(true)}) {
    spoil(LX_CODEPAGE, file, page_ranges(file, true), 7);
  }
}

TEST(Corruption, OfOtherFiles) {
  const Bytes special = language_file({1, 367, 0, {{'a', 0, 'b', 'c'}, {'d', 0, 'e', 0}}, {{'f', 0, 'g', 0}}});
  spoil(LX_LANGUAGE, special, {{0, 1000, 1}}, 1);
  spoil(LX_TERRITORY, territory_file(), {{0, 1000, 1}}, 1);
}

}  // namespace
}  // namespace lx::test
