// SPDX-License-Identifier: Apache-2.0
// Variables, the names of data files, and the comparison without case.
#include <gtest/gtest.h>

#include "support/environment.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

TEST(Environment, ValueIsCopiedWhenItFits) {
  Variable variable("LX_TEST_VALUE", "abc");
  for (int32_t size : {-1, 0, 3, 4, 5}) {
    Guarded buffer(size > 0 ? static_cast<size_t>(size) : 0);
    EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", buffer.data(), size), 4) << size;
    if (size >= 4) {
      EXPECT_STREQ(buffer.data(), "abc");
    } else if (size > 0) {
      EXPECT_EQ(buffer.data()[0], 'Z') << "nothing is copied in part";
    }
  }
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", nullptr, 100), 4);
  variable.set("");
  char one[1] = {'x'};
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", one, 1), 1);
  EXPECT_EQ(one[0], '\0');
  variable.set(nullptr);
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", one, 1), 0);
  EXPECT_EQ(LXGetEnv(nullptr, one, 1), 0);
}

TEST(Environment, DataLocation) {
  Variable variable("LX_LOCALEDIR", nullptr);
  char buffer[32];
  EXPECT_EQ(LXGetDataLocation(buffer, sizeof buffer, 0), -1);
  variable.set("/somewhere");
  EXPECT_EQ(LXGetDataLocation(buffer, sizeof buffer, 0), 11);
  EXPECT_STREQ(buffer, "/somewhere");
  EXPECT_EQ(LXGetDataLocation(buffer, 11, 0), 11);
  EXPECT_EQ(LXGetDataLocation(buffer, 10, 0), 0) << "set, but too long";
  EXPECT_EQ(LXGetDataLocation(nullptr, 100, 0), 0);

  Guarded exact(17);
  EXPECT_EQ(LXGetDataLocation(exact.data(), 17, 1), 17);
  EXPECT_STREQ(exact.data(), "/Vantrel/locale");
  EXPECT_EQ(LXGetDataLocation(exact.data(), 16, 1), 0);
  EXPECT_EQ(LXGetDataLocation(nullptr, 17, 1), 0);
}

TEST(Environment, ControlFileName) {
  struct Case {
    const char* directory;
    int32_t size;
    const char* name;  // null: does not fit
  };
  const Case cases[] = {
      {"/d", 100, "/d/control.nls"},
      {"/d", 15, "/d/control.nls"},
      {"/d", 14, nullptr},
      {"/d", 2, nullptr},
      {"/d", 1, nullptr},
      {"/d", 0, nullptr},
      {"/d", -1, nullptr},
      {"", 13, "/control.nls"},
  };
  for (const Case& one : cases) {
    Guarded buffer(one.size > 0 ? static_cast<size_t>(one.size) : 0);
    char* name = LXGetControlFileName(one.directory, buffer.data(), one.size);
    if (one.name != nullptr) {
      ASSERT_EQ(name, buffer.data()) << one.size;
      EXPECT_STREQ(name, one.name);
    } else {
      EXPECT_EQ(name, nullptr) << one.size;
    }
  }
  char buffer[32];
  EXPECT_EQ(LXGetControlFileName(nullptr, buffer, sizeof buffer), nullptr);
  EXPECT_EQ(LXGetControlFileName("/d", nullptr, 32), nullptr);
}

TEST(Environment, DataFileName) {
  struct Case {
    const char* directory;
    uint8_t type;
    uint16_t id;
    const char* name;
  };
  const Case cases[] = {
      {"/Vantrel/locale", LX_LANGUAGE, 1, "/Vantrel/locale/la_00001.nls"},
      {"/d", LX_TERRITORY, 840, "/d/te_00840.nls"},
      {"/d", LX_CODEPAGE, 367, "/d/cp_00367.nls"},
      {"", LX_SORT, 65535, "/so_65535.nls"},
  };
  for (const Case& one : cases) {
    size_t exact = std::strlen(one.directory) + 14;
    Guarded buffer(exact);
    char* name = LXGetDataFileName(one.directory, one.type, one.id, buffer.data(), static_cast<int32_t>(exact));
    ASSERT_EQ(name, buffer.data());
    EXPECT_STREQ(name, one.name);
  }
  char buffer[32];
  EXPECT_EQ(LXGetDataFileName("/d", 4, 1, buffer, sizeof buffer), nullptr);
  EXPECT_EQ(LXGetDataFileName(nullptr, 0, 1, buffer, sizeof buffer), nullptr);
}

TEST(Environment, NameThatDoesNotFitIsExplained) {
  char buffer[32] = "before";
  testing::internal::CaptureStderr();
  EXPECT_EQ(LXGetDataFileName("/direct", LX_CODEPAGE, 37, buffer, 20), nullptr);
  EXPECT_EQ(LXGetDataFileName("/direct", LX_CODEPAGE, 37, buffer, -1), nullptr);
  EXPECT_EQ(LXGetAliasFileName("/direct", buffer, 16), nullptr);
  EXPECT_EQ(testing::internal::GetCapturedStderr(),
            "Buffer provided = 20, needed = 21\n"
            "Buffer provided = -1, needed = 21\n"
            "Buffer provided = 16, needed = 18\n");
  EXPECT_STREQ(buffer, "before");
}

int sign(int value) { return (value > 0) - (value < 0); }

TEST(Memicmp, IgnoresAsciiCaseOnly) {
  struct Case {
    std::string_view a, b;
    int sign;
  };
  using namespace std::string_view_literals;
  const Case cases[] = {
      {"BINARY", "binary", 0},  {"ab", "AC", -1},     {"AC", "ab", 1},         {"", "", 0},
      {"a\0b"sv, "A\0C"sv, -1}, {"\xC4", "\xE4", -1}, {"[", "{", -1},          {"Z", "[", 1},
      {"@", "`", -1},           {"\xFF", "a", 1},     {"a\0x"sv, "a\0X"sv, 0},
  };
  for (const Case& one : cases) {
    EXPECT_EQ(sign(LXmemicmp(one.a.data(), one.b.data(), one.a.size())), one.sign) << one.a << " " << one.b;
  }
  EXPECT_EQ(LXmemicmp("A", "c", 1), 'a' - 'c');
}

}  // namespace
}  // namespace lx::test
