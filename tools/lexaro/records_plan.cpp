// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/records_plan.hpp"

#include <algorithm>

namespace lx::tool {
namespace {

// Places where the file may be divided, a sample of bounded size of them.
class Joints {
 public:
  explicit Joints(uint64_t parts) : most_(std::max<std::size_t>(1U << 16, 4 * static_cast<std::size_t>(parts))) {}

  void add(uint64_t first_record) {
    if (met_++ % stride_ != 0) return;
    places_.push_back(first_record);
    if (places_.size() < most_) return;
    for (std::size_t i = 0; 2 * i < places_.size(); ++i) places_[i] = places_[2 * i];
    places_.resize((places_.size() + 1) / 2);
    stride_ *= 2;
  }
  // The first joint that is not before the record, or else `end`.
  uint64_t from(uint64_t record, uint64_t end) const {
    const auto found = std::lower_bound(places_.begin(), places_.end(), record);
    return found == places_.end() ? end : *found;
  }

 private:
  std::size_t most_;
  std::vector<uint64_t> places_;
  uint64_t met_ = 0;
  uint64_t stride_ = 1;
};

}  // namespace

RecordPlan plan_records(InputFile& input, Progress& progress, const RecordShape& shape, uint64_t parts) {
  const bool blocked = shape.format == RecordFormat::kVariableBlocked;
  const std::unique_ptr<RecordReader> reader = open_records(input, progress, shape);
  Joints joints(parts);
  if (blocked) {
    Record record;
    while (reader->next(record)) {
      if (record.begins_block) joints.add(record.number);
    }
  } else {
    reader->skip(std::numeric_limits<uint64_t>::max());
  }

  RecordPlan plan{{}, reader->damage()};
  const uint64_t records = reader->records() + (plan.damage.empty() ? 0 : 1);
  uint64_t first = 1;
  for (uint64_t part = 1; part <= parts; ++part) {
    // As parts * records / part would be, without its overflow.
    const uint64_t share = records / parts * part + records % parts * part / parts;
    const uint64_t next = !blocked || part == parts ? share + 1 : joints.from(share + 1, records + 1);
    if (next > first) plan.parts.push_back({first, next - first});
    first = std::max(first, next);
  }
  if (plan.parts.empty()) plan.parts.push_back({1, 0});
  return plan;
}

}  // namespace lx::tool
