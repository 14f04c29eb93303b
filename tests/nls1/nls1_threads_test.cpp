// SPDX-License-Identifier: Apache-2.0
// Many threads that begin together, set and reset locales of their own and translate fields.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <barrier>
#include <cstdlib>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

namespace lx::test {
namespace {

constexpr unsigned kThreads = 16;

struct Field {
  uint16_t to, from;
  std::string_view in, out;
};
constexpr Field kFields[] = {
    {37, 819, "FIELD 1", "\xC6\xC9\xC5\xD3\xC4\x40\xF1\x40\x40\x40\x40\x40"},
    {930, 57352, "日本A", "\x0E\x45\x62\x45\x66\x0F\xC1\x40\x40\x40\x40\x40"},
    {57352, 930, "\x0E\x45\x62\x0F\xC1", "日A        "},
    {932, 1399, "\x0E\x45\x62\x0F", "\x93\xFA          "},
    {964, 954, "abc", "abc         "},
};

void expect_translated(const Field& field) {
  char out[12];
  uint32_t error = 99;
  const auto length = static_cast<int32_t>(field.in.size());
  EXPECT_EQ(NLS1_TranslateString(field.to, out, 12, field.from, field.in.data(), length, nullptr, NLS1_XLT_PAD, &error),
            12);
  EXPECT_EQ(error, LX_OK);
  EXPECT_EQ(std::string_view(out, 12), field.out);
}

void expect_own_locale(unsigned number, int round) {
  static constexpr struct {
    int32_t language, territory;
  } kLocales[] = {{1, 840}, {2, 276}, {2, 40}, {3, 250}, {11, 392}};
  const auto& wanted = kLocales[(number + static_cast<unsigned>(round)) % std::size(kLocales)];
  EXPECT_EQ(NLS1_SetLocale(wanted.territory << 16 | wanted.language, 0, NLS1_THREAD), LX_OK);
  std::this_thread::yield();
  LXLocale* own = NLS1_PrivateFunction_GetThreadLocale();
  EXPECT_EQ(NLS1_GetLocaleNumInfo(own, 1, 0), wanted.language);
  EXPECT_EQ(NLS1_GetLocaleNumInfo(own, 5, 0), wanted.territory);
  EXPECT_EQ(NLS1_SetLocaleNumInfo(own, 5, 276), 1);
  uint32_t rc = 99;
  EXPECT_EQ(NLS1_GetCodepageId("cp930", &rc), 930u);
  char name[16];
  EXPECT_EQ(NLS1_GetCodepageName(37, name, sizeof name), LX_OK);
}

TEST(Nls1Threads, FirstUseAndAllThatFollows) {
  setenv("NLS1_LOCALEDIR", LEXARO_DATA, 1);
  setenv("LX_LANG", "French_France.Latin1@BINARY", 1);
  EXPECT_EQ(qlginflg, 0);
  std::barrier start(kThreads);
  std::vector<std::thread> threads;
  for (unsigned number = 0; number < kThreads; ++number) {
    threads.emplace_back([&start, number] {
      start.arrive_and_wait();
      for (int round = 0; round < 40; ++round) {
        if ((number + static_cast<unsigned>(round)) % 2 == 0) expect_own_locale(number, round);
        for (size_t i = 0; i < std::size(kFields); ++i) expect_translated(kFields[(i + number) % std::size(kFields)]);
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(qlginflg, 1);
  EXPECT_EQ(LXGetLocaleNumInfo(lxglocale, 1, 0), 3) << "the locale of the process is as it was";
  TermThread(HSV1_ResolveThread(&qlgnlthr_HSV1__T, "test"));
  TermProcess(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "test"));
  EXPECT_EQ(LXGetObjManager(), nullptr) << "it was initialised once";
}

}  // namespace
}  // namespace lx::test
