// SPDX-License-Identifier: Apache-2.0
#include "bench/support/program.hpp"

#include <cstdio>
#include <cstring>

namespace lx::bench {
namespace {

bool parse(int count, char** arguments, Options& options) {
  for (int i = 1; i < count; ++i) {
    const char* value = i + 1 < count ? arguments[i + 1] : nullptr;
    if (std::strcmp(arguments[i], "--quick") == 0) {
      options.quick = true;
    } else if (std::strcmp(arguments[i], "--only") == 0 && value != nullptr) {
      options.only = arguments[++i];
    } else if (std::strcmp(arguments[i], "--data") == 0 && value != nullptr) {
      options.data = arguments[++i];
    } else {
      return false;
    }
  }
  return true;
}

}  // namespace

bool Options::wants(const char* row) const { return std::strstr(row, only) != nullptr; }

int run_program(const char* name, int argc, char** argv, int (*run)(const Options&)) {
  Options options;
  if (!parse(argc, argv, options)) {
    std::fprintf(stderr, "usage: %s [--quick] [--only TEXT] [--data DIRECTORY]\n", name);
    return 2;
  }
  try {
    return run(options);
  } catch (const std::runtime_error& failure) {
    std::fprintf(stderr, "%s: %s\n", name, failure.what());
    return 2;
  }
}

}  // namespace lx::bench
