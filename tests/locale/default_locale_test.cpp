// SPDX-License-Identifier: Apache-2.0
// The default locale of the process, the end of locales, and the user's locale.
#include <gtest/gtest.h>

#include <clocale>
#include <tuple>

#include "support/environment.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

std::string territory_of(LXLocale* locale) {
  const char* name = LXGetObjName(LXGetLocaleObject(locale, LX_TERRITORY));
  return name != nullptr ? name : "-";
}

TEST(DefaultLocale, IsReplaced) {
  Session session;
  EXPECT_EQ(LXSetLocale("German", 0), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "Germany");
  EXPECT_EQ(LXSetLocale("Klingon", 0), LX_E_LANGUAGE);
  EXPECT_EQ(territory_of(nullptr), "Germany") << "a failure changes nothing";
  locale_of("UTF-8").reset();
  EXPECT_EQ(territory_of(nullptr), "Germany") << "releasing another leaves it";
  const LXWChar wide[] = {'F', 'r', 'e', 'n', 'c', 'h', 0};
  EXPECT_EQ(LXSetLocaleW(wide, 0), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "France");
  const LXUChar ucs2[] = {'S', 'p', 'a', 'n', 'i', 's', 'h', 0};
  EXPECT_EQ(LXSetLocaleU(ucs2, 0), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "Spain");
  EXPECT_EQ(LXReleaseLocale(lxglocale, 0), LX_OK);
  EXPECT_EQ(lxglocale, nullptr);
}

// ---- The user's locale ----------------------------------------------------------------------------------------------

class UserLocaleTest : public testing::Test {
 protected:
  std::string name_and_origin() {
    char name[132] = {};
    int32_t origin = LXGetUserLocale(name, sizeof name);
    return std::to_string(origin) + " " + name;
  }
  std::string get_user(uint32_t options) {
    uint32_t rc = 99;
    Locale locale(LXGetLocale("French", options | LX_GET_USER, &rc));
    return locale != nullptr ? territory_of(locale.get()) : std::to_string(rc);
  }
  Session session_;
  Variable lx_lang_{"LX_LANG", nullptr};
  Variable lc_all_{"LC_ALL", nullptr};
  Variable lang_{"LANG", nullptr};
};

TEST_F(UserLocaleTest, FromTheVariable) {
  const std::string long_name(131, 'x');
  for (auto [value, territory, with_substitution] : {std::tuple("German_Austria.UTF-8", "Austria", "Austria"),
                                                     {"", "UnitedStates", "UnitedStates"},
                                                     {long_name.c_str(), "31", "UnitedStates"}}) {
    lx_lang_.set(value);
    EXPECT_EQ(name_and_origin(), std::string("1 ") + value);
    EXPECT_EQ(get_user(0), territory);
    EXPECT_EQ(get_user(LX_GET_SUBSTITUTE), with_substitution);
  }
  lx_lang_.set(std::string(1000, 'x').c_str());
  EXPECT_EQ(LXSetLocale(nullptr, LX_GET_USER), LX_E_LANGUAGE);
}

// Names known to the system are left as they were; of those unknown to it the variable has the name.
TEST_F(UserLocaleTest, FromTheSystem) {
  const std::string c_name = "2 English_UnitedStates.US-ASCII@Binary";
  for (auto [variable, value, name, territory] : {std::tuple(&lc_all_, "POSIX", c_name, "UnitedStates"),
                                                  {&lc_all_, "xx_YY", "2 Unknown", "31"},
                                                  {&lang_, "C", c_name, "UnitedStates"},
                                                  {&lang_, "de_CH.x", "2 Unknown", "31"}}) {
    std::setlocale(LC_ALL, "C.utf8");
    const std::string before = std::setlocale(LC_ALL, nullptr);
    lc_all_.set(nullptr);
    variable->set(value);
    EXPECT_EQ(name_and_origin(), name) << value;
    EXPECT_EQ(get_user(0), territory) << value;
    EXPECT_EQ(get_user(LX_GET_SUBSTITUTE), "UnitedStates");
    EXPECT_EQ(std::setlocale(LC_ALL, nullptr), before);
  }
  std::setlocale(LC_ALL, "C");
}

// A name that just fits has no terminator.
TEST_F(UserLocaleTest, CutToTheBuffer) {
  lx_lang_.set("German");
  for (size_t size : {1u, 6u, 7u, 8u}) {
    Guarded buffer(size, '?');
    EXPECT_EQ(LXGetUserLocale(buffer.data(), static_cast<int32_t>(size)), 1);
    EXPECT_EQ(buffer.view(), std::string("German\0?", 8).substr(0, size));
  }
}

}  // namespace
}  // namespace lx::test
