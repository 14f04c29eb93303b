// SPDX-License-Identifier: Apache-2.0
// Many threads that begin together, set and reset locales of their own and translate fields.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <barrier>
#include <cstdlib>
#include <string_view>
#include <thread>
#include <vector>

namespace lx::test {
namespace {

void translate_fields() {
  static constexpr struct {
    uint16_t to, from;
    std::string_view in, out;
  } kFields[] = {
      {37, 819, "FIELD 1", "\xC6\xC9\xC5\xD3\xC4\x40\xF1\x40\x40\x40\x40\x40"},
      {930, 57352, "日本A", "\x0E\x45\x62\x45\x66\x0F\xC1\x40\x40\x40\x40\x40"},
      {932, 1399, "\x0E\x45\x62\x0F", "\x93\xFA          "},
  };
  for (const auto& [to, from, in, expected] : kFields) {
    char out[12];
    const auto length = static_cast<int32_t>(in.size());
    EXPECT_EQ(NLS1_TranslateString(to, out, 12, from, in.data(), length, nullptr, NLS1_XLT_PAD, nullptr), 12);
    EXPECT_EQ(std::string_view(out, 12), expected);
  }
}

void change_own_locale(int32_t territory) {
  EXPECT_EQ(NLS1_SetLocale(territory << 16 | 2, 0, NLS1_THREAD), LX_OK);
  std::this_thread::yield();
  EXPECT_EQ(NLS1_GetLocaleNumInfo(NLS1_PrivateFunction_GetThreadLocale(), LX_ITEM_TERRITORY_ID, 0), territory);
  EXPECT_EQ(NLS1_GetCodepageId("cp930", nullptr), 930u);
}

TEST(Nls1Threads, FirstUseAndAllThatFollows) {
  setenv("NLS1_LOCALEDIR", LEXARO_DATA, 1);
  setenv("LX_LANG", "French_France.Latin1@BINARY", 1);
  constexpr int kThreads = 16;
  std::barrier start(kThreads);
  std::vector<std::thread> threads;
  for (int number = 0; number < kThreads; ++number) {
    threads.emplace_back([&start, number] {
      start.arrive_and_wait();
      for (int round = number; round < number + 40; ++round) {
        if (round % 2 == 0) change_own_locale(round % 3 == 0 ? 276 : 40);
        translate_fields();
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(LXGetLocaleNumInfo(lxglocale, LX_ITEM_LANGUAGE_ID, 0), 3) << "the locale of the process is as it was";
  TermProcess(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "test"));
  EXPECT_EQ(LXGetObjManager(), nullptr) << "it was initialised once";
}

}  // namespace
}  // namespace lx::test
