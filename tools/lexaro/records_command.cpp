// SPDX-License-Identifier: Apache-2.0
#include <charconv>
#include <memory>
#include <optional>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/library_session.hpp"
#include "tools/lexaro/records_job.hpp"
#include "tools/lexaro/records_plan.hpp"
#include "tools/lexaro/records_report.hpp"
#include "tools/lexaro/run_options.hpp"

namespace lx::tool {
namespace {

struct RecordsOptions : RunOptions {
  std::optional<uint64_t> length;
  std::optional<uint64_t> to_length;
  std::string keep;
  std::string range;
  std::optional<uint64_t> plan;
  std::string format = "F";
  std::string line_ends;
  bool line_in = false;
  bool line_out = false;
  bool keep_blanks = false;
};

constexpr uint64_t kMostParts = 100000;

constexpr char kExamples[] = R"(Each record is translated on its own: its shift bytes are balanced, it never ends
inside a character, and fixed records are padded with the blank of TO. A text that
does not fit loses blanks at its end; when that is not enough, it is truncated
behind a whole character, and this is told.

Columns and records count from 1. F: fixed records of N bytes. V: each record
behind a record descriptor word (its length in two bytes, these 4 included, and
two zero bytes). VB: such records in blocks behind block descriptor words. N and
M do not count descriptor words; of V and VB they are the longest record.

Exit codes: 0 exact, 1 something was replaced, truncated, malformed or of the
wrong length, 2 usage, 3 input or output failed, 4 unknown code page or bad
locale data.

Examples:
  lexaro records -f IBM-1047 -t UTF-8 --length 80 --line-out cards.dat
  lexaro records -f 930 -t MS932 --length 200 --keep 41-45,90-97 -o out.dat in.dat
  lexaro records -f 37 -t 819 --format VB --range 1001:500 -o part2 journal.dat
  lexaro records -f 37 --length 80 --plan 4 cards.dat
)";

RecordFormat format_of(const RecordsOptions& options) {
  if (options.line_in) return RecordFormat::kLines;
  if (options.format == "V") return RecordFormat::kVariable;
  if (options.format == "VB") return RecordFormat::kVariableBlocked;
  return RecordFormat::kFixed;
}

bool is_fixed(const RecordsOptions& options) { return options.format == "F"; }

void check_lengths(RecordsOptions& options) {
  const uint64_t longest = is_fixed(options) ? kLongestRecord : longest_data(format_of(options));
  const auto check = [&](const char* option, const std::optional<uint64_t>& length) {
    if (length && (*length == 0 || *length > longest)) {
      throw usage_failure(
          message("{0}: records of format {1} have 1 to {2} bytes, not {3}", option, options.format, longest, *length));
    }
  };
  check("--length", options.length);
  check("--to-length", options.to_length);
  if (is_fixed(options) && !options.length && !(options.plan && options.line_in)) {
    throw usage_failure(message("tell the length of the records with --length"));
  }
}

void check_lines(const RecordsOptions& options) {
  if (options.line_in && options.line_out) {
    throw usage_failure(message("--line-in and --line-out leave no records: \"lexaro convert\" converts lines"));
  }
  if (options.line_in && !is_fixed(options)) {
    throw usage_failure(message("--line-in makes fixed records: it cannot go with --format {0}", options.format));
  }
  if ((options.line_in || options.line_out) && options.to_length) {
    throw usage_failure(options.line_in
                            ? message("--line-in: --length already tells the length of the records written")
                            : message("--line-out: lines have no length of their own, leave --to-length out"));
  }
  if ((options.line_in || options.line_out) && !options.keep.empty()) {
    throw usage_failure(message("--keep: kept bytes may look like line ends, so they cannot stand in lines"));
  }
  if (!options.line_out && options.keep_blanks)
    throw usage_failure(message("{0} goes with --line-out only", "--keep-blanks"));
  if (!options.line_out && !options.line_ends.empty())
    throw usage_failure(message("{0} goes with --line-out only", "--nl"));
}

void check_plan(const RecordsOptions& options) {
  if (!options.plan) return;
  if (*options.plan == 0 || *options.plan > kMostParts) {
    throw usage_failure(message("--plan: a file is divided into 1 to {0} parts", kMostParts));
  }
  if (options.output != "-" || !options.report.empty() || !options.range.empty()) {
    throw usage_failure(message("--plan converts nothing: leave -o, --report and --range to the runs that it plans"));
  }
}

void settle_options(RecordsOptions& options) {
  if (options.plan && options.from.empty() && options.to.empty() && !options.line_in) options.from = "UTF-8";
  settle_run_options(options);
  check_lines(options);
  check_lengths(options);
  check_plan(options);
  if ((options.plan || !options.range.empty()) && options.files.size() > 1) {
    throw usage_failure(message("{0} is about one file, not several", options.plan ? "--plan" : "--range"));
  }
}

std::optional<RecordRange> parse_range(const std::string& text) {
  if (text.empty()) return std::nullopt;
  RecordRange range;
  const char* end = text.data() + text.size();
  const auto first = std::from_chars(text.data(), end, range.first);
  const bool divided = first.ec == std::errc() && first.ptr != end && *first.ptr == ':';
  const auto count = divided ? std::from_chars(first.ptr + 1, end, range.count) : first;
  if (!divided || count.ec != std::errc() || count.ptr != end || range.first == 0) {
    throw usage_failure(
        message("--range: \"{0}\" is no FIRST:COUNT, the number of the first record, from 1, and how many",
                display_name(text)));
  }
  return range;
}

RecordLayout make_layout(const RecordsOptions& options) {
  const std::vector<Columns> kept = options.keep.empty() ? std::vector<Columns>() : parse_columns(options.keep);
  if (options.line_out) return variable_layout(kEndless, {});
  if (options.line_in) return padding_layout(*options.length);
  if (is_fixed(options)) return fixed_layout(*options.length, options.to_length.value_or(*options.length), kept);
  return variable_layout(options.to_length.value_or(longest_data(format_of(options))), kept);
}

// The line end of the output, and what would end a line early.
std::pair<std::string, std::string> line_ends_of(const RecordsOptions& options, const RecordPage& to) {
  const std::string name = !options.line_ends.empty() ? options.line_ends : to.info.ascii_family != 0 ? "lf" : "nel";
  const auto in_page = [&](const char* utf8) {
    const std::optional<std::string> text = to.encode(utf8);
    if (!text) throw usage_failure(message("--nl {0}: the code page {1} has no such line end", name, to.page.name));
    return *text;
  };
  if (name == "crlf") return {in_page("\r\n"), in_page("\n")};
  const std::string line_end = in_page(name == "nel" ? "\xC2\x85" : "\n");
  return {line_end, line_end};
}

RecordSettings make_settings(const RecordsOptions& options, const RecordPage& from, const RecordPage& to) {
  TranslationSettings translation{from, to};
  translation.options |= options.discard ? LX_CONV_DISCARD : 0;
  translation.layout = make_layout(options);
  translation.length = static_cast<std::size_t>(options.length.value_or(0));
  translation.keep_blanks = options.keep_blanks;
  RecordSettings settings{translation, {format_of(options), translation.length, from.line_ends}, {}, {}, {}, {}};
  settings.output = options.line_out  ? RecordFormat::kLines
                    : options.line_in ? RecordFormat::kFixed
                                      : settings.input.format;
  if (options.line_out) std::tie(settings.line_end, settings.translation.line_mark) = line_ends_of(options, to);
  settings.longest = options.length && !options.line_in ? translation.length : kEndless;
  settings.range = parse_range(options.range);
  return settings;
}

// Damage is told even to those who want silence: a part of the file was not converted.
void tell_result(const std::string& file, const RecordResult& result, const RecordsOptions& options) {
  if (!options.silent) {
    const Message summary = result.log.summary(options.discard);
    for (const Message& text : {summary, result.size_fault, result.note}) {
      if (!text.empty()) complain(display_name(file) + ": " + text);
    }
  }
  if (!result.log.damage.empty()) {
    complain(message("{0}: {1}; the rest of the file is not converted", display_name(file), result.log.damage));
  }
}

void convert_files(const RecordsOptions& options, const RecordSettings& settings, OutputFile& output,
                   RecordsReport& report) {
  Progress progress(progress_mode(options), size_of_records(options.files, settings));
  for (const std::string& file : options.files) {
    InputFile input = open_input(file, output);
    RecordResult result = convert_records(input, output, settings, progress);
    progress.clear();
    tell_result(file, result, options);
    if (!result.log.exact()) report.status = ExitStatus::kDataProblem;
    if (!options.report.empty()) report.files.push_back(std::move(result));
  }
  output.commit();
}

ExitStatus run_plan(const RecordsOptions& options, const RecordSettings& settings) {
  Progress progress(progress_mode(options), total_size(options.files));
  InputFile input(options.files.front());
  const RecordPlan plan = plan_records(input, progress, settings.input, *options.plan);
  progress.clear();
  std::string text;
  for (const RecordRange& part : plan.parts) {
    text += "--range=" + std::to_string(part.first) + ":" + std::to_string(part.count) + "\n";
  }
  print(text);
  if (plan.damage.empty()) return ExitStatus::kExact;
  complain(message("{0}: {1}; the last part ends there", input.name(), plan.damage));
  return ExitStatus::kDataProblem;
}

ExitStatus run_records(RecordsOptions options, const CommonOptions& common) {
  settle_options(options);
  const LibrarySession session(common.locale_directory);
  const CodePage from_page = open_code_page(options.from);
  const CodePage to_page = open_code_page(options.to);
  const RecordPage from(from_page);
  const RecordPage to(to_page);
  if (options.plan) {
    if (!options.length) options.length = 1;  // lines have none
    return run_plan(options, make_settings(options, from, to));
  }
  const RecordSettings settings = make_settings(options, from, to);
  RecordsReport report{from_page,
                       to_page,
                       options.format,
                       options.length.value_or(longest_data(format_of(options))),
                       settings.output == RecordFormat::kLines ? 0 : settings.translation.layout.limit,
                       options.keep,
                       settings.range,
                       options.discard,
                       {},
                       ExitStatus::kExact,
                       ""};
  return run_reported(options, report, [&](OutputFile& output) { convert_files(options, settings, output, report); });
}

}  // namespace

Command add_records_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("records", "Translate the records of host files");
  auto options = std::make_shared<RecordsOptions>();
  app->add_option("--length", options->length, "Bytes of a record")->type_name("N");
  app->add_option("--to-length", options->to_length, "Bytes of a record in the output (default N)")->type_name("M");
  app->add_option("--keep", options->keep, "Columns to copy as they are, like 5-8,21-24")->type_name("RANGES");
  app->add_option("--range", options->range, "Only COUNT records from number FIRST on")->type_name("FIRST:COUNT");
  app->add_option("--plan", options->plan, "Convert nothing, print --range arguments that cover FILE in N parts")
      ->type_name("N");
  app->add_option("--format", options->format, "Fixed, variable or variable blocked records (default F)")
      ->option_text("F|V|VB")
      ->check(CLI::IsMember({"F", "V", "VB"}));
  app->add_flag("--line-out", options->line_out, "Write a line for each record, without the blanks at its end");
  app->add_flag("--keep-blanks", options->keep_blanks, "... with them");
  app->add_option("--nl", options->line_ends, "Line ends of --line-out (default lf, to EBCDIC pages nel)")
      ->option_text("lf|nel|crlf")
      ->check(CLI::IsMember({"lf", "nel", "crlf"}));
  app->add_flag("--line-in", options->line_in, "Make a fixed record of each input line");
  add_run_options(*app, *options);
  app->footer(kExamples);
  return {app, [options](const CommonOptions& common) { return run_records(*options, common); }};
}

}  // namespace lx::tool
