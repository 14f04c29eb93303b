// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/near_names.hpp"

#include <algorithm>
#include <numeric>
#include <utility>

namespace lx::tool {
namespace {

// Insertions, deletions and replacements that turn one name into the other.
std::size_t edit_distance(const std::string& a, const std::string& b) {
  std::vector<std::size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 0; i < a.size(); ++i) {
    std::size_t diagonal = std::exchange(row[0], i + 1);
    for (std::size_t j = 0; j < b.size(); ++j) {
      const std::size_t replaced = diagonal + (a[i] != b[j]);
      diagonal = row[j + 1];
      row[j + 1] = std::min({replaced, diagonal + 1, row[j] + 1});
    }
  }
  return row[b.size()];
}

}  // namespace

std::string plain_letters(const std::string& name) {
  std::string plain;
  for (char c : name) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    if ((c >= 'a' && c <= 'z') || (c >= '0' && c <= '9')) plain.push_back(c);
  }
  return plain;
}

void NearNames::offer(const char* name, const char* shown) {
  const std::size_t distance = edit_distance(wanted_, plain_letters(name));
  if (distance > limit_ || distance >= wanted_.size()) return;
  const auto [known, fresh] = distances_.try_emplace(shown, distance);
  if (!fresh) known->second = std::min(known->second, distance);
}

std::vector<std::string> NearNames::best() const {
  std::vector<std::pair<std::size_t, std::string>> ranked;
  for (const auto& [name, distance] : distances_) ranked.emplace_back(distance, name);
  std::sort(ranked.begin(), ranked.end());
  std::vector<std::string> names;
  for (const auto& [distance, name] : ranked) {
    if (distance > ranked.front().first || names.size() == 4) break;
    names.push_back(name);
  }
  return names;
}

Message NearNames::question() const {
  const std::vector<std::string> names = best();
  if (names.empty()) return {};
  Message text = names.front();
  for (std::size_t i = 1; i < names.size(); ++i) {
    text = i + 1 == names.size() ? message("{0} or {1}", text, names[i]) : text + ", " + names[i];
  }
  return message("; did you mean {0}?", text);
}

}  // namespace lx::tool
