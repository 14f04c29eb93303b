// SPDX-License-Identifier: Apache-2.0
// The library with everything that a call may be given: a locale on a code page, its objects, files, texts.
#pragma once

#include <lexaro/nls1.h>

#include <map>
#include <string>

#include "support/counting_allocator.hpp"
#include "support/object_builder.hpp"

namespace lx::test {

// All memory that the library has; it outlives the library's last use.
CountingAllocator& memory();

// A number as it stands in memory.
std::string raw_number(int64_t value, size_t size);

// The far end of the streams.
struct Wire {
  std::string bytes;  // to be read
  size_t at = 0;
  int fail_at = -1;  // the number of the transfer that fails, and what it gives then
  int32_t failure = -1;
  bool failed = false;

  static Wire& get();
  static int32_t move(void* wire, void* buffer, int32_t count);
};

class World {
 public:
  explicit World(const char* page_name);
  ~World();
  World(const World&) = delete;
  World& operator=(const World&) = delete;

  // Units of a text as the page has them: "=" before ASCII, then "$" before the name of a file; "_" is a blank;
  // empty: some of all kinds. Hostile: what no text should be.
  const std::string& text(size_t unit, const std::string& value);
  const std::string& hostile(size_t unit) const;
  // A locale like the world's, with values of its own.
  LXLocale* own_locale() const;

  const std::string page_name;
  LXObjMgr* manager;
  LXLocale* locale;
  LXLocale* other;
  LXObjEntry *page, *other_page, *language, *sort;

 private:
  std::string encoded(size_t unit, const std::u16string& characters) const;

  std::map<std::pair<size_t, std::string>, std::string> texts_;
};

}  // namespace lx::test
