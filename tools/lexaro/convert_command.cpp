// SPDX-License-Identifier: Apache-2.0
#include <memory>
#include <string>
#include <utility>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/conversion_job.hpp"
#include "tools/lexaro/library_session.hpp"
#include "tools/lexaro/report.hpp"
#include "tools/lexaro/run_options.hpp"

namespace lx::tool {
namespace {

struct ConvertOptions : RunOptions {
  std::string line_ends = "keep";
  bool verify = false;
  bool list = false;
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

void settle_options(ConvertOptions& options) {
  settle_run_options(options);
  if (options.verify && options.line_ends != "keep") {
    throw usage_failure(
        message("--verify compares with the unchanged input: it cannot go with --nl {0}", options.line_ends));
  }
  if (options.verify && options.discard) {
    throw usage_failure(message("--verify compares with the whole input: it cannot go with -c"));
  }
}

void tell_result(const std::string& file, const FileResult& result, bool discarded) {
  const Message summary = result.problems.summary(result.counts, discarded);
  if (!summary.empty()) complain(display_name(file) + ": " + summary);
  if (result.difference) complain(display_name(file) + ": " + result.difference->describe());
}

// Converts all files and puts the output in place.
void convert_files(const ConvertOptions& options, const ConversionSettings& settings, OutputFile& output,
                   Report& report) {
  Progress progress(progress_mode(options), total_size(options.files));
  for (const std::string& file : options.files) {
    InputFile input = open_input(file, output);
    FileResult result = convert_file(input, output, settings, progress);
    progress.clear();
    if (!options.silent) tell_result(file, result, options.discard);
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

  Report report{from, to, options.line_ends, options.discard, {}, ExitStatus::kExact, ""};
  return run_reported(options, report, [&](OutputFile& output) { convert_files(options, settings, output, report); });
}

}  // namespace

Command add_convert_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("convert", "Convert text from one code page into another");
  auto options = std::make_shared<ConvertOptions>();
  add_run_options(*app, *options);
  app->add_option("--nl", options->line_ends, "Line ends of the output (default keep)")
      ->option_text("keep|lf|nel|crlf")
      ->check(CLI::IsMember({"keep", "lf", "nel", "crlf"}));
  app->add_flag("--verify", options->verify, "Convert back and compare with the input");
  app->add_flag("-l,--list", options->list, "List the code pages and their names");
  app->footer(kExamples);
  return {app, [options](const CommonOptions& common) {
            return options->list ? list_code_pages(common, true, false) : run_convert(*options, common);
          }};
}

}  // namespace lx::tool
