// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/report.hpp"

#include "tools/lexaro/report_parts.hpp"

namespace lx::tool {
namespace {

Json file_json(const FileResult& file) {
  Json json;
  json["name"] = file.name;
  add_counts(json, file.counts);
  if (file.verified) json["converts_back"] = !file.difference.has_value();
  if (file.difference) json["first_difference"] = file.difference->offset;
  json["first_problems"] = Json::array();
  for (const LXConversionProblem& problem : file.problems.first()) {
    json["first_problems"].push_back(problem_json(problem));
  }
  add_histograms(json, file.problems);
  return json;
}

}  // namespace

std::string Report::json() const {
  Json json = begin_report();
  json["from"] = code_page_json(from);
  json["to"] = code_page_json(to);
  json["line_ends"] = line_ends;
  json["discard"] = discard;
  json["files"] = Json::array();
  LXConversionCounts total{};
  for (const FileResult& file : files) {
    json["files"].push_back(file_json(file));
    add_counts(total, file.counts);
  }
  json["totals"] = Json::object();
  add_counts(json["totals"], total);
  if (!error.empty()) json["error"] = error;
  json["exit_status"] = static_cast<int>(status);
  return report_text(json);
}

}  // namespace lx::tool
