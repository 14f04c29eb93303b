// SPDX-License-Identifier: Apache-2.0
// The C++ interface: lengths, buffers that grow, failures that throw, and objects that move.
#include <gtest/gtest.h>

#include <cstring>
#include <lexaro/lexaro.hpp>

#include "support/environment.hpp"

namespace lexaro {
namespace {

// "Lexaro " and two kanji in IBM-930.
constexpr std::string_view kHostText = "\xD3\x66\xB7\x62\x9B\x77\x40\x0E\x45\x62\x45\x66\x0F";

template <typename Body>
uint32_t status_of(Body body) {
  try {
    body();
  } catch (const Error& error) {
    return error.status();
  }
  return LX_OK;
}

class Wrapper : public testing::Test {
 protected:
  Library library{LEXARO_DATA};
  Locale german{"German.UTF-8"};
  Locale host{"Japanese.IBM-930"};
  Locale utf8{"Japanese.UTF-8"};
};

TEST(WrapperLibrary, WantsItsData) {
  const std::string too_long(300, 'x');  // the search for data ends there
  lx::test::Variable place("LX_LOCALEDIR", too_long.c_str());
  EXPECT_EQ(status_of([] { Library library("/nowhere"); }), LX_E_DEFAULTS);
  EXPECT_EQ(LXGetObjManager(), nullptr) << "given back";
  Library library("/nowhere", 0);
  EXPECT_TRUE(library.on_defaults());
  EXPECT_EQ(Locale("").name(), "English_UnitedStates.US-ASCII@Binary");
}

TEST_F(Wrapper, OwnersMoveAndConstructorsThrow) {
  Library second = std::move(library);
  Locale moved = std::move(german);
  german = std::move(moved);
  EXPECT_EQ(german.name(), "German_Germany.UTF-8@Default");
  EXPECT_EQ(status_of([] { Locale("Klingon.UTF-8"); }), LX_E_LANGUAGE);
  EXPECT_EQ(status_of([] { Locale(static_cast<LXLocale*>(nullptr)); }), LX_E_ARGUMENT);
  EXPECT_EQ(status_of([&] { Catalog(german, "", "/nowhere/none.cat"); }), LX_E_NOFILE);
}

TEST_F(Wrapper, ItemsAndOrder) {
  EXPECT_EQ(german.text(LX_ITEM_DAY_1), "Sonntag");
  EXPECT_EQ(german.text_u(LX_ITEM_DAY_1), u"Sonntag");
  EXPECT_EQ(status_of([&] { german.number(999); }), LX_E_ITEM);
  EXPECT_EQ(status_of([&] { german.text(999); }), LX_E_ITEM);
  EXPECT_EQ(status_of([&] { german.set_text(LX_ITEM_DECIMAL, "5"); }), LX_E_NOTFOUND);
  EXPECT_LT(german.compare({}, "a"), 0);
  EXPECT_EQ(german.compare(u"A", u"a", LX_CMP_NOCASE), 0);
  EXPECT_EQ(status_of([&] { german.compare("a", "b", 0x40000000); }), LX_E_ARGUMENT);
  const std::string large(100000, 'x');  // longer than the first guess
  EXPECT_LT(german.sort_key(large), german.sort_key(large + "x"));
  EXPECT_EQ(german.sort_key(std::string_view()), german.sort_key(u""));
}

TEST_F(Wrapper, MappingAndConversionGrow) {
  std::string sharp;
  for (int i = 0; i < 5000; ++i) sharp += "ẞß";
  EXPECT_EQ(german.upper(u"stra\u00DFe"), u"STRASSE");
  EXPECT_EQ(german.upper(std::string_view()), "");
  EXPECT_EQ(utf8.map("AB", LX_MAP_H2F), "ＡＢ");
  EXPECT_EQ(german.upper(sharp), german.from_ucs2(german.upper(german.to_ucs2(sharp))));
  EXPECT_EQ(status_of([&] { german.map("a", 0x40000000); }), LX_E_ARGUMENT);
  EXPECT_EQ(host.from_ucs2(host.to_ucs2(kHostText)), kHostText);
  EXPECT_EQ(host.count(kHostText), 9u);
  std::string large;
  for (int i = 0; i < 5000; ++i) large += kHostText;
  Conversion conversion(host, utf8);
  Conversion moved = std::move(conversion);
  std::string in_blocks;
  for (size_t i = 0; i < large.size(); i += 777) moved.append(std::string_view(large).substr(i, 777), in_blocks);
  moved.finish(in_blocks);
  EXPECT_EQ(in_blocks, convert(host, utf8, large));
  EXPECT_EQ(convert(utf8, host, in_blocks), large);
}

TEST_F(Wrapper, ProblemsAreReportedAfterAMove) {
  Locale euro("German.IBM-1140");
  Locale latin1("German.ISO-8859-1");
  Conversion conversion(euro, latin1);
  uint32_t missing = 0;
  conversion.set_options(LX_CONV_STRICT, [&](const LXConversionProblem& problem) { missing = problem.unicode; });
  Conversion moved = std::move(conversion);
  EXPECT_EQ(moved("\xC1\x9F\xC2"),
            "A\x1A"
            "B");
  EXPECT_EQ(missing, 0x20ACu);
  EXPECT_EQ(moved.counts().substituted, 1u);
  EXPECT_EQ(status_of([&] { moved.set_options(0); }), LX_E_ARGUMENT);
  const Field field = translate_field(930, LX_CP_UTF8, kHostText, 9);
  EXPECT_EQ(field.text, "Lexaro ");
  EXPECT_FALSE(field.complete);
  EXPECT_EQ(status_of([] { translate_field(5, 6, "a", 5); }), LX_E_CODEPAGE);
}

TEST_F(Wrapper, ValuesAreWrittenAndRead) {
  LXTime time{};
  time.tm_year = 126, time.tm_mon = 10, time.tm_mday = 22;
  EXPECT_EQ(german.format(1234567), "1.234.567");
  EXPECT_EQ(german.format<std::u16string>(-1234.5), u"-1.234,50");
  EXPECT_GT(german.format_currency(1e300).size(), 300u);
  EXPECT_EQ(german.format_time(time, "%d. %B %Y"), "22. November 2026");
  EXPECT_EQ(german.format_time(time, std::u16string(500, u'x')).size(), 500u);
  EXPECT_EQ(status_of([&] { german.format_time(time, "%Q"); }), LX_E_FORMAT);
  EXPECT_EQ(german.parse_integer("1.234 x").length, 5u);
  EXPECT_EQ(german.parse_integer(u"x").length, 0u);
  EXPECT_EQ(german.parse_number(u"-1.234,5").value, -1234.5);
  EXPECT_EQ(german.parse_time("22. November 2026", "%d. %B %Y").value.tm_mon, 10);
  EXPECT_EQ(status_of([&] { german.parse_time(u"x", u"%d"); }), LX_E_NOTFOUND);
}

TEST_F(Wrapper, StreamsReadAndFlush) {
  std::string_view source = "eins\nzwei\r\ndrei";
  Stream reader = Stream::reader(german, [&](void* buffer, int32_t) -> int32_t {
    if (source.empty()) return -1;
    std::memcpy(buffer, source.data(), 1);
    source.remove_prefix(1);
    return 1;
  });
  std::string line;
  const auto first = reader.read_char();
  ASSERT_TRUE(first);
  reader.unget(*first);
  Stream moved = std::move(reader);
  for (const char* expected : {"eins", "zwei", "drei"}) {
    EXPECT_TRUE(moved.read_line(line));
    EXPECT_EQ(line, expected);
  }
  EXPECT_FALSE(moved.read_line(line));
  EXPECT_EQ(status_of([&] { moved.write(LXWChar{'x'}); }), LX_E_DIRECTION);
  moved.close();

  std::string written;
  {
    Stream writer = Stream::writer(host, [&](const void* buffer, int32_t count) {
      written.append(static_cast<const char*>(buffer), static_cast<size_t>(count));
      return count;
    });
    writer.write(0x4562);
  }
  EXPECT_EQ(written, "\x0E\x45\x62\x0F");  // its end was written by the destructor
}

TEST_F(Wrapper, Enumerations) {
  int found = 0;
  for_each_object(
      [&](uint8_t type, const char* name) { found += type == LX_LANGUAGE && !std::strcmp(name, "German"); });
  for_each_alias([&](const char*, const char* code_page) { found += !std::strcmp(code_page, "IBM930") ? 10 : 0; });
  EXPECT_EQ(found % 10, 1);
  EXPECT_GE(found, 11);
}

}  // namespace
}  // namespace lexaro
