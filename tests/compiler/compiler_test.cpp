// SPDX-License-Identifier: Apache-2.0
#include "compiler_run.hpp"

#include <sstream>

namespace {

TEST_F(CompilerTest, OutputIsCleanAndGoesRound) {
  compile(data_, work("compiled"));
  const auto files = files_in(work("compiled"));
  EXPECT_EQ(files.at("alias.txt"), content(data_ / "alias.txt"));
  EXPECT_EQ(lexaroc("check " + quoted(data_) + " " + quoted(work("compiled"))).output, "");
  dump_all(work("compiled"), work("dumped"));
  for (const char* folder : {"language", "territory", "codepage"}) {
    auto dumped = files_in(work("dumped") / folder);
    auto sources = files_in(data_ / folder);
    EXPECT_EQ(dumped.size(), sources.size());
    for (const auto& [name, text] : sources) {
      EXPECT_TRUE(without_comments(dumped[name]) == without_comments(text)) << name << " is not in the form of dump";
    }
  }
  for (const fs::path& sources : {work("dumped"), data_}) {  // the second time over what is there
    compile(sources, work("again"));
    EXPECT_TRUE(files == files_in(work("again")));
  }
}

TEST_F(CompilerTest, OlderLayoutGoesRoundOrIsRefused) {
  const std::string options = "--layout=1 --only 37,367,819,970";
  compile(data_, work("compiled"), options);
  auto files = files_in(work("compiled"));
  EXPECT_EQ(files["cp_00037.nls"][4], 0x10);
  EXPECT_EQ(files.count("cp_00930.nls"), 0u);
  EXPECT_EQ(lexaroc("check " + quoted(work("compiled"))).output, "");
  fs::copy(data_, work("dumped"), fs::copy_options::recursive);
  for (const char* page : {"cp_00037", "cp_00367", "cp_00819", "cp_00970"}) {
    const fs::path source = work("dumped/codepage") / (page + std::string(".txt"));
    dump(work("compiled") / (page + std::string(".nls")), source);
    EXPECT_TRUE(without_comments(content(source)) == without_comments(content(data_ / "codepage" / source.filename())));
  }
  compile(work("dumped"), work("again"), options);
  EXPECT_TRUE(files == files_in(work("again")));

  for (const char* id : {"930", "932", "954", "57352"}) {
    Outcome refused = lexaroc(std::string("data --layout=1 --only ") + id + " " + quoted(data_) + " x");
    EXPECT_EQ(refused.exit_code, 1) << id;
    EXPECT_NE(refused.output.find("version-1 layout"), std::string::npos) << refused.output;
  }
}

TEST_F(CompilerTest, BuiltInSourcesAreUpToDate) {
  for (const char* folder : {"objects", "codepage"}) fs::create_directories(work("made") / folder);
  Outcome outcome = lexaroc("builtin " + quoted(data_) + " " + quoted(work("made")));
  ASSERT_EQ(outcome.exit_code, 0) << outcome.output;
  for (const char* name : {"objects/builtin_objects.cpp", "codepage/unicode_tables.cpp"}) {
    EXPECT_TRUE(content(data_.parent_path() / name) == content(work("made") / name)) << "run: lexaroc builtin data .";
  }
}

constexpr const char* kGerman = "language/la_00002.txt";
constexpr const char* kGermany = "territory/te_00276.txt";
constexpr const char* kMixed = "codepage/cp_00930.txt";
constexpr const char* kAscii = "codepage/cp_00367.txt";
constexpr const char* kEuc = "codepage/cp_00954.txt";

const std::vector<BrokenSource> kBroken = {
    // What every source has in common
    {kGerman, "pm = ", "pm = A\x01", 0, 7, "a control character, or bytes that are not UTF-8"},
    {kGerman, "pm = ", "pm = \xED\xA0\x80", 0, 6, "a control character, or bytes that are not UTF-8"},
    {kGerman, "pm = ", "pm = \xE0\x80\xAF", 0, 6, "a control character, or bytes that are not UTF-8"},
    {kGerman, "id = ", "\xEF\xBB\xBFid = 2", 0, 1, "expected a key"},
    // Fields
    {kGerman, "pm = ", "pm = a\nam = b", 1, 1, "\"am\" is given twice"},
    {kGerman, "pm = ", "pn = x", 0, 1, "unknown key \"pn\""},
    {kGerman, "pm = ", "# pm", kEnd, 1, "\"pm\" is missing"},
    {kGerman, "pm = ", "pm = ", 0, 6, "text that is empty or begins with a blank needs quotes"},
    {kGerman, "pm = ", "pm = x\\n", 0, 7, "an unknown escape"},
    {kGerman, "pm = ", "pm = \\u00e4", 0, 10, "expected 4 hexadecimal digits in upper case"},
    {kGerman, "pm = ", "pm = \\uD800", 0, 8, "a surrogate is no character"},
    {kGerman, "pm = ", "pm = x\xC2\xA0y", 0, 7, "U+00A0 must be written as an escape"},
    {kGerman, "pm = ", "pm = \xF0\x9F\x98\x80", 0, 6, "only characters up to U+FFFF are possible"},
    {kGerman, "name = ", "name = A_B", 0, 8, "a name cannot contain"},
    {kGerman, "name = ", "name = abcdefghijklmnopqrstuvwxyzabcdefg", 0, 8, "the name is longer than 32"},
    {kGerman, "default-territory = ", "default-territory = 65536", 0, 21, "the number is larger than 65535"},
    {kGerman, "default-territory = ", "default-territory = -1", 0, 21, "expected a number"},
    {kGerman, "special.upper = ", "special.upper = 00DF = 0053 0053 0053", 0, 33, "expected the end of the line"},
    {kGermany, "decimal = ", "decimal = \",,\"", 0, 11, "a separator is one character"},
    // Code pages
    {kAscii, "kind ", "kind mixed", kEnd, 1, "a mixed page needs \"shift\""},
    {kAscii, "substitution ", "substitution 9A", kElsewhere, 0, "the substitution byte is no character"},
    {kAscii, "50 ", "40 A", 0, 4, "the bytes 40 are given twice"},
    {kAscii, "50 ", "50 \\{0050-005F}x", 1, 4, "the bytes 60 are given twice"},
    {kAscii, "70 ", "FF \\-{2}", 0, 4, "the row runs past the byte FF"},
    {kAscii, "70 ", "70 \\uFFFD", 0, 4, "U+FFFD stands for bytes that are no character"},
    {kAscii, "70 ", "70 \\{D7FF-E000}", 0, 4, "the range is empty or too wide"},
    {kAscii, "70 ", "7A7A a", 0, 1, "too many bytes for a page of this kind"},
    {kAscii, "70 ", "70 p\nkind single", 1, 1, "\"kind\" must stand before the characters"},
    {kAscii, "70 ", "70 p\nfrom U+00A0 71", 1, 13, "these bytes are no character of the page"},
    {kAscii, "70 ", "70 p\nfrom U+0070 41", 1, 6, "the character has bytes already"},
    {kAscii, "70 ", "70 p\nfrom U+00A0 1A", 1, 13, "characters without bytes become the substitution anyway"},
    {kAscii, "70 ", "70 p\nprefer U+0070 70", 1, 15, "these bytes are taken anyway"},
    {kAscii, "70 ", "70 p\nfrom U+00A0 41\n71 q", 2, 1, "characters must stand before"},
    {kMixed, "shift ", "shift 0E 0E", 0, 9, "the shift bytes must differ"},
    {kMixed, "4040 ", "4000 a", 0, 6, "a later byte of a character cannot be 00"},
    {kMixed, "4040 ", "0041 a", 0, 1, "the first byte of several cannot be 00"},
    {kEuc, "70 ", "A1 a", kElsewhere, 0, "the byte A1 begins characters of different length"},
    {kEuc, "A2A1 ", "A1A1A1 a", 0, 8, "the byte A1 begins characters of different length"},
    // Aliases and Unicode tables
    {"alias.txt", "US-ASCII", " early", 0, 1, "aliases without a code page"},
    {"alias.txt", "    us", "    us US", 0, 8, "\"US\" is given twice"},
    {"unicode/case.txt", "0102 0103", "0100 0101", 0, 1, "out of order, or outside its table"},
    {"unicode/case.txt", "table lower 2", "table lower 3 0380 03EE", 0, 7, "expected \"lower 2 0200 0275\""},
    {"unicode/ctype.txt", "0009 ;", "0009 ; space ; S L ;", 0, 16, "expected one direction"},
    {"unicode/digits.txt", "0031 0031", "0032 0032", 1, 1, "out of order"},
};

TEST_F(CompilerTest, BrokenSourcesAreNamedByPlace) { expect_checked(small_tree(), kBroken); }

TEST_F(CompilerTest, BrokenSourcesChangeNoOutput) {
  fs::path tree = small_tree();
  compile(tree, work("out"));
  const auto before = files_in(work("out"));
  write(tree / kAscii, "nonsense\n");
  for (const char* output : {"out", "new"}) {
    EXPECT_EQ(lexaroc("data " + quoted(tree) + " " + quoted(work(output))).exit_code, 1);
  }
  EXPECT_TRUE(files_in(work("out")) == before);
  EXPECT_FALSE(fs::exists(work("new")));
}

// Sources that compile but that users should not get.
const std::vector<BrokenSource> kBad = {
    {kGermany, "decimal = ", "decimal = \"\\u00A0\"", 0, 11, "a separator must be an ASCII character"},
    {kGermany, "decimal = ", "decimal = \"1\"", 0, 11, "a separator cannot be a digit"},
    {kGermany, "decimal = ", "decimal = \"\"", 0, 11, "a decimal separator is needed"},
    {kGermany, "thousands = ", "thousands = \",\"", 0, 13, "the same character as the decimal separator"},
    {kGermany, "grouping = ", "grouping = 3", 0, 12, "expected group sizes that end in 0"},
    {kGermany, "time = ", "time = %H:%N", 0, 8, "an unknown directive"},
    {kGermany, "time = ", "time = %#H:%Z", 0, 8, "an unknown directive"},
    {kGermany, "time = ", "time = \"\"", 0, 8, "a format is needed"},
    {kGermany, "list = ", "list = \"\\u0009\"", 0, 8, "a separator cannot be a control character"},
    {kGermany, "abbreviation = ", "abbreviation = De", 0, 16, "expected three capitals"},
    {kGermany, "currency-intl = ", "currency-intl = \"EUR \"", 0, 17, "expected three capitals"},
    {kGermany, "negative-sign = ", "negative-sign = \"minus\"", 0, 17, "the sign is longer than 3 characters"},
    {kAscii, "40 ", "40 \\u2020ABCDEFGHIJKLMNO", kElsewhere, 0,
     "on every page of this family, 40 is U+0040, both ways"},
    {kAscii, "line-ends ", "line-ends 0A 0D 0B 0A", kElsewhere, 0, "line end 0A is given twice"},
    {kEuc, "line-ends ", "line-ends 0A 0D 0B 8F", kElsewhere, 0, "line end 8F is no character"},
    {kMixed, "F0 ", "F0 1023456789", kElsewhere, 0, "on every page of this family, F0 is U+0030, both ways"},
};

TEST_F(CompilerTest, CheckFindsWhatCompiles) {
  fs::path tree = small_tree();
  expect_checked(tree, kBad);
  for (const BrokenSource& bad : kBad) spoil(tree, bad);
  compile(tree, work("out"));
}

// Faults that show only when all sources are seen together.
TEST_F(CompilerTest, CheckSeesTheWholeTree) {
  const BrokenSource cases[] = {
      {kAscii, "id ", "id 368", kElsewhere, 0, "the id is not that of the file name"},
      {"language/la_00033.txt", "pm = ", "pm = \xC3\xBC", 0, 6, "U+00FC does not exist in ISO-8859-5"},
      {"language/la_00033.txt", "own-name = ",
       "own-name = \xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F"
       "\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F\xD1\x8F",
       0, 12, "longer than 31 bytes in "},
      {"language/la_00033.txt", "abbreviation = ", "abbreviation = ru", 0, 16, "expected two capitals"},
      {"language/la_00033.txt", "abday.tue = ", "abday.tue = \xD0\xBF\xD0\xBD", 0, 13, "the same name as abday.mon"},
      {"language/la_00033.txt", "month.7 = ", "month.7 = \"\"", 0, 11, "a text is needed"},
      {"language/la_00033.txt", "default-territory = ", "default-territory = 440", 0, 21, "there is no such territory"},
      {"language/la_00033.txt", "default-codepage = ", "default-codepage = 4711", 0, 20, "there is no such codepage"},
      {"language/la_00033.txt", "default-sort = ", "default-sort = 99", 0, 16, "there is no such sort"},
      {"territory/te_00643.txt", "name = ", "name = Rossija", kElsewhere, 0, "no object has the name \"Russia\""},
      {"territory/te_00233.txt", "long-date = ", "long-date = %#d. %B", 0, 13, "\"#\" cannot be used"},
      {"territory/te_00233.txt", "currency = ", "currency = \xE2\x82\xAC", 0, 12, "U+20AC does not exist in "},
      {"territory/te_00752.txt", "negative-sign = ", "negative-sign = \"\\u00AD\\u00AD\"", 0, 17,
       "longer than 3 bytes in "},
      {"alias.txt", "KOI8-R ", "KOI8-R cp878 57371", 0, 14, "57371 is the number of another code page"},
      {"alias.txt", "KOI8-U ", "KOI8-X cp1168", 0, 8, "there is no code page \"KOI8-X\""},
  };
  fs::path tree = work("tree");
  fs::copy(data_, tree, fs::copy_options::recursive);
  std::vector<Complaint> complaints;
  for (const BrokenSource& bad : cases) complaints.push_back(spoil(tree, bad));
  Outcome outcome = lexaroc("check " + quoted(tree));
  for (const Complaint& complaint : complaints) complaint.expect_in(outcome);
}

// Objects have other numbers among the built-in ones.
std::string texts_in(const fs::path& source) {
  std::istringstream lines(without_comments(content(source)));
  std::string texts;
  for (std::string line; std::getline(lines, line);) {
    if (line.rfind("id = ", 0) != 0 && line.rfind("default-", 0) != 0) texts += line + "\n";
  }
  return texts;
}

TEST_F(CompilerTest, BuiltInObjectsSayWhatTheShippedOnesSay) {
  EXPECT_EQ(texts_in(data_ / "builtin/language.txt"), texts_in(data_ / "language/la_00001.txt"));
  EXPECT_EQ(texts_in(data_ / "builtin/territory.txt"), texts_in(data_ / "territory/te_00840.txt"));
}

TEST_F(CompilerTest, ExitCodesTellUsageFromTheSystem) {
  const std::pair<std::string, int> cases[] = {
      {"", 2},
      {"data " + quoted(data_), 2},
      {"data --layout=3 " + quoted(data_) + " x", 2},
      {"frobnicate", 2},
      {"--help", 0},
      {"data " + quoted(work("nowhere")) + " " + quoted(work("out")), 3},
      {"check " + quoted(work("nowhere.txt")), 3},
      {"dump " + quoted(work("cp_00037.nls")), 3},
  };
  for (const auto& [arguments, status] : cases) EXPECT_EQ(lexaroc(arguments).exit_code, status) << arguments;
}

TEST_F(CompilerTest, DamagedFilesAreRefusedOrHarmless) {
  compile(data_, work("compiled"), "--only 37,970,57352");
  for (const char* name : {"cp_00970.nls", "cp_57352.nls", "cp_00037.nls", "la_00002.nls", "te_00276.nls",
                           "so_00004.nls", "control.nls"}) {
    const std::string sound = content(work("compiled") / name);
    std::vector<std::string> damaged;
    for (unsigned round = 0; round < 40; ++round) {
      std::string bytes = sound;
      // Headers, and the tables that steer the walks, are near the start of their sections.
      const size_t start = std::min<size_t>(bytes.size(), round % 4 == 1 ? 76 : 6000);
      char& byte = bytes[(round * 7919u + round * round * 104729u) % start];
      byte = static_cast<char>(byte ^ (1 << round % 8) ^ (round % 3 == 0 ? 0x7F : 0));
      damaged.push_back(round % 4 == 0 ? sound.substr(0, sound.size() * round / 40) : bytes);
    }
    expect_harmless(name, damaged);
  }
}

}  // namespace
