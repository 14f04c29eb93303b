// SPDX-License-Identifier: Apache-2.0
// Times written and read, in all kinds of text.
#include <gtest/gtest.h>

#include <functional>
#include <lexaro/lexaro.hpp>
#include <sstream>

#include "frame/records.hpp"
#include "support/session.hpp"
#include "support/text_calls.hpp"

namespace lx::test {
namespace {

constexpr Family<LXTimeToString, LXTimeToStringEx, LXTimeToStringW, LXTimeToStringU> kTimeToString;
constexpr Family<LXStringToTime, LXStringToTimeEx, LXStringToTimeW, LXStringToTimeU> kStringToTime;

LXTime time_of(int64_t moment) {
  LXTime time;
  gmtime_r(&moment, &time);
  return time;
}
const LXTime kSaturday = time_of(1722697509);  // 2024-08-03 15:05:09

struct Result {
  int32_t count;
  uint32_t error;
  Units units;  // of the whole room
  Units text() const { return first_units(units, static_cast<size_t>(std::max(count, 0))); }
};

struct Place {
  explicit Place(const std::string& name) {
    locale.reset(LXGetLocale(name.c_str(), 0, nullptr));
    if (locale == nullptr) throw std::runtime_error(name);
    page = &PageSource::of(locale->code_page->id);
  }
  // `length` is what the call is told, `room` the units that there really are.
  Result write(const Form& form, const LXTime& time, const Units& format, int32_t length, uint32_t flags, size_t room,
               int32_t format_length = -1) const {
    return with_calls(form, [&](auto calls) {
      using U = typename decltype(calls)::Unit;
      U* to = out.room<U>(room);
      U* given = place<U>(in, format, format_length);
      State state = {0};
      int32_t count = calls(kTimeToString, locale.get(), &time, to, state, length, given, state, format_length, flags);
      Units units;
      for (size_t i = 0; i < room; ++i) units.push_back(std::make_unsigned_t<U>(to[i]));
      return Result{count, LXGetError(locale.get()), units};
    });
  }
  Result write(const Form& form, const LXTime& time, std::u16string_view format, int32_t length = 100,
               uint32_t flags = 0) const {
    return write(form, time, spelled(form, format), length, flags, static_cast<size_t>(length));
  }
  Result read(const Form& form, LXTime& time, const Units& text, const Units& format) const {
    return with_calls(form, [&](auto calls) {
      using U = typename decltype(calls)::Unit;
      U *string = place<U>(out, text, 0), *given = place<U>(in, format, 0);
      auto length = static_cast<int32_t>(text.size()), format_length = static_cast<int32_t>(format.size());
      State state = {0};
      int32_t count = calls(kStringToTime, locale.get(), &time, string, state, length, given, state, format_length, 0u);
      return Result{count, LXGetError(locale.get()), {}};
    });
  }

  Session session;
  Locale locale;
  const PageSource* page;
  mutable EdgeBuffer out{8192}, in{8192};
};

// use(place, form), for each of these code pages.
void each_form(const std::string& place_name, const char* page_names,
               const std::function<void(const Place&, const Form&)>& use) {
  std::istringstream pages(page_names);
  for (std::string page; pages >> page;) {
    Place place(place_name + "." + page);
    for (Form::Kind kind : {Form::plain, Form::shifted, Form::wide, Form::ucs2}) {
      Form form = {kind, place.page};
      SCOPED_TRACE(place_name + " " + form.name());
      use(place, form);
    }
  }
}

// Names of double-byte characters have no place in plain text of mixed pages, which is about bytes.
bool can_hold(const Form& form, std::u16string_view text) {
  return form.kind != Form::plain || !form.page->mixed() || std::ranges::max(text) < 128;
}

TEST(FormatTime, IsWhatPeopleExpect) {
  struct People {
    const char *place, *pages;
    std::u16string date, time, long_date, weekday, month, half;
  };
  // clang-format off
  const People kPeople[] = {
      {"English_UnitedStates", "UTF-8 Latin1 IBM037", u"8/3/24", u"3:05:09 PM", u"Saturday, August 03, 2024", u"Saturday", u"August", u"PM"},
      {"German_Germany", "UTF-8 Latin1 IBM273", u"03.08.24", u"15:05:09", u"Samstag, 3. August 2024", u"Samstag", u"August", u"PM"},
      {"French_France", "UTF-8 Latin1 IBM297", u"03/08/2024", u"15:05:09", u"samedi 03 août 2024", u"samedi", u"août", u"PM"},
      {"Japanese_Japan", "UTF-8 MS932 JapanEUC IBM930", u"2024/08/03", u"15:05:09", u"2024年8月3日土曜日", u"土曜日", u"8月", u"午後"},
      {"Hungarian_Hungary", "UTF-8 ISO-8859-2", u"2024. 08. 03.", u"15:05:09", u"2024. augusztus 3., szombat", u"szombat", u"augusztus", u"du."},
      {"Turkish_Turkey", "UTF-8 ISO-8859-9", u"03.08.2024", u"15:05:09", u"03 Ağustos 2024 Cumartesi", u"Cumartesi", u"Ağustos", u"ÖS"},
  };
  // clang-format on
  for (const People& people : kPeople) {
    const std::u16string date_time = people.date + u" " + people.time, half = u"03 " + people.half;
    const std::pair<const char16_t*, std::u16string> kTexts[] = {
        {u"%x", people.date},       {u"%X", people.time},
        {u"%#x", people.long_date}, {u"%c", date_time},
        {u"%A", people.weekday},    {u"%B", people.month},
        {u"%I %p", half},           {u"%#x%A", people.long_date + people.weekday},
    };
    each_form(people.place, people.pages, [&](const Place& place, const Form& form) {
      if (!can_hold(form, people.long_date)) return;
      for (const auto& [format, expected] : kTexts) {
        SCOPED_TRACE(std::string(expected.begin(), expected.end()));
        Units text = spelled(form, expected);
        Result result = place.write(form, kSaturday, format);
        EXPECT_EQ(std::pair(result.text(), result.error), std::pair(text, LX_OK));
        LXTime time = time_of(36000);
        EXPECT_EQ(place.read(form, time, text, spelled(form, format)).count, static_cast<int32_t>(text.size()));
        EXPECT_EQ(place.write(form, time, format).text(), text) << "read and written again";
      }
    });
  }
}

TEST(FormatTime, FieldsHaveRanges) {
  struct Row {
    std::u16string letter;
    int LXTime::*field;
    int highest;  // the lowest is 0
    std::u16string low, high, low_alternate;
  };
  // clang-format off
  const Row kRows[] = {
      {u"d", &LXTime::tm_mday, 31, u"00", u"31", u"0"}, {u"H", &LXTime::tm_hour, 23, u"00", u"23", u"0"}, {u"I", &LXTime::tm_hour, 23, u"12", u"11", u"12"},
      {u"j", &LXTime::tm_yday, 365, u"000", u"365", u"0"}, {u"m", &LXTime::tm_mon, 11, u"01", u"12", u"1"}, {u"M", &LXTime::tm_min, 59, u"00", u"59", u"0"},
      {u"S", &LXTime::tm_sec, 59, u"00", u"59", u"0"}, {u"w", &LXTime::tm_wday, 6, u"0", u"6", u"0"}, {u"a", &LXTime::tm_wday, 6, u"Sun", u"Sat", u"Sun"},
      {u"p", &LXTime::tm_hour, 23, u"AM", u"PM", u"AM"}, {u"b", &LXTime::tm_mon, 11, u"Jan", u"Dec", u"Jan"}, {u"U", &LXTime::tm_wday, 6, u"31", u"30", u"31"},
      {u"U", &LXTime::tm_yday, 365, u"01", u"53", u"1"}, {u"W", &LXTime::tm_yday, 365, u"00", u"52", u"0"},
  };
  // clang-format on
  each_form("English_UnitedStates", "Latin1 IBM037 IBM930", [&](const Place& place, const Form& form) {
    for (const Row& row : kRows) {
      auto written = [&](int value, const std::u16string& format) {
        LXTime time = kSaturday;
        if (row.field == &LXTime::tm_yday) time.tm_wday = 0;
        time.*row.field = value;
        Result result = place.write(form, time, format + row.letter);
        return std::pair(result.error, result.text());
      };
      EXPECT_EQ(written(0, u"%"), std::pair(LX_OK, spelled(form, row.low)));
      EXPECT_EQ(written(row.highest, u"%"), std::pair(LX_OK, spelled(form, row.high)));
      EXPECT_EQ(written(0, u"%#"), std::pair(LX_OK, spelled(form, row.low_alternate)));
      const auto refused = std::pair(LX_E_NOTFOUND, spelled(form, u"x"));
      for (int outside : {-1, row.highest + 1, INT32_MIN, INT32_MAX}) EXPECT_EQ(written(outside, u"x%"), refused);
    }
  });
}

TEST(FormatTime, QuirksStay) {
  struct Written {
    const char* name;
    std::u16string format;
    int32_t length;
    uint32_t error;
    std::u16string text;  // a full stop at the end: the terminator
    int32_t kept = 0;     // units that stay as they were
  };
  struct Read {
    std::u16string format, text;
    int result;  // negative: an error
    int LXTime::*field = &LXTime::tm_mday;
    int value = 3;
  };
  // clang-format off
  const Written kWritten[] = {
      {"a number that just fills the room", u"%H:%M", 5, 40, u"15:05"}, {"and before the terminator", u"%H:%M", 6, 40, u"15:05."},
      {"not a word or a literal", u"%d%A;", 11, 0, u"03Saturday;"},     {"a number cut", u"%H:%M", 5, 40, u"15:0."},
      {"the day of the year from zero", u"%j", 9, 0, u"215"},           {"the century by itself", u"%y %#y", 9, 0, u"24 24"},
      {"dates lie over the start", u"abcdefgh%x", 20, 0, u"8/3/24gh", 6}, {"what they leave out is no error", u"%x", 4, 0, u"8/3/"},
      {"%#% is a percent sign", u"%#%%%", 9, 0, u"%%"}, {"an empty format", u"", 9, 0, u"."}, {"a percent sign alone", u"a%", 9, 51, u"a"},
      {"with #", u"a%#", 9, 51, u"a"}, {"# twice", u"a%##", 9, 51, u"a"}, {"zones", u"a%Z", 9, 51, u"a"}, {"no letter", u"a%é", 9, 51, u"a"},
      {"other letters", u"a%Q", 9, 51, u"a"}, {"no room", u"a", 0, 40, u""},
  };
  const Read kRead[] = {
      {u"%y", u"05", 2, &LXTime::tm_year, 5}, {u"%Y", u"2005", 4, &LXTime::tm_year, 105}, {u"%m", u"00", 2, &LXTime::tm_mon, -1},
      {u"%d", u"0", 1, &LXTime::tm_mday, 0}, {u"%j", u"001x", 3, &LXTime::tm_yday, 1}, {u"%H:%M", u"7", 1, &LXTime::tm_hour, 7},
      {u"%#I:%M %p", u"1:05 PM", 7, &LXTime::tm_hour, 13}, {u"%I %p", u"12 AM", 5, &LXTime::tm_hour, 0},
      {u"%I %p", u"12 PM", 5, &LXTime::tm_hour, 12}, {u"%b", u"May", 3, &LXTime::tm_mon, 4}, {u"%c", u"8/3/24?3:05:09 PM", 17},
      {u"a%", u"a", 1}, {u"", u"a", 0}, {u"a%%b", u"a%b", 3}, {u"a%", u"ab", -51}, {u"a%#", u"ab", -51}, {u"%U", u"12", -51},
      {u"%d", u"32", -37}, {u"%H", u"24", -37}, {u"%I", u"13", -37}, {u"%j", u"367", -37}, {u"%m", u"13", -37}, {u"%M", u"60", -37},
      {u"%w", u"7", -37}, {u"%%", u"a", -37}, {u"éa", u"éb", -37}, {u"%B", u"march", -37},
  };
  // clang-format on
  each_form("English_UnitedStates", "Latin1 IBM037", [&](const Place& place, const Form& form) {
    for (const Written& row : kWritten) {
      SCOPED_TRACE(row.name);
      Units text = spelled(form, row.text);
      uint32_t flags = row.text.ends_with(u'.') ? LX_NUM_TERMINATE : 0;
      if (flags != 0) text.back() = 0;
      Result result = place.write(form, kSaturday, row.format, row.length, flags);
      EXPECT_EQ(std::pair(result.error, first_units(result.units, text.size())), std::pair(row.error, text));
      EXPECT_EQ(result.count, static_cast<int32_t>(text.size()) + row.kept);
    }
    LXTime time = kSaturday;
    for (const Read& row : kRead) {
      SCOPED_TRACE(std::string(row.format.begin(), row.format.end()));
      time = kSaturday;
      Result result = place.read(form, time, spelled(form, row.text), spelled(form, row.format));
      int32_t outcome = result.count < 0 ? -static_cast<int32_t>(result.error) : result.count;
      EXPECT_EQ(std::pair(outcome, time.*row.field), std::pair(row.result, row.value));
    }
    LXUChar format[] = {'%', '#', 'x', 0};
    ASSERT_EQ(LXSetLocaleTextInfoU(place.locale.get(), LX_ITEM_LONG_DATE, format, -1, 0), 1);
    EXPECT_EQ(place.write(form, time, u"%#x").error, LX_E_FORMAT) << "a format that names itself";
    EXPECT_EQ(place.read(form, time, spelled(form, u"1"), spelled(form, u"%#x")).error, LX_E_FORMAT);
    EXPECT_EQ(place.write(form, time, u"a", 9, 0x10).count, -1) << "another flag";
  });
}

TEST(FormatTime, EveryMinuteAndEveryDayComesBack) {
  auto comes_back = [](const Place& place, const Form& form) {
    if (!can_hold(form, u"年")) return;
    bool all = form.kind == Form::plain && form.page->ascii_family;
    auto check = [&](int64_t moment, std::u16string_view format) {
      LXTime time = time_of(moment), back = time_of(0);
      Units text = place.write(form, time, format, 80).text();
      ASSERT_EQ(place.read(form, back, text, spelled(form, format)).count, static_cast<int32_t>(text.size()));
      ASSERT_EQ(std::memcmp(&back, &time, offsetof(LXTime, tm_isdst)), 0) << moment;
    };
    for (int64_t day = -73000; day < 73097; day += all ? 1 : 997) {
      check(day * 86400, day % 2 == 0 ? u"%A, %#d. %B %Y (%j)" : u"%a %b %d %j%Y");
    }
    for (int64_t minute = 0; minute < 1440; minute += all ? 1 : 37) {
      check(minute * 60 + minute % 60, minute % 2 == 0 ? u"%#I:%M:%S %p" : u"%H%M%S");
    }
  };
  each_form("English_UnitedStates", "UTF-8 IBM037", comes_back);
  each_form("Japanese_Japan", "IBM930", comes_back);
}

TEST(FormatTime, EveryRoomIsFilledWithWholeCharacters) {
  auto is_filled = [](std::u16string_view given, std::u16string_view written) {
    return [given, written](const Place& place, const Form& form) {
      if (!can_hold(form, written)) return;
      const Units whole = spelled(form, written), format = spelled(form, given);
      for (size_t length = 0; length <= whole.size() + 2; ++length) {
        for (uint32_t flags : {0u, LX_NUM_TERMINATE, LX_NUM_CHARLEN, LX_NUM_CHARLEN | LX_NUM_TERMINATE}) {
          SCOPED_TRACE(std::to_string(flags) + " " + std::to_string(length));
          size_t terminator = length != 0 && (flags & LX_NUM_TERMINATE) != 0 ? 1 : 0;
          bool characters = (flags & LX_NUM_CHARLEN) != 0 && form.is_bytes();
          std::u16string fits(written);
          while ((characters ? fits.size() : spelled(form, fits).size()) > length - terminator) fits.pop_back();
          Units expected = spelled(form, fits);
          expected.resize(expected.size() + terminator);
          Result result = place.write(form, kSaturday, format, static_cast<int32_t>(length), flags,
                                      characters ? expected.size() : length);
          EXPECT_EQ(first_units(result.units, expected.size()), expected);
          EXPECT_EQ(result.count, static_cast<int32_t>(characters ? fits.size() + terminator : expected.size()));
          EXPECT_EQ(result.error, fits == written ? LX_OK : LX_E_BUFFER);
        }
        LXTime time = kSaturday;
        EXPECT_LE(place.read(form, time, first_units(whole, length), format).count, static_cast<int32_t>(length));
      }
    };
  };
  each_form("French_France", "Latin1 IBM037", is_filled(u"xü%H%A, %B%%%a", u"xü15samedi, août%sam."));
  each_form("Japanese_Japan", "UTF-8 MS932 IBM930", is_filled(u"x日%H%A%a日, %B%%%a", u"x日15土曜日土日, 8月%土"));
}

TEST(FormatTime, ATextThatEndsInsideACharacterIsSkippedBetweenDateAndTime) {
  Place place("English.UTF-8");
  ASSERT_EQ(LXSetLocaleTextInfo(place.locale.get(), LX_ITEM_SHORT_DATE, "%Y", -1, 0), 1);
  LXTime time = kSaturday;
  for (const char* text : {"2018\xE5", "2018?"}) {
    EXPECT_EQ(LXStringToTime(place.locale.get(), &time, text, -1, "%c", -1, 0), 5) << text;
  }
}

TEST(FormatTime, EmptyTextsNeedNoAddress) {
  Place place("English.UTF-8");
  LXTime time = kSaturday;
  char out[] = "x";
  EXPECT_EQ(LXTimeToString(place.locale.get(), &time, out, 1, nullptr, 0, LX_NUM_TERMINATE), 1);
  EXPECT_EQ(LXStringToTime(place.locale.get(), &time, nullptr, 0, "a", 1, 0), 0);
  EXPECT_EQ(LXStringToTime(place.locale.get(), &time, "a", 1, nullptr, 0, 0), 0);
  EXPECT_EQ(LXTimeToString(place.locale.get(), &time, out, 1, nullptr, -1, 0), -1);
  EXPECT_EQ(LXStringToTime(place.locale.get(), &time, nullptr, 1, "a", 1, 0), -1);
}

TEST(FormatTime, WhatALocalesFormatLeavesOutIsSeenByTheWrapper) {
  Session session;
  lexaro::Locale greek("Greek.UTF-8");
  for (int64_t day = 0; day < 366; ++day) {
    LXTime time = time_of(day * 86400 + 85473);
    char all[500];
    int32_t count = LXTimeToStringEx(greek.get(), &time, all, 0, 500, "%#c", 0, -1, 0);
    ASSERT_EQ(greek.format_time(time, "%#c"), std::string(all, static_cast<size_t>(count)));
  }
}

TEST(FormatTime, WordsOfMixedPagesAreCompleteAndCutAsTheirTextIs) {
  Place place("Japanese.IBM930");
  char word[32], out[32];
  int32_t length = LXGetLocaleTextInfo(place.locale.get(), LX_ITEM_DAY_1, word, 32, 0) - 1;
  for (int32_t room = 0, at = 0; room <= length; ++room, at = 0) {
    EXPECT_EQ(LXStrWriteWord(place.locale.get(), out, &at, room, LX_ITEM_DAY_1, 0), room < length ? 40u : 0u);
    EXPECT_EQ(std::string(out, static_cast<size_t>(at)), std::string(word, static_cast<size_t>(room)));
  }
  uint32_t state = 0, format_state = 0;
  int32_t at = 0, format_at = 0;
  for (int32_t end : {4, 8}) {  // each word with its shift bytes
    EXPECT_EQ(LXStrWriteWordEx(place.locale.get(), out, &state, &at, 32, LX_ITEM_ABDAY_1, 0), LX_OK);
    EXPECT_EQ(std::pair(at, state), std::pair(end, 0u));
  }
  EXPECT_EQ(LXStrExpandTimeEx(place.locale.get(), &kSaturday, out, &state, &at, 32, "\x6C\x62", &format_state,
                              &format_at, 0, 0, 0, 0),
            LX_OK);
  EXPECT_EQ(std::tuple(at, state, format_at), std::tuple(12, 0u, 2));
  // A room that a word fills is full, though the byte that ends its run is not written yet.
  LXTime time = kSaturday;
  time.tm_sec = 60;
  for (const char16_t* format : {u"%A%x", u"%A%c", u"%A%q", u"%A%#", u"%A%S", u"%A%A"}) {
    Result result = place.write({Form::shifted, place.page}, time, format, length, 0);
    EXPECT_EQ(std::pair(result.count, result.error), std::pair(length, LX_E_BUFFER));
  }
}

TEST(FormatTime, PiecesMoveTheirPositions) {
  Place place("German_Germany.Latin1");
  char out[] = "----------";
  int32_t at = 1, format_at = 2, half = 0;
  uint32_t error = LX_OK;
  LXTime time = kSaturday;
  EXPECT_EQ(LXStrExpandTime(place.locale.get(), &time, out, &at, 10, "ab%#dx", &format_at, 0, 1, 1, 0), LX_OK);
  EXPECT_EQ(LXStrWriteWord(place.locale.get(), out, &at, 10, LX_ITEM_ABDAY_1, 0), LX_OK);
  EXPECT_EQ(LXStrWriteNumber(out, &at, 10, -1234, 3, 1, 0), LX_OK);
  EXPECT_EQ(std::tuple(std::string(out), at, format_at), std::tuple("-3So.234--", 8, 5));
  EXPECT_EQ(LXStrReadNumber(&error, "x1234", &(at = 1), -1, 3, 99, 1), 123);
  EXPECT_EQ(std::pair(error, at), std::pair(LX_E_NOTFOUND, 4));
  EXPECT_EQ(LXStrReadWord(place.locale.get(), &error, "xJuni", &(at = 1), -1, LX_ITEM_ABMON_1, 12, 0), 5);
  EXPECT_EQ(LXStrExtractTime(place.locale.get(), &time, "xPM", &(at = 1), -1, "%p", &(format_at = 0), -1, &half, 1, 0),
            LX_OK);
  EXPECT_EQ(std::tuple(at, format_at, half), std::tuple(3, 2, 1));
}

}  // namespace
}  // namespace lx::test
