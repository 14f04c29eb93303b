// SPDX-License-Identifier: Apache-2.0
// Locales of the C library for a benchmark: made with its own tool, in a directory that goes with this.
#pragma once

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <initializer_list>
#include <stdexcept>
#include <string>

namespace lx::bench {

class SystemLocales {
 public:
  // Of these sources, each as NAME.UTF-8. What cannot be made is told; the contender then misses its locale.
  explicit SystemLocales(std::initializer_list<const char*> sources) {
    char name[] = "/tmp/bench-locales-XXXXXX";
    if (mkdtemp(name) == nullptr) throw std::runtime_error("no temporary directory");
    directory_ = name;
    for (const std::string source : sources) {
      const std::string command = "localedef -i " + source + " -f UTF-8 " + directory_ + "/" + source + ".UTF-8";
      if (std::system((command + " > /dev/null 2>&1").c_str()) == 0) continue;
      std::fprintf(stderr, "localedef: no %s\n", source.c_str());
    }
    setenv("LOCPATH", name, 1);
  }
  ~SystemLocales() {
    std::error_code error;
    std::filesystem::remove_all(directory_, error);
  }
  SystemLocales(const SystemLocales&) = delete;
  SystemLocales& operator=(const SystemLocales&) = delete;

 private:
  std::string directory_;
};

}  // namespace lx::bench
