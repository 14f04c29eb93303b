// SPDX-License-Identifier: Apache-2.0
#include <sys/stat.h>
#include <unistd.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/conversion_job.hpp"
#include "tools/lexaro/library_session.hpp"
#include "tools/lexaro/report.hpp"

namespace lx::tool {
namespace {

struct ConvertOptions {
  std::string from;
  std::string to;
  std::string output = "-";
  std::string report;
  std::string line_ends = "keep";
  std::string progress = "auto";
  bool discard = false;
  bool silent = false;
  bool verify = false;
  bool list = false;
  std::vector<std::string> files;
};

constexpr char kExamples[] = R"(Each file is a text of its own; the converted texts follow one another in the output.
Characters that TO lacks become its substitution character; malformed input
becomes U+FFFD, or that character. Both are counted and told at the end.

Exit codes: 0 exact, 1 something was replaced, left out, malformed or did not
convert back, 2 usage, 3 input or output failed, 4 unknown code page or bad
locale data.

Examples:
  lexaro convert -f IBM-930 -t UTF-8 host.dat > host.txt
  lexaro convert -f cp1047 --nl lf -o notes.txt notes.txt
  lexaro convert -f UTF-8 -t 37 --verify --report audit.json -o out.dat in.txt
)";

uint32_t line_end_bits(const std::string& name) {
  if (name == "lf") return LX_CONV_LINES_LF;
  if (name == "nel") return LX_CONV_LINES_NEL;
  if (name == "crlf") return LX_CONV_LINES_CRLF;
  return 0;
}

Progress::When progress_mode(const ConvertOptions& options) {
  if (options.progress == "always") return Progress::When::kAlways;
  const bool text_on_terminal = options.output == "-" && ::isatty(STDOUT_FILENO);  // it would tear the line apart
  return options.progress == "never" || text_on_terminal ? Progress::When::kNever : Progress::When::kAutomatic;
}

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

void apply_suffixes(ConvertOptions& options) {
  if (const std::string suffix = take_suffix(options.from); !suffix.empty()) {
    throw usage_failure("-f: the suffix //" + display_name(suffix) + " has no meaning for the source code page");
  }
  const std::string suffix = take_suffix(options.to);
  if (suffix == "IGNORE") {
    options.discard = true;
  } else if (suffix == "TRANSLIT") {
    throw usage_failure(
        "-t: //TRANSLIT is not offered: characters are never replaced by look-alikes; "
        "leave it out for substitution characters, or use -c to leave them out");
  } else if (!suffix.empty()) {
    throw usage_failure("-t: unknown suffix //" + display_name(suffix));
  }
}

void settle_options(ConvertOptions& options) {
  if (options.from.empty() && options.to.empty()) throw usage_failure("name a code page with -f, -t or both");
  if (options.from.empty()) options.from = "UTF-8";
  if (options.to.empty()) options.to = "UTF-8";
  apply_suffixes(options);
  if (options.files.empty()) options.files.emplace_back("-");
  if (options.verify && options.line_ends != "keep") {
    throw usage_failure("--verify compares with the unchanged input: it cannot go with --nl " + options.line_ends);
  }
  if (options.verify && options.discard) {
    throw usage_failure("--verify compares with the whole input: it cannot go with -c");
  }
  if (options.report == "-" && options.output == "-") {
    throw usage_failure("--report - needs -o FILE: standard output already takes the converted text");
  }
}

bool same_file(const struct stat& a, const struct stat& b) { return a.st_dev == b.st_dev && a.st_ino == b.st_ino; }

// The report must not take the place of a file that the same run reads or writes.
void check_report_file(const ConvertOptions& options, const OutputFile& report, const OutputFile& output) {
  if (report.target().empty()) return;
  if (report.target() == output.target()) throw usage_failure("--report and -o name the same file");
  struct stat target {};
  if (::stat(report.target().c_str(), &target) != 0) return;
  struct stat other {};
  for (const std::string& file : options.files) {
    const int failed = file == "-" ? ::fstat(STDIN_FILENO, &other) : ::stat(file.c_str(), &other);
    if (failed == 0 && same_file(target, other)) throw usage_failure("--report names an input file");
  }
  if (output.writes_into(target)) throw usage_failure("--report names the output file");
}

void tell_result(const FileResult& result, bool discarded) {
  const std::string summary = result.problems.summary(result.counts, discarded);
  if (!summary.empty()) complain(result.name + ": " + summary);
  if (result.difference) complain(result.name + ": " + result.difference->describe());
}

// Converts all files and puts the output in place; the results so far stay in the report when something fails.
void convert_files(const ConvertOptions& options, const ConversionSettings& settings, OutputFile& output,
                   Report& report) {
  Progress progress(progress_mode(options), total_size(options.files));
  for (const std::string& file : options.files) {
    InputFile input(file);
    if (output.writes_into(input.status())) {
      throw Failure(ExitStatus::kInputOutput, input.name() + ": is both input and output; use -o to replace it safely");
    }
    FileResult result = convert_file(input, output, settings, progress);
    progress.clear();
    if (!options.silent) tell_result(result, options.discard);
    if (!result.exact()) report.status = ExitStatus::kDataProblem;
    if (options.report.empty()) result.problems = {};
    report.files.push_back(std::move(result));
  }
  output.commit();
}

ExitStatus run_convert(ConvertOptions options, const CommonOptions& common) {
  settle_options(options);
  const LibrarySession session(common.locale_directory);
  const CodePage from = open_code_page(options.from);
  const CodePage to = open_code_page(options.to);
  ConversionSettings settings{from, to};
  settings.options |= line_end_bits(options.line_ends) | (options.discard ? LX_CONV_DISCARD : 0);
  settings.verify = options.verify;

  OutputFile output(options.output);
  std::unique_ptr<OutputFile> report_file;
  if (!options.report.empty()) {
    report_file = std::make_unique<OutputFile>(options.report);
    check_report_file(options, *report_file, output);
  }
  Report report{from, to, options.line_ends, options.discard, {}, ExitStatus::kExact, ""};
  bool quiet = false;
  try {
    convert_files(options, settings, output, report);
  } catch (const Failure& failure) {
    report.status = failure.status();
    report.error = failure.what();
    quiet = failure.quiet();
  }
  if (report_file) {
    report_file->write(report.json());
    report_file->commit();
  }
  if (!report.error.empty()) throw Failure(report.status, report.error, quiet);
  return report.status;
}

}  // namespace

Command add_convert_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("convert", "Convert text from one code page into another");
  auto options = std::make_shared<ConvertOptions>();
  app->add_option("-f,--from", options->from, "Code page of the input (default UTF-8)")->type_name("FROM");
  app->add_option("-t,--to", options->to, "Code page of the output (default UTF-8)")->type_name("TO");
  app->add_option("-o,--output", options->output, "Write to FILE, put in place only when it is complete")
      ->type_name("FILE");
  app->add_flag("-c", options->discard, "Leave out what cannot be converted");
  app->add_flag("-s,--silent", options->silent, "Do not tell what was replaced or left out");
  app->add_option("--nl", options->line_ends, "Line ends of the output (default keep)")
      ->option_text("keep|lf|nel|crlf")
      ->check(CLI::IsMember({"keep", "lf", "nel", "crlf"}));
  app->add_flag("--verify", options->verify, "Convert back and compare with the input");
  app->add_option("--report", options->report, "Write the audit of the conversion to FILE, as JSON")->type_name("FILE");
  app->add_flag("--progress{always}", options->progress, "Show progress on standard error")
      ->option_text("=auto|always|never")
      ->check(CLI::IsMember({"auto", "always", "never"}));
  app->add_flag("-l,--list", options->list, "List the code pages and their names");
  app->add_option("FILE", options->files, "Files to convert; none or - is standard input")->option_text("...");
  app->footer(kExamples);
  return {app, [options](const CommonOptions& common) {
            return options->list ? list_code_pages(common, true, false) : run_convert(*options, common);
          }};
}

}  // namespace lx::tool
