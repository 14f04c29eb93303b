// SPDX-License-Identifier: Apache-2.0
// The environment of a test: its variables, and what the C library makes of them.
#pragma once

#include <locale.h>

#include <cstdlib>
#include <string>

namespace lx::test {

#ifdef __GLIBC__
inline constexpr bool kSystemHasLocales = true;
#else
inline constexpr bool kSystemHasLocales = false;
#endif
inline constexpr char kOneLocale[] = "the C library has one locale, in UTF-8, for all names";

// Not on an emulated machine of another byte order: it finds the files of this machine, and cannot read them.
inline bool system_has(const char* locale) {
  const locale_t found = newlocale(LC_ALL_MASK, locale, nullptr);
  if (found != nullptr) freelocale(found);
  return found != nullptr;
}

// Set (or removed: null) as long as the object lives.
class Variable {
 public:
  Variable(const char* name, const char* value) : name_(name), had_(std::getenv(name) != nullptr) {
    if (had_) before_ = std::getenv(name);
    set(value);
  }
  ~Variable() { set(had_ ? before_.c_str() : nullptr); }
  Variable(const Variable&) = delete;
  Variable& operator=(const Variable&) = delete;

  void set(const char* value) { value != nullptr ? setenv(name_.c_str(), value, 1) : unsetenv(name_.c_str()); }

 private:
  std::string name_;
  bool had_;
  std::string before_;
};

}  // namespace lx::test
