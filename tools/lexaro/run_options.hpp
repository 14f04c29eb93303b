// SPDX-License-Identifier: Apache-2.0
// What the commands that convert files share: their options, and a run with its report.
#pragma once

#include <CLI/CLI.hpp>
#include <exception>
#include <memory>
#include <string>
#include <vector>

#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/input_file.hpp"
#include "tools/lexaro/output_file.hpp"
#include "tools/lexaro/progress.hpp"

namespace lx::tool {

struct RunOptions {
  std::string from;
  std::string to;
  std::string output = "-";
  std::string report;
  std::string progress = "auto";
  bool discard = false;
  bool silent = false;
  std::vector<std::string> files;
};

void add_run_options(CLI::App& app, RunOptions& options);
// Fills in what was left out, and takes iconv's suffixes off the code page names.
void settle_run_options(RunOptions& options);

Progress::When progress_mode(const RunOptions& options);
// Opens a file to read, unless the output is being written into it.
InputFile open_input(const std::string& file, const OutputFile& output);
// The report must not take the place of a file that the same run reads or writes.
void check_report_file(const RunOptions& options, const OutputFile& report, const OutputFile& output);

// Does the work, which fills in the report; what was done stays in the report when something fails.
template <class Report, class Work>
ExitStatus run_reported(const RunOptions& options, Report& report, Work work) {
  OutputFile output(options.output);
  std::unique_ptr<OutputFile> report_file;
  if (!options.report.empty()) {
    report_file = std::make_unique<OutputFile>(options.report);
    check_report_file(options, *report_file, output);
  }
  std::exception_ptr failed;
  try {
    work(output);
  } catch (const Failure& failure) {
    report.status = failure.status();
    report.error = failure.what();
    failed = std::current_exception();
  }
  if (report_file) {
    report_file->write(report.json());
    report_file->commit();
  }
  if (failed) std::rethrow_exception(failed);
  return report.status;
}

}  // namespace lx::tool
