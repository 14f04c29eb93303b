// SPDX-License-Identifier: Apache-2.0
// A host that brings its own services: the shared library calls those of the program.
#include <gtest/gtest.h>
#include <lexaro/host.h>

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

namespace {

std::vector<std::string> g_messages;

bool traced(std::string_view text) {
  return std::any_of(g_messages.begin(), g_messages.end(), [=](const auto& one) { return one.find(text) != one.npos; });
}

}  // namespace

const char* HSV1_GetEnv(const char* name, uint32_t reserved) noexcept {
  EXPECT_EQ(reserved, 0u);
  return std::string_view(name) == "LX_LOCALEDIR" ? "/from/the/host" : nullptr;
}

void TRC1_Sync(TRC1_Unit* unit) noexcept { unit->flags = ~0u; }

void TRC1_Event(TRC1_Unit*, int32_t, uint32_t kind, const char* function, intptr_t result) noexcept {
  g_messages.push_back(function + std::string(kind == TRC1_ENTRY ? " entry " : " exit ") + std::to_string(result));
}

void TRC1_Printf(TRC1_Unit*, int32_t, const char* format, ...) noexcept {
  char text[512];
  va_list arguments;
  va_start(arguments, format);
  std::vsnprintf(text, sizeof text, format, arguments);
  va_end(arguments);
  g_messages.emplace_back(text);
}

namespace {

TEST(HostReplacement, SeesTheLibrarysCalls) {
  char buffer[64];
  EXPECT_EQ(LXGetEnv("LX_LOCALEDIR", buffer, sizeof buffer), 15);
  EXPECT_STREQ(buffer, "/from/the/host");

  EXPECT_EQ(LXInit("/does/not/exist", nullptr, nullptr, nullptr, 0), LX_E_DEFAULTS);
  EXPECT_TRUE(traced("LXInit entry"));
  EXPECT_TRUE(traced("LXInit exit 10"));
  EXPECT_TRUE(traced("Creating global area"));
  EXPECT_EQ(LXTerm(), LX_OK);
}

}  // namespace
