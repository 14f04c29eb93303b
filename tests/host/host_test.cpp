// SPDX-License-Identifier: Apache-2.0
// The default host services.
#include <gtest/gtest.h>
#include <lexaro/host.h>

#include <atomic>
#include <barrier>
#include <cerrno>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <string>
#include <thread>
#include <vector>

namespace {

using Lines = std::vector<std::string>;

// All threads begin together.
void race(int count, const std::function<void(int)>& body) {
  std::barrier start(count);
  std::vector<std::thread> threads;
  for (int i = 0; i < count; ++i) {
    threads.emplace_back([&, i] {
      start.arrive_and_wait();
      body(i);
    });
  }
  for (auto& thread : threads) thread.join();
}

// The trace settings are read once in a process, so each of these tests traces in a process of its own.
class Trace : public testing::Test {
 protected:
  Trace() {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    file_ = std::string("host_") + testing::UnitTest::GetInstance()->current_test_info()->name() + ".trace";
  }

  Lines traced(const char* flags, const std::function<void()>& body) {
    auto child = [&] {
      std::remove(file_.c_str());
      setenv("TRC1_FLAGS", flags, 1);
      setenv("TRC1_FILE", file_.c_str(), 1);
      TRC1_Sync(&unit_);
      body();
      std::exit(testing::Test::HasFailure() ? 1 : 0);
    };
    EXPECT_EXIT(child(), testing::ExitedWithCode(0), "");
    Lines lines;
    std::ifstream input(file_);
    for (std::string line; std::getline(input, line);) lines.push_back(line);
    return lines;
  }

  TRC1_Unit unit_{"Lexaro", "sample", 0};
  std::string file_;
};

TEST_F(Trace, WritesEachMessageAsOneLine) {
  const Lines lines = traced("d0", [this] {
    EXPECT_EQ(unit_.flags, TRC1_LEVEL_FLOW | TRC1_LEVEL_ERROR | 0x10u);
    TRC1_Event(&unit_, 12, TRC1_ENTRY, "LXSample", 0);
    TRC1_Printf(&unit_, 13, "rc = %d, name %s\n", -5, "a\nb");
    TRC1_Event(&unit_, 14, TRC1_EXIT_RESULT, "LXSample", -1);
    TRC1_Event(&unit_, 15, TRC1_EXIT, "LXSample", 99);
    TRC1_Dump(&unit_, 7, "key", "0123456789\xC1 bcd~\x7F", 18);
  });
  const Lines expected = {"Lexaro sample(12): LXSample: entry",
                          "Lexaro sample(13): rc = -5, name a b",
                          "Lexaro sample(14): LXSample: exit, result -1",
                          "Lexaro sample(15): LXSample: exit",
                          "Lexaro sample(7): key: 18 bytes",
                          "Lexaro sample(7): key 000000: 30 31 32 33 34 35 36 37 38 39 C1 20 62 63 64 7E"
                          "  |0123456789. bcd~|",
                          "Lexaro sample(7): key 000010: 7F 00" + std::string(14 * 3, ' ') + "  |..|"};
  EXPECT_EQ(lines, expected);
}

TEST_F(Trace, CutsLongMessagesAndKeepsErrno) {
  const Lines lines = traced("80", [this] {
    errno = ERANGE;
    TRC1_Printf(&unit_, 1, "%s", std::string(100000, 'x').c_str());
    TRC1_Printf(&unit_, 2, "next");
    EXPECT_EQ(errno, ERANGE);
  });
  ASSERT_EQ(lines.size(), 2u);
  EXPECT_LE(lines[0].size(), 4095u);
  EXPECT_GT(lines[0].size(), 4000u);
  EXPECT_EQ(lines[1], "Lexaro sample(2): next");
}

TEST_F(Trace, KeepsTheLinesOfThreadsApart) {
  constexpr int kThreads = 4;
  constexpr int kLines = 200;
  const Lines lines = traced("fff", [this] {
    race(kThreads, [this](int i) {
      for (int n = 0; n < kLines; ++n) {
        TRC1_Sync(&unit_);
        TRC1_Printf(&unit_, i, "%s", std::string(200, static_cast<char>('a' + i)).c_str());
      }
    });
  });
  ASSERT_EQ(lines.size(), static_cast<size_t>(kThreads * kLines));
  for (const std::string& line : lines) {
    const std::string text = line.substr(line.find(": ") + 2);
    EXPECT_EQ(text, std::string(200, text[0])) << line;
  }
}

TEST_F(Trace, IsOffWithoutLevels) {
  for (const char* flags : {"0", "", "none"}) {
    auto silent = [this] {
      EXPECT_EQ(unit_.flags, 0u);
      TRC1_Printf(&unit_, 1, "nobody reads this");
      TRC1_Dump(&unit_, 2, "nor this", "x", 1);
    };
    EXPECT_EQ(traced(flags, silent), Lines{}) << flags;
  }
}

TEST(Lock, ExcludesAndReportsMisuse) {
  HSV1_Lock lock;
  ASSERT_EQ(HSV1_InitializeLock(&lock), 0);
  int count = 0;
  race(4, [&](int) {
    for (int n = 0; n < 1000; ++n) {
      HSV1_GetLock(&lock);
      ++count;
      HSV1_ReleaseLock(&lock);
    }
  });
  EXPECT_EQ(count, 4000);
  EXPECT_EQ(HSV1_GetLock(&lock), 0);
  EXPECT_NE(HSV1_GetLock(&lock), 0) << "taking it twice fails instead of waiting for ever";
  EXPECT_EQ(HSV1_ReleaseLock(&lock), 0);
  EXPECT_EQ(HSV1_DestroyLock(&lock), 0);
}

// A block that its init fills and its term counts.
struct Block {
  uint64_t before;
  uint32_t made;
};
std::atomic<int> g_inits;
std::atomic<int> g_terms;

void* init_block(void* memory) {
  auto* block = static_cast<Block*>(memory);
  EXPECT_EQ(block->before, 0u) << "a block starts zero-filled";
  std::this_thread::yield();
  block->made = 1;
  ++g_inits;
  return memory;
}

void* term_block(void* memory) {
  EXPECT_EQ(static_cast<Block*>(memory)->made, 1u);
  ++g_terms;
  return memory;
}

TEST(Storage, GivesAProcessOneBlock) {
  static HSV1_Descriptor descriptors[20];
  for (HSV1_Descriptor& descriptor : descriptors) {
    descriptor = {sizeof(Block), init_block, term_block, nullptr};
    g_inits = g_terms = 0;
    std::vector<void*> blocks(8);
    race(8, [&](int i) {
      void* block = HSV1_ResolveProcess(&descriptor, "test");
      EXPECT_EQ(static_cast<Block*>(block)->made, 1u) << "handed out before it was initialised";
      blocks[static_cast<size_t>(i)] = block;
    });
    EXPECT_EQ(g_inits, 1);
    EXPECT_EQ(g_terms, 0);
    for (void* block : blocks) EXPECT_EQ(block, blocks[0]);
  }
}

TEST(Storage, GivesEachThreadABlockUntilItEnds) {
  static HSV1_Descriptor descriptor{sizeof(Block), init_block, term_block, nullptr};
  g_inits = g_terms = 0;
  race(8, [&](int) {
    void* block = HSV1_ResolveThread(&descriptor, "test");
    EXPECT_EQ(block, HSV1_ResolveThread(&descriptor, "test"));
    EXPECT_EQ(reinterpret_cast<uintptr_t>(block) % alignof(std::max_align_t), 0u);
    static_cast<Block*>(block)->before = 1;
  });
  EXPECT_EQ(g_inits, 8);
  EXPECT_EQ(g_terms, 8);
}

HSV1_Descriptor g_outer{sizeof(Block), nullptr, nullptr, nullptr};
HSV1_Descriptor g_inner{sizeof(Block), init_block, nullptr, nullptr};

// The services of a library may need each other while they start and end.
TEST(Storage, MayBeResolvedWhileItStartsAndEnds) {
  g_outer.init = [](void* block) { return HSV1_ResolveProcess(&g_inner, "init") != nullptr ? block : nullptr; };
  EXPECT_NE(HSV1_ResolveProcess(&g_outer, "test"), nullptr);

  static HSV1_Descriptor descriptor{sizeof(Block), nullptr, nullptr, nullptr};
  static std::atomic<bool> same{false};
  descriptor.term = [](void* block) {
    same = HSV1_ResolveThread(&descriptor, "term") == block;
    return block;
  };
  std::thread([] { HSV1_ResolveThread(&descriptor, "test"); }).join();
  EXPECT_TRUE(same);
}

TEST(Storage, SaysWhenThereIsNoMemory) {
  static HSV1_Descriptor descriptors[] = {{SIZE_MAX, init_block, nullptr, nullptr},
                                          {SIZE_MAX - 8, init_block, nullptr, nullptr}};
  for (HSV1_Descriptor& descriptor : descriptors) EXPECT_EQ(HSV1_ResolveThread(&descriptor, "test"), nullptr);
}

}  // namespace
