// SPDX-License-Identifier: Apache-2.0
// Takes a file apart into its records.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "tools/lexaro/input_file.hpp"
#include "tools/lexaro/progress.hpp"
#include "tools/messages/message.hpp"

namespace lx::tool {

enum class RecordFormat {
  kFixed,
  kVariable,         // behind a record descriptor word each
  kVariableBlocked,  // and in blocks behind a block descriptor word
  kLines,
};

inline constexpr std::size_t kLongestRecord = (1U << 24) - 1;
inline constexpr std::size_t kDescriptorSize = 4;
// What a descriptor word of a record or a block may count, itself included.
inline constexpr std::size_t kLongestDescribed = 32760;
// Bytes of the longest record of a format that describes its records, without descriptor words.
std::size_t longest_data(RecordFormat format);

// A file seen through a buffer.
class InputWindow {
 public:
  InputWindow(InputFile& input, Progress& progress) : input_(input), progress_(progress) {}

  // The bytes at hand, at least so many unless the file ends before.
  std::string_view ensure(std::size_t bytes);
  void consume(std::size_t bytes) { begin_ += bytes; }
  // Bytes passed over, fewer than wanted when the file ends.
  uint64_t skip(uint64_t wanted);
  // Where the bytes at hand stand in the file.
  uint64_t offset() const { return buffer_offset_ + begin_; }

 private:
  InputFile& input_;
  Progress& progress_;
  std::vector<char> buffer_;
  std::size_t begin_ = 0;
  std::size_t end_ = 0;
  uint64_t buffer_offset_ = 0;
  bool ended_ = false;
};

struct Record {
  std::string_view data;  // until the next one is read
  uint64_t number = 0;    // from 1
  uint64_t offset = 0;    // of the data in the file
  bool begins_block = false;
};

class RecordReader {
 public:
  RecordReader(InputFile& input, Progress& progress) : window_(input, progress) {}
  RecordReader(const RecordReader&) = delete;
  RecordReader& operator=(const RecordReader&) = delete;
  virtual ~RecordReader() = default;

  // False at the end of the file, and where the records cannot be told apart any further.
  bool next(Record& record);
  // Records passed over, fewer than wanted when there are no more.
  virtual uint64_t skip(uint64_t wanted);

  uint64_t records() const { return records_; }  // passed so far
  uint64_t offset() const { return window_.offset(); }
  const Message& damage() const { return damage_; }  // empty: none

 protected:
  // Fills in all but the number.
  virtual bool read(Record& record) = 0;

  InputWindow window_;
  uint64_t records_ = 0;
  Message damage_;
};

class FixedReader final : public RecordReader {
 public:
  FixedReader(InputFile& input, Progress& progress, std::size_t length)
      : RecordReader(input, progress), length_(length) {}

  // Several whole records one behind the other, at most so many; false when no whole one is left.
  bool next_block(Record& block, uint64_t most);
  uint64_t skip(uint64_t wanted) override;

 protected:
  bool read(Record& record) override;  // the last record may be short

 private:
  std::size_t length_;
};

struct RecordShape {
  RecordFormat format = RecordFormat::kFixed;
  std::size_t length = 0;  // of fixed records
  std::string line_ends;   // bytes that end a line
};

std::unique_ptr<RecordReader> open_records(InputFile& input, Progress& progress, const RecordShape& shape);

}  // namespace lx::tool
