// SPDX-License-Identifier: Apache-2.0
// Ids by name and names by id.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <algorithm>
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

TEST(Queries, LoadNothing) {
  char name[32];
  EXPECT_EQ(NLS1_GetCodepageId("cp1168", nullptr), 1168u);
  EXPECT_EQ(NLS1_GetCodepageName(1168, name, sizeof name), LX_OK);
  LXCodePageInfo info;
  EXPECT_EQ(LXGetCodePageInfo(LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, 1168, 1, nullptr), &info), LX_E_ARGUMENT);
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
    std::string upper = name;
    for (char& c : upper) c = c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c;
    uint32_t rc = 99;
    const auto id = static_cast<uint16_t>(kIds[type](name.c_str(), &rc));
    EXPECT_EQ(rc, LX_OK) << name;
    EXPECT_EQ(kIds[type](upper.c_str(), nullptr), id) << name;
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

TEST(Queries, AliasesAreOfCodePagesOnly) {
  for (auto [name, id] : {std::pair("iBm-930", 930u), {"8859_1", 819u}, {"utf-8", 57352u}, {"IBM-1399", 1399u}}) {
    uint32_t rc = 99;
    EXPECT_EQ(NLS1_GetCodepageId(name, &rc), id);
    EXPECT_EQ(rc, LX_OK);
    EXPECT_EQ(NLS1_GetLanguageId(name, &rc), 0u);
    EXPECT_EQ(rc, LX_E_NOTFOUND);
  }
}

TEST(Queries, UnknownNamesAndIds) {
  for (uint8_t type = LX_LANGUAGE; type <= LX_SORT; ++type) {
    for (const char* name : {"", "English_", static_cast<const char*>(nullptr)}) {
      uint32_t rc = 99;
      EXPECT_EQ(kIds[type](name, &rc), 0u);
      EXPECT_EQ(rc, LX_E_NOTFOUND) << int{type} << (name != nullptr ? name : " null");
    }
    // The binary sort has no name, but is no error.
    char buffer[40] = "untouched";
    EXPECT_EQ(name_of(type, 65535, buffer, sizeof buffer), LX_E_NOTFOUND);
    EXPECT_EQ(name_of(type, 0, buffer, sizeof buffer), type == LX_SORT ? LX_OK : LX_E_NOTFOUND);
    EXPECT_EQ(NLS1_GetObjectName(0, nullptr, 0, type), type == LX_SORT ? LX_OK : LX_E_NOTFOUND);
    EXPECT_EQ(NLS1_GetObjectName(1, buffer, sizeof buffer, static_cast<uint8_t>(type + 4)), LX_E_NOTFOUND);
    EXPECT_STREQ(buffer, "untouched");
  }
  uint32_t rc = 99;
  EXPECT_EQ(NLS1_GetSortId("binary", &rc), 0u);
  EXPECT_EQ(rc, LX_OK);
}

TEST(Queries, CombinedIds) {
  using Name = decltype(&NLS1_GetLanguageName);
  auto name = [](Name of, uint32_t id) -> std::string {
    char buffer[40] = "";
    const uint32_t rc = of(static_cast<int32_t>(id), buffer, sizeof buffer);
    EXPECT_EQ(rc, *buffer != '\0' ? LX_OK : LX_E_NOTFOUND) << id;
    return buffer;
  };
  for (auto [id, language, territory] : {std::tuple(2u, "German", ""),
                                         {276u, "", "Germany"},
                                         {0x01140002u, "German", "Germany"},
                                         {0x01140000u, "", "Germany"},
                                         {0x80010002u, "German", ""},
                                         {0x0000FFFFu, "", ""}}) {
    EXPECT_EQ(name(NLS1_GetLanguageName, id), language);
    EXPECT_EQ(name(NLS1_GetTerritoryName, id), territory);
  }
  for (int32_t size : {0, -1}) EXPECT_EQ(NLS1_GetLanguageName(1, nullptr, size), LX_E_BUFFER);
}

}  // namespace
}  // namespace lx::test
