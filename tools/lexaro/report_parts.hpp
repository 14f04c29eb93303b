// SPDX-License-Identifier: Apache-2.0
// What the audits of different commands have in common.
#pragma once

#include "tools/lexaro/code_page_names.hpp"
#include "tools/lexaro/json_output.hpp"
#include "tools/lexaro/problem_log.hpp"

namespace lx::tool {

Json code_page_json(const CodePage& page);
// Adds the counts as fields, and sums them up.
void add_counts(Json& json, const LXConversionCounts& counts);
void add_counts(LXConversionCounts& total, const LXConversionCounts& counts);
Json problem_json(const LXConversionProblem& problem);
// Adds the histograms of characters and of sequences.
void add_histograms(Json& json, const ProblemLog& problems);
// The program and its version, which begin each audit.
Json begin_report();
// The text of an audit. File names need not be UTF-8.
std::string report_text(const Json& json);

}  // namespace lx::tool
