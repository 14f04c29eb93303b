// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/report.hpp"

#include <algorithm>
#include <nlohmann/json.hpp>

namespace lx::tool {
namespace {

using Json = nlohmann::ordered_json;

const char* kind_name(uint32_t kind) {
  switch (kind) {
    case LX_PROBLEM_SUBSTITUTED:
      return "substituted";
    case LX_PROBLEM_MALFORMED:
      return "malformed";
    case LX_PROBLEM_SHIFT:
      return "shift";
    default:
      return "cut";
  }
}

Json code_page_json(const CodePage& page) { return {{"name", page.name}, {"id", page.id}}; }

void add_counts(Json& json, const LXConversionCounts& counts) {
  json["bytes_in"] = counts.bytes_in;
  json["bytes_out"] = counts.bytes_out;
  json["substituted"] = counts.substituted;
  json["malformed"] = counts.malformed;
  json["cut"] = counts.cut;
  json["shifts"] = counts.shifts;
}

Json problem_json(const LXConversionProblem& problem) {
  const std::size_t length = std::min<std::size_t>(problem.length, sizeof problem.bytes);
  return {{"offset", problem.offset},
          {"kind", kind_name(problem.kind)},
          {"unicode", code_point(problem.unicode)},
          {"bytes", hexadecimal(problem.bytes, length)}};
}

template <class KeyName>
Json histogram_json(const Histogram& histogram, KeyName key_name) {
  Json json = Json::object();
  for (const auto& [key, count] : histogram.counts()) json[key_name(key)] = count;
  if (histogram.other() != 0) json["other"] = histogram.other();
  return json;
}

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
  json["substituted_characters"] =
      histogram_json(file.problems.substituted(), [](uint64_t key) { return code_point(static_cast<uint32_t>(key)); });
  json["malformed_sequences"] =
      histogram_json(file.problems.malformed(), [](uint64_t key) { return hexadecimal(key); });
  return json;
}

LXConversionCounts sum(const std::vector<FileResult>& files) {
  LXConversionCounts total{};
  for (const FileResult& file : files) {
    total.bytes_in += file.counts.bytes_in;
    total.bytes_out += file.counts.bytes_out;
    total.substituted += file.counts.substituted;
    total.malformed += file.counts.malformed;
    total.shifts += file.counts.shifts;
    total.cut += file.counts.cut;
  }
  return total;
}

}  // namespace

std::string Report::json() const {
  Json json;
  json["program"] = "lexaro";
  json["version"] = LXVersion();
  json["from"] = code_page_json(from);
  json["to"] = code_page_json(to);
  json["line_ends"] = line_ends;
  json["discard"] = discard;
  json["files"] = Json::array();
  for (const FileResult& file : files) json["files"].push_back(file_json(file));
  json["totals"] = Json::object();
  add_counts(json["totals"], sum(files));
  if (!error.empty()) json["error"] = error;
  json["exit_status"] = static_cast<int>(status);
  // File names need not be UTF-8.
  return json.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace lx::tool
