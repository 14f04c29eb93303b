// SPDX-License-Identifier: Apache-2.0
// A host that brings its own services: the shared library calls those of the program.
#include <gtest/gtest.h>
#include <lexaro/host.h>

#include <cstdarg>
#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

namespace {

std::vector<std::string> g_messages;
int g_locks;

bool traced(std::string_view text) {
  for (const std::string& message : g_messages) {
    if (message.find(text) != std::string::npos) return true;
  }
  return false;
}

}  // namespace

const char* HSV1_GetEnv(const char* name, uint32_t reserved) noexcept {
  EXPECT_EQ(reserved, 0u);
  return std::string_view(name) == "LX_LOCALEDIR" ? "/from/the/host" : nullptr;
}

int32_t HSV1_InitializeLock(HSV1_Lock*) noexcept { return 0; }
int32_t HSV1_GetLock(HSV1_Lock*) noexcept { return ++g_locks, 0; }
int32_t HSV1_ReleaseLock(HSV1_Lock*) noexcept { return --g_locks, 0; }
int32_t HSV1_DestroyLock(HSV1_Lock*) noexcept { return 0; }

void TRC1_Sync(TRC1_Unit* unit) noexcept { unit->flags = ~0u; }

void TRC1_Event(TRC1_Unit* unit, int32_t, uint32_t kind, const char* function, intptr_t result) noexcept {
  EXPECT_STREQ(unit->component, "Lexaro");
  const char* words[] = {"entry", "result", "exit"};
  g_messages.push_back(std::string(function) + " " + words[kind] + " " + std::to_string(result));
}

void TRC1_Printf(TRC1_Unit*, int32_t, const char* format, ...) noexcept {
  char text[512];
  va_list arguments;
  va_start(arguments, format);
  std::vsnprintf(text, sizeof text, format, arguments);
  va_end(arguments);
  g_messages.emplace_back(text);
}

void TRC1_Dump(TRC1_Unit*, int32_t, const char*, const void*, size_t) noexcept {}

namespace {

TEST(HostReplacement, SeesTheLibrarysCalls) {
  char buffer[64];
  EXPECT_EQ(LXGetEnv("LX_LOCALEDIR", buffer, sizeof buffer), 15);
  EXPECT_STREQ(buffer, "/from/the/host");
  EXPECT_EQ(LXGetEnv("PATH", buffer, sizeof buffer), 0);

  EXPECT_EQ(LXInit("/does/not/exist", nullptr, nullptr, nullptr, 0), LX_E_DEFAULTS);
  EXPECT_EQ(g_locks, 0) << "a lock is taken and not released";
  EXPECT_TRUE(traced("LXInit entry"));
  EXPECT_TRUE(traced("LXInit result 10"));
  EXPECT_TRUE(traced("Creating global area"));
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_TRUE(traced("LXTerm result 0"));
}

}  // namespace
