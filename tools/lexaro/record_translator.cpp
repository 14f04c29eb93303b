// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_translator.hpp"

#include <algorithm>

namespace lx::tool {
namespace {

bool single_byte(const RecordPage& page) { return page.info.max_length == 1 && page.info.shift_sensitive == 0; }

bool all_are(std::string_view text, char blank) { return text.find_first_not_of(blank) == std::string_view::npos; }

}  // namespace

RecordTranslator::RecordTranslator(const TranslationSettings& settings, RecordLog& log)
    : settings_(settings),
      log_(log),
      byte_for_byte_(single_byte(settings.from) && single_byte(settings.to) &&
                     (settings.options & LX_CONV_DISCARD) == 0),
      same_places_(settings.layout.padded && settings.layout.pieces.size() == 1 &&
                   settings.layout.limit == settings.length),
      conversion_(
          settings.from.page, settings.to.page, settings.options,
          [this](std::string_view converted) { text_ += converted; },
          [this](const LXConversionProblem& problem) { hear_problem(problem); }) {}

void RecordTranslator::hear_problem(const LXConversionProblem& problem) {
  const uint64_t at = problem.offset - given_;
  RecordPlace place = place_.after(at);
  if (in_block_ != 0) {
    const uint64_t column = at % in_block_;
    if (settings_.layout.keeps(static_cast<std::size_t>(column))) return;  // no text there
    place.record = place_.record + at / in_block_;
    place.column = place_.column + column;
  }
  log_.add(problem, place);
}

std::string_view RecordTranslator::convert(std::string_view source, const RecordPlace& place) {
  text_.clear();
  place_ = place;
  conversion_.convert(source);
  conversion_.finish();
  given_ += source.size();
  return text_;
}

// What a piece of text may take: a text at the end of a record that is not padded has no width of its own.
std::size_t RecordTranslator::room_of(const Piece& piece, bool at_end) const {
  if (settings_.layout.padded || !at_end) return piece.to_width;
  return settings_.layout.limit == kEndless ? kEndless : settings_.layout.limit - record_.size();
}

template <class TextOf>
std::string_view RecordTranslator::assemble(std::string_view source, const RecordPlace& place, TextOf text_of) {
  const RecordLayout& layout = settings_.layout;
  record_.clear();
  for (const Piece& piece : layout.pieces) {
    if (!layout.padded && piece.begin >= source.size()) break;
    const std::size_t begin = std::min(piece.begin, source.size());
    const std::string_view part = source.substr(begin, piece.width);
    const bool at_end = begin + part.size() == source.size();
    std::size_t room = piece.width;
    if (piece.kept) {
      record_ += part;
      room -= part.size();
    } else {
      room = room_of(piece, at_end);
      const std::string_view text = fit(text_of(begin, part, place.after(begin)), room, part, place.after(begin));
      record_ += text;
      room -= text.size();
    }
    if (layout.padded || !at_end) record_.append(room, settings_.to.blank);
  }
  if (!settings_.line_mark.empty()) end_line(source, place);
  return record_;
}

std::string_view RecordTranslator::fit(std::string_view text, std::size_t width, std::string_view source,
                                       const RecordPlace& place) {
  if (text.size() <= width) return text;
  // A blank is never a part of another character, and behind the last double-byte run stands its shift byte.
  const std::size_t excess = text.size() - width;
  if (all_are(text.substr(width), settings_.to.blank) && source.size() >= excess &&
      all_are(source.substr(source.size() - excess), settings_.from.blank)) {
    return text.substr(0, width);
  }
  if (byte_for_byte_) {
    log_.truncated.add(place.after(width));
    return text.substr(0, width);
  }
  const CutFinder::Cut cut = cut_finder().find(source, width);
  if (!cut.only_blanks) log_.truncated.add(place.after(cut.used));
  return cut.text;
}

void RecordTranslator::end_line(std::string_view source, const RecordPlace& place) {
  if (!settings_.keep_blanks) {
    const std::size_t last = record_.find_last_not_of(settings_.to.blank);
    record_.resize(last == std::string::npos ? 0 : last + 1);
  }
  const std::size_t line_end = record_.find(settings_.line_mark);
  if (line_end == std::string::npos) return;
  const std::size_t column = byte_for_byte_ ? line_end : cut_finder().find(source, line_end).used;
  log_.line_ends.add(place.after(column));
}

CutFinder& RecordTranslator::cut_finder() {
  if (!cut_finder_) cut_finder_.emplace(settings_.from, settings_.to, settings_.options);
  return *cut_finder_;
}

std::string_view RecordTranslator::translate(const Record& record) {
  return assemble(
      record.data, {record.number, 1, record.offset},
      [&](std::size_t, std::string_view source, const RecordPlace& place) { return convert(source, place); });
}

void RecordTranslator::translate_block(const Record& block, RecordWriter& writer) {
  const std::size_t length = settings_.length;
  in_block_ = length;
  convert(block.data, {block.number, 1, block.offset});
  in_block_ = 0;
  if (same_places_) {
    writer.write_through(text_);
    return;
  }
  RecordPlace place{block.number, 1, block.offset};
  for (std::size_t at = 0; at < block.data.size(); at += length) {
    const std::string_view text = std::string_view(text_).substr(at, length);
    writer.write(assemble(block.data.substr(at, length), place,
                          [&](std::size_t begin, std::string_view source, const RecordPlace&) {
                            return text.substr(begin, source.size());
                          }),
                 false);
    ++place.record;
    place.offset += length;
  }
}

}  // namespace lx::tool
