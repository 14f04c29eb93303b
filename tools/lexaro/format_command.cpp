// SPDX-License-Identifier: Apache-2.0
#include <limits>
#include <locale>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/conversion.hpp"
#include "tools/lexaro/locale_items.hpp"
#include "tools/lexaro/open_locale.hpp"
#include "tools/lexaro/output_file.hpp"
#include "tools/lexaro/sort_lines.hpp"
#include "tools/lexaro/terminal_text.hpp"
#include "tools/lexaro/time_format.hpp"
#include "tools/lexaro/time_value.hpp"
#include "tools/lexaro/values.hpp"

namespace lx::tool {
namespace {

constexpr char kNotes[] =
    R"(KIND is integer, number, currency or time. Values are written as C writes numbers
and ISO 8601 writes times: 1234567, -0.5, 2026-11-22, 2026-11-22T13:05:09, 13:05,
now, @86400 (seconds since 1970 in UTC). Without values, the lines of standard
input are taken. The result appears in the encoding of the terminal, with -t as
bytes of that code page.

Exit codes: 0 done, 1 some values could not be written, 2 usage, 3 input or output
failed, 4 unknown locale or code page, or bad locale data.

Examples:
  lexaro format integer --locale de_CH.UTF-8 1234567 -5
  lexaro format currency --locale fr_FR 1234.5
  lexaro format currency --locale English_Canada --international 99
  lexaro format time --locale Japanese --format "%A %#x" 2026-11-22
  lexaro format number --locale German -t IBM273 < numbers.txt > host.dat
)";

struct FormatOptions {
  std::string kind;
  std::optional<std::string> locale;
  std::string code_page;
  std::string format = "%c";
  bool territory = false;
  bool is_unsigned = false;
  bool international = false;
  std::vector<std::string> values;
};

// The longest text: a double with all fraction digits that a locale can ask for.
constexpr int32_t kRoom = 80000;

// The library's functions by the kind of text that they write.
struct InUcs2 {
  using Unit = LXUChar;
  using Text = std::vector<LXUChar>;
  static int32_t integer(LXLocale* locale, int32_t value, Unit* out, uint32_t flags) {
    return LXLongToStringU(locale, value, out, kRoom, flags);
  }
  static int32_t number(LXLocale* locale, double value, Unit* out, uint32_t flags) {
    return LXDoubleToStringU(locale, value, out, kRoom, flags);
  }
  static int32_t currency(LXLocale* locale, double value, Unit* out, uint32_t flags) {
    return LXCurrencyToStringU(locale, value, out, kRoom, flags);
  }
  static int32_t time(LXLocale* locale, const LXTime& value, Unit* out, const Text& format, uint32_t flags) {
    return LXTimeToStringU(locale, &value, out, kRoom, format.data(), static_cast<int32_t>(format.size()), flags);
  }
};

struct InCodePage {
  using Unit = char;
  using Text = std::string;
  static int32_t integer(LXLocale* locale, int32_t value, Unit* out, uint32_t flags) {
    return LXLongToStringEx(locale, value, out, 0, kRoom, flags);
  }
  static int32_t number(LXLocale* locale, double value, Unit* out, uint32_t flags) {
    return LXDoubleToStringEx(locale, value, out, 0, kRoom, flags);
  }
  static int32_t currency(LXLocale* locale, double value, Unit* out, uint32_t flags) {
    return LXCurrencyToStringEx(locale, value, out, 0, kRoom, flags);
  }
  static int32_t time(LXLocale* locale, const LXTime& value, Unit* out, const Text& format, uint32_t flags) {
    return LXTimeToStringEx(locale, &value, out, 0, kRoom, format.data(), 0, static_cast<int32_t>(format.size()),
                            flags);
  }
};

// As in C on the plain side, whatever the user's locale.
template <class Number>
std::optional<Number> read_number(const std::string& text) {
  std::istringstream in(text);
  in.imbue(std::locale::classic());
  Number number{};
  if (!(in >> std::noskipws >> number) || in.peek() != std::istringstream::traits_type::eof()) return std::nullopt;
  return number;
}

std::optional<int32_t> read_integer(const std::string& text, bool is_unsigned) {
  const auto number = read_number<int64_t>(text);
  const int64_t least = is_unsigned ? 0 : std::numeric_limits<int32_t>::min();
  const int64_t most =
      is_unsigned ? int64_t{std::numeric_limits<uint32_t>::max()} : std::numeric_limits<int32_t>::max();
  if (!number || *number < least || *number > most) return std::nullopt;
  return static_cast<int32_t>(*number);
}

template <class Out>
class Formatter {
 public:
  Formatter(LXLocale* locale, const FormatOptions& options, typename Out::Text format)
      : locale_(locale), options_(options), format_(std::move(format)), buffer_(kRoom) {
    if (options.territory) flags_ |= LX_NUM_TEXTOPT;
    if (options.is_unsigned) flags_ |= LX_NUM_UNSIGNED;
    if (options.international) flags_ |= LX_NUM_INTLSYM;
  }

  // False: the value is none of the kind, or the library refused it; the user was told.
  bool write(const Value& value, typename Out::Text& text) {
    const std::string given = utf8_of(value.text);
    int32_t count = 0;
    if (options_.kind == "integer") {
      const auto number = read_integer(given, options_.is_unsigned);
      if (!number)
        return refuse(value, options_.is_unsigned ? message("not an integer from 0 to 4294967295")
                                                  : message("not an integer from -2147483648 to 2147483647"));
      count = Out::integer(locale_, *number, buffer_.data(), flags_);
    } else if (options_.kind == "time") {
      const auto time = read_time(given);
      if (!time) return refuse(value, message("not a time such as 2026-11-22 or 2026-11-22T13:05:09"));
      count = Out::time(locale_, *time, buffer_.data(), format_, flags_);
    } else {
      const auto number = read_number<double>(given);
      if (!number) return refuse(value, message("not a number"));
      count = options_.kind == "number" ? Out::number(locale_, *number, buffer_.data(), flags_)
                                        : Out::currency(locale_, *number, buffer_.data(), flags_);
    }
    const uint32_t status = LXGetError(locale_);
    if (status != LX_OK) {
      return refuse(value, status == LX_E_FORMAT ? message("the format has an unknown or incomplete directive")
                                                 : describe_status(status));
    }
    text.assign(buffer_.data(), buffer_.data() + count);
    return true;
  }

 private:
  static bool refuse(const Value& value, const Message& why) {
    complain_about(value, why);
    return false;
  }

  LXLocale* locale_;
  const FormatOptions& options_;
  uint32_t flags_ = 0;
  typename Out::Text format_;
  std::vector<typename Out::Unit> buffer_;
};

// Hands on each value as the locale writes it; whether all could be written.
template <class Out, class Take>
bool write_all(LXLocale* locale, const FormatOptions& options, typename Out::Text format, Take take) {
  Formatter<Out> formatter(locale, options, std::move(format));
  typename Out::Text text;
  bool all = true;
  for_each_value(options.values, "UTF-8", [&](const Value& value) {
    const bool written = formatter.write(value, text);
    if (written) take(text);
    all = all && written;
  });
  return all;
}

bool write_to_terminal(LXLocale* locale, const FormatOptions& options, const std::vector<LXUChar>& format,
                       OutputFile& output) {
  return write_all<InUcs2>(locale, options, format, [&](const std::vector<LXUChar>& text) {
    output.write(terminal_text(utf8_of(text) + "\n"));
  });
}

bool write_in_code_page(LXLocale* locale, const FormatOptions& options, const std::vector<LXUChar>& format,
                        OutputFile& output) {
  const CodePage page = open_code_page(options.code_page);
  if (LXSetLocaleNumInfo(locale, LX_ITEM_CODEPAGE_ID, page.id) == 0) {
    throw Failure(ExitStatus::kCodePage, message("code page {0}: {1}", page.name, describe_status(LXGetError(locale))));
  }
  const LineEnds ends(page);
  std::string page_format;
  const CodePage utf8 = open_code_page("UTF-8");
  Conversion conversion(utf8, page, 0, [&](std::string_view bytes) { page_format += bytes; });
  conversion.convert(utf8_of(format));
  conversion.finish();
  return write_all<InCodePage>(locale, options, page_format,
                               [&](const std::string& text) { output.write(text + std::string(ends.usual())); });
}

void check_options(const CLI::App& app, const FormatOptions& options) {
  const struct {
    const char* option;
    const char* kind;
  } rules[] = {{"--unsigned", "integer"}, {"--international", "currency"}, {"--format", "time"}};
  for (const auto& rule : rules) {
    if (app.count(rule.option) != 0 && options.kind != rule.kind) {
      throw usage_failure(message("{0} goes with \"{1}\" only", rule.option, rule.kind));
    }
  }
}

ExitStatus run_format(const CLI::App& app, const FormatOptions& options, const CommonOptions& common) {
  check_options(app, options);
  const LibrarySession session(common.locale_directory);
  const LocalePtr locale = options.locale ? open_locale(*options.locale) : open_user_locale();
  const std::vector<LXUChar> format = whole_format(locale.get(), terminal_ucs2(options.format), options.territory);
  OutputFile output("-");
  const auto write = options.code_page.empty() ? write_to_terminal : write_in_code_page;
  const bool all = write(locale.get(), options, format, output);
  output.commit();
  return all ? ExitStatus::kExact : ExitStatus::kDataProblem;
}

}  // namespace

Command add_format_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("format", "Write numbers, money and times as a locale does");
  auto options = std::make_shared<FormatOptions>();
  app->add_option("KIND", options->kind, "integer, number, currency or time")
      ->required()
      ->check(CLI::IsMember({"integer", "number", "currency", "time"}))
      ->type_name("");
  app->add_option("VALUE", options->values, "What to write; without any, the lines of standard input")
      ->option_text("...");
  app->add_option("--locale", options->locale, "Whose way; without it, the user's locale")->type_name("NAME");
  app->add_option("-t,--to", options->code_page, "Code page of the result")->type_name("CODEPAGE");
  app->add_option("--format", options->format, "Directives of a time (default %c: date and time)")->type_name("FORMAT");
  app->add_flag("--unsigned", options->is_unsigned, "Integers without sign")->option_text(" ");
  app->add_flag("--international", options->international, "The international currency symbol")->option_text(" ");
  app->add_flag("--territory", options->territory, "The territory's own conventions, not the locale's")
      ->option_text(" ");
  app->footer(kNotes);
  return {app, [app, options](const CommonOptions& common) { return run_format(*app, *options, common); }};
}

}  // namespace lx::tool
