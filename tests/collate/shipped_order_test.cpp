// SPDX-License-Identifier: Apache-2.0
// The order of a few words by the sort objects that come with the library.
#include <vector>

#include "support/session.hpp"

namespace lx::test {
namespace {

TEST(ShippedOrder, OfWords) {
  struct Case {
    const char* sort;
    std::vector<std::string> words;  // in order
  };
  const Case cases[] = {
      {"Default", {"", "1", "2", "a", "A", "ab", "B", "cote", "coté", "côte", "côté", "z", "α", "β", "я"}},
      {"Default", {"resume", "Resume", "résumé", "resumes"}},
      {"Default", {"Strasse", "Straße", "Strassen"}},
      {"Spanish", {"nube", "nzz", "ñandú", "Ñandú", "obra"}},
      {"Swedish", {"zebra", "ål", "ärlig", "öl"}},
      {"Finnish", {"zebra", "ål", "ärlig", "öl"}},
      {"CanadianFrench", {"cote", "côte", "coté", "côté"}},
      {"Czech", {"cukr", "čaj", "dům", "hora", "hz", "chata", "ikona"}},
      {"Hungarian", {"cukor", "cz", "csak", "dal"}},
  };
  Session session;
  for (const Case& one : cases) {
    uint32_t rc = 99;
    Locale locale(LXGetLocale((std::string("English_UnitedStates.UTF-8@") + one.sort).c_str(), 0, &rc));
    ASSERT_EQ(rc, uint32_t{LX_OK}) << one.sort;
    for (bool keys : {false, true}) {
      for (size_t i = 0; i < one.words.size(); ++i) {
        for (size_t j = 0; j < one.words.size(); ++j) {
          const std::string &a = one.words[i], &b = one.words[j];
          int result = LXStrcoll(locale.get(), a.c_str(), -1, b.c_str(), -1, 0);
          if (keys) {
            auto key = [&](const std::string& word) {
              std::string room(400, '\0');
              int32_t length = LXStrxfrm(locale.get(), room.data(), 400, word.c_str(), -1, 0);
              return room.substr(0, static_cast<size_t>(length));
            };
            result = key(a).compare(key(b));
          }
          EXPECT_EQ((result > 0) - (result < 0), (i > j) - (i < j))
              << one.sort << ": " << a << ' ' << b << (keys ? " by keys" : "");
        }
      }
    }
  }
}

TEST(ShippedOrder, LeavesPunctuationToTheLastLevel) {
  Session session;
  uint32_t rc = 99;
  Locale locale(LXGetLocale("English_UnitedStates.Latin1@Default", 0, &rc));
  ASSERT_EQ(rc, uint32_t{LX_OK});
  EXPECT_LT(LXStrcoll(locale.get(), "coop", -1, "co-op", -1, 0), 0);
  EXPECT_LT(LXStrcoll(locale.get(), "co-op", -1, "Coop", -1, 0), 0);
  EXPECT_LT(LXStrcoll(locale.get(), "co-op", -1, "coops", -1, 0), 0);
}

}  // namespace
}  // namespace lx::test
