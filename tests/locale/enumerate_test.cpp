// SPDX-License-Identifier: Apache-2.0
#include <gtest/gtest.h>

#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

struct Listing {
  std::string text;
  int left = 1000;
};

template <class Unit>
int32_t note(void* context, uint8_t type, const Unit* name) {
  auto& listing = *static_cast<Listing*>(context);
  listing.text += std::to_string(type) + ":";
  for (; *name != 0; ++name) listing.text += static_cast<char>(*name);
  listing.text += " ";
  return --listing.left > 0 ? 1 : 0;
}

template <class Enumerate, class Unit>
std::string listed(Enumerate enumerate, int32_t (*callback)(void*, uint8_t, const Unit*), int left = 1000) {
  Listing listing{"", left};
  EXPECT_EQ(enumerate(callback, &listing, 0), 0);
  return listing.text;
}

TEST(Enumerate, AllObjectsInTheirOrder) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  const std::string all =
      "0:English 0:German 1:UnitedStates 1:Germany 2:US-ASCII 2:Small 2:Mixed 2:OldSmall 2:OldSingle ";
  EXPECT_EQ(listed(LXEnumLocales, note<char>), all);
  EXPECT_EQ(listed(LXEnumLocalesW, note<LXWChar>), all);
  EXPECT_EQ(listed(LXEnumLocalesU, note<LXUChar>), all);
  EXPECT_EQ(listed(LXEnumLocales, note<char>, 1), "0:English ");
  EXPECT_EQ(listed(LXEnumLocalesW, note<LXWChar>, 2), "0:English 0:German ");
  EXPECT_EQ(listed(LXEnumLocalesU, note<LXUChar>, 3), "0:English 0:German 1:UnitedStates ");
  EXPECT_EQ(LXEnumLocales(nullptr, nullptr, 0), 0);
}

TEST(Enumerate, BuiltInsAndNothing) {
  EXPECT_EQ(listed(LXEnumLocales, note<char>), "") << "before the start";
  Session session("/does/not/exist");
  EXPECT_EQ(listed(LXEnumLocales, note<char>), "0:English 1:UnitedStates 2:US-ASCII ");
}

}  // namespace
}  // namespace lx::test
