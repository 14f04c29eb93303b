// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/verifier.hpp"

#include <algorithm>

#include "tools/lexaro/problem_log.hpp"

namespace lx::tool {
namespace {

// The two conversions hold back a few bytes only, so both sides advance together. Input that yields no output at all
// (shift bytes around nothing) must not fill the memory: this much of it has not come back for good.
constexpr std::size_t kWindowLimit = 4 * kBufferSize;

Message shown_byte(const std::optional<uint8_t>& byte) {
  return byte ? Message("X'" + hexadecimal(&*byte, 1) + "'") : message("the end");
}

}  // namespace

Verifier::Verifier(const CodePage& from, const CodePage& to)
    : back_(to, from, LX_CONV_STRICT, [this](std::string_view returned) { compare(returned); }) {}

void Verifier::expect(std::string_view source) {
  if (difference_) return;
  if (waiting().size() > kWindowLimit) {
    difference_ = Difference{window_start_ + compared_, static_cast<uint8_t>(waiting().front()), std::nullopt};
    window_.clear();
    return;
  }
  window_.erase(0, compared_);
  window_start_ += compared_;
  compared_ = 0;
  window_.append(source);
}

void Verifier::check(std::string_view output) {
  if (!difference_) back_.convert(output);
}

void Verifier::finish() {
  if (difference_) return;
  back_.finish();
  if (!difference_ && !waiting().empty()) {
    difference_ = Difference{window_start_ + compared_, static_cast<uint8_t>(waiting().front()), std::nullopt};
  }
}

void Verifier::compare(std::string_view returned) {
  if (difference_) return;
  const std::string_view source = waiting();
  const auto common = std::min(source.size(), returned.size());
  const auto equal = static_cast<std::size_t>(
      std::mismatch(returned.begin(), returned.begin() + static_cast<std::ptrdiff_t>(common), source.begin()).first -
      returned.begin());
  compared_ += equal;
  if (equal == returned.size()) return;
  difference_ = Difference{window_start_ + compared_, std::nullopt, static_cast<uint8_t>(returned[equal])};
  if (equal < source.size()) difference_->source = static_cast<uint8_t>(source[equal]);
}

Message Verifier::Difference::describe() const {
  return message("does not convert back: first difference at byte {0} ({1} comes back as {2})", offset,
                 shown_byte(source), returned ? shown_byte(returned) : message("nothing"));
}

}  // namespace lx::tool
