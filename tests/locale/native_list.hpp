// SPDX-License-Identifier: Apache-2.0
// The system's locale names and what they mean, as the library lists them.
#pragma once

#include <lexaro/lexaro.h>

#include <string>
#include <vector>

namespace lx::test {

struct NativeName {
  std::string native, name;
  bool operator==(const NativeName&) const = default;
};

// The first of them, at most so many.
inline std::vector<NativeName> native_names(size_t most = SIZE_MAX) {
  struct List {
    size_t most;
    std::vector<NativeName> names = {};
  } list{most};
  auto note = [](void* context, const char* native, const char* name) -> int32_t {
    auto& [limit, names] = *static_cast<List*>(context);
    names.push_back({native, name});
    return names.size() < limit;
  };
  LXEnumNativeNames(note, &list);
  return list.names;
}

}  // namespace lx::test
