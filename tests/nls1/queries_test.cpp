// SPDX-License-Identifier: Apache-2.0
// Ids by name and names by id.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <algorithm>
#include <string>
#include <vector>

#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

using IdByName = uint32_t (*)(const char*, uint32_t*);

struct Object {
  uint8_t type;
  std::string name;
};

std::vector<Object> all_objects() {
  std::vector<Object> objects;
  auto note = [](void* context, uint8_t type, const char* name) -> int32_t {
    static_cast<std::vector<Object>*>(context)->push_back({type, name});
    return 1;
  };
  LXEnumLocales(note, &objects, 0);
  return objects;
}

uint32_t id_of(uint8_t type, const char* name, uint32_t* rc) {
  static constexpr IdByName kFunctions[] = {NLS1_GetLanguageId, NLS1_GetTerritoryId, NLS1_GetCodepageId,
                                            NLS1_GetSortId};
  return kFunctions[type](name, rc);
}

uint32_t name_of(uint8_t type, uint16_t id, char* buffer, int32_t size) {
  switch (type) {
    case LX_LANGUAGE:
      return NLS1_GetLanguageName(id, buffer, size);
    case LX_TERRITORY:
      return NLS1_GetTerritoryName(id, buffer, size);
    case LX_CODEPAGE:
      return NLS1_GetCodepageName(id, buffer, size);
    default:
      return NLS1_GetSortName(id, buffer, size);
  }
}

TEST(Queries, LoadNothing) {
  char name[32];
  EXPECT_EQ(NLS1_GetCodepageId("cp1168", nullptr), 1168u);
  EXPECT_EQ(NLS1_GetCodepageName(1168, name, sizeof name), LX_OK);
  LXCodePageInfo info;
  EXPECT_EQ(LXGetCodePageInfo(LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, 1168, 1, nullptr), &info), LX_E_ARGUMENT);
}

TEST(Queries, GoThereAndBackForEveryObject) {
  const std::vector<Object> objects = all_objects();
  ASSERT_GT(objects.size(), 100u);
  for (const Object& object : objects) {
    std::string upper = object.name;
    std::transform(upper.begin(), upper.end(), upper.begin(),
                   [](char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; });
    for (const std::string& name : {object.name, upper}) {
      uint32_t rc = 99;
      const uint32_t id = id_of(object.type, name.c_str(), &rc);
      EXPECT_EQ(rc, LX_OK) << name;
      const auto size = static_cast<int32_t>(object.name.size());
      char buffer[40] = "untouched";
      TraceCapture trace;
      EXPECT_EQ(name_of(object.type, static_cast<uint16_t>(id), buffer, size), LX_E_BUFFER);
      EXPECT_STREQ(buffer, "untouched");
      EXPECT_TRUE(trace.has("Object name length (" + std::to_string(size) + ") for " + object.name +
                            " exceeds output buffer length (" + std::to_string(size) + ")"))
          << trace.all();
      EXPECT_EQ(name_of(object.type, static_cast<uint16_t>(id), buffer, size + 1), LX_OK);
      EXPECT_EQ(buffer, object.name);
      EXPECT_EQ(NLS1_GetObjectName(static_cast<uint16_t>(id), buffer, sizeof buffer, object.type), LX_OK);
      EXPECT_EQ(buffer, object.name);
    }
  }
}

TEST(Queries, AliasesAreOfCodePagesOnly) {
  const struct {
    const char* name;
    uint32_t id;
  } cases[] = {{"iBm-930", 930}, {"CP37", 37}, {"8859_1", 819}, {"utf-8", 57352}, {"IBM-1399", 1399}};
  for (const auto& one : cases) {
    uint32_t rc = 99;
    EXPECT_EQ(NLS1_GetCodepageId(one.name, &rc), one.id) << one.name;
    EXPECT_EQ(rc, LX_OK);
    EXPECT_EQ(NLS1_GetLanguageId(one.name, &rc), 0u);
    EXPECT_EQ(rc, LX_E_NOTFOUND);
  }
}

TEST(Queries, UnknownNamesAndIds) {
  for (uint8_t type = LX_LANGUAGE; type <= LX_SORT; ++type) {
    for (const char* name : {"", "no such object", "English_", static_cast<const char*>(nullptr)}) {
      uint32_t rc = 99;
      EXPECT_EQ(id_of(type, name, &rc), 0u);
      EXPECT_EQ(rc, LX_E_NOTFOUND) << int{type} << (name != nullptr ? name : " null");
    }
    char buffer[40] = "untouched";
    EXPECT_EQ(name_of(type, 65535, buffer, sizeof buffer), LX_E_NOTFOUND);
    if (type != LX_SORT) {
      EXPECT_EQ(name_of(type, 0, buffer, sizeof buffer), LX_E_NOTFOUND);
    }
    EXPECT_EQ(NLS1_GetObjectName(1, buffer, sizeof buffer, static_cast<uint8_t>(type + 4)), LX_E_NOTFOUND);
    EXPECT_STREQ(buffer, "untouched");
  }
  EXPECT_EQ(NLS1_GetLanguageId("English", nullptr), 1u) << "the status is optional";
}

TEST(Queries, TheBinarySortHasNoNameButIsNoError) {
  char buffer[40] = "untouched";
  EXPECT_EQ(NLS1_GetSortName(0, buffer, sizeof buffer), LX_OK);
  EXPECT_EQ(NLS1_GetSortName(0, nullptr, 0), LX_OK);
  EXPECT_EQ(NLS1_GetObjectName(0, buffer, sizeof buffer, LX_SORT), LX_OK);
  EXPECT_STREQ(buffer, "untouched");
  for (const char* name : {"BINARY", "binary", "Binary"}) {
    uint32_t rc = 99;
    EXPECT_EQ(NLS1_GetSortId(name, &rc), 0u);
    EXPECT_EQ(rc, LX_OK);
  }
}

TEST(Queries, CombinedIds) {
  const struct {
    uint32_t value;
    const char* language;
    const char* territory;
  } cases[] = {
      {2, "German", nullptr},           {276, nullptr, "Germany"},       {0x01140002, "German", "Germany"},
      {0x01140000, nullptr, "Germany"}, {0x80010002, "German", nullptr}, {0xFFFF0001, "English", nullptr},
      {0x0000FFFF, nullptr, nullptr},
  };
  for (const auto& one : cases) {
    char buffer[40];
    const auto value = static_cast<int32_t>(one.value);
    EXPECT_EQ(NLS1_GetLanguageName(value, buffer, sizeof buffer), one.language != nullptr ? LX_OK : LX_E_NOTFOUND);
    if (one.language != nullptr) {
      EXPECT_STREQ(buffer, one.language);
    }
    EXPECT_EQ(NLS1_GetTerritoryName(value, buffer, sizeof buffer), one.territory != nullptr ? LX_OK : LX_E_NOTFOUND);
    if (one.territory != nullptr) {
      EXPECT_STREQ(buffer, one.territory) << std::hex << one.value;
    }
  }
  for (int32_t size : {0, -1}) EXPECT_EQ(NLS1_GetLanguageName(1, nullptr, size), LX_E_BUFFER);
}

}  // namespace
}  // namespace lx::test
