// SPDX-License-Identifier: Apache-2.0
// The conversion of whole files.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "tools/lexaro/code_page_names.hpp"
#include "tools/lexaro/input_file.hpp"
#include "tools/lexaro/output_file.hpp"
#include "tools/lexaro/problem_log.hpp"
#include "tools/lexaro/progress.hpp"
#include "tools/lexaro/verifier.hpp"

namespace lx::tool {

struct ConversionSettings {
  const CodePage& from;
  const CodePage& to;
  uint32_t options = LX_CONV_STRICT;  // LX_CONV_ bits
  bool verify = false;
};

struct FileResult {
  std::string name;
  LXConversionCounts counts{};
  ProblemLog problems;
  bool verified = false;  // whether it was tried; `difference` tells the result
  std::optional<Verifier::Difference> difference;

  bool exact() const { return counts.substituted + counts.malformed + counts.shifts + counts.cut == 0 && !difference; }
};

// Converts a file as a text of its own, so that neither half a character nor a shift state leaks into the next one.
FileResult convert_file(InputFile& input, OutputFile& output, const ConversionSettings& settings, Progress& progress);

}  // namespace lx::tool
