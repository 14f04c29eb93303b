// SPDX-License-Identifier: Apache-2.0
// The default locale of the process, the end of locales, and the user's locale.
#include <gtest/gtest.h>

#include <clocale>

#include "support/counting_allocator.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

std::string territory_of(LXLocale* locale) {
  const char* name = LXGetObjName(LXGetLocaleObject(locale, LX_TERRITORY));
  return name != nullptr ? name : "-";
}

TEST(DefaultLocale, IsReplaced) {
  Session session;
  EXPECT_EQ(lxglocale, nullptr);
  EXPECT_EQ(LXSetLocale("German", 0), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "Germany");
  const LXLocale* before = lxglocale;
  EXPECT_EQ(LXSetLocale("Klingon", 0), LX_E_LANGUAGE);
  EXPECT_EQ(lxglocale, before) << "a failure changes nothing";
  const LXWChar wide[] = {'F', 'r', 'e', 'n', 'c', 'h', 0};
  EXPECT_EQ(LXSetLocaleW(wide, 0), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "France");
  const LXUChar ucs2[] = {'S', 'p', 'a', 'n', 'i', 's', 'h', 0};
  EXPECT_EQ(LXSetLocaleU(ucs2, 0), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "Spain");
  EXPECT_EQ(LXSetLocale(nullptr, 0), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "UnitedStates");
}

TEST(DefaultLocale, NoneIsLeftWhenItIsReleased) {
  Session session;
  ASSERT_EQ(LXSetLocale("German", 0), LX_OK);
  EXPECT_EQ(LXReleaseLocale(lxglocale, 0), LX_OK);
  EXPECT_EQ(lxglocale, nullptr);
  EXPECT_EQ(LXReleaseLocale(nullptr, 0), LX_OK);
  ASSERT_EQ(LXSetLocale("German", 0), LX_OK);
  Locale other = locale_of("UTF-8");
  other.reset();
  EXPECT_NE(lxglocale, nullptr) << "releasing another leaves it";
}

TEST(DefaultLocale, ReleaseReportsTheFreeCallback) {
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(LEXARO_DATA), LX_OK);
  uint32_t rc = 0;
  LXLocale* locale = LXGetLocale("German", 0, &rc);
  ASSERT_NE(locale, nullptr);
  allocator.free_fails = true;
  EXPECT_EQ(LXReleaseLocale(locale, 0), 1u);
  allocator.free_fails = false;
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(allocator.live, 0);
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
  lx_lang_.set("German_Austria.UTF-8");
  EXPECT_EQ(name_and_origin(), "1 German_Austria.UTF-8");
  EXPECT_EQ(get_user(0), "Austria");
  lx_lang_.set("");
  EXPECT_EQ(name_and_origin(), "1 ");
  EXPECT_EQ(get_user(0), "UnitedStates");
  lx_lang_.set("Klingon");
  EXPECT_EQ(get_user(0), "31");
  EXPECT_EQ(get_user(LX_GET_SUBSTITUTE), "UnitedStates");
  lx_lang_.set((std::string(1000, 'x')).c_str());
  EXPECT_EQ(get_user(0), "31");
  EXPECT_EQ(LXSetLocale(nullptr, LX_GET_USER), LX_E_LANGUAGE);
  lx_lang_.set("German");
  EXPECT_EQ(LXSetLocale(nullptr, LX_GET_USER), LX_OK);
  EXPECT_EQ(territory_of(nullptr), "Germany");
  uint32_t rc = 99;
  Locale wide(LXGetLocaleW(nullptr, LX_GET_USER, &rc));
  EXPECT_EQ(territory_of(wide.get()), "Germany");
  Locale ucs2(LXGetLocaleU(nullptr, LX_GET_USER, &rc));
  EXPECT_EQ(territory_of(ucs2.get()), "Germany");
}

TEST_F(UserLocaleTest, CutToTheBuffer) {
  lx_lang_.set("German");
  for (int32_t size : {1, 6, 7, 8}) {
    Guarded buffer(static_cast<size_t>(size), '?');
    EXPECT_EQ(LXGetUserLocale(buffer.data(), size), 1);
    EXPECT_EQ(buffer.view(), std::string("German\0?", 8).substr(0, static_cast<size_t>(size))) << size;
  }
  char one;
  EXPECT_EQ(LXGetUserLocale(&one, 0), 0);
  EXPECT_EQ(LXGetUserLocale(nullptr, 10), 0);
}

TEST_F(UserLocaleTest, FromTheSystem) {
  lc_all_.set("C");
  EXPECT_EQ(name_and_origin(), "2 English_UnitedStates.US-ASCII@Binary");
  EXPECT_EQ(get_user(0), "UnitedStates");
  lc_all_.set("POSIX");
  EXPECT_EQ(name_and_origin(), "2 English_UnitedStates.US-ASCII@Binary");
  lc_all_.set("xx_YY");  // unknown to the system, so its name is taken from the variable
  EXPECT_EQ(name_and_origin(), "2 Unknown");
  EXPECT_EQ(get_user(0), "31");
  EXPECT_EQ(get_user(LX_GET_SUBSTITUTE), "UnitedStates");
  lc_all_.set(nullptr);
  lang_.set("de_CH.unknown");
  EXPECT_EQ(name_and_origin(), "2 Unknown");
  lc_all_.set("C");
  for (int32_t size : {1, 5, 36}) {
    Guarded buffer(static_cast<size_t>(size), '?');
    EXPECT_EQ(LXGetUserLocale(buffer.data(), size), 2);
    EXPECT_EQ(buffer.data()[size - 1], '\0');
  }
}

TEST_F(UserLocaleTest, SystemLocaleIsLeftAsItWas) {
  lc_all_.set("C");
  for (const char* before : {"C", "POSIX", "C.utf8"}) {
    if (std::setlocale(LC_ALL, before) == nullptr) continue;
    name_and_origin();
    get_user(0);
    EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), std::string(before) == "POSIX" ? "C" : before);
  }
  std::setlocale(LC_ALL, "C");
}

}  // namespace
}  // namespace lx::test
