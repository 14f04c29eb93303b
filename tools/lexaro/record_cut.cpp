// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_cut.hpp"

#include <algorithm>

namespace lx::tool {
namespace {

// Source bytes that can be converted at once with room left for a character: single ones where it becomes narrow.
std::size_t safe_step(std::size_t width, std::size_t length) {
  constexpr std::size_t kMostGrowth = 5;  // bytes made of one, shift bytes included
  constexpr std::size_t kMargin = 16;     // what waits in the conversion, a character and a shift byte
  return std::max<std::size_t>(1, (width - std::min(width, length + kMargin)) / kMostGrowth);
}

}  // namespace

CutFinder::CutFinder(const RecordPage& from, const RecordPage& to, uint32_t options)
    : to_(to), conversion_(from.page, to.page, options, [this](std::string_view converted) { text_ += converted; }) {}

CutFinder::Cut CutFinder::find(std::string_view source, std::size_t width) {
  text_.clear();
  double_byte_ = false;
  std::size_t length = 0;
  bool closing = false;
  Cut cut{{}, 0, true};
  bool fits = true;
  const auto pass = [&](std::size_t begin, std::size_t used) {
    if (text_.size() == begin) return;
    const bool blanks = pass_blanks(std::string_view(text_).substr(begin));
    fits = fits && text_.size() + (double_byte_ ? 1 : 0) <= width;
    if (fits) {
      length = text_.size();
      closing = double_byte_;
      cut.used = used;
    } else {
      cut.only_blanks = cut.only_blanks && blanks;
    }
  };
  for (std::size_t at = 0; at < source.size();) {
    const std::size_t begin = text_.size();
    const std::string_view step = source.substr(at, fits ? safe_step(width, begin) : source.size());
    conversion_.convert(step);
    at += step.size();
    pass(begin, at);
  }
  const std::size_t begin = text_.size();
  conversion_.finish();
  pass(begin, source.size());

  text_.resize(length);
  if (closing) text_ += static_cast<char>(to_.info.leave_byte);
  cut.text = text_;
  return cut;
}

bool CutFinder::pass_blanks(std::string_view added) {
  bool blanks = true;
  while (!added.empty()) {
    const auto byte = static_cast<uint8_t>(added.front());
    std::size_t length = 1;
    if (to_.info.shift_sensitive != 0 && (byte == to_.info.enter_byte || byte == to_.info.leave_byte)) {
      double_byte_ = byte == to_.info.enter_byte;
    } else if (!to_.wide_blank.empty() && added.starts_with(to_.wide_blank) &&
               (double_byte_ || !to_.info.shift_sensitive)) {
      length = to_.wide_blank.size();
    } else {
      length = double_byte_ ? 2 : 1;
      blanks = blanks && !double_byte_ && added.front() == to_.blank;
    }
    added.remove_prefix(std::min(length, added.size()));
  }
  return blanks;
}

}  // namespace lx::tool
