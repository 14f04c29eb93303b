// SPDX-License-Identifier: Apache-2.0
// The translation of whole files of records.
#pragma once

#include <cstdint>
#include <limits>
#include <optional>
#include <span>
#include <string>

#include "tools/lexaro/record_log.hpp"
#include "tools/lexaro/record_reader.hpp"
#include "tools/lexaro/record_translator.hpp"
#include "tools/messages/message.hpp"

namespace lx::tool {

struct RecordRange {
  uint64_t first = 1;
  uint64_t count = std::numeric_limits<uint64_t>::max();
};

struct RecordSettings {
  TranslationSettings translation;
  RecordShape input;
  RecordFormat output = RecordFormat::kFixed;
  std::string line_end;     // of the output
  std::size_t longest = 0;  // bytes that an input record should not exceed
  std::optional<RecordRange> range;
};

struct RecordResult {
  std::string name;
  RecordLog log;
  Message size_fault;  // what is wrong with the length of records
  Message note;        // no fault: the file ends before the range does
};

RecordResult convert_records(InputFile& input, OutputFile& output, const RecordSettings& settings, Progress& progress);

// Bytes that will be read of these files, where that can be known.
std::optional<uint64_t> size_of_records(std::span<const std::string> files, const RecordSettings& settings);

}  // namespace lx::tool
