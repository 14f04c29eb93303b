// SPDX-License-Identifier: Apache-2.0
// Divides a file of records for several runs.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "tools/lexaro/records_job.hpp"
#include "tools/messages/message.hpp"

namespace lx::tool {

struct RecordPlan {
  std::vector<RecordRange> parts;  // of nearly equal numbers of records, none empty unless the file is
  Message damage;                  // met by whoever converts the last part
};

// Blocks of records are not divided, so that the converted parts put together are the converted whole.
RecordPlan plan_records(InputFile& input, Progress& progress, const RecordShape& shape, uint64_t parts);

}  // namespace lx::tool
