// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_writer.hpp"

#include <utility>

#include "tools/lexaro/conversion.hpp"

namespace lx::tool {
namespace {

void append_descriptor(std::string& text, std::size_t data) {
  const std::size_t length = data + kDescriptorSize;
  text += static_cast<char>(length >> 8 & 0xFF);
  text += static_cast<char>(length & 0xFF);
  text.append(2, '\0');
}

}  // namespace

RecordWriter::RecordWriter(OutputFile& output, RecordFormat format, std::string line_end)
    : output_(output), format_(format), line_end_(std::move(line_end)) {
  buffer_.reserve(2 * kBufferSize);
}

void RecordWriter::write(std::string_view record, bool begins_block) {
  if (format_ == RecordFormat::kFixed) {
    buffer_ += record;
  } else if (format_ == RecordFormat::kLines) {
    buffer_ += record;
    buffer_ += line_end_;
  } else {
    write_described(record, begins_block);
  }
  if (buffer_.size() >= kBufferSize) flush();
}

void RecordWriter::write_described(std::string_view record, bool begins_block) {
  const bool blocked = format_ == RecordFormat::kVariableBlocked;
  if (blocked && (begins_block || block_.size() + record.size() + 2 * kDescriptorSize > kLongestDescribed)) {
    end_block();
  }
  std::string& text = blocked ? block_ : buffer_;
  append_descriptor(text, record.size());
  text += record;
}

void RecordWriter::write_through(std::string_view records) {
  flush();
  output_.write(records);
  bytes_ += records.size();
}

void RecordWriter::finish() {
  end_block();
  flush();
}

void RecordWriter::end_block() {
  if (block_.empty()) return;
  append_descriptor(buffer_, block_.size());
  buffer_ += block_;
  block_.clear();
}

void RecordWriter::flush() {
  if (buffer_.empty()) return;
  output_.write(buffer_);
  bytes_ += buffer_.size();
  buffer_.clear();
}

}  // namespace lx::tool
