// SPDX-License-Identifier: Apache-2.0
// Sort objects that are broken, and memory that runs out.
#include "collate/sort_model.hpp"
#include "support/counting_allocator.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kSubject = 99;
constexpr char kName[] = "English_UnitedStates.US-ASCII@Subject";

class BrokenSort : public testing::Test {
 protected:
  BrokenSort() {
    write_small_directory(directory_);
    directory_.write_control({{LX_LANGUAGE, 1, "English"},
                              {LX_TERRITORY, 1, "UnitedStates"},
                              {LX_CODEPAGE, 367, "US-ASCII"},
                              {LX_SORT, kSubject, "Subject"}});
    session_ = std::make_unique<Session>(directory_.path());
  }

  // LX_OK when the object was loaded, and used without harm.
  uint32_t load(const Bytes& file) {
    directory_.write_object(LX_SORT, kSubject, file);
    LXObjMgr* manager = LXGetObjManager();
    uint32_t rc = 99;
    LXObjEntry* entry = LXGetObjFromID(manager, LX_SORT, kSubject, 1, &rc);
    if (LXLoadObj(manager, entry, &rc) == nullptr) return rc;
    EXPECT_EQ(rc, LX_OK);
    use(entry);
    EXPECT_EQ(LXUnloadObj(manager, entry), LX_OK);
    return LX_OK;
  }

 private:
  static void use(const LXObjEntry* entry) {
    uint16_t primary, special, primary2, special2;
    uint8_t secondary, tertiary, secondary2, tertiary2, mask = 0;
    for (unsigned unit = 0; unit < 0x10000; unit += 0x55) {
      LXSortGetWeights(entry, static_cast<LXUChar>(unit), &primary, &secondary, &tertiary, &special, &primary2,
                       &secondary2, &tertiary2, &special2, &mask);
      ASSERT_LE(mask, 15);
    }
    uint32_t rc = 99;
    Locale locale(LXGetLocale(kName, 0, &rc));
    ASSERT_EQ(rc, LX_OK);
    static EdgeBuffer edge(4096), other(4096), room(4096);
    constexpr std::string_view text = "aABcbefcc-pqQ-+*mnxyzw0ac";
    const LXUChar units[] = {'c', 'b', 0x100, 0x3041, 0x3105, 0x4E07, 0x5001, 0x5101, 0xFFFE, 'x', 'a', 0x3041};
    const char *a = edge.text(text), *b = other.text(text.substr(5));
    constexpr auto length = static_cast<int32_t>(text.size());
    const int32_t result = LXStrcoll(locale.get(), a, length, b, length - 5, 0);
    const int32_t reverse = LXStrcoll(locale.get(), b, length - 5, a, length, 0);
    ASSERT_EQ(result > 0, reverse < 0);
    ASSERT_EQ(LXStrcoll(locale.get(), a, length, a, length, 0), 0);
    const int32_t size = LXStrxfrm(locale.get(), nullptr, 0, a, length, 0);
    ASSERT_GE(size, 3);
    ASSERT_EQ(LXStrxfrm(locale.get(), room.room(static_cast<size_t>(size)), size, a, length, 0), size);
    ASSERT_GE(LXStrxfrm(locale.get(), room.room(1024), 1024, a, length, LX_CMP_NOCASE), 3);
    ASSERT_EQ(LXStrcollU(locale.get(), units, 12, units, 12, 0), 0);
    ASSERT_GE(LXStrGenSortKey(locale.get(), room.room(1024), 1024, units, 12), 3);
  }

  DataDirectory directory_;
  std::unique_ptr<Session> session_;
};

TEST_F(BrokenSort, EveryFlippedBitIsRefusedOrHarmless) {
  const Bytes good = test_sort("Combining").section();
  ASSERT_EQ(load(object_file({good})), LX_OK);
  for (size_t bit = 0; bit < 1036 * 8; ++bit) {
    Bytes broken = good;
    broken[bit / 8] = static_cast<uint8_t>(broken[bit / 8] ^ 1 << bit % 8);
    uint32_t status = load(object_file({broken}));
    ASSERT_TRUE(status == LX_OK || status == LX_E_HEADER) << bit << ": " << status;
    if (HasFatalFailure()) FAIL() << bit;
  }
}

// What reaches to the last byte is good, what reaches one row further is not.
TEST_F(BrokenSort, TablesMayReachTheEnd) {
  const struct {
    size_t at;
    int change;
    uint32_t status;
  } cases[] = {
      {4, 0, LX_OK},
      {4, 1, LX_E_HEADER},
      {1034, 1, LX_E_HEADER},
      {1034, -1, LX_OK},
      {2, 7, LX_E_HEADER},
      {1030, 0x4000, LX_E_HEADER},
      {8, 0x7000, LX_E_HEADER},
      {8 + 4 * 0x30, 0x7000, LX_OK},  // there it is a weight
  };
  for (const auto& one : cases) {
    Bytes bytes = test_sort("Combining").section();
    const int value = (bytes[one.at] << 8 | bytes[one.at + 1]) + one.change;
    bytes[one.at] = static_cast<uint8_t>(value >> 8);
    bytes[one.at + 1] = static_cast<uint8_t>(value);
    EXPECT_EQ(load(object_file({bytes})), one.status) << one.at << ' ' << one.change;
  }
}

// ---- Memory ----

// For texts that are mapped before they are compared or made into keys.
TEST(CollationMemory, RunsOut) {
  const DataDirectory directory;
  write_collation_directory(directory);
  CountingAllocator memory;
  ASSERT_EQ(memory.init(directory.path()), LX_OK);
  {
    const Collation form(Form::plain, 819, "Combining", kGerman);
    const Units text = form.store(std::u16string(3000, u'q')), shorter = first_units(text, 2999);
    const int live = memory.live;
    for (bool compares : {false, true}) {
      bool failed = true;
      for (int call = 0; failed; ++call) {
        char key[10];
        memory.arm(call, false);
        const int32_t result =
            compares ? form.compare(text, shorter, LX_CMP_NOCASE) : form.transform(key, 10, text, 3000, LX_CMP_NOCASE);
        failed = memory.has_failed();
        memory.disarm();
        EXPECT_TRUE(failed ? result == (compares ? 0 : -1) : result > 0 && call > 1) << call << ' ' << result;
        EXPECT_EQ(LXGetError(form.locale()), failed ? LX_E_MEMORY : LX_OK) << call;
        ASSERT_EQ(memory.live, live) << call;
      }
    }
  }
  LXTerm();
  EXPECT_EQ(memory.live, 0);
}

}  // namespace
}  // namespace lx::test
