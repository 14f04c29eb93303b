// SPDX-License-Identifier: Apache-2.0
// Host records: fixed, variable and blocked, each translated on its own.
#include <fcntl.h>

#include <algorithm>
#include <nlohmann/json.hpp>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using Json = nlohmann::json;
using Records = ToolTest;

Arguments operator+(Arguments all, const Arguments& more) {
  all.insert(all.end(), more.begin(), more.end());
  return all;
}

Arguments records(const std::string& from, const std::string& to, const Arguments& more) {
  return Arguments{"records", "-f", from, "-t", to} + more;
}

void expect_told(const ToolResult& result, const std::string& text) {
  EXPECT_NE(result.errors.find(text), std::string::npos) << "missing: " << text << "\nin: " << result.errors;
}

std::string described(const std::string& data) {
  const std::size_t length = data.size() + 4;
  return std::string{static_cast<char>(length >> 8), static_cast<char>(length & 0xFF), 0, 0} + data;
}

std::vector<std::string> lines_of(const std::string& text) {
  std::vector<std::string> lines;
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t end = text.find('\n', at);
    lines.push_back(text.substr(at, end - at));
    at = end + 1;
  }
  return lines;
}

// Text in columns 1-4, 9-20 and 25-80, packed decimal and binary numbers between.
std::string mixed_card(const std::string& key, const std::string& packed, const std::string& name,
                       const std::string& binary, const std::string& text, char blank) {
  const auto padded = [&](const std::string& field, std::size_t width) {
    return field + std::string(width - field.size(), blank);
  };
  return key + packed + padded(name, 12) + binary + padded(text, 56);
}

TEST_F(Records, PackedFieldsStayInPlace) {
  const std::string key = bytes("F0F0F0F7"), packed = bytes("1234567C"), binary = bytes("0E0F1525");
  const std::string name = bytes("D4A4934093859989"), text = bytes("D695856B40A3A69F");
  const std::string card = mixed_card(key, packed, name, binary, text, '\x40');
  const std::string last = mixed_card(key, bytes("00000D00"), "", bytes("FFFFFFFF"), name, '\x40');
  ASSERT_EQ(card.size(), 80U);
  const Arguments keep = {"--length", "80", "--keep", "5-8,21-24"};

  ToolResult result = run_tool(records("37", "819", keep), card + last);
  EXPECT_EQ(result.status, 0) << result.errors;
  EXPECT_EQ(result.output, mixed_card("0007", packed, "Mul leri", binary, "One, tw\xA4", ' ') +
                               mixed_card("0007", bytes("00000D00"), "", bytes("FFFFFFFF"), "Mul leri", ' '));

  // The last text takes what the output records have more or less; a longer character takes a blank.
  for (const int length : {80, 33, 32, 90}) {
    result = run_tool(records("37", "UTF-8", keep + Arguments{"--to-length", std::to_string(length)}), card);
    const std::string want = mixed_card("0007", packed, "Mul leri", binary, "One, tw\xC2\xA4", ' ') + "          ";
    if (length == 32) {  // the last character does not fit as a whole
      EXPECT_EQ(result.status, 1);
      EXPECT_EQ(result.output, want.substr(0, 31) + " ");
      expect_told(result, "1 record truncated because its text does not fit (in record 1, column 32, byte 31)");
    } else {
      EXPECT_EQ(result.status, 0) << result.errors;
      EXPECT_EQ(result.output, want.substr(0, static_cast<std::size_t>(length)));
    }
  }

  // Shift bytes are balanced in each text, and those in kept bytes are none.
  result = run_tool(records("930", "UTF-8", {"--length", "14", "--keep", "7-8"}),
                    bytes("0E44814482 0F 0E0E C1 0E4481 0F C2"));
  EXPECT_EQ(result.status, 0) << result.errors;
  EXPECT_EQ(result.output,
            "\xE3\x81\x82\xE3\x81\x84\x0E\x0E"
            "A\xE3\x81\x82"
            "B ");
}

TEST_F(Records, ShiftsStayInTheirRecord) {
  // Record 2 leaves its double-byte run open; record 3 must not begin inside it.
  const std::string input = bytes("C10E44810F404040 C1C20E4481448240 C1C2C340 40404040");
  ToolResult result = run_tool(records("930", "UTF-8", {"--length", "8", "--line-out"}), input);
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "A\xE3\x81\x82\nAB\xE3\x81\x82\xE3\x81\x84\xEF\xBF\xBD\nABC\n");
  expect_told(result, "1 unbalanced shift (in record 2, column 9, byte 16: the end)");
  expect_told(result, "1 character cut off by the end (in record 2, column 8, byte 15: X'40')");
}

TEST_F(Records, EachLengthIsExactAndBalanced) {
  const std::string kana = "\xE3\x81\x82", wide_blank = "\xE3\x80\x80";
  const std::vector<std::string> patterns = {"a", "w", "aw", "wa", "aaw", "wwa", "wwwaa", "aaaw b", "wW"};
  std::string input;
  std::vector<std::string> texts;
  for (const std::string& pattern : patterns) {
    for (std::size_t count = 0; count <= 40; ++count) {
      for (const char* end : {"", "  ", "W", "aW W", " w"}) {
        std::string text;
        for (std::size_t i = 0; i < count; ++i) text += pattern[i % pattern.size()];
        text += end;
        texts.push_back(text);
        for (const char c : text) input += c == 'w' ? kana : c == 'W' ? wide_blank : std::string(1, c);
        input += '\n';
      }
    }
  }
  for (const char* page : {"IBM930", "IBM1399"}) {
    const std::string letter = bytes(page == std::string("IBM930") ? "62" : "81");
    for (std::size_t length = 1; length <= 40; ++length) {
      std::string want;
      uint64_t truncated = 0;
      for (const std::string& text : texts) {
        // The obvious way: one character after the other while it and the way back fit.
        std::string record;
        bool wide = false, fits = true, lost = false;
        for (const char c : text) {
          const bool is_wide = c == 'w' || c == 'W';
          const std::string code = c == 'w'   ? bytes("4481")
                                   : c == 'W' ? bytes("4040")
                                   : c == ' ' ? bytes("40")
                                   : c == 'b' ? std::string()
                                              : letter;
          std::string more = record;
          if (is_wide != wide) more += is_wide ? '\x0E' : '\x0F';
          more += c == 'b' ? bytes(page == std::string("IBM930") ? "63" : "82") : code;
          fits = fits && more.size() + (is_wide ? 1 : 0) <= length;
          if (fits) {
            record = more;
            wide = is_wide;
          } else {
            lost = lost || (c != 'W' && c != ' ');
          }
        }
        if (wide) record += '\x0F';
        truncated += lost ? 1 : 0;
        want += record + std::string(length - record.size(), '\x40');
      }
      const ToolResult result =
          run_tool(records("UTF-8", page,
                           {"--length", std::to_string(length), "--line-in", "-s", "-o", path("out"), "--report", "-"}),
                   input);
      EXPECT_EQ(result.status, truncated != 0 ? 1 : 0) << result.errors;
      const Json report = Json::parse(result.output);
      EXPECT_EQ(report["files"][0]["records"], texts.size());
      EXPECT_EQ(report["files"][0]["truncated_records"], truncated) << page << " " << length;
      const std::string got = read("out");
      ASSERT_EQ(got.size(), want.size());
      for (std::size_t i = 0; i < texts.size(); ++i) {
        ASSERT_EQ(got.substr(i * length, length), want.substr(i * length, length))
            << page << " " << length << " \"" << texts[i] << '"';
      }
    }
  }
}

TEST_F(Records, WhatDoesNotFit) {
  const struct {
    const char* from;
    const char* to;
    const char* length;
    const char* to_length;
    const char* input;
    const char* output;
    const char* told;  // "" for nothing
  } cases[] = {
      {"37", "819", "4", "2", "C1C24040", "4142", ""},
      {"37", "819", "4", "2", "C1C240C3", "4142", "column 3"},
      {"37", "819", "4", "6", "C1C2C3C4", "414243442020", ""},
      {"819", "37", "2", "4", "4142", "C1C24040", ""},
      {"1047", "UTF-8", "3", "3", "C1DC40", "41C3BC", ""},          // u umlaut takes a blank's byte
      {"1047", "UTF-8", "3", "3", "DCC1DC", "C3BC41", "column 3"},  // no half character at the end
      {"1047", "UTF-8", "3", "3", "DCDC40", "C3BC20", "column 2"},  // ... its rest is blank
      {"932", "930", "4", "4", "82A082A0", "0E44810F", "column 3"},
      {"932", "930", "6", "6", "82A082A02020", "0E448144810F", ""},
      {"932", "930", "6", "6", "82A082A08140", "0E448144810F", ""},  // a full-width blank is one too
      {"930", "932", "6", "6", "0E448144810F", "82A082A02020", ""},
      {"930", "932", "6", "3", "0E448144810F", "82A020", "column 4"},
      {"930", "UTF-8", "8", "8", "0E448140400F4040", "E38182E380802020", ""},
      {"UTF-8", "930", "3", "3", "E38182", "404040", "column 1"},  // not even the shift bytes have room
      {"UTF-8", "UTF-8", "6", "4", "E38182E38182", "E3818220", "column 4"},
  };
  for (const auto& c : cases) {
    const ToolResult result =
        run_tool(records(c.from, c.to, {"--length", c.length, "--to-length", c.to_length}), bytes(c.input));
    EXPECT_EQ(result.output, bytes(c.output)) << c.input << " " << result.errors;
    EXPECT_EQ(result.status, c.told[0] == '\0' ? 0 : 1) << c.input;
    if (c.told[0] == '\0') {
      EXPECT_EQ(result.errors, "") << c.input;
    } else {
      expect_told(result, std::string("in record 1, ") + c.told + ", ");
    }
  }
}

TEST_F(Records, SizeIsNoMultiple) {
  const ToolResult result =
      run_tool(records("37", "819", {"--length", "4", "--to-length", "5", "-o", path("out"), "--report", "-"}),
               bytes("C1C2C3C4 C5C6"));
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(read("out"), "ABCD EF   ");
  expect_told(
      result,
      "standard input: 6 bytes are no multiple of the record length 4: record 2, the last one, has only 2 bytes");
  const Json file = Json::parse(result.output)["files"][0];
  EXPECT_EQ(file["records"], 2);
  EXPECT_EQ(file["bytes_in"], 6);
  EXPECT_EQ(file["bytes_out"], 10);
  EXPECT_EQ(file["first_wrong_lengths"], (Json{{{"record", 2}, {"offset", 4}, {"length", 2}}}));

  // Whatever of a kept field is there is kept.
  EXPECT_EQ(run_tool(records("37", "819", {"--length", "6", "--keep", "2-3"}), bytes("C10C")).output,
            std::string("A\x0C    "));
  EXPECT_EQ(run_tool(records("37", "819", {"--length", "4"}), "").status, 0);
}

TEST_F(Records, PlacesInLargeBlocks) {
  // The euro sign of 1140 is nothing in Latin 1; kept columns are no text.
  std::string input;
  for (int i = 0; i < 50000; ++i) input += bytes("C1C29F9FC3C4C5");
  input[7 * 49999 + 6] = '\x9F';
  for (const bool discard : {false, true}) {  // in one go, and record by record
    Arguments arguments =
        records("1140", "819", {"--length", "7", "--keep", "3-4", "-o", path("out"), "--report", "-"});
    if (discard) arguments.emplace_back("-c");
    const ToolResult result = run_tool(arguments, input);
    EXPECT_EQ(result.status, 1);
    expect_told(result, "(in record 50000, column 7, byte 349999: U+20AC)");
    const Json file = Json::parse(result.output)["files"][0];
    EXPECT_EQ(file["substituted"], 1);
    const Json want = {{"record", 50000},       {"column", 7},         {"offset", 349999},
                       {"kind", "substituted"}, {"unicode", "U+20AC"}, {"bytes", "9F"}};
    EXPECT_EQ(file["first_problems"][0], want);
    EXPECT_EQ(read("out").substr(0, 7),
              "AB\x9F\x9F"
              "CDE");
    EXPECT_EQ(read("out").substr(7 * 49999), discard ? "AB\x9F\x9F"
                                                       "CD "
                                                     : "AB\x9F\x9F"
                                                       "CD\x1A");
  }
}

TEST_F(Records, VariableRecords) {
  const std::string long_text(300, '\xC1');
  const std::string input =
      described(bytes("C1C2C3")) + described("") + described(long_text) + described(bytes("C1DC"));
  ToolResult result = run_tool(records("1047", "UTF-8", {"--format", "V"}), input);
  EXPECT_EQ(result.status, 0) << result.errors;
  EXPECT_EQ(result.output,
            described("ABC") + described("") + described(std::string(300, 'A')) + described("A\xC3\xBC"));
  EXPECT_EQ(run_tool(records("1047", "UTF-8", {"--format", "V", "--line-out"}), input).output,
            "ABC\n\n" + std::string(300, 'A') + "\nA\xC3\xBC\n");

  result = run_tool(records("1047", "UTF-8", {"--format", "V", "--length", "3", "--to-length", "2"}), input);
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, described("AB") + described("") + described("AA") + described("A"));
  expect_told(result, "1 record is longer than 3 bytes (record 3 at byte 15: 300 bytes)");
  expect_told(result, "3 records truncated because their text does not fit (first in record 1, column 3, byte 6)");

  // Text before a kept field keeps its width, text behind the last one in the record takes what it needs.
  result = run_tool(records("1047", "UTF-8", {"--format", "V", "--keep", "4-5"}),
                    described(bytes("DCC140 0C0C DCC1")) + described(bytes("DCDC")) + described(bytes("C1DCDC 0C")));
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, described("\xC3\xBC"
                                     "A\x0C\x0C\xC3\xBC"
                                     "A") +
                               described("\xC3\xBC\xC3\xBC") + described("A\xC3\xBC\x0C"));
  expect_told(result, "(in record 3, column 3, ");
}

TEST_F(Records, BlockedRecords) {
  const std::string one = described(bytes("C1C2")) + described(bytes("C3")), two = described(bytes("DCDCDC"));
  const std::string large = std::string{'\x80', 0, 0, static_cast<char>(two.size() + 4)} + two;
  ToolResult result = run_tool(records("1047", "UTF-8", {"--format", "VB"}), described(one) + large + described(two));
  EXPECT_EQ(result.status, 0) << result.errors;
  const std::string converted = described(described("\xC3\xBC\xC3\xBC\xC3\xBC"));
  EXPECT_EQ(result.output, described(described("AB") + described("C")) + converted + converted);

  // A block that outgrows what a descriptor word may tell becomes two.
  std::string block;
  for (int i = 0; i < 300; ++i) block += described(std::string(100, '\xDC'));
  result = run_tool(records("1047", "UTF-8", {"--format", "VB"}), described(block));
  EXPECT_EQ(result.status, 0) << result.errors;
  const std::string record = described(std::string(200, '\xBC'));
  ASSERT_EQ(result.output.size(), 2 * 4 + 300 * record.size());
  EXPECT_EQ(result.output.substr(0, 2), bytes("7F84"));  // 160 records
  EXPECT_EQ(result.output.substr(160 * record.size() + 4, 2), bytes("6F94"));
}

TEST_F(Records, DamagedDescriptors) {
  const std::string good = "00060000 C1C2 ";
  const struct {
    const char* format;
    std::string input;
    const char* told;
  } cases[] = {
      {"V", good + "0003 0000 C1C2C3C4", "record 2 at byte 6: X'00030000' is no record descriptor word"},
      {"V", good + "0006 0001 C1C2", "record 2 at byte 6: X'00060001' is no record"},
      {"V", good + "C1C2C3C4C5C6", "record 2 at byte 6: X'C1C2C3C4' is no record"},
      {"V", good + "0006 0100 C1C2", "record 2 at byte 6: it is a segment of a spanned record (X'00060100')"},
      {"V", good + "0009 0000 C1C2",
       "record 2 at byte 6: its descriptor word tells 9 bytes, and the file ends after 6"},
      {"V", good + "0009", "record 2 at byte 6: the file ends inside a record descriptor word"},
      {"VB", "000A0000" + good + "00040000", "record 2 at byte 10: X'00040000' is no block descriptor word"},
      {"VB", "000A0000" + good + "00100001" + good, "record 2 at byte 10: X'00100001' is no block"},
      {"VB", "000A0000" + good + "0010", "record 2 at byte 10: the file ends inside a block descriptor word"},
      {"VB", "000C0000" + good + "0006", "record 2 at byte 10: the file ends inside a record descriptor word"},
      {"VB", "000C0000" + good + "00060000C1C2", "record 2 at byte 10: its block ends inside the record descriptor"},
      {"VB", "000F0000" + good + "00060000C1C2",
       "record 2 at byte 10: its descriptor word tells 6 bytes, and its block"},
      {"VB", "00100000" + good + "00060300C1C2", "record 2 at byte 10: it is a segment"},
  };
  for (const auto& c : cases) {
    for (const bool silent : {false, true}) {
      Arguments arguments = records("37", "819", {"--format", c.format, "-o", path("out"), "--report", "-"});
      if (silent) arguments.emplace_back("-s");
      const ToolResult result = run_tool(arguments, bytes(c.input));
      EXPECT_EQ(result.status, 1) << c.told;
      expect_told(result, c.told);
      const std::string record = described("AB");
      EXPECT_EQ(read("out"), c.format[1] == 'B' ? described(record) : record) << c.told;
      const Json file = Json::parse(result.output)["files"][0];
      EXPECT_EQ(file["records"], 1);
      EXPECT_EQ(file["damage"].get<std::string>().find(c.told), 0U) << file["damage"];
    }
  }
}

TEST_F(Records, Ranges) {
  const std::string fixed = write("fixed", bytes("C1C1 C2C2 C3C3 C4"));
  const std::string variable =
      write("variable", described(bytes("C1C1")) + described(bytes("C2C2")) + described(bytes("C3")));
  const struct {
    const char* range;
    const char* fixed;
    int fixed_status;
    const char* variable;
    const char* note;  // of the fixed file
  } cases[] = {
      {"1:1", "AA", 0, "AA\n", ""},
      {"2:2", "BBCC", 0, "BB\nC\n", ""},
      {"1:3", "AABBCC", 0, "AA\nBB\nC\n", ""},
      {"4:1", "D ", 1, "", "7 bytes are no multiple"},
      {"3:9", "CCD ", 1, "C\n", "the file has 4 records: --range 3:9 took 2 of them"},
      {"5:9", "", 0, "", "the file has 4 records: --range 5:9 took none of them"},
      {"2:0", "", 0, "", ""},
      {"18446744073709551615:18446744073709551615", "", 0, "", "took none"},
      {"2:18446744073709551615", "BBCCD ", 1, "BB\nC\n", "took 3"},
  };
  for (const auto& c : cases) {
    for (const bool piped : {false, true}) {
      const Arguments range = {"--length", "2", "--range", c.range};
      const ToolResult result = piped ? run_tool(records("37", "819", range), read("fixed"))
                                      : run_tool(records("37", "819", range + Arguments{fixed}));
      EXPECT_EQ(result.output, c.fixed) << c.range;
      EXPECT_EQ(result.status, c.fixed_status) << c.range;
      expect_told(result, c.note);
    }
    const ToolResult result =
        run_tool(records("37", "819", {"--format", "V", "--line-out", "--range", c.range, variable}));
    EXPECT_EQ(result.output, c.variable) << c.range;
    EXPECT_EQ(result.status, 0) << c.range;
  }
}

// The parts that a plan names, converted and put together.
std::string converted_parts(const Arguments& plan, const Arguments& convert, int& worst_status, std::size_t& parts) {
  const ToolResult planned = run_tool(plan);
  const std::vector<std::string> ranges = lines_of(planned.output);
  std::string whole;
  parts = ranges.size();
  for (const std::string& range : ranges) {
    const ToolResult part = run_tool(convert + Arguments{range});
    EXPECT_EQ(part.errors.find("took"), std::string::npos) << range << part.errors;
    worst_status = std::max(worst_status, part.status);
    whole += part.output;
  }
  return whole;
}

TEST_F(Records, PlannedPartsMakeTheWhole) {
  std::string fixed, variable, blocked, block, lines;
  for (int i = 0; i < 60; ++i) {
    const std::string text(static_cast<std::size_t>(i % 23), static_cast<char>(0xC1 + i % 9));
    fixed += std::string(10, static_cast<char>(0xC1 + i % 9));
    variable += described(text);
    lines += text + "\x15";
    block += described(text);
    if (i % 7 == 0 || i > 50) {
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
      {"fixed", fixed, {"--length", "10"}, 60},
      {"short", fixed + "\xC1\xC2", {"--length", "10"}, 61},
      {"long", fixed, {"--length", "20000"}, 1},
      {"empty", "", {"--length", "10"}, 1},
      {"variable", variable, {"--format", "V"}, 60},
      {"damaged", variable + "\xC1\xC2", {"--format", "V"}, 61},
      {"blocked", blocked, {"--format", "VB"}, 17},
      {"spoilt", blocked + "\xC1\xC2", {"--format", "VB"}, 18},
      {"lines", lines, {"--length", "12", "--line-in"}, 60},
  };
  for (const auto& c : cases) {
    const std::string file = write(c.name, c.input);
    const Arguments convert = records("37", "UTF-8", c.shape + Arguments{file});
    const ToolResult whole = run_tool(convert);
    for (const std::size_t parts : {1u, 2u, 3u, 7u, 5000u}) {
      int status = 0;
      std::size_t count = 0;
      const std::string together =
          converted_parts(convert + Arguments{"--plan", std::to_string(parts)}, convert, status, count);
      EXPECT_EQ(together, whole.output) << c.name << " " << parts;
      EXPECT_EQ(status, whole.status) << c.name << " " << parts;
      if (c.shape.front() == "--length") {
        EXPECT_EQ(count, std::min(parts, c.most)) << c.name;
      }
      EXPECT_LE(count, std::min(parts, c.most)) << c.name;
    }
  }
  EXPECT_EQ(run_tool({"records", "--length", "10", "--plan", "3", path("fixed")}).output,
            "--range=1:20\n--range=21:20\n--range=41:20\n");
}

TEST_F(Records, LinesOut) {
  const std::string cards = bytes("C1C24040 40404040 C3C4C5C6 40C14040");
  const struct {
    const char* to;
    Arguments more;
    const char* output;
  } cases[] = {
      {"UTF-8", {}, "41420A 0A 434445460A 20410A"},
      {"UTF-8", {"--keep-blanks"}, "414220200A 202020200A 434445460A 204120200A"},
      {"UTF-8", {"--nl", "crlf"}, "41420D0A 0D0A 434445460D0A 20410D0A"},
      {"500", {}, "C1C215 15 C3C4C5C615 40C115"},
      {"500", {"--nl", "lf"}, "C1C225 25 C3C4C5C625 40C125"},
      {"930", {}, "C1C215 15 C3C4C5C615 40C115"},
  };
  for (const auto& c : cases) {
    const ToolResult result = run_tool(records("37", c.to, Arguments{"--length", "4", "--line-out"} + c.more), cards);
    EXPECT_EQ(result.output, bytes(c.output)) << c.to;
    EXPECT_EQ(result.status, 0) << result.errors;
  }
  // A line end inside a record would make two lines of it.
  for (const auto& [from, to] : {std::pair("37", "819"), std::pair("930", "UTF-8")}) {
    const ToolResult result = run_tool(records(from, to, {"--length", "4", "--line-out"}), bytes("C1C2C340 C125C240"));
    EXPECT_EQ(result.status, 1);
    expect_told(result, "1 record with a line end inside (in record 2, column 2, byte 5)");
  }
}

TEST_F(Records, LinesIn) {
  ToolResult result = run_tool(records("UTF-8", "37", {"--length", "4", "--line-in"}), "AB\n\nABCD\r\nABCD  \n C");
  EXPECT_EQ(result.status, 0) << result.errors;
  EXPECT_EQ(result.output, bytes("C1C24040 40404040 C1C2C3C4 C1C2C3C4 40C34040"));
  result = run_tool(records("UTF-8", "37", {"--length", "4", "--line-in"}), "AB\nABCDE\n");
  EXPECT_EQ(result.status, 1);
  expect_told(result, "1 record truncated because its text does not fit (in record 2, column 5, byte 7)");
  result = run_tool(records("37", "819", {"--length", "2", "--line-in"}), bytes("C115C225C3"));
  EXPECT_EQ(result.output, "A B C ");
}

TEST_F(Records, Usage) {
  const struct {
    Arguments arguments;
    int status;
    const char* told;
  } cases[] = {
      {{"-f", "37"}, 2, "tell the length of the records with --length"},
      {{"-f", "37", "--length", "0"}, 2, "--length: records of format F have 1 to 16777215 bytes, not 0"},
      {{"-f", "37", "--length", "-1"}, 2, "--length"},
      {{"-f", "37", "--format", "V", "--length", "32757"}, 2, "1 to 32756 bytes"},
      {{"-f", "37", "--format", "VB", "--to-length", "32753"}, 2, "1 to 32752 bytes"},
      {{"-f", "37", "--format", "U", "--length", "8"}, 2, "--format"},
      {{"--length", "8"}, 2, "name a code page"},
      {{"-f", "37", "--length", "80", "--keep", "5"}, 0, ""},
      {{"-f", "37", "--length", "80", "--keep", "21-24,5-8"}, 0, ""},
      {{"-f", "37", "--length", "80", "--keep", "5-"}, 2, "\"5-\" is no range of columns"},
      {{"-f", "37", "--length", "80", "--keep", "0-3"}, 2, "is no range of columns"},
      {{"-f", "37", "--length", "80", "--keep", "1-2,,4"}, 2, "is no range of columns"},
      {{"-f", "37", "--length", "80", "--keep", "8-5"}, 2, "columns 8-5 end before they begin"},
      {{"-f", "37", "--length", "80", "--keep", "5-8,8-9"}, 2, "columns 5-8 and 8-9 overlap"},
      {{"-f", "37", "--length", "80", "--keep", "79-81"},
       2,
       "columns 79-81 reach beyond the record, which ends at column 80"},
      {{"-f", "37", "--length", "80", "--to-length", "90", "--keep", "1-80"}, 2, "all columns are kept"},
      {{"-f", "37", "--length", "80", "--to-length", "70", "--keep", "11-80"},
       2,
       "columns 1-10, the last text of the record, would have no room in 70 bytes"},
      {{"-f", "37", "--format", "V", "--to-length", "7", "--keep", "5-8"},
       2,
       "reach beyond the longest output record of 7 bytes"},
      {{"-f", "37", "--length", "80", "--keep", "5-8", "--line-out"}, 2, "cannot stand in lines"},
      {{"-f", "37", "--length", "80", "--line-in", "--line-out"}, 2, "leave no records"},
      {{"-f", "37", "--length", "80", "--line-in", "--to-length", "90"}, 2, "--length already tells"},
      {{"-f", "37", "--length", "80", "--line-out", "--to-length", "90"}, 2, "leave --to-length out"},
      {{"-f", "37", "--format", "V", "--line-in"}, 2, "--line-in makes fixed records"},
      {{"-f", "37", "--length", "80", "--keep-blanks"}, 2, "--keep-blanks goes with --line-out only"},
      {{"-f", "37", "--length", "80", "--nl", "lf"}, 2, "--nl goes with --line-out only"},
      {{"-f", "37", "-t", "932", "--length", "80", "--line-out", "--nl", "nel"},
       2,
       "--nl nel: the code page MS932 has no such line end"},
      {{"-f", "37", "--length", "80", "--range", "0:5"}, 2, "\"0:5\" is no FIRST:COUNT"},
      {{"-f", "37", "--length", "80", "--range", "5"}, 2, "\"5\" is no FIRST:COUNT"},
      {{"-f", "37", "--length", "80", "--range", "1:2", "a", "b"}, 2, "--range is about one file"},
      {{"-f", "37", "--length", "80", "--plan", "2", "a", "b"}, 2, "--plan is about one file"},
      {{"-f", "37", "--length", "80", "--plan", "0"}, 2, "1 to 100000 parts"},
      {{"-f", "37", "--length", "80", "--plan", "2", "--range", "1:2"}, 2, "--plan converts nothing"},
      {{"-f", "37", "--length", "80", "--report", "-"}, 2, "--report - needs -o FILE"},
      {{"-f", "nonsense", "--length", "80"}, 4, "unknown code page"},
      {{"-f", "37", "--length", "80", "/no/such/file"}, 3, "No such file"},
  };
  for (const auto& c : cases) {
    const ToolResult result = run_tool(Arguments{"records"} + c.arguments, "");
    EXPECT_EQ(result.status, c.status) << c.told << result.errors;
    expect_told(result, c.told);
    EXPECT_EQ(result.output, "") << c.told;
  }
}

TEST_F(Records, OutputIsSafe) {
  const std::string file = write("cards", bytes("C1C2C3C4"));
  EXPECT_EQ(run_tool(records("37", "819", {"--length", "2", "-o", file, file})).status, 0);
  EXPECT_EQ(read("cards"), "ABCD");
  EXPECT_EQ(run_tool(records("819", "37", {"--length", "2", "-o", file, file, path("no")})).status, 3);
  EXPECT_EQ(read("cards"), "ABCD");
  EXPECT_EQ(files(), (std::vector<std::string>{"cards"}));
  ToolInput appending;
  appending.output_path = file;
  appending.output_flags = O_APPEND;
  EXPECT_EQ(run_tool(records("819", "37", {"--length", "2", file}), appending).status, 3);
  EXPECT_EQ(read("cards"), "ABCD");

  // Each file has records and faults of its own.
  const std::string odd = write("odd", "ABC");
  const ToolResult result = run_tool(records("819", "37", {"--length", "2", odd, file}));
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, bytes("C1C2 C340 C1C2 C3C4"));
}

TEST_F(Records, ConstantMemory) {
  for (const auto& [to, shape] : {std::pair<std::string, Arguments>{"819", {"--length", "80"}},
                                  {"UTF-8", {"--length", "80", "--to-length", "100"}},
                                  {"UTF-8", {"--length", "80", "--line-out"}}}) {
    ToolInput input;
    input.keep_output = false;
    input.next = [left = 64](std::string& piece) mutable {
      piece.assign(1000000, '\xC1');
      return left-- > 0;
    };
    const ToolResult result = run_tool(records("37", to, shape), input);
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_GE(result.output_size, 64000000U);
#ifndef LEXARO_SANITIZED
    EXPECT_LT(result.peak_kib, 32 * 1024);
#endif
  }
}

}  // namespace
}  // namespace lx::test
