// SPDX-License-Identifier: Apache-2.0
// What a conversion could not carry over exactly: enough to find and judge it, in bounded memory.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "lexaro/lexaro.h"
#include "tools/messages/message.hpp"

namespace lx::tool {

// Occurrences by key. Keys that come after too many others are only counted together.
class Histogram {
 public:
  void add(uint64_t key);
  const std::map<uint64_t, uint64_t>& counts() const { return counts_; }
  uint64_t other() const { return other_; }

 private:
  static constexpr std::size_t kMostKeys = 1000;
  std::map<uint64_t, uint64_t> counts_;
  uint64_t other_ = 0;
};

class ProblemLog {
 public:
  using PlaceFn = std::function<Message(const LXConversionProblem& problem)>;  // "at byte 7"

  // Whether the problem is kept with its place; all are counted.
  bool add(const LXConversionProblem& problem);

  const std::vector<LXConversionProblem>& first() const { return first_; }
  const Histogram& substituted() const { return substituted_; }  // by character
  const Histogram& malformed() const { return malformed_; }      // by sequence_key

  // "2 characters replaced (first at byte 7: U+20AC), ..."; empty when there was no problem.
  Message summary(const LXConversionCounts& counts, bool discarded, const PlaceFn& place = byte_place) const;
  static Message byte_place(const LXConversionProblem& problem);

  // The bytes of a sequence behind a leading 1 byte, which keeps their number.
  static uint64_t sequence_key(const LXConversionProblem& problem);

 private:
  static constexpr std::size_t kMostPositions = 20;
  static constexpr std::size_t kKinds = LX_PROBLEM_CUT + 1;

  std::vector<LXConversionProblem> first_;
  LXConversionProblem first_of_kind_[kKinds]{};
  Histogram substituted_;
  Histogram malformed_;
};

// "U+20AC".
std::string code_point(uint32_t unicode);
// "E282AC".
std::string hexadecimal(const uint8_t* bytes, std::size_t count);
// The same from a sequence key.
std::string hexadecimal(uint64_t sequence_key);

}  // namespace lx::tool
