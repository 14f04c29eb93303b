// SPDX-License-Identifier: Apache-2.0
// Locales that run out of memory while they are changed report what they reported before.
#include <gtest/gtest.h>

#include <clocale>

#include "faults/each_allocation.hpp"
#include "support/locale_model.hpp"
#include "support/session.hpp"
#include "support/system_locales.hpp"

namespace lx::test {
namespace {

LXLocale* g_locale;
std::string g_before;

LXObjEntry* entry(uint8_t type, const char* name) {
  return LXGetObjFromName(LXGetObjManager(), type, name, -1, 0, nullptr);
}
uint32_t status_of(int32_t result) { return result == 1 ? LX_OK : LXGetError(g_locale); }
const LXUChar* ucs2(const char16_t* text) { return reinterpret_cast<const LXUChar*>(text); }

// Some values are the caller's, some the territory's.
void get_locale(const char* name) {
  g_locale = LXGetLocale(name, 0, nullptr);
  ASSERT_NE(g_locale, nullptr);
  for (uint32_t item : {62u, 64u, 80u}) EXPECT_EQ(LXSetLocaleTextInfo(g_locale, item, "x", -1, 0), 1);
  EXPECT_EQ(LXSetLocaleTextInfo(g_locale, 59, "'", -1, 0), 1);
  EXPECT_EQ(LXSetLocaleNumInfo(g_locale, 63, 5), 1);
  g_before = snapshot(g_locale);
}

void expect_unchanged() { EXPECT_EQ(snapshot(g_locale), g_before); }

const char kLong[] = "a longer text than it was before";
const char16_t kLongUcs2[] = u"a longer text \u3041\u3042 than it was before";
const LXWChar kLongWide[] = {'W', 0x4140, 0x8141, 'x', 'y', 'z', 'z', 'z', 'z', 'z', 'z', 'z', 'z', 'z', 'z', 'z', 0};

TEST(LocaleAllocation, OfChanges) {
  struct Case {
    const char* name;
    uint32_t (*call)();
    bool changes = true;
  };
  const Case cases[] = {
      {"territory by id", [] { return status_of(LXSetLocaleNumInfo(g_locale, LX_ITEM_TERRITORY_ID, 1)); }},
      {"code page by id", [] { return status_of(LXSetLocaleNumInfo(g_locale, LX_ITEM_CODEPAGE_ID, 902)); }},
      {"language by id", [] { return status_of(LXSetLocaleNumInfo(g_locale, LX_ITEM_LANGUAGE_ID, 1)); }},
      {"territory by name", [] { return status_of(LXSetLocaleTextInfo(g_locale, 6, "UnitedStates", -1, 0)); }},
      {"code page by name", [] { return status_of(LXSetLocaleTextInfoU(g_locale, 10, ucs2(u"OldSmall"), -1, 0)); }},
      {"language by name", [] { return status_of(LXSetLocaleTextInfo(g_locale, 2, "English", -1, 0)); }},
      {"territory", [] { return LXLocaleChangeTerritory(g_locale, entry(LX_TERRITORY, "UnitedStates")); }},
      {"code page", [] { return LXLocaleChangeCodePage(g_locale, entry(LX_CODEPAGE, "US-ASCII")); }},
      {"refill", [] { return LXLocaleSetModifiable(g_locale); }, false},
      {"text", [] { return status_of(LXSetLocaleTextInfo(g_locale, 64, kLong, -1, 0)); }},
      {"text first set", [] { return status_of(LXSetLocaleTextInfo(g_locale, 81, kLong, 30, LX_OPT_CHARS)); }},
      {"text W", [] { return status_of(LXSetLocaleTextInfoW(g_locale, 64, kLongWide, -1, 0)); }},
      {"text U", [] { return status_of(LXSetLocaleTextInfoU(g_locale, 72, ucs2(kLongUcs2), -1, 0)); }},
      {"text Ex", [] { return status_of(LXSetLocaleTextInfoEx(g_locale, 80, kLong, -1, nullptr, 0)); }},
      {"text of another page",
       [] { return status_of(LXSetLocaleTextInfoEx(g_locale, 80, kLong, -1, entry(LX_CODEPAGE, "US-ASCII"), 0)); }},
      {"separator U", [] { return status_of(LXSetLocaleTextInfoU(g_locale, 66, ucs2(u"#"), 1, 0)); }},
  };
  for (const char* page : {"Small", "Mixed"}) {
    for (const Case& one : cases) {
      auto check = [&] { EXPECT_EQ(snapshot(g_locale) != g_before, one.changes); };
      fail_each_allocation(
          {one.name, one.call, check, LX_E_MEMORY, expect_unchanged},
          [&] { get_locale((std::string("German_Germany.") + page + "@BINARY").c_str()); },
          [] { EXPECT_EQ(LXReleaseLocale(std::exchange(g_locale, nullptr), 0), LX_OK); });
    }
  }
}

// The system's values are an extra: without memory for them the locale keeps its territory's, each as a whole.
TEST(LocaleAllocation, OfSystemValues) {
  const SystemLocales system({{"de_CH", "de_CH", "ISO-8859-1"}});
  Variable lx_lang("LX_LANG", nullptr);
  Variable all("LC_ALL", system.made() ? "de_CH" : "C");
  std::string former, latter;
  for (bool user : {false, true}) {
    bool failed = true;
    for (int n = 0; failed; ++n) {
      SCOPED_TRACE(n);
      CountingAllocator allocator;
      ASSERT_EQ(allocator.init(small_directory().path(), LX_INIT_NO_DEFAULTS), LX_OK);
      allocator.arm(n, n % 2 == 1);
      uint32_t rc = 99;
      Locale locale(user ? LXGetLocale(nullptr, LX_GET_USER | LX_GET_SUBSTITUTE, &rc)
                         : LXConvertNativeLocale(system.made() ? "de_CH" : "C", LX_GET_SUBSTITUTE, &rc));
      failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_EQ(rc, locale != nullptr ? LX_OK : LX_E_MEMORY);
      EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C");
      if (locale != nullptr) {
        for (uint32_t item : {LX_ITEM_GROUPING, LX_ITEM_MON_GROUPING}) {
          char text[16];
          EXPECT_GT(LXGetLocaleTextInfo(locale.get(), item, text, 16, 0), 1);
          EXPECT_TRUE(text == std::string("3;0") || text == std::string("3;2;0") || text == std::string("3;3;0"))
              << text;
        }
        EXPECT_EQ(LXGetLocaleNumInfo(locale.get(), LX_ITEM_CURRENCY_DIGITS, 0), system.made() ? 2 : 3);
      }
      locale.reset();
      EXPECT_EQ(LXTerm(), LX_OK);
      ASSERT_EQ(allocator.live, 0);
    }
  }
}

}  // namespace
}  // namespace lx::test
