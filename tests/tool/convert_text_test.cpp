// SPDX-License-Identifier: Apache-2.0
// What comes out of a conversion.
#include "tests/support/environment.hpp"
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using ConvertText = ToolTest;

// From hexadecimal digits to hexadecimal digits.
void expect_conversion(const Arguments& arguments, const char* input, const char* output, int status = 0,
                       const char* told = "") {
  check_runs("convert", {{arguments, bytes(input), bytes(output), status, told}});
}

TEST_F(ConvertText, WhatCannotBeConverted) {
  expect_conversion("-t 37", "41 E2 82 AC 42", "C1 3F C2", 1, "1 character replaced (at byte 1: U+20AC");
  expect_conversion("-t 37 -s", "41 E2 82 AC 42", "C1 3F C2", 1);
  expect_conversion("-t 37 -c", "41 E2 82 AC 42", "C1 C2", 1, "1 character left out (at byte 1: U+20AC");
  expect_conversion("-t 37//IGNORE", "41 E2 82 AC 42", "C1 C2", 1, "1 character left out");
  expect_conversion("-t Latin1", "41 E2 82 AC 42", "41 1A 42", 1, "U+20AC");
  expect_conversion("-t IBM930 -c", "E3 81 82 C2 B2 E3 81 84", "0E 4481 4482 0F", 1, "U+00B2");
  expect_conversion("-f UTF-8", "41 41 FF 42", "41 41 EF BF BD 42", 1, "1 malformed sequence (at byte 2: X'FF')");
  expect_conversion("-f UTF-8", "41 E3 81", "41 EF BF BD", 1, "1 character cut off by the end (at byte 1: X'E381')");
  expect_conversion("-f UTF-8 -c", "41 E3 81", "41", 1, "cut off");
  expect_conversion("-f UTF-8", "C0 80", "EF BF BD EF BF BD", 1, "2 malformed");
  expect_conversion("-f IBM930", "0E 4481", "E3 81 82", 1, "1 unbalanced shift");
  // The C library knows which characters can be shown.
  const std::string euro = system_has("C.UTF-8") ? "U+20AC \"€\"" : "U+20AC";
  const std::string all =
      "2 characters replaced (first at byte 0: " + euro + "), 2 malformed sequences (first at byte 3: X'FF')";
  expect_conversion("-t 37", "E2 82 AC FF E2 82 AC FE", "3F 3F 3F 3F", 1, all.c_str());
}

// Next line, line feed, carriage return and line feed, and a lone carriage return.
TEST_F(ConvertText, LineEnds) {
  const char* const host = "81 15 82 25 83 0D25 84 0D 85";
  expect_conversion("-f IBM1047 --nl keep", host, "61 C285 62 0A 63 0D0A 64 0D 65");
  expect_conversion("-f IBM1047 --nl lf", host, "61 0A 62 0A 63 0A 64 0D 65");
  expect_conversion("-f IBM1047 --nl nel", host, "61 C285 62 C285 63 C285 64 0D 65");
  expect_conversion("-f IBM1047 --nl crlf", host, "61 0D0A 62 0D0A 63 0D0A 64 0D 65");
}

// Each file is a text of its own: half a character or an open double-byte run ends with its file.
TEST_F(ConvertText, SeveralFiles) {
  const std::string open_run = write("open_run", bytes("0E 4481")), single = write("single", bytes("C1 C2"));
  const std::string first = write("first", "x\xE3\x81"), second = write("second", "\x82y");
  const std::string japanese = write("japanese", "\xE3\x81\x82");
  const std::string at_end = "first: 1 character cut off by the end (at byte 1: X'E381')\nlexaro: " + second +
                             ": 1 malformed sequence (at byte 0";
  check_runs("convert", {{{"-f", "IBM930", open_run, single},
                          "",
                          bytes("E38182 41 42"),
                          1,
                          "open_run: 1 unbalanced shift (at byte 3: the end)\n"},
                         {{"-f", "UTF-8", first, "-", second}, "-", "x\xEF\xBF\xBD-\xEF\xBF\xBDy", 1, at_end},
                         {{"-t", "IBM930", japanese, japanese}, "", bytes("0E 4481 0F 0E 4481 0F")}});
}

}  // namespace
}  // namespace lx::test
