// SPDX-License-Identifier: Apache-2.0
// First use, failed use and end of use. Each case runs in a process of its own, where nothing has happened yet.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>
#include <pthread.h>
#include <sys/wait.h>
#include <unistd.h>

#include <barrier>
#include <clocale>
#include <cstdlib>
#include <functional>
#include <thread>
#include <utility>

#include "support/counting_allocator.hpp"
#include "support/object_builder.hpp"
#include "support/trace_capture.hpp"

namespace {

bool g_locks_fail = false;
int g_locks_made = 0;

}  // namespace

int32_t HSV1_InitializeLock(HSV1_Lock* lock) noexcept {
  ++g_locks_made;
  return g_locks_fail ? 1 : pthread_mutex_init(reinterpret_cast<pthread_mutex_t*>(lock), nullptr);
}

namespace lx::test {
namespace {

// The child ends as programs do, so that a leak checker looks at what it leaves behind.
void in_child(const std::function<void()>& body) {
  std::fflush(nullptr);
  const testing::TestResult& result = *testing::UnitTest::GetInstance()->current_test_info()->result();
  const int failures = result.total_part_count();
  const pid_t child = fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    for (const char* name : {"LX_LANG", "LX_LOCALEDIR", "LC_ALL", "LANG"}) unsetenv(name);
    setenv("NLS1_LOCALEDIR", LEXARO_DATA, 1);
    body();
    std::exit(result.total_part_count() > failures ? 1 : 0);
  }
  int status = 0;
  ASSERT_EQ(waitpid(child, &status, 0), child);
  EXPECT_EQ(status, 0);
}

uint32_t process_result() { return *static_cast<uint32_t*>(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "test")); }

void end_thread_block() { TermThread(HSV1_ResolveThread(&qlgnlthr_HSV1__T, "test")); }
void end_process_block() { TermProcess(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "test")); }

// Every function; true when it answers as long as the library is not initialised.
using Refusal = bool (*)();

char g_buffer[32] = "kept";
uint32_t g_rc = 99;

bool null_with_rc_1(LXLocale* locale) {
  LXReleaseLocale(locale, 0);
  return locale == nullptr && std::exchange(g_rc, 99) == 1;
}
bool zero_with_rc_11(uint32_t id) { return id == 0 && std::exchange(g_rc, 99) == LX_E_MANAGER; }
bool kept(uint32_t status) { return status == LX_E_MANAGER && std::string_view(g_buffer) == "kept"; }

const Refusal kFunctions[] = {[] { return null_with_rc_1(NLS1_GetLocale(1, 0, 0, &g_rc)); },
                              [] { return NLS1_SetLocale(1, 0, 0) == LX_E_MANAGER; },
                              [] { return NLS1_SetLocale(1, 0, NLS1_THREAD) == LX_E_MANAGER; },
                              [] { return NLS1_GetLocaleNumInfo(nullptr, 1, 0) == -1; },
                              [] { return NLS1_SetLocaleNumInfo(nullptr, 1, 1) == 0; },
                              [] { return NLS1_GetLocaleTextInfo(nullptr, 2, g_buffer, 32, 0, 0) == -1; },
                              [] { return NLS1_SetLocaleTextInfo(nullptr, 64, "$", 1, 37, 0) == 0; },
                              [] { return NLS1_SetLocaleFromNative("C", 0) == LX_E_MANAGER; },
                              [] { return NLS1_SetNativeLocale(1, 0, LC_TIME, 0) == LX_E_MANAGER; },
                              [] { return NLS1_SetNativeFromLocale(nullptr, LC_TIME, 0) == LX_E_MANAGER; },
                              [] { return null_with_rc_1(NLS1_ConvertNativeLocale("C", 0, &g_rc)); },
                              [] { return zero_with_rc_11(NLS1_GetCodepageId("IBM037", &g_rc)); },
                              [] { return zero_with_rc_11(NLS1_GetLanguageId("English", &g_rc)); },
                              [] { return zero_with_rc_11(NLS1_GetTerritoryId("Germany", &g_rc)); },
                              [] { return zero_with_rc_11(NLS1_GetSortId("BINARY", &g_rc)); },
                              [] { return kept(NLS1_GetObjectName(1, g_buffer, 32, LX_LANGUAGE)); },
                              [] { return kept(NLS1_GetLanguageName(1, g_buffer, 32)); },
                              [] { return kept(NLS1_GetTerritoryName(276, g_buffer, 32)); },
                              [] { return kept(NLS1_GetCodepageName(37, g_buffer, 32)); },
                              [] { return kept(NLS1_GetSortName(0, g_buffer, 32)); },
                              [] {
                                int32_t consumed = 99;
                                const int32_t count =
                                    NLS1_TranslateString(367, g_buffer, 32, 37, "\xC1", 1, &consumed, 0, &g_rc);
                                return count == -1 && consumed == 0 && kept(std::exchange(g_rc, 99));
                              }};

void expect_all_refuse() {
  for (size_t i = 0; i < std::size(kFunctions); ++i) EXPECT_TRUE(kFunctions[i]()) << i;
  EXPECT_EQ(NLS1_PrivateFunction_GetProcessLocale(), 0u);
}

TEST(Process, EveryFunctionInitialisesTheLibrary) {
  for (size_t i = 0; i < std::size(kFunctions); ++i) {
    in_child([=] {
      EXPECT_EQ(qlginflg, 0);
      EXPECT_FALSE(kFunctions[i]()) << i;
      EXPECT_EQ(qlginflg, 1) << i;
      EXPECT_EQ(process_result(), LX_OK);
      EXPECT_EQ(g_locks_made, 1);
      end_process_block();
    });
  }
}

TEST(Process, AFailedInitialisationIsNotTriedAgain) {
  in_child([] {
    g_locks_fail = true;
    TraceCapture trace;
    expect_all_refuse();
    EXPECT_EQ(qlginflg, -1);
    EXPECT_EQ(process_result(), LX_E_MANAGER);
    EXPECT_TRUE(trace.has("Unable to initialize Lexaro, rc = 11")) << trace.all();
    g_locks_fail = false;
    expect_all_refuse();
    EXPECT_EQ(g_locks_made, 1);
    EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
  });
}

TEST(Process, AfterItsEndEverythingIsRefused) {
  in_child([] {
    ASSERT_NE(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
    std::barrier ended(2);
    std::thread late([&] {
      EXPECT_NE(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
      ended.arrive_and_wait();
      ended.arrive_and_wait();
    });
    ended.arrive_and_wait();
    end_process_block();
    EXPECT_EQ(qlginflg, 0);
    EXPECT_EQ(lxglocale, nullptr);
    EXPECT_EQ(LXGetObjManager(), nullptr);
    expect_all_refuse();
    EXPECT_EQ(g_locks_made, 1);
    ended.arrive_and_wait();
    late.join();  // its locale ends after the library
    end_thread_block();
  });
}

TEST(Process, OtherUsersKeepTheLibrary) {
  in_child([] {
    ASSERT_EQ(LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, 0), LX_OK);
    EXPECT_NE(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
    end_process_block();
    EXPECT_NE(LXGetObjManager(), nullptr);
    expect_all_refuse();
    end_thread_block();
    EXPECT_EQ(LXTerm(), LX_OK);
    EXPECT_EQ(LXGetObjManager(), nullptr);
  });
}

TEST(Process, OnBuiltInData) {
  for (const char* directory : {"/no/such/directory", static_cast<const char*>(nullptr)}) {
    in_child([=] {
      directory != nullptr ? setenv("NLS1_LOCALEDIR", directory, 1) : unsetenv("NLS1_LOCALEDIR");
      setenv("LX_LOCALEDIR", "/no/such/directory", 1);
      TraceCapture trace;
      EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
      EXPECT_EQ(process_result(), LX_E_DEFAULTS);
      EXPECT_EQ(trace.has("Unable to determine location of locale definitions\n"), directory == nullptr);
      EXPECT_EQ(NLS1_GetLocaleNumInfo(nullptr, LX_ITEM_LANGUAGE_ID, 0), 1);
      alignas(2) char out[4];
      EXPECT_EQ(NLS1_TranslateString(1200, out, 4, 1, "AB", 2, nullptr, 0, nullptr), 4) << "US-ASCII has the id 1 here";
      end_process_block();
    });
  }
}

TEST(Process, TheOtherVariableNamesTheDirectoryToo) {
  in_child([] {
    unsetenv("NLS1_LOCALEDIR");
    setenv("LX_LOCALEDIR", LEXARO_DATA, 1);
    setenv("LX_LANG", "German_Austria", 1);
    EXPECT_EQ(NLS1_GetTerritoryId("Austria", nullptr), 40u);
    EXPECT_EQ(process_result(), LX_OK);
    EXPECT_EQ(LXGetLocaleNumInfo(lxglocale, 5, 0), 40);
    EXPECT_EQ(LXGetLocaleNumInfo(NLS1_PrivateFunction_GetThreadLocale(), 5, 0), 40);
    EXPECT_NE(NLS1_PrivateFunction_GetThreadLocale(), lxglocale);
    end_thread_block();
    end_process_block();
  });
}

// Data that stand in for a page would give a wrong text.
TEST(Process, PagesThatCannotBeReadAreNotFound) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.remove("cp_00900.nls");
  directory.write("cp_00901.nls", "no object");
  in_child([&] {
    setenv("NLS1_LOCALEDIR", directory.path(), 1);
    char out[4];
    for (auto [to, from] : {std::pair<uint16_t, uint16_t>{900, 367}, {367, 900}, {901, 367}, {367, 901}}) {
      for (int again = 0; again < 2; ++again) {
        uint32_t error = 99;
        EXPECT_EQ(NLS1_TranslateString(to, out, 4, from, "A", 1, nullptr, 0, &error), -1);
        EXPECT_EQ(error, LX_E_CODEPAGE) << from << " to " << to;
      }
    }
    EXPECT_EQ(NLS1_TranslateString(367, out, 4, 367, "A", 1, nullptr, 0, nullptr), 1);
    end_process_block();
  });
}

// ---- Memory ----

TEST(Process, EveryAllocationMayFail) {
  for (bool on : {false, true}) {
    bool failed = true;
    for (int at = 0; failed; ++at) {
      int results[2];
      ASSERT_EQ(pipe(results), 0);
      in_child([&] {
        CountingAllocator allocator;
        EXPECT_EQ(allocator.init(LEXARO_DATA), LX_OK);
        allocator.arm(at, on);
        for (Refusal function : kFunctions) function();
        std::thread([] { NLS1_PrivateFunction_GetThreadLocale(); }).join();
        const bool more = allocator.has_failed();
        EXPECT_EQ(write(results[1], &more, sizeof more), ssize_t{sizeof more});
        end_thread_block();
        if (qlginflg > 0) end_process_block();
        EXPECT_EQ(LXTerm(), LX_OK);
        EXPECT_EQ(allocator.live, 0) << "allocation " << at;
      });
      close(results[1]);
      const bool told = read(results[0], &failed, sizeof failed) == ssize_t{sizeof failed};
      close(results[0]);
      ASSERT_TRUE(told && !HasFailure()) << at;
    }
  }
}

TEST(Process, WithoutMemoryForLocales) {
  for (bool of_thread : {false, true}) {
    in_child([=] {
      CountingAllocator allocator;
      ASSERT_EQ(allocator.init(LEXARO_DATA), LX_OK);
      ASSERT_TRUE(!of_thread || NLS1_PrivateFunction_GetProcessLocale() == 0u);
      allocator.arm(0, true);
      TraceCapture trace;
      EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
      EXPECT_EQ(qlginflg, 1);
      EXPECT_EQ(process_result(), of_thread ? LX_OK : LX_E_MEMORY);
      const std::string whose = of_thread ? "thread" : "global";
      EXPECT_TRUE(trace.has("Unable to set " + whose + " locale, rc = 20")) << trace.all();
      end_process_block();
      LXTerm();
    });
  }
}

TEST(Process, ThreadsTakeTheirLocalesWithThem) {
  in_child([] {
    CountingAllocator allocator;
    ASSERT_EQ(allocator.init(LEXARO_DATA), LX_OK);
    auto work = [] {
      const LXLocale* first = NLS1_PrivateFunction_GetThreadLocale();
      EXPECT_NE(first, nullptr);
      EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale(), first);
      EXPECT_EQ(NLS1_SetLocale(276 << 16 | 2, 0, NLS1_THREAD), LX_OK);
      EXPECT_EQ(LXGetLocaleNumInfo(NLS1_PrivateFunction_GetThreadLocale(), 1, 0), 2);
    };
    std::thread(work).join();  // loads the objects
    const int before = allocator.live;
    for (int i = 0; i < 10; ++i) std::thread(work).join();
    EXPECT_EQ(allocator.live, before);
    end_process_block();
    EXPECT_EQ(LXTerm(), LX_OK);
    EXPECT_EQ(allocator.live, 0);
  });
}

// A host with storage of its own calls these.
TEST(Process, BlocksAreReturned) {
  in_child([] {
    uint32_t result = 99;
    EXPECT_EQ(InitProcess(&result), &result);
    EXPECT_EQ(result, LX_OK);
    LXLocale* locale = nullptr;
    EXPECT_EQ(InitThread(&locale), &locale);
    EXPECT_NE(locale, nullptr);
    for (int i = 0; i < 2; ++i) {
      EXPECT_EQ(TermThread(&locale), &locale);
      EXPECT_EQ(locale, nullptr);
    }
    EXPECT_EQ(TermProcess(&result), &result);
    for (auto* call : {InitProcess, TermProcess, InitThread, TermThread}) EXPECT_EQ(call(nullptr), nullptr);
    EXPECT_EQ(qlginflg, 0);
    while (LXGetObjManager() != nullptr) LXTerm();  // the blocks of the process itself count as well
  });
}

}  // namespace
}  // namespace lx::test
