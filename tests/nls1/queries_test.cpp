// SPDX-License-Identifier: Apache-2.0
// Ids by name and names by id.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <string>
#include <tuple>
#include <vector>

#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

// By type of object.
constexpr decltype(&NLS1_GetSortId) kIds[] = {NLS1_GetLanguageId, NLS1_GetTerritoryId, NLS1_GetCodepageId,
                                              NLS1_GetSortId};
uint32_t name_of(uint8_t type, uint16_t id, char* buffer, int32_t size) {
  if (type == LX_LANGUAGE) return NLS1_GetLanguageName(id, buffer, size);
  if (type == LX_TERRITORY) return NLS1_GetTerritoryName(id, buffer, size);
  return type == LX_CODEPAGE ? NLS1_GetCodepageName(id, buffer, size) : NLS1_GetSortName(id, buffer, size);
}

TEST(Queries, GoThereAndBackForEveryObject) {
  std::vector<std::pair<uint8_t, std::string>> objects;
  auto note = [](void* context, uint8_t type, const char* name) -> int32_t {
    static_cast<decltype(objects)*>(context)->emplace_back(type, name);
    return 1;
  };
  LXEnumLocales(note, &objects, 0);
  ASSERT_GT(objects.size(), 100u);
  for (const auto& [type, name] : objects) {
    uint32_t rc = 99;
    const auto id = static_cast<uint16_t>(kIds[type](name.c_str(), &rc));
    EXPECT_EQ(rc, LX_OK) << name;
    const auto size = static_cast<int32_t>(name.size());
    char buffer[40] = "untouched";
    TraceCapture trace;
    EXPECT_EQ(name_of(type, id, buffer, size), LX_E_BUFFER);
    EXPECT_STREQ(buffer, "untouched");
    const std::string number = "(" + std::to_string(size) + ")";
    EXPECT_TRUE(trace.has("Object name length " + number + " for " + name + " exceeds output buffer length " + number));
    EXPECT_EQ(name_of(type, id, buffer, size + 1), LX_OK);
    EXPECT_EQ(buffer, name);
    EXPECT_EQ(NLS1_GetObjectName(id, buffer, sizeof buffer, type), LX_OK);
    EXPECT_EQ(buffer, name);
  }
}

TEST(Queries, LoadNothingAndKnowTheAliasesOfPages) {
  uint32_t rc = 99;
  EXPECT_EQ(NLS1_GetCodepageId("cp1168", &rc), 1168u);
  EXPECT_EQ(rc, LX_OK);
  char name[32];
  EXPECT_EQ(NLS1_GetCodepageName(1168, name, sizeof name), LX_OK);
  LXCodePageInfo info;
  EXPECT_EQ(LXGetCodePageInfo(LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, 1168, 1, nullptr), &info), LX_E_ARGUMENT);
}

TEST(Queries, UnknownNamesAndIds) {
  for (uint8_t type = LX_LANGUAGE; type <= LX_SORT; ++type) {
    for (const char* name : {"", "English_", static_cast<const char*>(nullptr)}) {
      uint32_t rc = 99;
      EXPECT_EQ(kIds[type](name, &rc), 0u);
      EXPECT_EQ(rc, LX_E_NOTFOUND) << int{type} << (name != nullptr ? name : " null");
    }
    EXPECT_EQ(name_of(type, 65535, nullptr, 0), LX_E_NOTFOUND);
    EXPECT_EQ(NLS1_GetObjectName(1, nullptr, 0, static_cast<uint8_t>(type + 4)), LX_E_NOTFOUND);
  }
  // The binary sort has no name, but is no error.
  char buffer[40] = "untouched";
  EXPECT_EQ(NLS1_GetSortName(0, buffer, sizeof buffer), LX_OK);
  EXPECT_STREQ(buffer, "untouched");
}

TEST(Queries, CombinedIds) {
  for (auto [id, language, territory] : {std::tuple(0x00000002u, "German", "none"),
                                         {0x00000114u, "none", "Germany"},
                                         {0x01140002u, "German", "Germany"}}) {
    char name[40] = "none", territory_name[40] = "none";
    NLS1_GetLanguageName(static_cast<int32_t>(id), name, sizeof name);
    NLS1_GetTerritoryName(static_cast<int32_t>(id), territory_name, sizeof territory_name);
    EXPECT_STREQ(name, language);
    EXPECT_STREQ(territory_name, territory);
  }
  EXPECT_EQ(NLS1_GetLanguageName(1, nullptr, 40), LX_E_BUFFER);
}

}  // namespace
}  // namespace lx::test
