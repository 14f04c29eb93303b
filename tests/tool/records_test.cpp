// SPDX-License-Identifier: Apache-2.0
// Host records: fixed, variable and blocked, each translated on its own.
#include <algorithm>

#include "tests/support/environment.hpp"
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using Records = ToolTest;

std::string described(const std::string& data) {
  const std::size_t length = data.size() + 4;
  return std::string{static_cast<char>(length >> 8), static_cast<char>(length & 0xFF), 0, 0} + data;
}

std::string described_bytes(const char* hexadecimal) { return described(bytes(hexadecimal)); }

// Text in columns 1-4, 9-20 and 25-80, packed decimal and binary numbers between.
std::string mixed_card(const std::string& key, const std::string& packed, std::string name, const std::string& binary,
                       std::string text, char blank) {
  name.resize(12, blank);
  text.resize(56, blank);
  return key + packed + name + binary + text;
}

TEST_F(Records, PackedFieldsStayInPlace) {
  const std::string packed = bytes("1234567C"), binary = bytes("0E0F1525");
  const std::string card =
      mixed_card(bytes("F0F0F0F7"), packed, bytes("D4A4934093859989"), binary, bytes("D695856B40A3A69F"), '\x40');
  const std::string last = mixed_card(bytes("F0F0F0F7"), packed, "", binary, bytes("C1"), '\x40');
  const std::string latin = mixed_card("0007", packed, "Mul leri", binary, "One, tw\xA4", ' ');
  const std::string want = mixed_card("0007", packed, "Mul leri", binary, "One, tw\xC2\xA4", ' ') + "          ";
  check_runs("records --length 80 --keep 5-8,21-24 -f 37 -t",
             {{"819", card + last, latin + mixed_card("0007", packed, "", binary, "A", ' ')},
              // The last text takes what the output records have more or less; a longer character takes a blank.
              {"UTF-8", card, want.substr(0, 80)},
              {"UTF-8 --to-length 33", card, want.substr(0, 33)},
              {"UTF-8 --to-length 90", card, want},
              // ... and is not cut.
              {"UTF-8 --to-length 32", card, want.substr(0, 31) + " ", 1,
               "1 record truncated because its text does not fit (in record 1, column 32, byte 31)"}});
  // Shift bytes are balanced in each text, and those in kept bytes are none.
  check_runs("records -f 930 -t UTF-8 --length 14 --keep 7-8",
             {{{}, bytes("0E44814482 0F 0E0E C1 0E4481 0F C2"), bytes("E38182 E38184 0E0E 41 E38182 42 20")}});
}

TEST_F(Records, ShiftsStayInTheirRecord) {
  // Record 2 leaves its double-byte run open; record 3 must not begin inside it.
  const std::string input = bytes("C10E44810F404040 C1C20E4481448240 C1C2C340 40404040");
  const ToolResult result = run_tool("records -f 930 -t UTF-8 --length 8 --line-out", input);
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "A\xE3\x81\x82\nAB\xE3\x81\x82\xE3\x81\x84\xEF\xBF\xBD\nABC\n");
  expect_told(result, "1 unbalanced shift (in record 2, column 9, byte 16: the end)");
  expect_told(result, "1 character cut off by the end (in record 2, column 8, byte 15: X'40')");
}

TEST_F(Records, EachLengthIsExactAndBalanced) {
  std::vector<std::string> texts;  // of letters, blanks, and wide ones of both
  for (const std::string pattern : {"a", "w", "aw", "wa", "aaw", "wwa", "wwwaa", "aaaw a", "wW"}) {
    for (std::size_t count = 0; count <= 40; ++count) {
      for (const char* end : {"", "  ", "W", "aW W", " w"}) {
        std::string text;
        for (std::size_t i = 0; i < count; ++i) text += pattern[i % pattern.size()];
        texts.push_back(text + end);
      }
    }
  }
  std::string input;
  for (const std::string& text : texts) {
    for (const char c : text + "\n") input += c == 'w' ? "あ" : c == 'W' ? "\u3000" : std::string(1, c);
  }
  for (const auto& [page, letter] : {std::pair("IBM930", "\x62"), {"IBM1399", "\x81"}}) {
    const std::map<char, std::string> codes = {{'a', letter}, {' ', "\x40"}, {'w', "\x44\x81"}, {'W', "\x40\x40"}};
    for (std::size_t length = 1; length <= 40; ++length) {
      std::string want;
      int truncated = 0;
      for (const std::string& text : texts) {
        // The obvious way: one character after the other while it and the way back fit.
        std::string record;
        bool wide = false, fits = true, lost = false;
        for (const char c : text) {
          const bool now_wide = codes.at(c).size() == 2;
          const std::string shift(wide == now_wide ? "" : now_wide ? "\x0E" : "\x0F");
          const std::string more = record + shift + codes.at(c);
          fits = fits && more.size() + (now_wide ? 1 : 0) <= length;
          lost = lost || (!fits && c != 'W' && c != ' ');
          if (!fits) continue;
          record = more;
          wide = now_wide;
        }
        if (wide) record += '\x0F';
        truncated += lost ? 1 : 0;
        want += record + std::string(length - record.size(), '\x40');
      }
      const Arguments options = {"--length", std::to_string(length), "-t", page, "-o", path("out")};
      const ToolResult result = run_tool("records -f UTF-8 --line-in -s --report -" + options, input);
      EXPECT_EQ(result.status, truncated != 0 ? 1 : 0) << result.errors;
      expect_json(result.output, R"({"files":[{"records":)" + std::to_string(texts.size()) +
                                     R"(,"truncated_records":)" + std::to_string(truncated) + "}]}");
      const std::string got = read("out");
      ASSERT_EQ(got.size(), want.size());
      const auto place = std::mismatch(got.begin(), got.end(), want.begin()).first - got.begin();
      ASSERT_TRUE(got == want) << page << " " << length << " " << texts[static_cast<std::size_t>(place) / length];
    }
  }
}

TEST_F(Records, WhatDoesNotFit) {
  auto lost = [](const char* column) { return std::string("in record 1, column ") + column + ", "; };
  check_runs("records -f",
             {{"37 -t 819 --length 4 --to-length 2", bytes("C1C24040"), "AB"},
              {"37 -t 819 --length 4 --to-length 2", bytes("C1C240C3"), "AB", 1, lost("3")},
              {"37 -t 819 --length 4 --to-length 6", bytes("C1C2C3C4"), "ABCD  "},
              {"1047 -t UTF-8 --length 3", bytes("C1DC40"), "Aü"},                // it takes a blank's byte
              {"1047 -t UTF-8 --length 3", bytes("DCC1DC"), "üA", 1, lost("3")},  // no half character at the end
              {"1047 -t UTF-8 --length 3", bytes("DCDC40"), "ü ", 1, lost("2")},
              {"932 -t 930 --length 6", bytes("82A082A08140"), bytes("0E448144810F")},  // a full-width blank
              {"930 -t 932 --length 6 --to-length 3", bytes("0E448144810F"), bytes("82A020"), 1, lost("4")},
              {"930 -t UTF-8 --length 8", bytes("0E448140400F4040"), "あ\u3000  "}});
}

TEST_F(Records, SizeIsNoMultiple) {
  const Arguments arguments = "records -f 37 -t 819 --length 4 --to-length 5 --report -";
  const ToolResult result = run_tool(arguments + Arguments{"-o", path("out")}, bytes("C1C2C3C4 C5C6"));
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(read("out"), "ABCD EF   ");
  expect_told(result, "6 bytes are no multiple of the record length 4: record 2, the last one, has only 2 bytes");
  expect_json(result.output, R"({"files": [{"records": 2, "bytes_in": 6, "bytes_out": 10,
      "first_wrong_lengths": [{"record": 2, "offset": 4, "length": 2}]}]})");
  // Each file has records and faults of its own.
  check_runs("records -f 819 -t 37 --length 2",
             {{{write("odd", "ABC"), write("even", "ABCD")}, "", bytes("C1C2 C340 C1C2 C3C4"), 1, "odd: 3 bytes"}});
  // Whatever of a kept field is there is kept.
  check_runs("records -f 37 -t 819",
             {{"--length 6 --keep 2-3", bytes("C10C"), "A\x0C    ", 1, "no multiple"}, {"--length 4"}});
}

TEST_F(Records, PlacesInLargeBlocks) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  // The euro sign of 1140 is nothing in Latin 1; kept columns are no text.
  std::string input;
  for (int i = 0; i < 50000; ++i) input += bytes("C1C29F9FC3C4C5");
  input[7 * 49999 + 6] = '\x9F';
  for (const bool discard : {false, true}) {  // in one go, and record by record
    const Arguments arguments = "records -f 1140 -t 819 --length 7 --keep 3-4 --report -";
    const ToolResult result = run_tool(arguments + Arguments{"-o", path("out")} + (discard ? "-c" : ""), input);
    EXPECT_EQ(result.status, 1);
    expect_told(result, "(in record 50000, column 7, byte 349999: U+20AC)");
    expect_json(result.output, R"({"files": [{"substituted": 1, "first_problems": [{"record": 50000, "column": 7,
        "offset": 349999, "kind": "substituted", "unicode": "U+20AC", "bytes": "9F"}]}]})");
    EXPECT_EQ(read("out").substr(0, 7), bytes("41429F9F434445"));
    EXPECT_EQ(read("out").substr(7 * 49999), bytes("41429F9F4344") + (discard ? " " : "\x1A"));
  }
}

TEST_F(Records, VariableRecords) {
  const std::string long_text(300, '\xC1');
  const std::string input = described_bytes("C1C2C3") + described("") + described(long_text) + described_bytes("C1DC");
  const std::string output = described("ABC") + described("") + described(std::string(300, 'A')) + described("Aü");
  const std::string cut = described("AB") + described("") + described("AA") + described("A");
  // Text before a kept field keeps its width, text behind the last one in the record takes what it needs.
  const std::string kept = described_bytes("DCC140 0C0C DCC1") + described_bytes("DCDC") + described_bytes("C1DCDC 0C");
  const std::string kept_output = described("üA\x0C\x0CüA") + described("üü") + described("Aü\x0C");
  const Arguments shorter = "--length 3 --to-length 2";
  check_runs("records -f 1047 -t UTF-8 --format V",
             {{{}, input, output},
              {"--line-out", input, "ABC\n\n" + std::string(300, 'A') + "\nAü\n"},
              {shorter, input, cut, 1, "1 record is longer than 3 bytes (record 3 at byte 15: 300 bytes)"},
              {shorter, input, cut, 1,
               "3 records truncated because their text does not fit (first in record 1, column 3, byte 6)"},
              {"--keep 4-5", kept, kept_output, 1, "(in record 3, column 3, "}});
}

TEST_F(Records, BlockedRecords) {
  const std::string one = described_bytes("C1C2") + described_bytes("C3"), two = described_bytes("DCDCDC");
  const std::string large = std::string{'\x80', 0, 0, static_cast<char>(two.size() + 4)} + two;
  const std::string converted = described(described("üüü"));
  // A block that outgrows what a descriptor word may tell becomes two.
  std::string block, first, second;
  for (int i = 0; i < 4095; ++i) {
    block += described_bytes("DCDC");
    (i < 4094 ? first : second) += described("üü");
  }
  check_runs("records -f 1047 -t UTF-8 --format VB",
             {{{},
               described(one) + large + described(two),
               described(described("AB") + described("C")) + converted + converted},
              {{}, described(block), described(first) + described(second)}});
}

TEST_F(Records, DamagedDescriptors) {
  const std::string good = "00060000 C1C2 ";
  const struct {
    const char* format;
    std::string input;
    const char* told;
  } cases[] = {
      {"V", good + "0003 0000 C1C2C3C4", "record 2 at byte 6: X'00030000' is no record descriptor word"},
      {"V", good + "C1C2C3C4C5C6", "record 2 at byte 6: X'C1C2C3C4' is no record"},
      {"V", good + "0006 0100 C1C2", "record 2 at byte 6: it is a segment of a spanned record (X'00060100')"},
      {"V", good + "0009 0000 C1C2", "record 2 at byte 6: its descriptor word tells 9 bytes, and the file"},
      {"V", good + "0009", "record 2 at byte 6: the file ends inside a record descriptor word"},
      {"VB", "000A0000" + good + "00040000", "record 2 at byte 10: X'00040000' is no block descriptor word"},
      {"VB", "000A0000" + good + "00100001" + good, "record 2 at byte 10: X'00100001' is no block"},
      {"VB", "000A0000" + good + "0010", "record 2 at byte 10: the file ends inside a block descriptor word"},
      {"VB", "000C0000" + good + "00060000C1C2", "record 2 at byte 10: its block ends inside the record descriptor"},
      {"VB", "000F0000" + good + "00060000C1C2", "record 2 at byte 10: its descriptor word tells 6 bytes, and its"},
  };
  for (const auto& c : cases) {
    for (const char* silent : {"", "-s"}) {
      const Arguments options = {"-o", path("out"), "--format", c.format};
      const ToolResult result = run_tool("records -f 37 -t 819 --report -" + options + silent, bytes(c.input));
      EXPECT_EQ(result.status, 1) << c.told;
      expect_told(result, c.told);
      EXPECT_EQ(read("out"), c.format[1] == 'B' ? described(described("AB")) : described("AB")) << c.told;
      expect_json(result.output, R"({"files": [{"records": 1}]})");
      EXPECT_NE(result.output.find(std::string("\"damage\": \"") + c.told), std::string::npos) << result.output;
    }
  }
}

TEST_F(Records, Ranges) {
  const std::string cards = bytes("C1C1 C2C2 C3C3 C4");
  const std::string variable = described_bytes("C1C1") + described_bytes("C2C2") + described_bytes("C3");
  const std::string rest = "2:18446744073709551615", beyond = "18446744073709551615:18446744073709551615";
  check_runs("records -f 37 -t 819 --length 2 --range",
             {{"1:1", cards, "AA"},
              {"4:1", cards, "D ", 1, "7 bytes are no multiple"},
              {"3:9", cards, "CCD ", 1, "the file has 4 records: --range 3:9 took 2 of them"},
              {"5:9", cards, "", 0, "the file has 4 records: --range 5:9 took none of them"},
              {"2:0", cards, ""},
              {{beyond}, cards, "", 0, "took none"},
              {{rest}, cards, "BBCCD ", 1, "took 3"},
              {{"4:1", write("cards", cards)}, "", "D ", 1, "7 bytes are no multiple"}});
  check_runs("records -f 37 -t 819 --format V --line-out --range",
             {{"2:1", variable, "BB\n"}, {{rest}, variable, "BB\nC\n", 0, "took 2"}});
}

TEST_F(Records, PlannedPartsMakeTheWhole) {
  std::string fixed, variable, blocked, block, lines;
  for (int i = 0; i < 60; ++i) {
    const std::string text(static_cast<std::size_t>(i % 23), static_cast<char>(0xC1 + i % 9));
    fixed += std::string(10, static_cast<char>(0xC1 + i % 9));
    variable += described(text);
    lines += text + "\x15";
    block += described(text);
    if (i % 7 == 0 || (i > 40 && i < 50) || i == 59) {
      blocked += described(block);
      block.clear();
    }
  }
  const struct {
    const char* name;
    std::string input;
    Arguments shape;
    std::size_t most;  // parts that there can be
  } cases[] = {
      {"fixed", fixed, "--length 10", 60},           {"short", fixed + "\xC1\xC2", "--length 10", 61},
      {"long", fixed, "--length 20000", 1},          {"empty", "", "--length 10", 1},
      {"variable", variable, "--format V", 60},      {"damaged", variable + "\xC1\xC2", "--format V", 61},
      {"blocked", blocked, "--format VB", 17},       {"spoilt", blocked + "\xC1\xC2", "--format VB", 18},
      {"lines", lines, "--length 12 --line-in", 60},
  };
  for (const auto& c : cases) {
    const Arguments convert = "records -f 37 -t UTF-8" + (c.shape + Arguments{write(c.name, c.input)});
    const ToolResult whole = run_tool(convert);
    for (const std::size_t parts : {1u, 2u, 3u, 7u, 5000u}) {
      const auto ranges = lines_of(run_tool(convert + Arguments{"--plan", std::to_string(parts)}).output);
      std::string together;
      int status = 0;
      for (const std::string& range : ranges) {
        const ToolResult part = run_tool(convert + Arguments{range});
        EXPECT_EQ(part.errors.find("took"), std::string::npos) << range << part.errors;
        status = std::max(status, part.status);
        together += part.output;
      }
      EXPECT_EQ(together, whole.output) << c.name << " " << parts;
      EXPECT_EQ(status, whole.status) << c.name << " " << parts;
      EXPECT_LE(ranges.size(), std::min(parts, c.most)) << c.name;
      EXPECT_TRUE(ranges.size() == std::min(parts, c.most) || c.shape.front() == "--format") << c.name;
    }
  }
  check_runs({"records", "--length", "10", "--plan", "3"},
             {{{path("fixed")}, "", "--range=1:20\n--range=21:20\n--range=41:20\n"}});
}

TEST_F(Records, Lines) {
  const std::string cards = bytes("C1C24040 40404040 C3C4C5C6 40C14040"), inside = bytes("C1C2C340 C125C240");
  const char* const line_end_inside = "1 record with a line end inside (in record 2, column 2, byte 5)";
  check_runs("records --length 4 --line-out -f", {{"37 -t UTF-8", cards, "AB\n\nCDEF\n A\n"},
                                                  {"37 -t UTF-8 --keep-blanks", cards, "AB  \n    \nCDEF\n A  \n"},
                                                  {"37 -t UTF-8 --nl crlf", cards, "AB\r\n\r\nCDEF\r\n A\r\n"},
                                                  {"37 -t 500", cards, bytes("C1C215 15 C3C4C5C615 40C115")},
                                                  {"37 -t 500 --nl lf", cards, bytes("C1C225 25 C3C4C5C625 40C125")},
                                                  {"37 -t 930", cards, bytes("C1C215 15 C3C4C5C615 40C115")},
                                                  // It makes two lines of the record.
                                                  {"37 -t 819", inside, "ABC\nA\nB\n", 1, line_end_inside},
                                                  {"930 -t UTF-8", inside, "ABC\nA\nB\n", 1, line_end_inside}});
  check_runs("records --line-in -f", {{"UTF-8 -t 37 --length 4", "AB\n\nABCD\r\nABCD  \n C",
                                       bytes("C1C24040 40404040 C1C2C3C4 C1C2C3C4 40C34040")},
                                      {"UTF-8 -t 37 --length 4", "AB\nABCDE\n", bytes("C1C24040 C1C2C3C4"), 1,
                                       "does not fit (in record 2, column 5, byte 7)"},
                                      {"37 -t 819 --length 2", bytes("C115C225C3"), "A B C "}});
}

TEST_F(Records, Usage) {
  check_runs(
      "records",
      {{"-f 37", "", "", 2, "tell the length of the records with --length"},
       {"-f 37 --length 0", "", "", 2, "--length: records of format F have 1 to 16777215 bytes, not 0"},
       {"-f 37 --format V --length 32757", "", "", 2, "1 to 32756 bytes"},
       {"-f 37 --format VB --to-length 32753", "", "", 2, "1 to 32752 bytes"},
       {"-f 37 --length 80 --keep 21-24,5-8"},
       {"-f 37 --length 80 --keep 1-2,,4", "", "", 2, "is no range of columns"},
       {"-f 37 --length 80 --keep 8-5", "", "", 2, "columns 8-5 end before they begin"},
       {"-f 37 --length 80 --keep 5-8,8-9", "", "", 2, "columns 5-8 and 8-9 overlap"},
       {"-f 37 --length 80 --keep 79-81", "", "", 2, "columns 79-81 reach beyond the record"},
       {"-f 37 --length 80 --to-length 90 --keep 1-80", "", "", 2, "all columns are kept"},
       {"-f 37 --length 80 --to-length 70 --keep 11-80", "", "", 2, "would have no room in 70 bytes"},
       {"-f 37 --format V --to-length 7 --keep 5-8", "", "", 2, "reach beyond the longest output record of 7 bytes"},
       {"-f 37 --length 80 --keep 5-8 --line-out", "", "", 2, "cannot stand in lines"},
       {"-f 37 --length 80 --line-in --line-out", "", "", 2, "leave no records"},
       {"-f 37 --length 80 --line-out --to-length 90", "", "", 2, "leave --to-length out"},
       {"-f 37 --format V --line-in", "", "", 2, "--line-in makes fixed records"},
       {"-f 37 -t 932 --length 80 --line-out --nl nel", "", "", 2, "the code page MS932 has no such line end"},
       {"-f 37 --length 80 --range 0:5", "", "", 2, "\"0:5\" is no FIRST:COUNT"},
       {"-f 37 --length 80 --plan 0", "", "", 2, "1 to 100000 parts"},
       {"-f 37 --length 80 --plan 2 --range 1:2", "", "", 2, "--plan converts nothing"},
       {"-f 37 --length 80 --report -", "", "", 2, "--report - needs -o FILE"},
       {"-f 37 --length 80 /no/such/file", "", "", 3, "No such file"}});
}

}  // namespace
}  // namespace lx::test
