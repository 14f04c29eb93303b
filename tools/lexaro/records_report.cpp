// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/records_report.hpp"

#include "tools/lexaro/report_parts.hpp"

namespace lx::tool {
namespace {

Json place_json(const RecordPlace& place) {
  return {{"record", place.record}, {"column", place.column}, {"offset", place.offset}};
}

Json faults_json(const RecordFaults& faults) {
  Json json = Json::array();
  for (const RecordFaults::Fault& fault : faults.first()) json.push_back(place_json(fault.place));
  return json;
}

Json lengths_json(const RecordFaults& faults) {
  Json json = Json::array();
  for (const RecordFaults::Fault& fault : faults.first()) {
    json.push_back({{"record", fault.place.record}, {"offset", fault.place.offset}, {"length", fault.length}});
  }
  return json;
}

void add_totals(Json& json, const RecordLog& log) {
  json["records"] = log.records;
  add_counts(json, log.counts);
  json["truncated_records"] = log.truncated.count();
  json["wrong_length_records"] = log.wrong_length.count();
  json["records_with_line_ends"] = log.line_ends.count();
}

Json file_json(const RecordResult& file) {
  const RecordLog& log = file.log;
  Json json;
  json["name"] = file.name;
  add_totals(json, log);
  json["first_problems"] = Json::array();
  for (const LXConversionProblem& problem : log.problems().first()) {
    Json entry = place_json(log.place(problem));
    entry.update(problem_json(problem));
    json["first_problems"].push_back(std::move(entry));
  }
  json["first_truncated"] = faults_json(log.truncated);
  json["first_wrong_lengths"] = lengths_json(log.wrong_length);
  json["first_line_ends"] = faults_json(log.line_ends);
  add_histograms(json, log.problems());
  if (!log.damage.empty()) json["damage"] = log.damage.english;
  if (!file.note.empty()) json["note"] = file.note.english;
  return json;
}

}  // namespace

std::string RecordsReport::json() const {
  Json json = begin_report();
  json["from"] = code_page_json(from);
  json["to"] = code_page_json(to);
  json["format"] = format;
  json["length"] = length;
  if (to_length != 0) json["to_length"] = to_length;
  if (!keep.empty()) json["keep"] = keep;
  if (range) json["range"] = {{"first", range->first}, {"count", range->count}};
  json["discard"] = discard;
  json["files"] = Json::array();
  uint64_t records = 0;
  uint64_t truncated = 0;
  LXConversionCounts total{};
  for (const RecordResult& file : files) {
    json["files"].push_back(file_json(file));
    records += file.log.records;
    truncated += file.log.truncated.count();
    add_counts(total, file.log.counts);
  }
  json["totals"] = {{"records", records}};
  add_counts(json["totals"], total);
  json["totals"]["truncated_records"] = truncated;
  if (!error.empty()) json["error"] = error;
  json["exit_status"] = static_cast<int>(status);
  return report_text(json);
}

}  // namespace lx::tool
