// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/report_parts.hpp"

#include <algorithm>

namespace lx::tool {
namespace {

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

template <class KeyName>
Json histogram_json(const Histogram& histogram, KeyName key_name) {
  Json json = Json::object();
  for (const auto& [key, count] : histogram.counts()) json[key_name(key)] = count;
  if (histogram.other() != 0) json["other"] = histogram.other();
  return json;
}

}  // namespace

Json code_page_json(const CodePage& page) { return {{"name", page.name}, {"id", page.id}}; }

void add_counts(Json& json, const LXConversionCounts& counts) {
  json["bytes_in"] = counts.bytes_in;
  json["bytes_out"] = counts.bytes_out;
  json["substituted"] = counts.substituted;
  json["malformed"] = counts.malformed;
  json["cut"] = counts.cut;
  json["shifts"] = counts.shifts;
}

void add_counts(LXConversionCounts& total, const LXConversionCounts& counts) {
  total.bytes_in += counts.bytes_in;
  total.bytes_out += counts.bytes_out;
  total.substituted += counts.substituted;
  total.malformed += counts.malformed;
  total.shifts += counts.shifts;
  total.cut += counts.cut;
}

Json problem_json(const LXConversionProblem& problem) {
  const std::size_t length = std::min<std::size_t>(problem.length, sizeof problem.bytes);
  return {{"offset", problem.offset},
          {"kind", kind_name(problem.kind)},
          {"unicode", code_point(problem.unicode)},
          {"bytes", hexadecimal(problem.bytes, length)}};
}

void add_histograms(Json& json, const ProblemLog& problems) {
  json["substituted_characters"] =
      histogram_json(problems.substituted(), [](uint64_t key) { return code_point(static_cast<uint32_t>(key)); });
  json["malformed_sequences"] = histogram_json(problems.malformed(), [](uint64_t key) { return hexadecimal(key); });
}

Json begin_report() { return {{"program", "lexaro"}, {"version", LXVersion()}}; }

std::string report_text(const Json& json) { return json.dump(2, ' ', false, Json::error_handler_t::replace) + "\n"; }

}  // namespace lx::tool
