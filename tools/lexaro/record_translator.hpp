// SPDX-License-Identifier: Apache-2.0
// Translates records, each on its own.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "tools/lexaro/conversion.hpp"
#include "tools/lexaro/record_cut.hpp"
#include "tools/lexaro/record_layout.hpp"
#include "tools/lexaro/record_log.hpp"
#include "tools/lexaro/record_page.hpp"
#include "tools/lexaro/record_reader.hpp"
#include "tools/lexaro/record_writer.hpp"

namespace lx::tool {

struct TranslationSettings {
  const RecordPage& from;
  const RecordPage& to;
  uint32_t options = LX_CONV_STRICT;  // LX_CONV_ bits
  RecordLayout layout{};
  std::size_t length = 0;   // of fixed records
  std::string line_mark{};  // what would end a line of the output early; empty when its records do not become lines
  bool keep_blanks = false;
};

class RecordTranslator {
 public:
  RecordTranslator(const TranslationSettings& settings, RecordLog& log);

  // The output record, until the next call.
  std::string_view translate(const Record& record);

  // Whether each byte of the source becomes one byte, so that many records can be converted in one go.
  bool byte_for_byte() const { return byte_for_byte_; }
  // Translates a block of whole records of the settings' length.
  void translate_block(const Record& block, RecordWriter& writer);

 private:
  void hear_problem(const LXConversionProblem& problem);
  // The text of a source, until the next call.
  std::string_view convert(std::string_view source, const RecordPlace& place);
  // Puts the record together; `text_of(column, source, place)` gives the texts.
  template <class TextOf>
  std::string_view assemble(std::string_view source, const RecordPlace& place, TextOf text_of);
  std::size_t room_of(const Piece& piece, bool at_end) const;
  std::string_view fit(std::string_view text, std::size_t width, std::string_view source, const RecordPlace& place);
  void end_line(std::string_view source, const RecordPlace& place);
  CutFinder& cut_finder();

  const TranslationSettings& settings_;
  RecordLog& log_;
  bool byte_for_byte_;
  bool same_places_;  // a block's records come out as they were converted
  std::string text_;
  std::string record_;
  RecordPlace place_{};       // of what is being converted
  uint64_t given_ = 0;        // bytes given to the conversion before that
  std::size_t in_block_ = 0;  // the record length while a block is converted
  Conversion conversion_;
  std::optional<CutFinder> cut_finder_;
};

}  // namespace lx::tool
