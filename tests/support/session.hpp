// SPDX-License-Identifier: Apache-2.0
// What most tests stand on: the initialised library, locales that free themselves, and memory whose edge is real.
#pragma once

#include <gtest/gtest.h>
#include <lexaro/lexaro.h>
#include <sys/mman.h>
#include <unistd.h>

#include <cstring>
#include <memory>
#include <string>
#include <string_view>

namespace lx::test {

// The library on the compiled data, for as long as the object lives.
class Session {
 public:
  explicit Session(const char* directory = LEXARO_DATA) : status(LXInit(directory, nullptr, nullptr, nullptr, 0)) {}
  ~Session() { LXTerm(); }
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;
  uint32_t status;
};

struct ReleaseLocale {
  void operator()(LXLocale* locale) const { LXReleaseLocale(locale, 0); }
};
using Locale = std::unique_ptr<LXLocale, ReleaseLocale>;

// English with that code page and the binary sort.
inline Locale locale_of(std::string_view code_page) {
  uint32_t rc = LX_OK;
  std::string name = "English_UnitedStates." + std::string(code_page) + "@BINARY";
  Locale locale(LXGetLocale(name.c_str(), 0, &rc));
  EXPECT_NE(locale, nullptr) << name << ": " << rc;
  return locale;
}

struct CloseConversion {
  void operator()(LXConversion* handle) const { LXCloseConversion(handle); }
};
using Conversion = std::unique_ptr<LXConversion, CloseConversion>;

// A block of memory that ends (and begins) at an unmapped page, so that a step too far is a crash.
class Guarded {
 public:
  explicit Guarded(size_t size, char fill = '\x5A') : size_(size) {
    auto page = static_cast<size_t>(sysconf(_SC_PAGESIZE));
    mapped_ = (size + page - 1) / page * page + 2 * page;
    base_ = static_cast<char*>(mmap(nullptr, mapped_, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0));
    mprotect(base_, page, PROT_NONE);
    mprotect(base_ + mapped_ - page, page, PROT_NONE);
    data_ = base_ + mapped_ - page - size;
    std::memset(data_, fill, size);
  }
  explicit Guarded(std::string_view text) : Guarded(text.size()) { std::memcpy(data_, text.data(), text.size()); }
  ~Guarded() { munmap(base_, mapped_); }
  Guarded(const Guarded&) = delete;
  Guarded& operator=(const Guarded&) = delete;

  char* data() { return data_; }
  template <class Unit>
  Unit* as() {
    return reinterpret_cast<Unit*>(data_);
  }
  size_t size() const { return size_; }
  std::string_view view() const { return {data_, size_}; }

 private:
  size_t size_;
  size_t mapped_;
  char* base_;
  char* data_;
};

}  // namespace lx::test
