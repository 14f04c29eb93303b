// SPDX-License-Identifier: Apache-2.0
// What was not carried over exactly, with the records it stands in.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "tools/lexaro/problem_log.hpp"
#include "tools/messages/message.hpp"

namespace lx::tool {

struct RecordPlace {
  uint64_t record;  // from 1, counted in the whole file
  uint64_t column;  // from 1, a byte of the input record
  uint64_t offset;  // from 0, a byte of the file

  RecordPlace after(uint64_t bytes) const { return {record, column + bytes, offset + bytes}; }
};

// "in record 3, column 7, byte 166".
Message shown_place(const RecordPlace& place);

// Records with one sort of fault: all are counted, the first are kept.
class RecordFaults {
 public:
  struct Fault {
    RecordPlace place;
    uint64_t length;  // bytes of the record, where they are the fault
  };

  void add(const RecordPlace& place, uint64_t length = 0);
  uint64_t count() const { return count_; }
  const std::vector<Fault>& first() const { return first_; }

 private:
  static constexpr std::size_t kMostPlaces = 20;
  uint64_t count_ = 0;
  std::vector<Fault> first_;
};

class RecordLog {
 public:
  void add(const LXConversionProblem& problem, const RecordPlace& place);

  // The characters' problems; their offsets are those of the file.
  const ProblemLog& problems() const { return problems_; }
  // Where a problem stands that problems() keeps.
  RecordPlace place(const LXConversionProblem& problem) const { return places_.at(problem.offset); }
  Message summary(bool discarded) const;
  bool exact() const;

  LXConversionCounts counts{};
  uint64_t records = 0;
  RecordFaults truncated;     // text that did not fit was cut off at the place
  RecordFaults wrong_length;  // shorter or longer than the records should be
  RecordFaults line_ends;     // the text of a record holds a line end, which splits its line
  Message damage;             // why the records could not be told apart any further

 private:
  ProblemLog problems_;
  std::map<uint64_t, RecordPlace> places_;  // by offset
};

}  // namespace lx::tool
