// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/problem_log.hpp"

#include <langinfo.h>
#include <locale.h>
#include <wctype.h>

#include <algorithm>
#include <cstring>

namespace lx::tool {
namespace {

constexpr char kDigits[] = "0123456789ABCDEF";

// The character itself, where the user's terminal expects UTF-8 and can show it.
std::string quoted_character(uint32_t unicode) {
  static const locale_t user = newlocale(LC_CTYPE_MASK, "", nullptr);
  if (user == nullptr || std::strcmp(nl_langinfo_l(CODESET, user), "UTF-8") != 0) return "";
  const bool invisible = unicode < 0x80 || (unicode >= 0xD800 && unicode <= 0xF8FF) ||
                         (unicode >= 0x200B && unicode <= 0x200F) || (unicode >= 0x2028 && unicode <= 0x202E) ||
                         (unicode >= 0x2060 && unicode <= 0x206F) || unicode == 0xFEFF;
  if (invisible || !iswprint_l(static_cast<wint_t>(unicode), user)) return "";
  std::string text = " \"";
  if (unicode < 0x800) {
    text += static_cast<char>(0xC0 | unicode >> 6);
  } else {
    if (unicode < 0x10000) {
      text += static_cast<char>(0xE0 | unicode >> 12);
    } else {
      text += static_cast<char>(0xF0 | unicode >> 18);
      text += static_cast<char>(0x80 | (unicode >> 12 & 0x3F));
    }
    text += static_cast<char>(0x80 | (unicode >> 6 & 0x3F));
  }
  text += static_cast<char>(0x80 | (unicode & 0x3F));
  return text + '"';
}

Message source_bytes(const LXConversionProblem& problem) {
  if (problem.length == 0) return message("the end");  // where a double-byte run was left open
  return "X'" + hexadecimal(problem.bytes, std::min<std::size_t>(problem.length, sizeof problem.bytes)) + "'";
}

}  // namespace

void Histogram::add(uint64_t key) {
  const auto known = counts_.find(key);
  if (known != counts_.end()) {
    ++known->second;
  } else if (counts_.size() < kMostKeys) {
    counts_.emplace(key, 1);
  } else {
    ++other_;
  }
}

bool ProblemLog::add(const LXConversionProblem& problem) {
  const bool among_first = first_.size() < kMostPositions;
  if (among_first) first_.push_back(problem);
  const bool first_of_kind = problem.kind < kKinds && first_of_kind_[problem.kind].kind == 0;
  if (first_of_kind) first_of_kind_[problem.kind] = problem;
  if (problem.kind == LX_PROBLEM_SUBSTITUTED) substituted_.add(problem.unicode);
  if (problem.kind == LX_PROBLEM_MALFORMED) malformed_.add(sequence_key(problem));
  return among_first || first_of_kind;
}

uint64_t ProblemLog::sequence_key(const LXConversionProblem& problem) {
  uint64_t key = 1;
  const std::size_t length = std::min<std::size_t>(problem.length, sizeof problem.bytes);
  for (std::size_t i = 0; i < length; ++i) key = key << 8 | problem.bytes[i];
  return key;
}

Message ProblemLog::byte_place(const LXConversionProblem& problem) { return message("at byte {0}", problem.offset); }

Message ProblemLog::summary(const LXConversionCounts& counts, bool discarded, const PlaceFn& place) const {
  Message text;
  const auto tell = [&](uint64_t count, uint32_t kind, const char* one, const char* many) {
    if (count == 0) return;
    const LXConversionProblem& first = first_of_kind_[kind];
    const Message what = kind == LX_PROBLEM_SUBSTITUTED ? code_point(first.unicode) + quoted_character(first.unicode)
                                                        : source_bytes(first);
    if (!text.empty()) text += ", ";
    text += count == 1 ? message(one, place(first), what) : message(many, count, place(first), what);
  };
  if (discarded) {
    tell(counts.substituted, LX_PROBLEM_SUBSTITUTED, "1 character left out ({0}: {1})",
         "{0} characters left out (first {1}: {2})");
  } else {
    tell(counts.substituted, LX_PROBLEM_SUBSTITUTED, "1 character replaced ({0}: {1})",
         "{0} characters replaced (first {1}: {2})");
  }
  tell(counts.malformed, LX_PROBLEM_MALFORMED, "1 malformed sequence ({0}: {1})",
       "{0} malformed sequences (first {1}: {2})");
  tell(counts.shifts, LX_PROBLEM_SHIFT, "1 unbalanced shift ({0}: {1})", "{0} unbalanced shifts (first {1}: {2})");
  tell(counts.cut, LX_PROBLEM_CUT, "1 character cut off by the end ({0}: {1})",
       "{0} characters cut off by the end (first {1}: {2})");
  return text;
}

std::string code_point(uint32_t unicode) {
  std::string text;
  for (uint32_t rest = unicode; rest != 0 || text.size() < 4; rest >>= 4) text += kDigits[rest & 0xF];
  std::reverse(text.begin(), text.end());
  return "U+" + text;
}

std::string hexadecimal(const uint8_t* bytes, std::size_t count) {
  std::string text;
  for (std::size_t i = 0; i < count; ++i) {
    text += kDigits[bytes[i] >> 4];
    text += kDigits[bytes[i] & 0xF];
  }
  return text;
}

std::string hexadecimal(uint64_t sequence_key) {
  std::string text;
  for (uint64_t rest = sequence_key; rest > 1; rest >>= 8) {
    text += kDigits[rest & 0xF];
    text += kDigits[rest >> 4 & 0xF];
  }
  std::reverse(text.begin(), text.end());
  return text;
}

}  // namespace lx::tool
