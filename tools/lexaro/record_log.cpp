// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_log.hpp"

namespace lx::tool {

std::string shown_place(const RecordPlace& place) {
  return "in record " + std::to_string(place.record) + ", column " + std::to_string(place.column) + ", byte " +
         std::to_string(place.offset);
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

std::string RecordLog::summary(bool discarded) const {
  std::string text = problems_.summary(
      counts, discarded, [this](const LXConversionProblem& problem) { return shown_place(place(problem)); });
  const auto tell = [&](const RecordFaults& faults, const char* one, const char* many) {
    if (faults.count() == 0) return;
    if (!text.empty()) text += ", ";
    text += std::to_string(faults.count()) + " " + (faults.count() == 1 ? one : many) +
            (faults.count() == 1 ? " (" : " (first ") + shown_place(faults.first().front().place) + ")";
  };
  tell(truncated, "record truncated because its text does not fit",
       "records truncated because their text does not fit");
  tell(line_ends, "record with a line end inside", "records with a line end inside");
  return text;
}

bool RecordLog::exact() const {
  return counts.substituted + counts.malformed + counts.shifts + counts.cut == 0 && damage.empty() &&
         truncated.count() + wrong_length.count() + line_ends.count() == 0;
}

}  // namespace lx::tool
