// SPDX-License-Identifier: Apache-2.0
// The audit of a conversion as JSON.
#pragma once

#include <string>
#include <vector>

#include "tools/lexaro/conversion_job.hpp"
#include "tools/lexaro/failure.hpp"

namespace lx::tool {

struct Report {
  const CodePage& from;
  const CodePage& to;
  std::string line_ends;
  bool discard = false;
  std::vector<FileResult> files;
  ExitStatus status = ExitStatus::kExact;
  std::string error;  // what ended the run early

  std::string json() const;
};

}  // namespace lx::tool
