// SPDX-License-Identifier: Apache-2.0
// The first call initialises the library on the compiled data; the user speaks French.
#include <gtest/gtest.h>

#include <cstdlib>

namespace {

class FrenchUser : public testing::Environment {
  void SetUp() override {
    setenv("NLS1_LOCALEDIR", LEXARO_DATA, 1);
    setenv("LX_LANG", "French_France.Latin1@BINARY", 1);
  }
};

[[maybe_unused]] testing::Environment* const environment = testing::AddGlobalTestEnvironment(new FrenchUser);

}  // namespace
