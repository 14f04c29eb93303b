// SPDX-License-Identifier: Apache-2.0
// Puts translated records behind one another in the output's format.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "tools/lexaro/output_file.hpp"
#include "tools/lexaro/record_reader.hpp"

namespace lx::tool {

class RecordWriter {
 public:
  RecordWriter(OutputFile& output, RecordFormat format, std::string line_end);

  // A block of the output holds the records of one block of the input, unless they have outgrown it.
  void write(std::string_view record, bool begins_block);
  // Many records at once, as they are.
  void write_through(std::string_view records);
  void finish();
  uint64_t bytes() const { return bytes_; }

 private:
  void write_described(std::string_view record, bool begins_block);
  void end_block();
  void flush();

  OutputFile& output_;
  RecordFormat format_;
  std::string line_end_;
  std::string buffer_;
  std::string block_;  // of records with their descriptor words
  uint64_t bytes_ = 0;
};

}  // namespace lx::tool
