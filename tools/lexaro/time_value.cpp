// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/time_value.hpp"

#include <charconv>
#include <climits>
#include <cstdio>
#include <ctime>

namespace lx::tool {
namespace {

constexpr int kUnknown = INT_MIN;

// Reads the parts of a date or time one after the other.
class Parts {
 public:
  explicit Parts(std::string_view text) : text_(text) {}

  bool number(std::size_t digits, int least, int most, int& value) {
    if (text_.size() < digits) return false;
    const char* end = text_.data() + digits;
    const auto result = std::from_chars(text_.data(), end, value);
    if (result.ec != std::errc() || result.ptr != end || value < least || value > most) return false;
    text_.remove_prefix(digits);
    return true;
  }
  bool character(std::string_view one_of) {
    if (text_.empty() || one_of.find(text_.front()) == std::string_view::npos) return false;
    text_.remove_prefix(1);
    return true;
  }
  bool done() const { return text_.empty(); }

 private:
  std::string_view text_;
};

bool read_date(Parts& parts, LXTime& time) {
  return parts.number(4, 0, 9999, time.tm_year) && parts.character("-") && parts.number(2, 1, 12, time.tm_mon) &&
         parts.character("-") && parts.number(2, 1, 31, time.tm_mday);
}

bool read_clock(Parts& parts, LXTime& time) {
  if (!parts.number(2, 0, 23, time.tm_hour) || !parts.character(":")) return false;
  if (!parts.number(2, 0, 59, time.tm_min)) return false;
  return parts.done() || (parts.character(":") && parts.number(2, 0, 59, time.tm_sec));
}

// Day of the week and of the year; false: there is no such day.
bool complete(LXTime& time) {
  const LXTime given = time;
  time.tm_isdst = 0;
  ::timegm(&time);
  return time.tm_mday == given.tm_mday && time.tm_mon == given.tm_mon;
}

std::string two_digits(int value) {
  char text[16];
  std::snprintf(text, sizeof text, "%02d", value);
  return text;
}

}  // namespace

std::optional<LXTime> read_time(const std::string& text) {
  LXTime time{};
  std::time_t seconds = std::time(nullptr);
  if (text == "now") return *::localtime_r(&seconds, &time);
  if (text.starts_with('@')) {
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data() + 1, end, seconds);
    if (result.ec != std::errc() || result.ptr != end || !::gmtime_r(&seconds, &time)) return std::nullopt;
    return time;
  }
  Parts parts(text);
  time.tm_year = 1970;
  time.tm_mon = time.tm_mday = 1;
  const bool dated = text.find('-') != std::string::npos;
  if (dated && !read_date(parts, time)) return std::nullopt;
  const bool clock = !dated || parts.character("T ");
  if (clock && !read_clock(parts, time)) return std::nullopt;
  time.tm_year -= 1900;
  time.tm_mon -= 1;
  if (!parts.done() || !complete(time)) return std::nullopt;
  return time;
}

LXTime unknown_time() {
  LXTime time{};
  time.tm_sec = time.tm_min = time.tm_hour = time.tm_mday = time.tm_mon = kUnknown;
  time.tm_year = time.tm_wday = time.tm_yday = kUnknown;
  return time;
}

std::string known_fields(const LXTime& time) {
  const auto known = [](int field) { return field != kUnknown; };
  const bool date = known(time.tm_year) && known(time.tm_mon) && known(time.tm_mday);
  const bool clock = known(time.tm_hour) && known(time.tm_min);
  std::string text;
  if (date) {
    const std::string year = std::to_string(time.tm_year + 1900);
    text = std::string(year.size() < 4 ? 4 - year.size() : 0, '0') + year + "-" + two_digits(time.tm_mon + 1) + "-" +
           two_digits(time.tm_mday);
  }
  if (clock) {
    text += (date ? "T" : "") + two_digits(time.tm_hour) + ":" + two_digits(time.tm_min);
    if (known(time.tm_sec)) text += ":" + two_digits(time.tm_sec);
  }
  const struct {
    const char* name;
    int value;
    bool shown;
    int offset;
  } fields[] = {{"year", time.tm_year, date, 1900},  {"month", time.tm_mon, date, 1},
                {"day", time.tm_mday, date, 0},      {"hour", time.tm_hour, clock, 0},
                {"minute", time.tm_min, clock, 0},   {"second", time.tm_sec, clock, 0},
                {"weekday", time.tm_wday, false, 0}, {"yearday", time.tm_yday, false, 0}};
  for (const auto& field : fields) {
    if (field.shown || !known(field.value)) continue;
    text += (text.empty() ? "" : " ") + std::string(field.name) + "=" + std::to_string(field.value + field.offset);
  }
  return text;
}

}  // namespace lx::tool
