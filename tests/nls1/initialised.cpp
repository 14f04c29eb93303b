// SPDX-License-Identifier: Apache-2.0
// The first call initialises the library on the compiled data; the user speaks French.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <cstdlib>

namespace {

class Initialised : public testing::Environment {
  void SetUp() override {
    setenv("NLS1_LOCALEDIR", LEXARO_DATA, 1);
    setenv("LX_LANG", "French_France.Latin1@BINARY", 1);
    ASSERT_EQ(NLS1_PrivateFunction_GetProcessLocale(), 0u);
    ASSERT_EQ(qlginflg, 1);
  }
  void TearDown() override {
    TermThread(HSV1_ResolveThread(&qlgnlthr_HSV1__T, "test"));
    TermProcess(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "test"));
    EXPECT_EQ(LXGetObjManager(), nullptr);
  }
};

[[maybe_unused]] testing::Environment* const environment = testing::AddGlobalTestEnvironment(new Initialised);

}  // namespace
