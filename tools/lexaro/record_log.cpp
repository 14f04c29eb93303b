// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_log.hpp"

namespace lx::tool {

Message shown_place(const RecordPlace& place) {
  return message("in record {0}, column {1}, byte {2}", place.record, place.column, place.offset);
}

void RecordFaults::add(const RecordPlace& place, uint64_t length) {
  ++count_;
  if (first_.size() < kMostPlaces) first_.push_back({place, length});
}

void RecordLog::add(const LXConversionProblem& problem, const RecordPlace& place) {
  switch (problem.kind) {
    case LX_PROBLEM_SUBSTITUTED:
      ++counts.substituted;
      break;
    case LX_PROBLEM_MALFORMED:
      ++counts.malformed;
      break;
    case LX_PROBLEM_SHIFT:
      ++counts.shifts;
      break;
    default:
      ++counts.cut;
  }
  LXConversionProblem in_file = problem;
  in_file.offset = place.offset;
  if (problems_.add(in_file)) places_.emplace(place.offset, place);
}

Message RecordLog::summary(bool discarded) const {
  Message text = problems_.summary(counts, discarded,
                                   [this](const LXConversionProblem& problem) { return shown_place(place(problem)); });
  const auto tell = [&](const RecordFaults& faults, const char* one, const char* many) {
    if (faults.count() == 0) return;
    if (!text.empty()) text += ", ";
    const Message where = shown_place(faults.first().front().place);
    text += faults.count() == 1 ? message(one, where) : message(many, faults.count(), where);
  };
  tell(truncated, "1 record truncated because its text does not fit ({0})",
       "{0} records truncated because their text does not fit (first {1})");
  tell(line_ends, "1 record with a line end inside ({0})", "{0} records with a line end inside (first {1})");
  return text;
}

bool RecordLog::exact() const {
  return counts.substituted + counts.malformed + counts.shifts + counts.cut == 0 && damage.empty() &&
         truncated.count() + wrong_length.count() + line_ends.count() == 0;
}

}  // namespace lx::tool
