// SPDX-License-Identifier: Apache-2.0
// Numbers, money and times written and read by the tool.
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

TEST(Format, WritesAsTheLocaleDoes) {
  check_runs("format", {{"integer --locale English 1234567 -5 0", "", "1,234,567\n-5\n0\n"},
                        {"integer --locale English --unsigned 4294967295", "", "4,294,967,295\n"},
                        {"integer --locale German", "1\r\n-2147483648\n", "1\n-2.147.483.648\n"},
                        {"number --locale German -1234.5 .25", "", "-1.234,50\n0,25\n"},
                        {"currency --locale English_UnitedStates 1234.5 -0.5", "", "$1,234.50\n($0.50)\n"},
                        {"currency --locale German --international 1234.5", "", "1.234,50 EUR\n"},
                        {"time --locale German --format %A,%x,%H:%M 2026-11-22T13:05", "", "Sonntag,22.11.26,13:05\n"},
                        {"time --locale Japanese --format %Y年%#m月 @86400", "", "1970年1月\n"},
                        {{"time", "--locale", "German", "--format", "", "2026-11-22"}, "", "\n"},
                        {"integer --locale English -t IBM037 -17", "", "\x60\xF1\xF7\x25"},
                        {"time --locale Japanese -t IBM930 --format %Y年 2026-01-02", "",
                         "\xF2\xF0\xF2\xF6\x0E\x45\x60\x0F\x25"}});
}

TEST(Format, TellsWhatItCannotWrite) {
  check_runs("format",
             {{"integer --locale English 2147483648", "", "", 1, "not an integer from -2147483648 to 2147483647"},
              {"integer --locale English", "1\nx\n3\n", "1\n3\n", 1, "line 2: not an integer"},
              {"number --locale English 1,5", "", "", 1, "not a number: \"1,5\""},
              {"time --locale English 2026-02-29", "", "", 1, "not a time"},
              {"time --locale English --format %Q now", "", "", 1, "directive"},
              {"integer --format %H 1", "", "", 2, "--format goes with \"time\" only"},
              {{"length", "1"}, "", "", 2, "length"},
              {"integer --locale Klingon 1", "", "", 4, "Klingon"}});
}

TEST(Parse, ReadsAsTheLocaleWrites) {
  check_runs("parse",
             {{"integer --locale English 1,234,567 -5", "", "1234567\n-5\n"},
              {"integer --locale English --base 0 0x1F 017", "", "31\n15\n"},
              {"integer --locale Japanese --full-width １２３", "", "123\n"},
              {"number --locale German 1.234,5", "", "1234.5\n"},
              {"number --locale German -t IBM273", "\xF1\x6B\xF5\x25\xF2\x15", "1.5\n2\n"},
              {"currency --locale English_UnitedStates -$1,234.50 $0.50 ($2.00)", "", "-1234.5\n0.5\n-2\n"},
              {{"currency", "--locale", "German", "1.234,50 EUR", "EUR -5,00"}, "", "1234.5\n-5\n"},
              {{"time", "--locale", "German", "--format", "%d. %B %Y", "22. November 2026"}, "", "2026-11-22\n"},
              {{"time", "--locale", "English", "--format", "%I:%M %p", "12:30 AM"}, "", "00:30\n"},
              {{"time", "--locale", "English", "--format", "%A %y", "Monday 99"}, "", "year=1999 weekday=1\n"}});
}

TEST(Parse, ShowsWhereATextDoesNotFit) {
  check_runs("parse", {{"integer --locale English 12x4", "", "", 1, "\n  12x4\n    ^"},
                       {"number --locale German", "1,5\n1,5,2\n", "1.5\n", 1, "line 2: this does not belong"},
                       {"integer --locale English 2147483648", "", "", 1, "32 bits"},
                       {{"integer", "--locale", "English", ""}, "", "", 1, "no integer"},
                       {"currency --locale English_UnitedStates $1.5x", "", "", 1, "\n  $1.5x\n      ^"},
                       {"time --locale Japanese --format %Y年%m月 2026年x", "", "", 1, "\n  2026年x\n        ^"},
                       {"time --locale English --format %H 13:05", "", "", 1, "more than the format has"},
                       {"integer --base 37 1", "", "", 2, "--base"}});
}

}  // namespace
}  // namespace lx::test
