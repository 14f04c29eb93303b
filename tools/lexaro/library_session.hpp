// SPDX-License-Identifier: Apache-2.0
// The library's start and end, and owners of its handles.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "lexaro/lexaro.h"
#include "tools/messages/message.hpp"

namespace lx::tool {

enum class WithoutData { kFail, kBuiltIn };

// The library runs on the locale data of one directory while this lives, and never on stand-ins for a part of them: a
// conversion through the wrong page would be worse than none. Where there are no data at all, the built-in objects can
// serve; standard error then tells it.
class LibrarySession {
 public:
  explicit LibrarySession(const std::optional<std::string>& locale_directory,
                          WithoutData without_data = WithoutData::kFail);
  LibrarySession(const LibrarySession&) = delete;
  LibrarySession& operator=(const LibrarySession&) = delete;
  ~LibrarySession() { LXTerm(); }
};

struct LocaleDeleter {
  void operator()(LXLocale* locale) const { LXReleaseLocale(locale, 0); }
};
using LocalePtr = std::unique_ptr<LXLocale, LocaleDeleter>;

struct ConversionDeleter {
  void operator()(LXConversion* handle) const { LXCloseConversion(handle); }
};
using ConversionPtr = std::unique_ptr<LXConversion, ConversionDeleter>;

// A status code of the library in words.
Message describe_status(uint32_t status);

}  // namespace lx::tool
