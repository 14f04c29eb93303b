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
  const pid_t child = fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    for (const char* name : {"LX_LANG", "LX_LOCALEDIR", "LC_ALL", "LANG"}) unsetenv(name);
    setenv("NLS1_LOCALEDIR", LEXARO_DATA, 1);
    body();
    std::exit(testing::Test::HasFailure() ? 1 : 0);
  }
  int status = 0;
  ASSERT_EQ(waitpid(child, &status, 0), child);
  EXPECT_EQ(status, 0);
}

uint32_t process_result() { return *static_cast<uint32_t*>(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "test")); }

void end_thread_block() { TermThread(HSV1_ResolveThread(&qlgnlthr_HSV1__T, "test")); }
void end_process_block() { TermProcess(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "test")); }

// Every function; true when it answers as long as the library is not initialised.
uint32_t g_rc;
char g_buffer[32];
bool (*const kFunctions[])() = {[] { return NLS1_GetLocale(1, 0, 8, &g_rc) == nullptr && g_rc == 1; },
                                [] { return NLS1_SetLocale(1, 0, 0) == LX_E_MANAGER; },
                                [] { return NLS1_SetLocale(1, 0, NLS1_THREAD) == LX_E_MANAGER; },
                                [] { return NLS1_GetLocaleNumInfo(nullptr, 1, 0) == -1; },
                                [] { return NLS1_SetLocaleNumInfo(nullptr, 1, 1) == 0; },
                                [] { return NLS1_GetLocaleTextInfo(nullptr, 2, g_buffer, 32, 0, 0) == -1; },
                                [] { return NLS1_SetLocaleTextInfo(nullptr, 64, "$", 1, 37, 0) == 0; },
                                [] { return NLS1_SetLocaleFromNative("C", 0) == LX_E_MANAGER; },
                                [] { return NLS1_SetNativeLocale(1, 0, LC_TIME, 0) == LX_E_MANAGER; },
                                [] { return NLS1_SetNativeFromLocale(nullptr, LC_TIME, 0) == LX_E_MANAGER; },
                                [] { return NLS1_ConvertNativeLocale("xx", 0, &g_rc) == nullptr && g_rc == 1; },
                                [] { return NLS1_GetCodepageId("IBM037", &g_rc) == 0 && g_rc == LX_E_MANAGER; },
                                [] { return NLS1_GetLanguageId("English", &g_rc) == 0 && g_rc == LX_E_MANAGER; },
                                [] { return NLS1_GetTerritoryId("Germany", &g_rc) == 0 && g_rc == LX_E_MANAGER; },
                                [] { return NLS1_GetSortId("BINARY", &g_rc) == 0 && g_rc == LX_E_MANAGER; },
                                [] { return NLS1_GetObjectName(1, g_buffer, 32, LX_LANGUAGE) == LX_E_MANAGER; },
                                [] { return NLS1_GetLanguageName(1, g_buffer, 32) == LX_E_MANAGER; },
                                [] { return NLS1_GetTerritoryName(276, g_buffer, 32) == LX_E_MANAGER; },
                                [] { return NLS1_GetCodepageName(37, g_buffer, 32) == LX_E_MANAGER; },
                                [] { return NLS1_GetSortName(0, g_buffer, 32) == LX_E_MANAGER; },
                                [] {
                                  int32_t consumed = 99;
                                  NLS1_TranslateString(367, g_buffer, 32, 37, "\xC1", 1, &consumed, 0, &g_rc);
                                  return consumed == 0 && g_rc == LX_E_MANAGER;
                                }};

void expect_all_refuse() {
  for (size_t i = 0; i < std::size(kFunctions); ++i) {
    g_rc = 99;
    EXPECT_TRUE(kFunctions[i]()) << i;
  }
  EXPECT_EQ(g_locks_made, 1) << "it was initialised only once";
}

TEST(Process, EveryFunctionInitialisesTheLibrary) {
  for (size_t i = 0; i < std::size(kFunctions); ++i) {
    in_child([=] {
      EXPECT_FALSE(kFunctions[i]()) << i;
      EXPECT_EQ(qlginflg, 1) << i;
      end_process_block();
      EXPECT_EQ(LXGetObjManager(), nullptr) << i;
    });
  }
}

TEST(Process, AFailedInitialisationIsNotTriedAgain) {
  in_child([] {
    g_locks_fail = true;
    TraceCapture trace;
    EXPECT_EQ(process_result(), LX_E_MANAGER);
    EXPECT_EQ(qlginflg, -1);
    EXPECT_TRUE(trace.has("Unable to initialize Lexaro, rc = 11")) << trace.all();
    g_locks_fail = false;
    expect_all_refuse();
    EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
  });
}

// Threads may end after the library, and the library may have other users.
TEST(Process, AfterItsEndEverythingIsRefused) {
  for (bool others : {false, true}) {
    in_child([=] {
      if (others) LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, 0);
      std::barrier ended(2);
      std::thread late([&] {
        EXPECT_NE(NLS1_PrivateFunction_GetThreadLocale(), nullptr);
        ended.arrive_and_wait();
        ended.arrive_and_wait();
      });
      ended.arrive_and_wait();
      end_process_block();
      EXPECT_EQ(qlginflg, 0);
      EXPECT_EQ(LXGetObjManager() != nullptr, others);
      expect_all_refuse();
      ended.arrive_and_wait();
      late.join();
      end_thread_block();
      LXTerm();
    });
  }
}

TEST(Process, OnBuiltInData) {
  for (const char* directory : {"/no/such/directory", static_cast<const char*>(nullptr)}) {
    in_child([=] {
      directory != nullptr ? setenv("NLS1_LOCALEDIR", directory, 1) : unsetenv("NLS1_LOCALEDIR");
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

// Data that stand in for a page would give a wrong text.
TEST(Process, PagesThatCannotBeReadAreNotFound) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.remove("cp_00900.nls");
  in_child([&] {
    setenv("NLS1_LOCALEDIR", directory.path(), 1);
    char out[4];
    for (auto [to, from] : {std::pair<uint16_t, uint16_t>{900, 367}, {900, 367}, {367, 900}}) {
      uint32_t error = 99;
      EXPECT_EQ(NLS1_TranslateString(to, out, 4, from, "A", 1, nullptr, 0, &error), -1);
      EXPECT_EQ(error, LX_E_CODEPAGE) << from << " to " << to;
    }
    EXPECT_EQ(NLS1_TranslateString(367, out, 4, 367, "A", 1, nullptr, 0, nullptr), 1);
    end_process_block();
  });
}

TEST(Process, WithoutMemoryForLocales) {
  for (bool of_thread : {false, true}) {
    in_child([=] {
      CountingAllocator allocator;
      ASSERT_EQ(allocator.init(LEXARO_DATA), LX_OK);
      if (of_thread) NLS1_PrivateFunction_GetProcessLocale();
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

TEST(Process, LocalesAreTheUsers) {
  in_child([] {
    setenv("LX_LANG", "German_Austria.Unknown", 1);
    LXLocale* locale = NLS1_PrivateFunction_GetThreadLocale();
    EXPECT_EQ(LXGetLocaleNumInfo(locale, LX_ITEM_TERRITORY_ID, 0), 40);
    EXPECT_EQ(LXGetLocaleNumInfo(lxglocale, LX_ITEM_TERRITORY_ID, 0), 40);
    EXPECT_NE(locale, lxglocale);
    end_thread_block();
    end_process_block();
  });
}

// A host with storage of its own calls these.
TEST(Process, BlocksAreReturned) {
  in_child([] {
    uint32_t result = 99;
    LXLocale* locale = nullptr;
    EXPECT_EQ(InitProcess(&result), &result);
    EXPECT_EQ(InitThread(&locale), &locale);
    EXPECT_NE(locale, nullptr);
    EXPECT_EQ(TermThread(&locale), &locale);
    EXPECT_EQ(locale, nullptr);
    EXPECT_EQ(TermProcess(&result), &result);
    for (auto* call : {InitProcess, TermProcess, InitThread, TermThread}) EXPECT_EQ(call(nullptr), nullptr);
    while (LXGetObjManager() != nullptr) LXTerm();  // the blocks of the process itself count as well
  });
}

}  // namespace
}  // namespace lx::test
