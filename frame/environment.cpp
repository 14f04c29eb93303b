// SPDX-License-Identifier: Apache-2.0
// Where the locale data is, and what its files are called.
#include "frame/environment.hpp"

#include <cstdio>
#include <cstring>

#include "frame/call.hpp"
#include "frame/library.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "environment", 0};

constexpr char kControlFile[] = "/control.nls";
constexpr char kDefaultDirectory[] = "/Vantrel/locale";
constexpr int32_t kDefaultLocationSize = 17;  // one more than the text needs, as callers have always been told
constexpr char kObjectExtension[] = ".nls";
constexpr char kTypePrefixes[kObjectTypes][3] = {"la", "te", "cp", "so"};

int32_t to_lower(uint8_t byte) { return byte >= 'A' && byte <= 'Z' ? byte + ('a' - 'A') : byte; }

}  // namespace

bool room_for(const char* text, int32_t more, int32_t buffer_size) {
  return buffer_size >= 0 && std::strlen(text) + static_cast<size_t>(more) <= static_cast<size_t>(buffer_size);
}

int compare_ignoring_case(const void* a, const void* b, size_t count) {
  const auto* left = static_cast<const uint8_t*>(a);
  const auto* right = static_cast<const uint8_t*>(b);
  for (size_t i = 0; i < count; ++i) {
    if (int difference = to_lower(left[i]) - to_lower(right[i])) return difference;
  }
  return 0;
}

void complain_about_room(int32_t provided, size_t needed) {
  std::fprintf(stderr, "Buffer provided = %d, needed = %d\n", provided, static_cast<int>(needed));
}

}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXGetEnv(const char* name, char* buffer, int32_t buffer_size) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    const char* value = name != nullptr ? HSV1_GetEnv(name, 0) : nullptr;
    if (value == nullptr) return 0;
    size_t needed = std::strlen(value) + 1;
    if (needed > INT32_MAX) return INT32_MAX;
    if (buffer != nullptr && static_cast<int64_t>(needed) <= buffer_size) std::memcpy(buffer, value, needed);
    return static_cast<int32_t>(needed);
  });
}

int32_t LXGetDataLocation(char* buffer, int32_t buffer_size, int32_t use_default) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (use_default != 0) {
      if (buffer == nullptr || buffer_size < kDefaultLocationSize) return 0;
      std::memset(buffer, 0, kDefaultLocationSize);
      std::memcpy(buffer, kDefaultDirectory, sizeof kDefaultDirectory);
      return kDefaultLocationSize;
    }
    int32_t needed = LXGetEnv("LX_LOCALEDIR", buffer, buffer_size);
    if (needed == 0) return -1;
    return buffer != nullptr && needed <= buffer_size ? needed : 0;
  });
}

char* LXGetControlFileName(const char* directory, char* buffer, int32_t buffer_size) noexcept {
  return exported(trace_unit, __func__, [&]() -> char* {
    if (directory == nullptr || buffer == nullptr) return nullptr;
    if (!room_for(directory, sizeof kControlFile, buffer_size)) return nullptr;
    size_t length = std::strlen(directory);
    std::memmove(buffer, directory, length);
    std::memcpy(buffer + length, kControlFile, sizeof kControlFile);
    return buffer;
  });
}

char* LXGetDataFileName(const char* directory, uint8_t object_type, uint16_t object_id, char* buffer,
                        int32_t buffer_size) noexcept {
  return exported(trace_unit, __func__, [&]() -> char* {
    if (directory == nullptr || buffer == nullptr || object_type >= kObjectTypes) return nullptr;
    if (!room_for(directory, kObjectNameRoom, buffer_size)) {
      complain_about_room(buffer_size, std::strlen(directory) + kObjectNameRoom);
      return nullptr;
    }
    const LXGlobals* area = live_globals();
    std::snprintf(buffer, static_cast<size_t>(buffer_size), "%s%s%s%s%05d%s", directory,
                  area != nullptr ? area->directory_separator : "/", kTypePrefixes[object_type],
                  area != nullptr ? area->name_separator : "_", object_id, kObjectExtension);
    return buffer;
  });
}

int LXmemicmp(const void* a, const void* b, size_t count) noexcept {
  return exported(trace_unit, __func__, [&] { return compare_ignoring_case(a, b, count); });
}

}  // extern "C"
