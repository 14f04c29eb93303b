// SPDX-License-Identifier: Apache-2.0
// The audit of a translation of records as JSON.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/records_job.hpp"

namespace lx::tool {

struct RecordsReport {
  const CodePage& from;
  const CodePage& to;
  std::string format;
  uint64_t length = 0;
  uint64_t to_length = 0;  // 0: lines, of any length
  std::string keep;
  std::optional<RecordRange> range;
  bool discard = false;
  std::vector<RecordResult> files;
  ExitStatus status = ExitStatus::kExact;
  std::string error;  // what ended the run early

  std::string json() const;
};

}  // namespace lx::tool
