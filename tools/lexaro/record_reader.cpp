// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_reader.hpp"

#include <algorithm>
#include <cstring>
#include <limits>
#include <utility>

#include "tools/lexaro/conversion.hpp"

namespace lx::tool {
namespace {

uint32_t byte_at(std::string_view text, std::size_t at) { return static_cast<unsigned char>(text[at]); }
uint32_t two_bytes(std::string_view text, std::size_t at) { return byte_at(text, at) << 8 | byte_at(text, at + 1); }

// Records behind descriptor words, in blocks or not.
class VariableReader final : public RecordReader {
 public:
  VariableReader(InputFile& input, Progress& progress, bool blocked)
      : RecordReader(input, progress), blocked_(blocked) {}

 protected:
  bool read(Record& record) override {
    if (!damage_.empty()) return false;
    record.begins_block = blocked_ && block_left_ == 0;
    if (record.begins_block && !begin_block()) return false;
    const std::string_view word = window_.ensure(kDescriptorSize);
    if (word.empty() && !blocked_) return false;
    const std::size_t length = described_length(word);
    if (length == 0) return false;
    const std::string_view whole = window_.ensure(length);
    if (whole.size() < length) {
      return damaged(message("its descriptor word tells {0} bytes, and the file ends after {1}", length, whole.size()));
    }
    record.offset = window_.offset() + kDescriptorSize;
    record.data = whole.substr(kDescriptorSize, length - kDescriptorSize);
    window_.consume(length);
    block_left_ -= blocked_ ? length : 0;
    return true;
  }

 private:
  bool damaged(const Message& why) {
    damage_ = message("record {0} at byte {1}: {2}", records_ + 1, window_.offset(), why);
    return false;
  }
  std::string shown(std::string_view word) const {
    static constexpr char kDigits[] = "0123456789ABCDEF";
    std::string text = "X'";
    for (std::size_t i = 0; i < std::min(word.size(), kDescriptorSize); ++i) {
      text += kDigits[byte_at(word, i) >> 4];
      text += kDigits[byte_at(word, i) & 0xF];
    }
    return text + "'";
  }

  bool begin_block() {
    const std::string_view word = window_.ensure(kDescriptorSize);
    if (word.empty()) return false;
    if (word.size() < kDescriptorSize) return damaged(message("the file ends inside a block descriptor word"));
    std::size_t length = two_bytes(word, 0);
    const bool large = (length & 0x8000) != 0;  // 31 bits of length
    if (large) length = (length & 0x7FFF) << 16 | two_bytes(word, 2);
    if (length < 2 * kDescriptorSize || (!large && two_bytes(word, 2) != 0)) {
      return damaged(message("{0} is no block descriptor word", shown(word)));
    }
    window_.consume(kDescriptorSize);
    block_left_ = length - kDescriptorSize;
    return true;
  }

  // What the record takes with its descriptor word; 0 when that is damaged.
  std::size_t described_length(std::string_view word) {
    if (word.size() < kDescriptorSize || (blocked_ && block_left_ < kDescriptorSize)) {
      damaged(word.size() < kDescriptorSize ? message("the file ends inside a record descriptor word")
                                            : message("its block ends inside the record descriptor word"));
      return 0;
    }
    const std::size_t length = two_bytes(word, 0);
    if (length < kDescriptorSize || length > kLongestDescribed || byte_at(word, 2) > 3 || byte_at(word, 3) != 0) {
      damaged(message("{0} is no record descriptor word", shown(word)));
      return 0;
    }
    if (byte_at(word, 2) != 0) {
      damaged(message("it is a segment of a spanned record ({0}); spanned records are not converted", shown(word)));
      return 0;
    }
    if (blocked_ && length > block_left_) {
      damaged(message("its descriptor word tells {0} bytes, and its block ends after {1}", length, block_left_));
      return 0;
    }
    return length;
  }

  bool blocked_;
  std::size_t block_left_ = 0;
};

class LineReader final : public RecordReader {
 public:
  LineReader(InputFile& input, Progress& progress, std::string line_ends)
      : RecordReader(input, progress), line_ends_(std::move(line_ends)) {}

 protected:
  bool read(Record& record) override {
    if (!damage_.empty()) return false;
    std::string_view text = window_.ensure(1);
    std::size_t searched = 0;
    std::size_t end = 0;
    while ((end = find_line_end(text, searched)) == std::string_view::npos) {
      searched = text.size();
      if (searched > kLongestRecord) break;
      text = window_.ensure(searched + 1);
      if (text.size() == searched) break;
    }
    if (text.empty()) return false;
    const bool closed = end != std::string_view::npos;
    if (!closed) end = text.size();
    if (end > kLongestRecord) {
      damage_ = message("line {0} at byte {1}: longer than {2} bytes", records_ + 1, window_.offset(), kLongestRecord);
      return false;
    }
    record.offset = window_.offset();
    record.data = text.substr(0, end);
    if (closed && !record.data.empty() && record.data.back() == '\r') record.data.remove_suffix(1);
    window_.consume(end + (closed ? 1 : 0));
    return true;
  }

 private:
  std::size_t find_line_end(std::string_view text, std::size_t from) const {
    return line_ends_.size() == 1 ? text.find(line_ends_.front(), from) : text.find_first_of(line_ends_, from);
  }

  std::string line_ends_;
};

}  // namespace

std::size_t longest_data(RecordFormat format) {
  return kLongestDescribed - (format == RecordFormat::kVariableBlocked ? 2 : 1) * kDescriptorSize;
}

std::string_view InputWindow::ensure(std::size_t bytes) {
  if (end_ - begin_ < bytes && !ended_) {
    if (begin_ != 0) std::memmove(buffer_.data(), buffer_.data() + begin_, end_ - begin_);
    buffer_offset_ += begin_;
    end_ -= begin_;
    begin_ = 0;
    if (buffer_.size() < bytes) buffer_.resize(std::max(kBufferSize, std::max(bytes, 2 * buffer_.size())));
    while (end_ < bytes) {
      const std::size_t count = input_.read(std::span(buffer_).subspan(end_));
      ended_ = count == 0;
      if (ended_) break;
      end_ += count;
      progress_.advance(count);
    }
  }
  return {buffer_.data() + begin_, end_ - begin_};
}

uint64_t InputWindow::skip(uint64_t wanted) {
  const uint64_t at_hand = std::min<uint64_t>(wanted, end_ - begin_);
  begin_ += static_cast<std::size_t>(at_hand);
  if (at_hand == wanted || ended_) return at_hand;
  const uint64_t skipped = input_.skip(wanted - at_hand);
  buffer_offset_ += skipped;
  return at_hand + skipped;
}

bool RecordReader::next(Record& record) {
  if (!read(record)) return false;
  record.number = ++records_;
  return true;
}

uint64_t RecordReader::skip(uint64_t wanted) {
  Record record;
  uint64_t skipped = 0;
  while (skipped < wanted && next(record)) ++skipped;
  return skipped;
}

bool FixedReader::next_block(Record& block, uint64_t most) {
  std::string_view text = window_.ensure(length_);
  const uint64_t count = std::min<uint64_t>(most, text.size() / length_);
  if (count == 0) return false;
  text = text.substr(0, static_cast<std::size_t>(count) * length_);
  block = {text, records_ + 1, window_.offset(), false};
  window_.consume(text.size());
  records_ += count;
  return true;
}

uint64_t FixedReader::skip(uint64_t wanted) {
  const uint64_t bytes = wanted <= std::numeric_limits<uint64_t>::max() / length_
                             ? wanted * length_
                             : std::numeric_limits<uint64_t>::max();
  const uint64_t skipped = window_.skip(bytes);
  const uint64_t count = skipped / length_ + (skipped % length_ != 0 ? 1 : 0);
  records_ += count;
  return count;
}

bool FixedReader::read(Record& record) {
  const std::string_view text = window_.ensure(length_);
  if (text.empty()) return false;
  record = {text.substr(0, length_), 0, window_.offset(), false};
  window_.consume(record.data.size());
  return true;
}

std::unique_ptr<RecordReader> open_records(InputFile& input, Progress& progress, const RecordShape& shape) {
  switch (shape.format) {
    case RecordFormat::kFixed:
      return std::make_unique<FixedReader>(input, progress, shape.length);
    case RecordFormat::kLines:
      return std::make_unique<LineReader>(input, progress, shape.line_ends);
    default:
      return std::make_unique<VariableReader>(input, progress, shape.format == RecordFormat::kVariableBlocked);
  }
}

}  // namespace lx::tool
