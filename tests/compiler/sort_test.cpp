// SPDX-License-Identifier: Apache-2.0
// The sort objects that come with the library, and what the compiler says to wrong ones.
#include <sstream>
#include <tuple>
#include <vector>

#include "compiler_run.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

struct Set {
  uint16_t primary = 0;
  uint8_t secondary = 0, tertiary = 0;
  uint16_t special = 0;
};

class Sort {
 public:
  explicit Sort(const std::string& name) : locale_(LXGetLocale(("English.UTF-8@" + name).c_str(), 0, nullptr)) {
    EXPECT_NE(locale_, nullptr) << name;
  }

  std::vector<Set> of(unsigned character, uint8_t* mask = nullptr) const {
    Set a, b;
    uint8_t forward = 0;
    const int32_t count = LXSortGetWeights(LXGetLocaleObject(locale_.get(), LX_SORT), static_cast<LXUChar>(character),
                                           &a.primary, &a.secondary, &a.tertiary, &a.special, &b.primary, &b.secondary,
                                           &b.tertiary, &b.special, mask != nullptr ? mask : &forward);
    return count == 2 ? std::vector{a, b} : std::vector(static_cast<size_t>(count), a);
  }
  Set only(unsigned character) const { return of(character).at(0); }

  std::string key(const std::string& text) const {
    char key[200];
    const auto length = LXStrxfrm(locale_.get(), key, sizeof key, text.data(), static_cast<int32_t>(text.size()), 0);
    return {key, static_cast<size_t>(length)};
  }
  std::string key(unsigned character) const {
    const auto unit = static_cast<LXUChar>(character);
    char key[40];
    return {key, static_cast<size_t>(LXStrxfrmU(locale_.get(), key, sizeof key, &unit, 1, 0))};
  }

 private:
  Locale locale_;
};

// The sorts of languages, and words in their order.
constexpr std::pair<const char*, const char*> kLanguageSorts[] = {
    {"Default", "| |co|coop|co-op|coops|cote|Cote|coté|Coté|côte|côté|d|Masse|Maße|Massen|Öl|Olm|π|Π|я|中"},
    {"Spanish", "cha|cz|lla|lz|n|nz|ñ|Ñ|ña|o|ó"},
    {"Danish", "Ab|ab|ay|ð|e|th|þ|tz|ü|z|zz|Æ|æ|ä|øab|øl|ör|Å|AA|Aa|å|aa|ål|aal|år"},
    {"Swedish", "tha|þa|ü|z|å|Å|ä|Ä|æ|ö|ø|œ|ôa"},
    {"Finnish", "nz|ŋz\u0061|v|w|y|ü|z|ž|ʒ|å|ä|ö|öa"},
    {"CanadianFrench", "cote|Cote|côte|coté|Coté|côté|d"},
    {"Czech", "cz|č|Č|ča|da|hz|ch|cH|Ch|CH|cha|i|rz|řa|sz|ša|zz|ža"},
    {"Estonian", "s|sz|š|Š|z|ź|ž|t|u|w|õ|ä|ö|ü|ǘ|x"},
    {"Hungarian", "c|cz|cs|Cs|CS|csa|d|dzs|gz|gy|o|ó|oz|ö|ő|öz|sz|t|ü"},
    {"Latvian", "cz|č|gz|ģ|h|i|ī|y|ý|iz|j|kz|ķ|lz|ļ|n|ņ|z|ž"},
    {"Lithuanian", "a|ą|az|cz|č|e|ę|ė|i|į|y|Y|iz|u|ų|ū|z|ž"},
    {"Polish", "az|ą|cz|ć|lz|ł|Ł|nz|ń|oz|ó|z|zz|ź|ż|ża"},
    {"Turkish", "cz|ça|gz|ğ|h|ı|I|i|İ|î|iz|j|oz|ö|s|ş|uz|ü"},
};

class SortTest : public CompilerTest {
 protected:
  // Sources of all sorts, and what they refer to, to be broken.
  fs::path sort_tree() {
    fs::path tree = small_tree();
    fs::copy(data_ / "collation", tree / "collation");
    for (const char* id : {"00037", "00273", "00500", "01047", "01140", "01141"}) {
      fs::path name = std::string("codepage/cp_") + id + ".txt";
      fs::copy(data_ / name, tree / name);
    }
    return tree;
  }

 private:
  Session session_;
};

// Every character weighs something, and only what Unicode calls equivalent may weigh the same.
TEST_F(SortTest, DifferentCharactersDiffer) {
  for (const auto& [name, words] : kLanguageSorts) {
    Sort sort(name);
    std::map<std::string, unsigned> holders;
    std::vector<unsigned> equal;
    unsigned faults = 0;
    for (unsigned c = 0; c < 0x10000; ++c) {
      if (!holders.emplace(sort.key(c), c).second) equal.push_back(c);
      uint8_t mask = 0;
      const auto sets = sort.of(c, &mask);
      bool sound = !sets.empty() && mask == (std::string(name) == "CanadianFrench" ? 11 : 15);
      for (const Set& set : sets) {
        sound = sound && (set.primary | set.secondary | set.tertiary | set.special) != 0 &&
                (set.primary == 0 || set.primary >= 0x200);
      }
      faults += !sound;
    }
    EXPECT_EQ(faults, 0u) << name;
    // U+2126, 212A, 212B; 1F71 and the like; Greek and Hebrew compatibility characters, ...
    EXPECT_LT(equal.size(), 80u) << name;
    for (unsigned c : {0x212Au, 0x212Bu, 0x2126u, 0x0340u, 0x037Eu})
      EXPECT_EQ(std::count(equal.begin(), equal.end(), c), 1) << name << " " << c;
    for (unsigned c : {0x0663u, 0x00BDu, 0x2488u, 0x030Eu, 0x3302u, 0xFB02u})
      EXPECT_EQ(std::count(equal.begin(), equal.end(), c), 0) << name << " " << c;
  }
}

TEST_F(SortTest, WeightsOfSomeCharacters) {
  Sort sort("Default");
  for (unsigned c : {0x41u, 0xE1u, 0x1EA4u, 0xFF21u}) EXPECT_EQ(sort.only(c).primary, sort.only('a').primary) << c;
  EXPECT_EQ(sort.key("a").size(), 5u);                              // its other weights are the usual ones
  EXPECT_EQ(sort.only(0xE1).secondary, sort.only(0xE9).secondary);  // the same accent
  for (unsigned c : {0u, 0x20u, 0x2Du, 0xADu, 0x0378u}) {           // the last one is unassigned
    const Set set = sort.only(c);
    EXPECT_TRUE(set.primary == 0 && set.secondary == 0 && set.tertiary == 0) << c;
  }
  // Scripts in order, then Korean, then ideographs by code point.
  unsigned before = 0;
  for (char16_t c : std::u16string_view(u"$09zαбאب\u0915あ가힣一\u5677\u5678\u9FA5")) {
    EXPECT_LT(before, sort.only(c).primary) << unsigned{c};
    before = sort.only(c).primary;
  }
}

TEST_F(SortTest, WordsOfEachLanguage) {
  for (const auto& [name, words] : kLanguageSorts) {
    Sort sort(name);
    std::istringstream list(words);
    std::string before, word;
    std::getline(list, before, '|');
    while (std::getline(list, word, '|')) {
      EXPECT_LT(sort.key(before), sort.key(word)) << name << ": " << before << " " << word;
      before = word;
    }
  }
}

// The order of a host's own characters is compared with that of their bytes in tests/wordlists. All others stand behind
// them, in their own order; ideographs of the mixed page, which have no table, between symbols and what users define.
TEST_F(SortTest, HostsLeaveRoomForOtherCharacters) {
  for (const char* name : {"IBM037", "IBM273", "IBM500", "IBM1047", "IBM1140", "IBM1141"}) {
    Sort sort(name);
    unsigned before = 0;
    for (unsigned c = 0; c < 0x100; ++c) before = std::max<unsigned>(before, sort.only(c).primary);
    for (unsigned c : {0x100u, 0x3B1u, 0x20BBu, 0x4E00u, 0xD800u, 0xFFFFu}) {
      EXPECT_GT(sort.only(c).primary, before) << name << " " << c;
      before = sort.only(c).primary;
    }
  }
  Sort sort("IBM930");
  for (unsigned c = 0x4E00; c < 0xFB00; c = c == 0x9FFF ? 0xF900 : c + 1) {
    EXPECT_GT(sort.only(c).primary, sort.only(0x2252).primary) << c;
    EXPECT_LT(sort.only(c).primary, sort.only(0xE000).primary) << c;
  }
  // One character may only become the bytes of another one.
  EXPECT_EQ(sort.only(0xFF5E).primary, sort.only(0x301C).primary);
  EXPECT_NE(sort.only(0xFF5E).tertiary, sort.only(0x301C).tertiary);
}

constexpr const char* kDanish = "collation/so_00004.txt";
constexpr const char* kCzech = "collation/so_00008.txt";
constexpr const char* kDefault = "collation/so_00001.txt";
constexpr const char* kHost = "collation/so_00930.txt";
constexpr const char* kRoot = "collation/root.txt";

const std::vector<BrokenSource> kBrokenRules = {
    {kCzech, "& H ", "& H < ch < chs", 0, 12, "3 characters cannot be weighed together"},
    {kCzech, "& H ", "& H < ch/s", 0, 7, "a pair can have one weight set, and this would have 2"},
    {kCzech, "& H ", "& s << þ/ch", 0, 8, "a character can have two weight sets, and this would have 3"},
    {kCzech, "& H ", "& H < 中", 0, 7, "U+4E2D is on no tabulated page"},
    {kCzech, "& H ", "& 中 < ch", 0, 3, "U+4E2D gets its weight from its code point"},
    {kCzech, "& H ", "& - < ch", 0, 3, "U+002D has only a special weight"},
    {kCzech, "& H ", "& \\u0301 < ch", 0, 12, "what stands before has no primary weight"},
    {kCzech, "& H ", "& H < ch < ch", 0, 12, "U+0063 U+0068 has a place already"},
    {kCzech, "& H ", "& H < č", 0, 7, "U+010D has a place already"},
    {kCzech, "& H ", "& H << x\n& H << y", 1, 8, "U+0079 gets the weights that U+0078 has"},
    {kCzech, "& H ", "& [before 1] H << ch", 0, 19, "[before 1] wants \"<\" first"},
    {kCzech, "& H ", "& H < ", 0, 7, "expected a character"},
    {kCzech, "follow ", "follow ß š", 0, 8, "only a letter with one weight set can be followed"},
    {kCzech, "follow ", "follow š ß", 0, 10, "only a character with one weight set can follow"},
    {kDanish, "option ", "option lower-first", 0, 8, "the options are upper-first and backward-secondary"},
    {kDefault, "base ", "# none", kEnd, 1, "one of base, order-of and weights is missing"},
    {kDefault, "base ", "& H < ch", 0, 1, "rules want \"base root\" before them"},
    {kDefault, "base ", "base root\norder-of codepage 37", 1, 1, "a sort is made by one of base, order-of and weights"},
    {kDefault, "base ", "order-of codepage 4711", 0, 19, "the code page is missing or has errors"},
    {kDefault, "base ", "weights\npages 00-FF table\n0041 0200.256.1 F", 2, 11, "the number is larger than 255"},
    {kDefault, "base ", "weights\npages 00-FF none\n0041 0200.1.1 F", 2, 1, "U+0041 is on no page with a table"},
    {kDefault, "base ", "weights\npages 00-FE none", kEnd, 1, "page FF is missing"},
    {kDefault, "base ", "weights\npages 00 table\npages 01-FF none", kEnd, 1,
     "256 characters of the pages with tables"},
    {kDefault, "base ", "weights\npages 00-FF primary 0300 F", 1, 7, "the weights run past FFFF"},
    {kHost, "block 6941 ", "block 4141 E0-F1", 0, 7, "blocks must be in order"},
    {kHost, "block 6941 ", "block 6941 E0-F1 9F", 0, 7, "page 9F is given twice"},
    {kRoot, "tabulated ", "tabulated 00 00", 0, 10, "page 00 is given twice"},
    {kRoot, "algorithmic ", "algorithmic AC", kEnd, 1, "page 07 is neither tabulated nor algorithmic"},
    {kRoot, "x Æ ", "x Æ a:100.8 e:1.8 e:1.8", 0, 19, "a character can have two weight sets at most"},
    {kRoot, "x Æ ", "x Æ Æ:100.8 e:1.8", 0, 5, "U+00C6 has no primary weight of its own"},
    {kRoot, "x Æ ", "x Æ a:0.8 e:1.8", 0, 7, "weights begin with 1"},
    {kRoot, "x Æ ", "x Æ a:1.6", 0, 3, "U+00C6 gets the weights that U+0041 has"},
};

// A line for each character, after a format with one number.
std::string lines_for(const char* format, unsigned begin, unsigned end) {
  std::string lines;
  for (unsigned c = begin; c < end; ++c) {
    char line[32];
    std::snprintf(line, sizeof line, format, c);
    lines += line;
  }
  return lines;
}

TEST_F(SortTest, BrokenRulesAreNamedByPlace) {
  fs::path tree = sort_tree();
  compile(tree, work("out"));
  // More tables than the file can hold, and more weights than a byte can tell.
  const std::string tables = "weights\npages 00-29 table\npages 2A-FF none" + lines_for("\n%04X 0200.1.1 F", 0, 0x2A00);
  const std::string secondaries = "base root\n& a" + lines_for(" << \\u%04X", 0x900, 0x940);
  std::vector<BrokenSource> cases = kBrokenRules;
  cases.push_back({kDefault, "base ", secondaries, kElsewhere, 0, "this needs one secondary weight more than the 255"});
  cases.push_back({kDefault, "base ", tables, kElsewhere, 0, "the sort object would have 65548 bytes"});
  cases.push_back({kHost, "block 4541 ", "# none", kElsewhere, 0, "there is room for 41 tables"});
  expect_checked(tree, cases);
}

TEST_F(SortTest, CheckFindsWeightsThatSortWrongly) {
  fs::path tree = sort_tree();
  auto with = [](const std::string& line, const std::string& more = "") {
    std::string text = "weights\ndefaults 1 1\npages 00 table\npages 01-F0 primary 0300 F\npages F1-FF special 0100 F";
    for (unsigned c = 0; c < 256; ++c) {
      char plain[32];
      std::snprintf(plain, sizeof plain, "%04X %04X.1.1 F", c, 0x200 + c);
      text += "\n" + (c == 0x41 && !line.empty() ? line : plain);
    }
    return text + more;
  };
  write(work("so_00001.txt"), "id 1\nname Default\n" + with("") + "\n");
  EXPECT_EQ(lexaroc("check " + quoted(work("so_00001.txt"))).output, "");
  const std::pair<std::string, const char*> cases[] = {
      {with("0041 01FF.1.1 F"), "U+0041 has a primary weight below 0200"},
      {with("0041 0241.0.1 F"), "U+0041 lacks a secondary or tertiary weight"},
      {with("0041 special 0000 F"), "U+0041 has no weights"},
      {with("0041 expands F"), "U+0041 expands to nothing"},
      {with("", "\nexpansion 0042 0200.1.1 0201.1.1"), "the expansion of U+0042 is never read"},
      {with("", "\npair 0041 0042 0200.1.1 F\npair 0041 0042 0201.1.1 F"), "the pair U+0041 U+0042 is given twice"},
  };
  std::vector<BrokenSource> sources;
  for (const auto& [text, message] : cases) sources.push_back({kDefault, "base ", text, kElsewhere, 0, message});
  expect_checked(tree, sources);
}

}  // namespace
}  // namespace lx::test
