// SPDX-License-Identifier: Apache-2.0
// Locales of the operating system, made with its own tool in a directory that LOCPATH names as long as this lives.
#pragma once

#include <gtest/gtest.h>
#include <unistd.h>

#include <bit>
#include <cstdlib>
#include <string>
#include <vector>

#include "support/environment.hpp"
#include "support/object_builder.hpp"

namespace lx::test {

struct SystemLocale {
  const char* native;
  const char* source;
  const char* charset;
};

class SystemLocales {
 public:
  explicit SystemLocales(const std::vector<SystemLocale>& locales) {
    const std::string order = std::endian::native == std::endian::big ? " --big-endian" : "";
    std::string command = "cd " + std::string(directory_.path()) + " && { ";
    for (const SystemLocale& one : locales) {
      command += "localedef" + order + " -i " + one.source + " -f " + one.charset + " ./" + one.native + " & ";
    }
    made_ = std::system((command + "wait; } >log 2>&1").c_str()) == 0;
    for (const SystemLocale& one : locales) {
      made_ = made_ && access((directory_.file(one.native) + "/LC_MONETARY").c_str(), F_OK) == 0;
    }
  }
  // False where the tool or its sources are not installed.
  bool made() const { return made_; }
  // A further name for one of them.
  void add_name(const char* native, const std::string& name) const {
    EXPECT_EQ(symlink(directory_.file(native).c_str(), directory_.file(name).c_str()), 0) << name;
  }

 private:
  DataDirectory directory_;
  Variable location_{"LOCPATH", directory_.path()};
  bool made_;
};

}  // namespace lx::test
