// SPDX-License-Identifier: Apache-2.0
// Compiled sort objects, read by a slow reader of their own.
#include <iconv.h>

#include <tuple>
#include <vector>

#include "compiler_run.hpp"

namespace {

struct Set {
  unsigned primary = 0, secondary = 0, tertiary = 0, special = 0;
  bool empty() const { return (primary | secondary | tertiary | special) == 0; }
};

struct Weights {
  std::vector<Set> sets;
  unsigned mask = 0;
};

class SortFile {
 public:
  explicit SortFile(const fs::path& path) : file_(content(path)) {
    EXPECT_GT(file_.size(), 76u + 1036u) << path;
    start_ = u16(14) | u16(12) << 16;
    EXPECT_EQ(start_ + u16(10), file_.size());
  }

  unsigned default_secondary() const { return byte(start_); }
  unsigned default_tertiary() const { return byte(start_ + 1); }

  Weights of(unsigned c) const {
    size_t page = start_ + 6 + (c >> 8) * 4;
    unsigned flags = byte(page), value = u16(page + 2), low = c & 0xFF;
    if ((flags & 1) != 0) return {};
    if ((flags & 2) != 0) return {{{value + low, 0, 0, 0}}, byte(page + 1)};
    if ((flags & 4) != 0) return {{{0, 0, 0, value + low}}, byte(page + 1)};
    size_t at = start_ + u16(start_ + 1030) + (value + low) * 6;
    unsigned mask = u16(at + 4) >> 10 & 15;
    if ((u16(at + 4) & 0x4000) != 0) return {expansion(c), mask};
    return {{set(at, (u16(at + 4) & 0x8000) != 0)}, mask};
  }

  bool pair(unsigned first, unsigned second, Weights& weights) const {
    size_t at = start_ + u16(start_ + 1034);
    for (unsigned i = u16(start_ + 4); i-- > 0; at += 10) {
      if (u16(at) != first || u16(at + 2) != second) continue;
      weights = {{set(at + 4, (u16(at + 8) & 0x8000) != 0)}, u16(at + 8) >> 10 & 15};
      return true;
    }
    return false;
  }

  // The levels one after the other, by which texts are compared.
  std::vector<std::vector<unsigned>> key(const std::u16string& text) const {
    std::vector<std::vector<unsigned>> levels(4);
    for (size_t i = 0; i < text.size(); ++i) {
      Weights weights;
      if (i + 1 < text.size() && pair(text[i], text[i + 1], weights)) {
        ++i;
      } else {
        weights = of(text[i]);
      }
      for (const Set& set : weights.sets) {
        put(levels[0], set.primary, true);
        put(levels[1], set.secondary, (weights.mask & 4) != 0);
        put(levels[2], set.tertiary, true);
        if (set.special != 0) levels[3].insert(levels[3].end(), {static_cast<unsigned>(i + 1), set.special});
      }
    }
    trim(levels[1], default_secondary());
    trim(levels[2], default_tertiary());
    return levels;
  }

 private:
  unsigned byte(size_t at) const { return static_cast<unsigned char>(file_.at(at)); }
  unsigned u16(size_t at) const { return byte(at) << 8 | byte(at + 1); }

  Set set(size_t at, bool special) const {
    if (special) return {0, 0, 0, u16(at)};
    return {u16(at), byte(at + 2), byte(at + 3), 0};
  }

  std::vector<Set> expansion(unsigned c) const {
    size_t at = start_ + u16(start_ + 1032);
    for (unsigned i = u16(start_ + 2); i-- > 0; at += 14) {
      if (u16(at) == c) return {set(at + 2, false), set(at + 6, false)};
    }
    return {};
  }

  // Objects here either have all accents in text order or all backwards.
  static void put(std::vector<unsigned>& level, unsigned weight, bool forward) {
    if (weight != 0) level.insert(forward ? level.end() : level.begin(), weight);
  }
  static void trim(std::vector<unsigned>& level, unsigned weight) {
    while (!level.empty() && level.back() == weight) level.pop_back();
  }

  std::string file_;
  size_t start_ = 0;
};

constexpr unsigned kLanguageSorts[] = {1, 2, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 17};
constexpr unsigned kHostSorts[] = {37, 273, 500, 930, 1047, 1140, 1141};

class SortTest : public CompilerTest {
 protected:
  static fs::path shipped(unsigned id) {
    std::string digits = std::to_string(id);
    return fs::path(LEXARO_DATA) / ("so_" + std::string(5 - digits.size(), '0') + digits + ".nls");
  }

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
};

TEST_F(SortTest, EveryCharacterHasWeights) {
  auto check = [](unsigned id) {
    SortFile sort(shipped(id));
    EXPECT_EQ(sort.default_secondary(), 1u) << id;
    EXPECT_EQ(sort.default_tertiary(), 1u) << id;
    unsigned faults = 0;
    for (unsigned c = 0; c < 0x10000; ++c) {
      Weights weights = sort.of(c);
      bool sound = !weights.sets.empty() && weights.mask == (id == 7 ? 11u : 15u);
      for (const Set& set : weights.sets) sound = sound && !set.empty() && (set.primary == 0 || set.primary >= 0x200);
      faults += !sound;
    }
    EXPECT_EQ(faults, 0u) << id;
  };
  for (unsigned id : kLanguageSorts) check(id);
  for (unsigned id : kHostSorts) check(id);
}

// Only what Unicode calls equivalent may weigh the same.
TEST_F(SortTest, DifferentCharactersDiffer) {
  for (unsigned id : kLanguageSorts) {
    SortFile sort(shipped(id));
    std::map<std::vector<std::vector<unsigned>>, unsigned> holders;
    std::vector<unsigned> equal;
    for (unsigned c = 0; c < 0x10000; ++c) {
      if (!holders.emplace(sort.key({static_cast<char16_t>(c)}), c).second) equal.push_back(c);
    }
    // U+2126, 212A, 212B; 1F71 and the like; Greek and Hebrew compatibility characters, ...
    EXPECT_LT(equal.size(), 80u) << id;
    for (unsigned c : {0x212Au, 0x212Bu, 0x2126u, 0x0340u, 0x037Eu}) {
      EXPECT_TRUE(std::find(equal.begin(), equal.end(), c) != equal.end()) << id << " " << c;
    }
    for (unsigned c : {0x0663u, 0x00BDu, 0x2488u, 0x030Eu, 0x3302u, 0xFB02u}) {
      EXPECT_TRUE(std::find(equal.begin(), equal.end(), c) == equal.end()) << id << " " << c;
    }
  }
}

TEST_F(SortTest, WeightsOfSomeCharacters) {
  SortFile sort(shipped(1));
  auto only = [&sort](unsigned c) { return sort.of(c).sets.at(0); };
  Set a = only('a');
  EXPECT_EQ(std::tuple(a.secondary, a.tertiary, a.special), std::tuple(1u, 1u, 0u));
  for (unsigned c : {0x41u, 0xE1u, 0xC1u, 0x1EA4u, 0xFF21u}) EXPECT_EQ(only(c).primary, a.primary) << c;
  EXPECT_GT(only('A').tertiary, a.tertiary);
  EXPECT_EQ(only('A').secondary, 1u);
  EXPECT_EQ(only(0xE1).secondary, only(0xE9).secondary);  // the same accent
  EXPECT_NE(only(0xE1).secondary, only(0xE0).secondary);
  Weights sharp_s = sort.of(0xDF);
  ASSERT_EQ(sharp_s.sets.size(), 2u);
  EXPECT_EQ(sharp_s.sets[0].primary, only('s').primary);
  EXPECT_EQ(sharp_s.sets[1].primary, only('s').primary);
  for (unsigned c : {0u, 0x20u, 0x2Du, 0xADu, 0x0378u}) {  // the last one is unassigned
    Set set = only(c);
    EXPECT_EQ(set.primary + set.secondary + set.tertiary, 0u) << c;
    EXPECT_GT(set.special, 0u) << c;
  }
  EXPECT_EQ(only(0x301).primary, 0u);
  EXPECT_GT(only(0x301).secondary, only(0xE1).secondary);
  // Scripts in order, then Korean, then ideographs by code point.
  const unsigned ascending[] = {'$',   '0',   '9',    'z',    0x3B1,  0x430,  0x5D0,
                                0x627, 0x915, 0x3042, 0xAC00, 0xD7A3, 0x4E00, 0x9FA5};
  for (size_t i = 1; i < std::size(ascending); ++i) {
    EXPECT_LT(only(ascending[i - 1]).primary, only(ascending[i]).primary) << ascending[i];
  }
  EXPECT_EQ(only(0x5678).primary, only(0x5677).primary + 1);
  EXPECT_EQ(SortFile(shipped(7)).of('a').mask, 11u);
}

struct WordOrder {
  unsigned id;
  std::vector<std::u16string> words;  // ascending
};

TEST_F(SortTest, WordsOfEachLanguage) {
  const WordOrder orders[] = {
      {1, {u"", u" ", u"co", u"coop", u"co-op", u"coops", u"cote", u"Cote", u"coté", u"Coté", u"côte", u"côté", u"d"}},
      {1, {u"Masse", u"Maße", u"Massen", u"Öl", u"Olm", u"π", u"Π", u"я", u"中"}},
      {2, {u"cha", u"cz", u"lla", u"lz", u"n", u"nz", u"ñ", u"Ñ", u"ña", u"o", u"ó"}},
      {4, {u"Ab", u"ab", u"ay", u"ð", u"e", u"th", u"þ", u"tz", u"ü", u"z", u"Æ", u"æ", u"ä", u"øab", u"øl", u"ör"}},
      {4, {u"zz", u"Å", u"AA", u"Aa", u"å", u"aa", u"ål", u"aal", u"år"}},
      {5, {u"tha", u"þa", u"ü", u"z", u"å", u"Å", u"ä", u"Ä", u"æ", u"ö", u"ø", u"œ", u"ôa"}},
      {6, {u"nz", u"ŋz\u0061", u"v", u"w", u"y", u"ü", u"z", u"ž", u"ʒ", u"å", u"ä", u"ö", u"öa"}},
      {7, {u"cote", u"Cote", u"côte", u"coté", u"Coté", u"côté", u"d"}},
      {8,
       {u"cz", u"č", u"Č", u"ča", u"da", u"hz", u"ch", u"cH", u"Ch", u"CH", u"cha", u"i", u"rz", u"řa", u"sz", u"ša",
        u"zz", u"ža"}},
      {9, {u"s", u"sz", u"š", u"Š", u"z", u"ź", u"ž", u"t", u"u", u"w", u"õ", u"ä", u"ö", u"ü", u"ǘ", u"x"}},
      {10,
       {u"c", u"cz", u"cs", u"Cs", u"CS", u"csa", u"d", u"dzs", u"gz", u"gy", u"o", u"ó", u"oz", u"ö", u"ő", u"öz",
        u"sz", u"t", u"ü"}},
      {11,
       {u"cz", u"č", u"gz", u"ģ", u"h", u"i", u"ī", u"y", u"ý", u"iz", u"j", u"kz", u"ķ", u"lz", u"ļ", u"n", u"ņ", u"z",
        u"ž"}},
      {12,
       {u"a", u"ą", u"az", u"cz", u"č", u"e", u"ę", u"ė", u"i", u"į", u"y", u"Y", u"iz", u"u", u"ų", u"ū", u"z", u"ž"}},
      {13, {u"az", u"ą", u"cz", u"ć", u"lz", u"ł", u"Ł", u"nz", u"ń", u"oz", u"ó", u"z", u"zz", u"ź", u"ż", u"ża"}},
      {17,
       {u"cz", u"ça", u"gz", u"ğ", u"h", u"ı", u"I", u"i", u"İ", u"î", u"iz", u"j", u"oz", u"ö", u"s", u"ş", u"uz",
        u"ü"}},
  };
  for (const WordOrder& order : orders) {
    SortFile sort(shipped(order.id));
    for (size_t i = 1; i < order.words.size(); ++i) {
      EXPECT_LT(sort.key(order.words[i - 1]), sort.key(order.words[i])) << "sort " << order.id << ", word " << i;
    }
  }
}

// What the C library makes of bytes of a host page; -1: nothing, or more than one unit.
class HostPage {
 public:
  explicit HostPage(const char* name) : converter_(iconv_open("UTF-16BE", name)) {}
  ~HostPage() { iconv_close(converter_); }

  int decode(std::string bytes) const {
    char out[8];
    char* in = bytes.data();
    char* end = out;
    size_t left = bytes.size(), room = sizeof out;
    iconv(converter_, nullptr, nullptr, nullptr, nullptr);
    if (iconv(converter_, &in, &left, &end, &room) != 0 || end - out != 2) return -1;
    return static_cast<unsigned char>(out[0]) << 8 | static_cast<unsigned char>(out[1]);
  }

 private:
  iconv_t converter_;
};

struct HostSort {
  unsigned id;
  const char* page;
  int other;  // a byte that the C library reads as another character
};

TEST_F(SortTest, SingleBytesSortAsTheirHost) {
  for (HostSort host : {HostSort{37, "IBM037", -1},
                        {273, "IBM273", 0xBC},
                        {500, "IBM500", -1},
                        {1047, "IBM1047", -1},
                        {1140, "IBM1140", -1},
                        {1141, "IBM1141", 0xBC},
                        {930, "IBM930", -1}}) {
    SortFile sort(shipped(host.id));
    HostPage page(host.page);
    unsigned before = 0, count = 0;
    for (int byte = 0; byte < 256; ++byte) {
      int c = page.decode(std::string(1, static_cast<char>(byte)));
      if (c < 0 || byte == host.other || (host.id == 930 && (byte == 0x0E || byte == 0x0F))) continue;
      Set set = sort.of(static_cast<unsigned>(c)).sets.at(0);
      EXPECT_GT(set.primary, before) << host.page << " " << byte;
      EXPECT_EQ(std::pair(set.secondary, set.tertiary), std::pair(1u, 1u));
      before = set.primary;
      ++count;
    }
    EXPECT_GT(count, host.id == 930 ? 180u : 253u) << host.page;
    if (host.id == 930) continue;
    // Everything else is behind, in its own order.
    unsigned last = before;
    for (unsigned c : {0x100u, 0x3B1u, 0x20ABu, 0x4E00u, 0xD800u, 0xFFFFu}) {
      unsigned primary = sort.of(c).sets.at(0).primary;
      EXPECT_GT(primary, last) << c;
      last = primary;
    }
  }
}

TEST_F(SortTest, DoubleBytesSortAsTheirHostButForIdeographs) {
  SortFile sort(shipped(930));
  HostPage page("IBM930");
  unsigned before = sort.of(0x9F).sets.at(0).primary, counts[3] = {};  // FF is the last single byte
  std::vector<unsigned> ideographs;
  for (unsigned code = 0x4040; code < 0x7FFF; ++code) {
    int c = page.decode({0x0E, static_cast<char>(code >> 8), static_cast<char>(code & 0xFF), 0x0F});
    if (c < 0) continue;
    unsigned primary = sort.of(static_cast<unsigned>(c)).sets.at(0).primary;
    bool ideograph = (c >= 0x4E00 && c <= 0x9FFF) || (c >= 0xF900 && c <= 0xFAFF);
    if (ideograph) {
      ideographs.push_back(primary);
    } else {
      EXPECT_GT(primary, before) << std::hex << code;
      before = primary;
    }
    ++counts[ideograph ? 1 : code < 0x4541 ? 0 : 2];
  }
  EXPECT_GT(counts[0], 500u);
  EXPECT_GT(counts[1], 6000u);
  EXPECT_GT(counts[2], 1000u);
  // Ideographs lie between the two other groups.
  unsigned last_symbol = sort.of(0x2252).sets.at(0).primary, first_user = sort.of(0xE000).sets.at(0).primary;
  auto [least, most] = std::minmax_element(ideographs.begin(), ideographs.end());
  EXPECT_LT(last_symbol, *least);
  EXPECT_LT(*most, first_user);
  // One character may only become the bytes of another one.
  EXPECT_EQ(sort.of(0xFF5E).sets.at(0).primary, sort.of(0x301C).sets.at(0).primary);
  EXPECT_NE(sort.of(0xFF5E).sets.at(0).tertiary, sort.of(0x301C).sets.at(0).tertiary);
}

constexpr const char* kDanish = "collation/so_00004.txt";
constexpr const char* kCzech = "collation/so_00008.txt";
constexpr const char* kDefault = "collation/so_00001.txt";
constexpr const char* kHost = "collation/so_00930.txt";
constexpr const char* kRoot = "collation/root.txt";

const BrokenSource kBrokenRules[] = {
    {kCzech, "& H ", "& H < ch < chs", 0, 12, "3 characters cannot be weighed together"},
    {kCzech, "& H ", "& HCH < ch", 0, 3, "3 characters cannot be weighed together"},
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
    {kCzech, "& H ", "& H ch", 0, 5, "expected <, <<, <<< or ="},
    {kCzech, "& H ", "& H", 0, 4, "expected <, <<, <<< or = and an element"},
    {kCzech, "& H ", "& H <", 0, 6, "expected a blank"},
    {kCzech, "& H ", "& H < ", 0, 7, "expected a character"},
    {kCzech, "& H ", "& H < \xCC\x81", 0, 7, "U+0301 must be written as an escape"},
    {kCzech, "& H ", "& H < \\x41", 0, 7, "an unknown escape"},
    {kCzech, "& H ", "& H < \xF0\x9F\x98\x80", 0, 7, "only characters up to U+FFFF are possible"},
    {kCzech, "follow ", "follow ß š", 0, 8, "only a letter with one weight set can be followed"},
    {kCzech, "follow ", "follow š ß", 0, 10, "only a character with one weight set can follow"},
    {kCzech, "follow ", "follow š", 0, 9, "expected characters that follow"},
    {kDanish, "option ", "option lower-first", 0, 8, "the options are upper-first and backward-secondary"},
    {kDanish, "option ", "color red", 0, 1, "unknown keyword \"color\""},
    {kDefault, "base ", "base tree", 0, 5, "expected \" root\""},
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
    {kDefault, "id ", "id 3", kElsewhere, 0, "the id is not that of the file name"},
    {kHost, "block 6941 ", "block 4141 E0-F1", 0, 7, "blocks must be in order"},
    {kHost, "block 6941 ", "block 6941 E0-F1 9F", 0, 7, "page 9F is given twice"},
    {kRoot, "tabulated ", "tabulated 00 00", 0, 10, "page 00 is given twice"},
    {kRoot, "algorithmic ", "algorithmic AC", kEnd, 1, "page 07 is neither tabulated nor algorithmic"},
    {kRoot, "x Æ ", "x Æ a:100.8 e:1.8 e:1.8", 0, 19, "a character can have two weight sets at most"},
    {kRoot, "x Æ ", "x Æ Æ:100.8 e:1.8", 0, 5, "U+00C6 has no primary weight of its own"},
    {kRoot, "x Æ ", "x A a:100.8 e:1.8", 0, 3, "U+0041 is given twice"},
    {kRoot, "x Æ ", "x Æ a:0.8 e:1.8", 0, 7, "weights begin with 1"},
    {kRoot, "x Æ ", "x Æ a:1.6", 0, 3, "U+00C6 gets the weights that U+0041 has"},
};

TEST_F(SortTest, BrokenRulesAreNamedByPlace) {
  fs::path tree = sort_tree();
  compile(tree, work("out"));
  for (const BrokenSource& broken : kBrokenRules) {
    Fault fault(tree, broken);
    fault.expect_in(lexaroc("data " + quoted(tree) + " " + quoted(work("out"))));
  }
}

// More weights than a byte can tell, and more tables than the file can hold.
TEST_F(SortTest, LimitsOfTheFormatAreErrors) {
  fs::path tree = sort_tree();
  std::string tables = "weights\npages 00-29 table\npages 2A-FF none";
  for (unsigned c = 0; c < 0x2A00; ++c) {
    char line[32];
    std::snprintf(line, sizeof line, "\n%04X 0200.1.1 F", c);
    tables += line;
  }
  std::string secondaries = "base root\n& a";
  for (unsigned c = 0x900; c < 0x940; ++c) {
    char step[16];
    std::snprintf(step, sizeof step, " << \\u%04X", c);
    secondaries += step;
  }
  const BrokenSource cases[] = {
      {kDefault, "base ", secondaries.c_str(), kElsewhere, 0, "this needs one secondary weight more than the 255"},
      {kDefault, "base ", tables.c_str(), kElsewhere, 0, "the sort object would have 65548 bytes"},
      {kHost, "block 4541 ", "# none", kElsewhere, 0, "there is room for 41 tables"},
  };
  for (const BrokenSource& broken : cases) {
    Fault fault(tree, broken);
    fault.expect_in(lexaroc("data " + quoted(tree) + " " + quoted(work("out"))));
  }
}

TEST_F(SortTest, CheckFindsWeightsThatSortWrongly) {
  fs::path tree = sort_tree();
  std::string table = "weights\ndefaults 1 1\npages 00 table\npages 01-F0 primary 0300 F\npages F1-FF special 0100 F";
  auto with = [&table](const std::string& line, const std::string& more = "") {
    std::string text = table;
    for (unsigned c = 0; c < 256; ++c) {
      char plain[32];
      std::snprintf(plain, sizeof plain, "%04X %04X.1.1 F", c, 0x200 + c);
      text += "\n" + (line.rfind(std::string(plain, 4), 0) == 0 ? line : plain);
    }
    return text + more;
  };
  struct Case {
    std::string text;
    const char* message;
  };
  write(tree / kDefault, "id 1\nname Default\n" + with("") + "\n");
  EXPECT_EQ(lexaroc("check " + quoted(tree / kDefault)).output, "");
  write(tree / kDefault, "id 1\nname Default\nbase root\n");
  const Case cases[] = {
      {with("0041 01FF.1.1 F"), "U+0041 has a primary weight below 0200"},
      {with("0041 0241.0.1 F"), "U+0041 lacks a secondary or tertiary weight"},
      {with("0041 special 0000 F"), "U+0041 has no weights"},
      {with("0041 expands F"), "U+0041 expands to nothing"},
      {with("", "\nexpansion 0042 0200.1.1 0201.1.1"), "the expansion of U+0042 is never read"},
      {with("", "\npair 0041 0042 0200.1.1 F\npair 0041 0042 0201.1.1 F"), "the pair U+0041 U+0042 is given twice"},
  };
  for (const Case& bad : cases) {
    BrokenSource source{kDefault, "base ", bad.text.c_str(), kElsewhere, 0, bad.message};
    Fault fault(tree, source);
    fault.expect_in(lexaroc("check " + quoted(tree / kDefault)));
  }
}

}  // namespace
