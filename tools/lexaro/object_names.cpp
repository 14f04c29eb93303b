// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/object_names.hpp"

#include "lexaro/lexaro.h"

namespace lx::tool {
namespace {

struct Collection {
  uint8_t type;
  std::vector<std::string> names;
};

int32_t collect(void* context, uint8_t type, const char* name) {
  auto& collection = *static_cast<Collection*>(context);
  if (type == collection.type) collection.names.emplace_back(name);
  return 1;
}

}  // namespace

std::vector<std::string> object_names(uint8_t type) {
  Collection collection{type, {}};
  LXEnumLocales(collect, &collection, 0);
  return std::move(collection.names);
}

bool object_exists(uint8_t type, const std::string& name) {
  uint32_t rc = LX_E_NOTFOUND;
  return LXGetObjFromName(LXGetObjManager(), type, name.c_str(), -1, 1, &rc) || rc == LX_OK;
}

}  // namespace lx::tool
