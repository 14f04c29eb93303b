// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/sort_lines.hpp"

#include <algorithm>
#include <cstring>

#include "tools/lexaro/conversion.hpp"
#include "tools/lexaro/failure.hpp"

namespace lx::tool {

LineEnds::LineEnds(const CodePage& page) {
  LXCodePageInfo info{};
  if (LXGetCodePageInfo(LXGetLocaleObject(page.locale.get(), LX_CODEPAGE), &info) != LX_OK) {
    throw Failure(ExitStatus::kCodePage, message("code page {0}: it cannot be used", page.name));
  }
  line_feed_ = static_cast<char>(info.line_bytes[0]);
  carriage_return_ = static_cast<char>(info.line_bytes[1]);
  ends_[info.line_bytes[0]] = true;
  if (info.ascii_family == 0) {
    // Host text ends lines with next line or with line feed; neither byte occurs in a double-byte character.
    ends_[0x15] = ends_[0x25] = true;
  }
}

LineReader::LineReader(InputFile& input, const LineEnds& ends) : input_(input), ends_(ends), buffer_(kBufferSize) {}

bool LineReader::fill() {
  if (begin_ > 0) {
    std::memmove(buffer_.data(), buffer_.data() + begin_, end_ - begin_);
    end_ -= begin_;
    begin_ = 0;
  }
  if (end_ > kLongestLine) {
    throw Failure(ExitStatus::kInputOutput, message("{0}: line {1} is longer than the {2} MiB that can be sorted",
                                                    input_.name(), number_ + 1, kLongestLine >> 20));
  }
  if (end_ == buffer_.size()) buffer_.resize(buffer_.size() * 2);
  const std::size_t count = input_.read(std::span(buffer_).subspan(end_));
  end_ += count;
  return count > 0;
}

Line LineReader::take(std::size_t length, std::size_t end_length) {
  const char* text = buffer_.data() + begin_;
  begin_ += length + end_length;
  ++number_;
  const bool with_return = end_length > 0 && length > 0 && ends_.is_return(text[length - 1]);
  if (with_return) --length;
  return {{text, length}, {text + length, end_length + (with_return ? 1 : 0)}};
}

bool LineReader::next(Line& line) {
  const auto ends_line = [this](char byte) { return ends_.ends_line(byte); };
  for (std::size_t searched = 0;;) {
    const char* start = buffer_.data() + begin_;
    const char* stop = buffer_.data() + end_;
    const char* found = std::find_if(start + searched, stop, ends_line);
    if (found != stop) {
      line = take(static_cast<std::size_t>(found - start), 1);
      return true;
    }
    searched = end_ - begin_;
    if (!fill()) break;
  }
  if (begin_ == end_) return false;
  line = take(end_ - begin_, 0);
  return true;
}

}  // namespace lx::tool
