// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_layout.hpp"

#include <algorithm>
#include <charconv>
#include <optional>
#include <string_view>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {
namespace {

std::optional<std::size_t> parse_column(std::string_view text) {
  std::size_t column = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), column);
  if (error != std::errc() || end != text.data() + text.size() || column == 0) return std::nullopt;
  return column;
}

std::string shown(const Columns& columns) { return std::to_string(columns.first) + "-" + std::to_string(columns.last); }

Columns parse_range(std::string_view text) {
  const std::size_t dash = text.find('-');
  const auto first = parse_column(text.substr(0, dash));
  const auto last = dash == std::string_view::npos ? first : parse_column(text.substr(dash + 1));
  if (!first || !last) {
    throw usage_failure(message("--keep: \"{0}\" is no range of columns: write them as 5-8,21-24, from column 1",
                                display_name(std::string(text))));
  }
  if (*last < *first) throw usage_failure(message("--keep: columns {0} end before they begin", shown({*first, *last})));
  return {*first, *last};
}

// The kept pieces with the texts between and behind them.
std::vector<Piece> pieces_of(std::size_t length, const std::vector<Columns>& kept) {
  std::vector<Piece> pieces;
  std::size_t at = 0;
  const auto add = [&](bool is_kept, std::size_t end) {
    if (end > at) pieces.push_back({is_kept, at, end - at, end - at});
    at = end;
  };
  for (const Columns& columns : kept) {
    add(false, columns.first - 1);
    add(true, columns.last);
  }
  add(false, length);
  return pieces;
}

}  // namespace

std::vector<Columns> parse_columns(const std::string& text) {
  std::vector<Columns> all;
  std::string_view rest = text;
  for (;;) {
    const std::size_t comma = rest.find(',');
    all.push_back(parse_range(rest.substr(0, comma)));
    if (comma == std::string_view::npos) break;
    rest.remove_prefix(comma + 1);
  }
  std::sort(all.begin(), all.end(), [](const Columns& a, const Columns& b) { return a.first < b.first; });
  for (std::size_t i = 1; i < all.size(); ++i) {
    if (all[i].first <= all[i - 1].last) {
      throw usage_failure(message("--keep: columns {0} and {1} overlap", shown(all[i - 1]), shown(all[i])));
    }
  }
  return all;
}

bool RecordLayout::keeps(std::size_t column) const {
  return std::any_of(pieces.begin(), pieces.end(), [&](const Piece& piece) {
    return piece.kept && column >= piece.begin && column - piece.begin < piece.width;
  });
}

RecordLayout fixed_layout(std::size_t length, std::size_t to_length, const std::vector<Columns>& kept) {
  if (!kept.empty() && kept.back().last > length) {
    throw usage_failure(
        message("--keep: columns {0} reach beyond the record, which ends at column {1}", shown(kept.back()), length));
  }
  std::vector<Piece> pieces = pieces_of(length, kept);
  if (to_length == length) return {pieces, true, to_length};
  const auto text = std::find_if(pieces.rbegin(), pieces.rend(), [](const Piece& piece) { return !piece.kept; });
  if (text == pieces.rend()) {
    throw usage_failure(
        message("--to-length: all columns are kept, so the record can become neither longer nor shorter"));
  }
  if (to_length < length && length - to_length >= text->width) {
    throw usage_failure(
        message("--to-length: columns {0}, the last text of the record, would have no room in {1} bytes",
                shown({text->begin + 1, text->begin + text->width}), to_length));
  }
  text->to_width = text->width + to_length - length;
  return {pieces, true, to_length};
}

RecordLayout variable_layout(std::size_t limit, const std::vector<Columns>& kept) {
  if (!kept.empty() && kept.back().last > limit) {
    throw usage_failure(
        message("--keep: columns {0} reach beyond the longest output record of {1} bytes", shown(kept.back()), limit));
  }
  return {pieces_of(kEndless, kept), false, limit};
}

RecordLayout padding_layout(std::size_t length) { return {{{false, 0, kEndless, length}}, true, length}; }

}  // namespace lx::tool
