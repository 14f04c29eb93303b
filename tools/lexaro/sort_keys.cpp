// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/sort_keys.hpp"

#include <new>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {
namespace {

// No character takes more bytes of a key, unless the language makes two upper-case letters of it.
constexpr std::size_t kKeyBytes = 8;
constexpr std::size_t kSeparators = 3;

}  // namespace

KeyMaker::KeyMaker(const SortOrder& order, const CodePage& utf8)
    : order_(order),
      plain_bytes_(order.options == 0 && LXGetLocaleObject(order.locale.get(), LX_SORT) == nullptr),
      decoder_(
          order.page, utf8, LX_CONV_STRICT, [](std::string_view) {},
          [this](const LXConversionProblem&) { ++unknown_; }) {}

std::size_t KeyMaker::transform(std::string_view line) {
  const auto length = static_cast<int32_t>(line.size());
  for (;;) {
    const auto room = static_cast<int32_t>(key_.size());
    const int32_t needed = LXStrxfrmEx(order_.locale.get(), key_.data(), room, line.data(), length, 0, order_.options);
    if (needed < 0) {
      const uint32_t status = LXGetError(order_.locale.get());
      if (status == LX_E_MEMORY) throw std::bad_alloc();
      throw Failure(ExitStatus::kCodePage, message("no key can be made: {0}", describe_status(status)));
    }
    if (needed <= room) return static_cast<std::size_t>(needed);
    key_.resize(static_cast<std::size_t>(needed));
  }
}

std::string_view KeyMaker::key_of(std::string_view line) {
  const uint64_t unknown_before = unknown_;
  decoder_.convert(line);
  decoder_.finish();
  key_.resize(line.size() * kKeyBytes + kSeparators);
  key_.resize(transform(line));
  if (unknown_ != unknown_before && !plain_bytes_)
    key_.append(2, '\0').append(line);  // sorts before any special weight
  return key_;
}

}  // namespace lx::tool
