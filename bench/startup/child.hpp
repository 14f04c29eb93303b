// SPDX-License-Identifier: Apache-2.0
// A process that converts one string, uses ten locales, or ends at once, as its argument says; with a second argument
// it prints the memory that it takes by then.
#pragma once

#include <cstdio>
#include <cstring>
#include <initializer_list>

namespace lx::bench {

inline constexpr char kEmpty[] = "empty";
inline constexpr char kWork[] = "work";
inline constexpr char kTen[] = "ten";

// "NAME, TOWN 12345" in EBCDIC.
inline constexpr char kText[] = "\xD5\xC1\xD4\xC5\x6B\x40\xE3\xD6\xE6\xD5\x40\xF1\xF2\xF3\xF4\xF5";
inline constexpr int kTextLength = 16;

// Prints the kilobytes of resident memory, with what of shared libraries has been touched, and of the process alone.
inline void print_memory() {
  std::FILE* file = std::fopen("/proc/self/smaps_rollup", "r");
  char line[256];
  while (file != nullptr && std::fgets(line, sizeof line, file) != nullptr) {
    for (const char* name : {"Rss:", "Anonymous:"}) {
      if (std::strncmp(line, name, std::strlen(name)) == 0) std::fputs(line + std::strlen(name), stdout);
    }
  }
}

inline int run_child(int count, char** arguments, bool (*work)(), bool (*ten)()) {
  const char* mode = count > 1 ? arguments[1] : kWork;
  if (std::strcmp(mode, kWork) == 0 && !work()) return 1;
  if (std::strcmp(mode, kTen) == 0 && !ten()) return 1;
  if (count > 2) print_memory();
  return 0;
}

}  // namespace lx::bench
