// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <charconv>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/open_locale.hpp"
#include "tools/lexaro/output_file.hpp"
#include "tools/lexaro/terminal_text.hpp"
#include "tools/lexaro/time_format.hpp"
#include "tools/lexaro/time_value.hpp"
#include "tools/lexaro/values.hpp"

namespace lx::tool {
namespace {

constexpr char kNotes[] =
    R"(KIND is integer, number, currency or time. The result is written as C writes
numbers and ISO 8601 writes times; a time that is not whole as name=value. Without
texts, the lines of standard input are taken. An exponent follows a decimal point
only ("1.E5").

Exit codes: 0 done, 1 some texts could not be read whole, 2 usage, 3 input or
output failed, 4 unknown locale or code page, or bad locale data.

Examples:
  lexaro parse integer --locale German "1.234.567"
  lexaro parse integer --base 0 0x1F
  lexaro parse currency --locale English_UnitedStates '-$1,234.50'
  lexaro parse time --locale fr_FR --format "%d %B %Y" "22 novembre 2026"
  lexaro parse number --locale German -t IBM273 < host.dat
)";

struct ParseOptions {
  std::string kind;
  std::optional<std::string> locale;
  std::string code_page = "UTF-8";
  std::string format = "%c";
  int base = 10;
  bool territory = false;
  bool is_unsigned = false;
  bool full_width = false;
  bool monetary = false;
  std::vector<std::string> values;
};

using Units = std::vector<LXUChar>;

int32_t length_of(const Units& text) { return static_cast<int32_t>(text.size()); }

bool is_blank(LXUChar unit) {
  return unit == ' ' || unit == '\t' || unit == 0xA0 || unit == 0x202F || unit == 0x2009 || unit == 0x3000;
}

// Why a text was not read, and where.
struct Refusal {
  Message why;
  std::size_t position;
};

// A text of the locale, without the blanks at its ends.
Units item_text(LXLocale* locale, uint32_t item, bool territory) {
  LXUChar text[64];
  const int32_t count = LXGetLocaleTextInfoU(locale, item, text, 64, territory ? LX_OPT_OBJECT : 0);
  Units units(text, text + std::max(count - 1, 0));
  while (!units.empty() && is_blank(units.back())) units.pop_back();
  while (!units.empty() && is_blank(units.front())) units.erase(units.begin());
  return units;
}

// An amount without its currency symbol, its parentheses and the blanks around them, with the place of each unit in
// the original.
struct Amount {
  Units text;
  std::vector<std::size_t> places;
  bool negative = false;

  void erase(std::size_t at, std::size_t count) {
    const auto range = [&](auto& vector) {
      const auto begin = vector.begin() + static_cast<std::ptrdiff_t>(at);
      vector.erase(begin, begin + static_cast<std::ptrdiff_t>(count));
    };
    range(text);
    range(places);
  }
  void strip_blanks() {
    while (!text.empty() && is_blank(text.back())) erase(text.size() - 1, 1);
    while (!text.empty() && is_blank(text.front())) erase(0, 1);
  }
};

bool ends_with(const Units& text, const Units& end) {
  return text.size() >= end.size() && std::equal(end.rbegin(), end.rend(), text.rbegin());
}

Amount bare_amount(LXLocale* locale, const Units& text, bool territory) {
  Amount amount{text, {}};
  for (std::size_t i = 0; i < text.size(); ++i) amount.places.push_back(i);
  amount.strip_blanks();
  if (amount.text.size() > 1 && amount.text.front() == '(' && amount.text.back() == ')') {
    amount.negative = true;
    amount.erase(amount.text.size() - 1, 1);
    amount.erase(0, 1);
  }
  for (uint32_t item : {LX_ITEM_CURRENCY, LX_ITEM_CURRENCY_INTL}) {
    const Units symbol = item_text(locale, item, territory);
    const auto found = std::search(amount.text.begin(), amount.text.end(), symbol.begin(), symbol.end());
    if (symbol.empty() || found == amount.text.end()) continue;
    auto at = static_cast<std::size_t>(found - amount.text.begin());
    amount.erase(at, symbol.size());
    while (at < amount.text.size() && is_blank(amount.text[at])) amount.erase(at, 1);
    while (at > 0 && is_blank(amount.text[at - 1])) amount.erase(--at, 1);
    break;
  }
  amount.strip_blanks();
  const Units sign = item_text(locale, LX_ITEM_NEGATIVE_SIGN, territory);
  if (!sign.empty() && amount.text.size() > sign.size() && ends_with(amount.text, sign)) {
    amount.negative = true;
    amount.erase(amount.text.size() - sign.size(), sign.size());
    amount.strip_blanks();
  }
  return amount;
}

class Reader {
 public:
  Reader(LXLocale* locale, const ParseOptions& options) : locale_(locale), options_(options) {
    if (options.territory) flags_ |= LX_NUM_TEXTOPT;
    if (options.full_width) flags_ |= LX_NUM_FULLWIDTH;
    if (options.monetary || options.kind == "currency") flags_ |= LX_NUM_MONETARY;
    format_ = whole_format(locale, terminal_ucs2(options.format), options.territory);
  }

  // The value in its plain form; throws a Refusal.
  std::string read(const Units& text) const {
    if (options_.kind == "integer") return read_integer(text);
    if (options_.kind == "time") return read_time(text);
    return options_.kind == "number" ? read_number(text) : read_currency(text);
  }

 private:
  // Everything must have been read but blanks at the end.
  void check_end(const Units& text, const LXUChar* end) const {
    if (LXGetError(locale_) != LX_OK) throw Refusal{describe_status(LXGetError(locale_)), 0};
    const auto position = static_cast<std::size_t>(end - text.data());
    if (std::all_of(text.begin() + static_cast<std::ptrdiff_t>(position), text.end(), is_blank) && has_digit(text)) {
      return;
    }
    const bool integer = options_.kind == "integer";
    if (position == text.size()) throw Refusal{integer ? message("no integer") : message("no number"), position};
    throw Refusal{integer ? message("this does not belong to an integer") : message("this does not belong to a number"),
                  position};
  }
  bool has_digit(const Units& text) const {
    for (std::size_t i = 0; i < text.size(); ++i) {
      const int32_t code = digit_at(&text[i]);
      if (code >= 0 && code < 36) return true;
    }
    return false;
  }

  int32_t digit_at(const LXUChar* at) const {
    const LXUChar* end = nullptr;
    return LXStrGetDigitU(locale_, at, 1, &end, 0, 0, &no_sign_, &no_sign_, options_.full_width ? LX_NUM_FULLWIDTH : 0);
  }
  // What the digits before `end` say; too much for 32 bits is all the same.
  uint64_t magnitude(const Units& text, const LXUChar* end) const {
    uint64_t base = static_cast<uint64_t>(options_.base);
    uint64_t sum = 0;
    bool leading_zero = false;
    for (const LXUChar* at = text.data(); at != end && sum <= std::numeric_limits<uint32_t>::max(); ++at) {
      const int32_t digit = digit_at(at);
      const bool prefix = leading_zero && (*at == 'x' || *at == 'X');
      if (options_.base == 0 && (base == 0 || prefix) && digit >= 0) base = prefix ? 16 : digit == 0 ? 8 : 10;
      leading_zero = sum == 0 && digit == 0;
      if (digit >= 0 && static_cast<uint64_t>(digit) < base) sum = sum * base + static_cast<uint64_t>(digit);
    }
    return sum;
  }
  static uint64_t magnitude_of(int32_t value) {
    return static_cast<uint64_t>(value < 0 ? -int64_t{value} : int64_t{value});
  }

  std::string read_integer(const Units& text) const {
    const uint32_t flags = flags_ | (options_.is_unsigned ? LX_NUM_UNSIGNED : 0);
    const LXUChar* end = nullptr;
    const int32_t value = LXStringToLongU(locale_, text.data(), length_of(text), &end, options_.base, flags);
    const auto unsigned_value = static_cast<uint32_t>(value);
    using Limits = std::numeric_limits<int32_t>;
    const bool at_limit = options_.is_unsigned ? unsigned_value == std::numeric_limits<uint32_t>::max()
                                               : value == Limits::max() || value == Limits::min();
    // Out of range the library gives the nearest value.
    const uint64_t limit = options_.is_unsigned ? unsigned_value : magnitude_of(value);
    if (at_limit && magnitude(text, end) != limit) throw Refusal{message("the value does not fit into 32 bits"), 0};
    check_end(text, end);
    return options_.is_unsigned ? std::to_string(unsigned_value) : std::to_string(value);
  }

  std::string read_number(const Units& text) const {
    const LXUChar* end = nullptr;
    const double value = LXStringToDoubleU(locale_, text.data(), length_of(text), &end, flags_);
    check_end(text, end);
    char plain[400];
    const auto result = std::to_chars(plain, plain + sizeof plain, value);
    return {plain, result.ptr};
  }

  std::string read_currency(const Units& text) const {
    const Amount amount = bare_amount(locale_, text, options_.territory);
    try {
      const std::string plain = read_number(amount.text);
      return amount.negative ? "-" + plain : plain;
    } catch (Refusal& refusal) {
      refusal.position = refusal.position < amount.places.size() ? amount.places[refusal.position] : text.size();
      throw;
    }
  }

  int32_t take_time(const Units& text, std::size_t format_length, LXTime& time) const {
    return LXStringToTimeU(locale_, &time, text.data(), length_of(text), format_.data(),
                           static_cast<int32_t>(format_length), flags_ & LX_NUM_TEXTOPT);
  }
  std::string read_time(const Units& text) const {
    LXTime time = unknown_time();
    const int32_t count = text.empty() ? 0 : take_time(text, format_.size(), time);
    if (count < 0) {
      const uint32_t status = LXGetError(locale_);
      const bool bad_format = status == LX_E_FORMAT;
      throw Refusal{bad_format ? message("the format has an unknown or incomplete directive")
                               : message("this does not fit the format"),
                    bad_format ? 0 : matched(text)};
    }
    const auto position = static_cast<std::size_t>(count);
    if (!std::all_of(text.begin() + count, text.end(), is_blank)) {
      throw Refusal{message("this is more than the format has"), position};
    }
    const std::string fields = known_fields(time);
    if (fields.empty()) throw Refusal{message("no time"), position};
    return fields;
  }
  // How far the text fits the format: as far as it fits the longest beginning of the format that fits at all.
  std::size_t matched(const Units& text) const {
    int32_t most = 0;
    for (std::size_t length = 1; length < format_.size(); ++length) {
      LXTime time = unknown_time();
      most = std::max(most, take_time(text, length, time));
    }
    return static_cast<std::size_t>(most);
  }

  LXLocale* locale_;
  const ParseOptions& options_;
  uint32_t flags_ = 0;
  Units format_;
  LXUChar no_sign_ = 0;
};

void check_options(const CLI::App& app, const ParseOptions& options) {
  const struct {
    const char* option;
    const char* kinds;
  } rules[] = {{"--base", "integer"},
               {"--unsigned", "integer"},
               {"--monetary", "integer number"},
               {"--full-width", "integer number currency"},
               {"--format", "time"}};
  for (const auto& rule : rules) {
    if (app.count(rule.option) != 0 && std::string_view(rule.kinds).find(options.kind) == std::string_view::npos) {
      throw usage_failure(message("{0} does not go with \"{1}\"", rule.option, options.kind));
    }
  }
  if (options.base < 0 || options.base == 1 || options.base > 36)
    throw usage_failure(message("--base is 0 or 2 to 36"));
}

ExitStatus run_parse(const CLI::App& app, const ParseOptions& options, const CommonOptions& common) {
  check_options(app, options);
  const LibrarySession session(common.locale_directory);
  const LocalePtr locale = options.locale ? open_locale(*options.locale) : open_user_locale();
  const Reader reader(locale.get(), options);
  OutputFile output("-");
  ExitStatus status = ExitStatus::kExact;
  for_each_value(options.values, options.code_page, [&](const Value& value) {
    try {
      output.write(reader.read(value.text) + "\n");
    } catch (const Refusal& refusal) {
      complain_about(value, refusal.why, refusal.position);
      status = ExitStatus::kDataProblem;
    }
  });
  output.commit();
  return status;
}

}  // namespace

Command add_parse_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("parse", "Read numbers, money and times as a locale writes them");
  auto options = std::make_shared<ParseOptions>();
  app->add_option("KIND", options->kind, "integer, number, currency or time")
      ->required()
      ->check(CLI::IsMember({"integer", "number", "currency", "time"}))
      ->type_name("");
  app->add_option("TEXT", options->values, "What to read; without any, the lines of standard input")
      ->option_text("...");
  app->add_option("--locale", options->locale, "Whose way; without it, the user's locale")->type_name("NAME");
  app->add_option("-t,--text", options->code_page, "Code page of standard input (default UTF-8)")
      ->type_name("CODEPAGE");
  app->add_option("--format", options->format, "Directives of a time (default %c: date and time)")->type_name("FORMAT");
  app->add_option("--base", options->base, "Base of integers, 2 to 36 (default 10); 0: by a prefix 0x or 0")
      ->type_name("NUMBER");
  app->add_flag("--unsigned", options->is_unsigned, "Integers without sign")->option_text(" ");
  app->add_flag("--full-width", options->full_width, "Full-width digits too")->option_text(" ");
  app->add_flag("--monetary", options->monetary, "The separators and signs of money")->option_text(" ");
  app->add_flag("--territory", options->territory, "The territory's own conventions, not the locale's")
      ->option_text(" ");
  app->footer(kNotes);
  return {app, [app, options](const CommonOptions& common) { return run_parse(*app, *options, common); }};
}

}  // namespace lx::tool
