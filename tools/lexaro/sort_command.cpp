// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <bit>
#include <cstring>
#include <memory>
#include <new>
#include <string>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/locale_items.hpp"
#include "tools/lexaro/open_locale.hpp"
#include "tools/lexaro/run_options.hpp"
#include "tools/lexaro/sort_keys.hpp"
#include "tools/lexaro/sort_lines.hpp"
#include "tools/lexaro/sort_memory.hpp"

namespace lx::tool {
namespace {

constexpr char kNotes[] =
    R"(Lines that are equal in the order keep their sequence. The text is UTF-8, or what
-f says, whatever code page the locale has; lines end with a line feed, in EBCDIC
with a next line or a line feed. Nothing but the order of the lines changes; only
a last line without line end gets one when it is not the last any more.
Characters that are malformed or beyond the Basic Multilingual Plane have no
place in the order: they are told at the end, and sort as U+FFFD and by their
bytes.

Exit codes: 0 sorted, 1 sorted, but with such characters (--check: not in
order), 2 usage, 3 input or output failed, 4 unknown locale or code page, or bad
locale data.

Examples:
  lexaro sort --locale Swedish names.txt
  lexaro sort --locale de_AT.UTF-8 --ignore-case -u -o words.txt words.txt
  lexaro sort -f IBM-1047 --locale English@IBM1047 host.dat
  lexaro sort --locale Danish --check names.txt
)";

struct SortOptions {
  std::optional<std::string> locale;
  std::string code_page = "UTF-8";
  std::string output = "-";
  bool ignore_case = false;
  bool ignore_width = false;
  bool reverse = false;
  bool unique = false;
  bool keys = false;
  bool check = false;
  std::vector<std::string> files;
};

// ---- The order ----

// What every line goes through, and what was met on the way.
struct Work {
  const SortOptions& options;
  const SortOrder& order;
  LineEnds ends;
  KeyMaker keys;
  ExitStatus status = ExitStatus::kExact;
};

SortOrder open_order(const SortOptions& options) {
  SortOrder order;
  order.page = open_code_page(options.code_page);
  order.locale = options.locale ? open_locale(*options.locale) : open_user_locale();
  if (LXSetLocaleNumInfo(order.locale.get(), LX_ITEM_CODEPAGE_ID, order.page.id) == 0) {
    throw Failure(ExitStatus::kCodePage,
                  message("code page {0}: {1}", order.page.name, describe_status(LXGetError(order.locale.get()))));
  }
  if (options.ignore_case) order.options = LX_CMP_NOCASE;
  if (options.ignore_width) order.options = LX_CMP_NOWIDTH;
  return order;
}

// Hands on each line of a file with its number and key.
template <class Take>
void read_lines(InputFile input, Work& work, Take take) {
  LineReader reader(input, work.ends);
  const uint64_t unknown_before = work.keys.unknown();
  uint64_t first_with_unknown = 0;
  for (Line line; reader.next(line);) {
    const std::string_view key = work.keys.key_of(line.text);
    if (first_with_unknown == 0 && work.keys.unknown() != unknown_before) first_with_unknown = reader.number();
    if (!take(line, key, reader.number())) return;
  }
  if (first_with_unknown == 0) return;
  work.status = ExitStatus::kDataProblem;
  complain(
      message("{0}: {1} characters that the order does not know, malformed or beyond the Basic Multilingual Plane; "
              "the first in line {2}",
              input.name(), work.keys.unknown() - unknown_before, first_with_unknown));
}

int compare_keys(std::string_view a, std::string_view b) { return a.compare(b); }

// ---- Sorting ----

struct SortLine {
  uint64_t key_begin;  // its first bytes, which decide most comparisons
  const char* text;
  const char* key;
  uint32_t length;
  uint32_t key_length;
  std::string_view end;

  std::string_view whole_key() const { return {key, key_length}; }
};

bool less(const SortLine& a, const SortLine& b) {
  return a.key_begin != b.key_begin ? a.key_begin < b.key_begin : compare_keys(a.whole_key(), b.whole_key()) < 0;
}

uint64_t begin_of(std::string_view key) {
  uint64_t bytes = 0;
  for (std::size_t i = 0; i < sizeof bytes; ++i) {
    bytes = bytes << 8 | (i < key.size() ? static_cast<unsigned char>(key[i]) : 0);
  }
  return bytes;
}

class SortedLines {
 public:
  void add(const Line& line, std::string_view key) {
    if (lines_.size() == lines_.capacity()) grow();
    SortLine kept{};
    kept.key_begin = begin_of(key);
    const char* text = store_.keep(line.text);
    kept.text = text;
    kept.length = static_cast<uint32_t>(line.text.size());
    kept.end = {store_.keep(line.end), line.end.size()};
    kept.key = store_.keep(key);
    kept.key_length = static_cast<uint32_t>(key.size());
    lines_.push_back(kept);
  }

  void sort(bool reverse, bool unique) {
    budget_.take(lines_.size() / 2 * sizeof(SortLine));  // the algorithm's own
    std::stable_sort(lines_.begin(), lines_.end(),
                     [reverse](const SortLine& a, const SortLine& b) { return reverse ? less(b, a) : less(a, b); });
    if (!unique) return;
    const auto equal = [](const SortLine& a, const SortLine& b) { return a.whole_key() == b.whole_key(); };
    lines_.erase(std::unique(lines_.begin(), lines_.end(), equal), lines_.end());
  }

  const std::vector<SortLine>& lines() const { return lines_; }

 private:
  void grow() {
    const std::size_t before = lines_.capacity();
    const std::size_t after = std::max<std::size_t>(1024, before * 2);
    budget_.take(after * sizeof(SortLine));
    lines_.reserve(after);
    budget_.give_back(before * sizeof(SortLine));
  }

  MemoryBudget budget_;
  ByteStore store_{budget_};
  std::vector<SortLine> lines_;
};

// ---- Writing ----

// Sixteen digits and a tab in the code page of the text.
std::string hexadecimal_digits(const CodePage& utf8, const CodePage& page) {
  std::string digits;
  Conversion conversion(utf8, page, 0, [&](std::string_view bytes) { digits += bytes; });
  conversion.convert("0123456789ABCDEF\t");
  conversion.finish();
  return digits;
}

class LineWriter {
 public:
  LineWriter(OutputFile& output, const std::string& digits) : output_(output), digits_(digits) {}

  void write_key(std::string_view key) {
    for (const char c : key) {
      const auto byte = static_cast<unsigned char>(c);
      buffer_ += digits_[byte >> 4];
      buffer_ += digits_[byte & 15];
    }
    buffer_ += digits_[16];
  }
  void write(std::string_view bytes) {
    buffer_ += bytes;
    if (buffer_.size() >= kBufferSize) flush();
  }
  void flush() {
    output_.write(buffer_);
    buffer_.clear();
  }

 private:
  OutputFile& output_;
  const std::string& digits_;  // empty: no keys wanted
  std::string buffer_;
};

void write_lines(const std::vector<SortLine>& lines, std::string_view line_end, const std::string& digits,
                 OutputFile& output) {
  LineWriter writer(output, digits);
  for (const SortLine& line : lines) {
    if (!digits.empty()) writer.write_key(line.whole_key());
    writer.write({line.text, line.length});
    const bool missing = line.end.empty() && &line != &lines.back();
    writer.write(missing ? line_end : line.end);
  }
  writer.flush();
}

void sort_files(Work& work, const CodePage& utf8) {
  OutputFile output(work.options.output);
  SortedLines sorted;
  std::string first_end;
  for (const std::string& file : work.options.files) {
    read_lines(open_input(file, output), work, [&](const Line& line, std::string_view key, uint64_t) {
      if (first_end.empty()) first_end = line.end;
      sorted.add(line, key);
      return true;
    });
  }
  sorted.sort(work.options.reverse, work.options.unique);
  if (first_end.empty()) first_end = work.ends.usual();
  const std::string digits = work.options.keys ? hexadecimal_digits(utf8, work.order.page) : "";
  write_lines(sorted.lines(), first_end, digits, output);
  output.commit();
}

// ---- Checking ----

Message shown_line(std::string_view line, const CodePage& page, const CodePage& utf8) {
  constexpr std::size_t kMostBytes = 400;
  std::string text;
  Conversion conversion(page, utf8, 0, [&](std::string_view bytes) { text += bytes; });
  conversion.convert(line.substr(0, kMostBytes));
  if (line.size() <= kMostBytes) conversion.finish();
  return quoted_text(plain_name(text)) + (line.size() <= kMostBytes ? "" : "...");
}

// Reads until a line should have come before the one before it.
void check_files(Work& work, const CodePage& utf8) {
  const SortOptions& options = work.options;
  std::string last_key;
  bool in_order = true;
  bool first = true;
  for (const std::string& file : options.files) {
    read_lines(InputFile(file), work, [&](const Line& line, std::string_view key, uint64_t number) {
      const int step = first ? 1 : compare_keys(options.reverse ? last_key : key, options.reverse ? key : last_key);
      first = false;
      in_order = options.unique ? step > 0 : step >= 0;
      if (!in_order) {
        const Message shown = shown_line(line.text, work.order.page, utf8);
        complain(step == 0
                     ? message("{0}: line {1} is equal to the line before it: {2}", display_name(file), number, shown)
                     : message("{0}: line {1} is out of order: {2}", display_name(file), number, shown));
      }
      last_key = key;
      return in_order;
    });
    if (!in_order) break;
  }
  if (!in_order) work.status = ExitStatus::kDataProblem;
}

ExitStatus run_sort(SortOptions options, const CommonOptions& common) {
  if (options.files.empty()) options.files.emplace_back("-");
  const LibrarySession session(common.locale_directory);
  const SortOrder order = open_order(options);
  const CodePage utf8 = open_code_page("UTF-8");
  Work work{options, order, LineEnds(order.page), KeyMaker(order, utf8)};
  try {
    options.check ? check_files(work, utf8) : sort_files(work, utf8);
  } catch (const std::bad_alloc&) {
    MemoryBudget::fail();
  }
  return work.status;
}

}  // namespace

Command add_sort_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("sort", "Sort lines in the order of a locale");
  auto options = std::make_shared<SortOptions>();
  app->add_option("--locale", options->locale, "Whose order; without it, the user's locale")->type_name("NAME");
  app->add_option("-f,--from", options->code_page, "Code page of the text (default UTF-8)")->type_name("CODEPAGE");
  auto* ignore_case = app->add_flag("--ignore-case", options->ignore_case, "Small and capital letters are equal");
  ignore_case->option_text(" ");
  app->add_flag("--ignore-width", options->ignore_width, "Half-width and full-width characters are equal")
      ->option_text(" ")
      ->excludes(ignore_case);
  app->add_flag("-r,--reverse", options->reverse, "The last line first");
  app->add_flag("-u,--unique", options->unique, "Only the first of equal lines (--check: none are equal)");
  auto* keys = app->add_flag("--keys", options->keys, "Before each line its key, in hexadecimal, and a tab");
  keys->option_text(" ");
  auto* output =
      app->add_option("-o,--output", options->output, "Write to FILE, put in place only when it is complete");
  output->option_text("FILE");
  app->add_flag("--check", options->check, "Only tell the first line that is out of order")
      ->option_text(" ")
      ->excludes(keys)
      ->excludes(output);
  app->add_option("FILE", options->files, "Files to sort together; none or - is standard input")->option_text("...");
  app->footer(kNotes);
  return {app, [options](const CommonOptions& common) { return run_sort(*options, common); }};
}

}  // namespace lx::tool
