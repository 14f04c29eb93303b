// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/run_options.hpp"

#include <sys/stat.h>
#include <unistd.h>

namespace lx::tool {
namespace {

// Takes iconv's suffix off a code page name and returns it in upper case: "UTF-8//IGNORE" asks for what -c does.
std::string take_suffix(std::string& name) {
  const std::size_t slashes = name.find("//");
  if (slashes == std::string::npos) return "";
  std::string suffix = name.substr(slashes + 2);
  name.resize(slashes);
  for (char& c : suffix) {
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
  }
  return suffix;
}

void apply_suffixes(RunOptions& options) {
  if (const std::string suffix = take_suffix(options.from); !suffix.empty()) {
    throw usage_failure(message("-f: the suffix //{0} has no meaning for the source code page", display_name(suffix)));
  }
  const std::string suffix = take_suffix(options.to);
  if (suffix == "IGNORE") {
    options.discard = true;
  } else if (suffix == "TRANSLIT") {
    throw usage_failure(
        message("-t: //TRANSLIT is not offered: characters are never replaced by look-alikes; "
                "leave it out for substitution characters, or use -c to leave them out"));
  } else if (!suffix.empty()) {
    throw usage_failure(message("-t: unknown suffix //{0}", display_name(suffix)));
  }
}

bool same_file(const struct stat& a, const struct stat& b) { return a.st_dev == b.st_dev && a.st_ino == b.st_ino; }

}  // namespace

void add_run_options(CLI::App& app, RunOptions& options) {
  app.add_option("-f,--from", options.from, "Code page of the input (default UTF-8)")->type_name("FROM");
  app.add_option("-t,--to", options.to, "Code page of the output (default UTF-8)")->type_name("TO");
  app.add_option("-o,--output", options.output, "Write to FILE, put in place only when it is complete")
      ->type_name("FILE");
  app.add_flag("-c", options.discard, "Leave out what cannot be converted");
  app.add_flag("-s,--silent", options.silent, "Do not tell what was replaced or left out");
  app.add_option("--report", options.report, "Write the audit of the conversion to FILE, as JSON")->type_name("FILE");
  app.add_flag("--progress{always}", options.progress, "Show progress on standard error")
      ->option_text("=auto|always|never")
      ->check(CLI::IsMember({"auto", "always", "never"}));
  app.add_option("FILE", options.files, "Files to convert; none or - is standard input")->option_text("...");
}

void settle_run_options(RunOptions& options) {
  if (options.from.empty() && options.to.empty()) throw usage_failure(message("name a code page with -f, -t or both"));
  if (options.from.empty()) options.from = "UTF-8";
  if (options.to.empty()) options.to = "UTF-8";
  apply_suffixes(options);
  if (options.files.empty()) options.files.emplace_back("-");
  if (options.report == "-" && options.output == "-") {
    throw usage_failure(message("--report - needs -o FILE: standard output already takes the converted text"));
  }
}

Progress::When progress_mode(const RunOptions& options) {
  if (options.progress == "always") return Progress::When::kAlways;
  const bool text_on_terminal = options.output == "-" && ::isatty(STDOUT_FILENO);  // it would tear the line apart
  return options.progress == "never" || text_on_terminal ? Progress::When::kNever : Progress::When::kAutomatic;
}

InputFile open_input(const std::string& file, const OutputFile& output) {
  InputFile input(file);
  if (output.writes_into(input.status())) {
    throw Failure(ExitStatus::kInputOutput,
                  message("{0}: is both input and output; use -o to replace it safely", input.name()));
  }
  return input;
}

void check_report_file(const RunOptions& options, const OutputFile& report, const OutputFile& output) {
  if (report.target().empty()) return;
  if (report.target() == output.target()) throw usage_failure(message("--report and -o name the same file"));
  struct stat target {};
  if (::stat(report.target().c_str(), &target) != 0) return;
  struct stat other {};
  for (const std::string& file : options.files) {
    const int failed = file == "-" ? ::fstat(STDIN_FILENO, &other) : ::stat(file.c_str(), &other);
    if (failed == 0 && same_file(target, other)) throw usage_failure(message("--report names an input file"));
  }
  if (output.writes_into(target)) throw usage_failure(message("--report names the output file"));
}

}  // namespace lx::tool
