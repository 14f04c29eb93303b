// SPDX-License-Identifier: Apache-2.0
// Whole texts mapped: cases in a table, then everything beside the slow model.
#include "text_mapping/mapping_runner.hpp"
#include "text_mapping/mapping_samples.hpp"

namespace lx::test {
namespace {

enum Language { english, german, turkish, lithuanian, greek };
constexpr uint32_t kUpperPlain = LX_MAP_UPPER | LX_MAP_PLAIN;
constexpr uint32_t kLowerPlain = LX_MAP_LOWER | LX_MAP_PLAIN;
const uint32_t kMappings[] = {0,
                              LX_MAP_H2F,
                              LX_MAP_F2H,
                              LX_MAP_COPY,
                              LX_MAP_LOWER,
                              LX_MAP_UPPER,
                              kLowerPlain,
                              kUpperPlain,
                              LX_MAP_DIGITS,
                              LX_MAP_UPPER | LX_MAP_DIGITS};

class MapString : public testing::Test {
 protected:
  // `size` in units, or in characters.
  MapCall call(const Form& form, const Units& text, int32_t size, uint32_t flags) {
    const TestLanguage& language = test_languages()[choice_.below(test_languages().size())];
    return {&language, form, text, mapping_length(choice_, form, text, (flags & LX_OPT_CHARS) != 0), size, flags};
  }
  void check_sizes(const Form& form, const Units& text, bool every_size) {
    for (uint32_t flags : kMappings) {
      // Counted copies of text with shift bytes are LXStrcpyEx's.
      bool copy = flags == 0 || flags == LX_MAP_COPY;
      if (choice_.below(3) == 0 && !(copy && form.follows_shifts())) flags |= LX_OPT_CHARS;
      auto most = static_cast<int32_t>(2 * text.size() + 3);
      for (int32_t size = every_size ? -1 : most; size <= most; ++size) runner_.check(call(form, text, size, flags));
      auto random = static_cast<int32_t>(choice_.below(static_cast<size_t>(most)));
      runner_.check(call(form, text, random, flags));
    }
  }

  MappingRunner runner_;
  Choice choice_;
};

TEST_F(MapString, Cases) {
  struct {
    const char* name;
    uint16_t page;
    Language language;
    uint32_t flags;
    std::string_view text;
    int32_t length;
    int32_t size;
    std::string_view out;
    int32_t count = -1;
  } cases[] = {
      {"terminator mapped and counted", 819, english, LX_MAP_UPPER, "ab", -1, 9, "AB\0"sv},
      {"any negative length", 819, english, LX_MAP_LOWER, "aB", -7, 9, "ab\0"sv},
      {"zeros inside are text", 819, english, LX_MAP_UPPER, "a\0b"sv, 3, 9, "A\0B"sv},
      {"copy", 932, english, LX_MAP_COPY, "a\x82\x81", 3, 9, "a\x82\x81"},
      {"copy by 0", 819, german, 0, "\xDF", -1, 9, "\xDF\0"sv},
      {"German", 819, german, LX_MAP_UPPER, "\xDF", 1, 9, "SS"},
      {"German without special pairs", 819, german, kUpperPlain, "\xDF\xE4", 2, 9, "\xDF\xC4"},
      {"English has none", 819, english, LX_MAP_UPPER, "\xDF", 1, 9, "\xDF"},
      {"half of a pair fits", 819, german, LX_MAP_UPPER, "a\xDF", 2, 2, "AS"},
      {"Turkish upper", 920, turkish, LX_MAP_UPPER, "iI\xFD", 3, 9, "\xDDII"},
      {"Turkish lower", 920, turkish, LX_MAP_LOWER, "iI\xDD", 3, 9, "i\xFDi"},
      {"Turkish without special pairs", 920, turkish, kUpperPlain, "i", 1, 9, "I"},
      {"replacement that the page lacks", 819, turkish, LX_MAP_UPPER, "ai", 2, 9, "A\x1A"},
      {"Lithuanian: both characters", 57352, lithuanian, LX_MAP_UPPER,
       "i\xCC\x87j\xCC\x87\xC4\xAF\xCC\x87"
       "i",
       11, 20, "IJ\xC4\xAEI"},
      {"Greek final sigma", 813, greek, LX_MAP_LOWER, "\xD3\xC1\xD3 \xD3", 5, 9, "\xF3\xE1\xF2 \xF3"},
      {"Greek upper", 813, greek, LX_MAP_UPPER, "\xF2\xF3", 2, 9, "\xD3\xD3"},
      {"one byte short", 932, english, LX_MAP_UPPER, "a\x82\x81", 3, 2, "A"},
      {"cut input", 932, english, LX_MAP_UPPER, "a\x82", 2, 9, "A"},
      {"widened", 932, english, LX_MAP_H2F, "A\xB1 ", 3, 9, "\x82\x60\x83\x41\x81\x40"},
      {"widened, one byte short", 932, english, LX_MAP_H2F, "AA", 2, 3, "\x82\x60"},
      {"narrowed", 932, english, LX_MAP_F2H, "\x82\x60\x83\x41\x81\x40\x88\x9F", 8, 9, "A\xB1 \x88\x9F"},
      {"one width on single-byte pages", 819, english, LX_MAP_H2F, "A\xA2", 2, 9, "A\xA2"},
      {"widened and back in UTF-8", 57352, english, LX_MAP_F2H, "\xEF\xBC\xA1\xE3\x82\xA2", 6, 9, "A\xEF\xBD\xB1"},
      {"digits", 819, english, LX_MAP_DIGITS,
       "x\xB2\xB9"
       "7",
       4, 9, "x217"},
      {"digits of other scripts", 57352, english, LX_MAP_DIGITS, "\xD9\xA3\xEF\xBC\x95\xC2\xBD", 7, 9, "35\xC2\xBD"},
      {"Tibetan digits have no type", 57352, english, LX_MAP_DIGITS, "\xE0\xBC\xA1", 3, 9, "\xE0\xBC\xA1"},
      {"characters", 932, english, LX_MAP_H2F | LX_OPT_CHARS, "AAA", 3, 2, "\x82\x60\x82\x60", 2},
      {"Georgian goes one way", 57352, english, LX_MAP_LOWER, "\xE1\x82\xA0", 3, 9, "\xE1\x83\x90"},
      {"... and not back", 57352, english, LX_MAP_UPPER, "\xE1\x83\x90", 3, 9, "\xE1\x83\x90"},
      {"no size", 819, english, LX_MAP_UPPER, "a", 1, 0, ""},
      {"negative size", 819, english, LX_MAP_UPPER, "a", 1, -5, ""},
      {"shorter other case", 57352, english, LX_MAP_UPPER, "\xC4\xB1\xC5\xBF", 4, 2, "IS"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    MapCall mapping = {&test_languages()[c.language],
                       {Form::plain, &PageSource::of(c.page)},
                       units_of(c.text),
                       c.length,
                       c.size,
                       c.flags};
    MapResult expected = {c.count >= 0 ? c.count : static_cast<int32_t>(c.out.size()), LX_OK, units_of(c.out)};
    EXPECT_EQ(map_model(mapping), expected);
    runner_.check(mapping, expected);
  }
}

// Shift bytes are written where the width of the text changes, not where they stood.
TEST_F(MapString, ShiftBytesFollowTheOutput) {
  struct {
    const char* name;
    uint32_t flags;
    std::string_view text;
    uint32_t state;
    int32_t size;
    std::string_view out;
  } cases[] = {
      {"widened", LX_MAP_H2F, "\xC1\xC2", 0, 9, "\x0E\x42\xC1\x42\xC2\x0F"},
      {"no room for the closing byte", LX_MAP_H2F, "\xC1\xC2", 0, 5, "\x0E\x42\xC1\x42\xC2"},
      {"no room for the character behind its shift byte", LX_MAP_H2F, "\xC1", 0, 2, ""},
      {"narrowed", LX_MAP_F2H, "\x0E\x42\xC1\x0F\xC1", 0, 9, "\xC1\xC1"},
      {"begins and ends inside", LX_MAP_LOWER, "\x42\xC1\x42\xC2", 1, 9, "\x42\x81\x42\x82"},
      {"narrowed inside: leaves and enters again", LX_MAP_F2H, "\x42\xC1", 1, 9, "\x0F\xC1\x0E"},
      {"cut inside a character", LX_MAP_LOWER, "\x0E\x42\xC1\x42", 0, 9, "\x0E\x42\x81"},
      {"empty runs vanish", LX_MAP_LOWER, "\x0E\x0F\xC1\x0E\x0F", 0, 9, "\x62"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    Form form = {Form::shifted, &PageSource::of(930), c.state};
    MapCall mapping = {&test_languages()[english],          form,   units_of(c.text),
                       static_cast<int32_t>(c.text.size()), c.size, c.flags};
    MapResult expected = {static_cast<int32_t>(c.out.size()), LX_OK, units_of(c.out)};
    EXPECT_EQ(map_model(mapping), expected) << map_model(mapping).describe();
    runner_.check(mapping, expected);
  }
}

TEST_F(MapString, CharactersAreMadeInALimitedArea) {
  struct {
    uint32_t flags;
    size_t length;
    int32_t size;
    int32_t count;
  } cases[] = {{LX_MAP_UPPER, 600, 1000, 512}, {LX_MAP_UPPER, 600, 511, 511},     {LX_MAP_H2F, 300, 300, 170},
               {LX_MAP_H2F, 300, 86, 86},      {LX_MAP_H2F, 300, INT32_MAX, 170}, {0, 600, 600, 600}};
  for (const auto& c : cases) {
    MapCall mapping = {&test_languages()[english],
                       {Form::plain, &PageSource::of(57352)},
                       Units(c.length, 'a'),
                       static_cast<int32_t>(c.length),
                       c.size,
                       c.flags | LX_OPT_CHARS};
    MapResult expected = map_model(mapping);
    EXPECT_EQ(expected.count, c.count);
    runner_.check(mapping, expected);
  }
}

TEST_F(MapString, UnknownFlags) {
  for (const Form& form : mapping_forms(PageSource::of(819))) {
    for (uint32_t flags : {1u, 8u, 17u, 0x2000u, 0x80000000u, 0x80000020u, 0x80000026u, 0x80002021u, 0x80002023u,
                           0x80000034u, 0x24u, 0x80008024u, 0xFFFFFFFFu}) {
      MapCall mapping = {&test_languages()[german], form, {'a'}, 1, 9, flags};
      runner_.check(mapping, {-1, LX_E_ARGUMENT});
    }
  }
}

TEST_F(MapString, AllShortTexts) {
  for (const Alphabet& alphabet : kMappingAlphabets) {
    for (const Form& form : mapping_forms(PageSource::of(alphabet.page))) {
      Units letters = mapping_letters(form, alphabet.units);
      for_all_strings(letters, 4, [&](const Units& text) {
        if (text.size() < 4 || choice_.below(16) == 0) check_sizes(form, text, text.size() < 3);
      });
    }
  }
}

TEST_F(MapString, RandomTexts) {
  for (const Alphabet& alphabet : kMappingAlphabets) {
    for (const Form& form : mapping_forms(PageSource::of(alphabet.page))) {
      Units letters = mapping_letters(form, alphabet.units);
      for (int i = 0; i < 150; ++i) check_sizes(form, mapping_text(choice_, form, letters, 40), i < 2);
    }
  }
}

// Where no character grows, and where the output is made elsewhere first.
TEST_F(MapString, InPlace) {
  for (uint16_t id : {uint16_t{819}, uint16_t{932}, uint16_t{954}, uint16_t{930}}) {
    for (const Form& form : mapping_forms(PageSource::of(id))) {
      Units letters = mapping_letters(form, "");
      letters.push_back(0x20);
      for (int i = 0; i < 200; ++i) {
        Units text = mapping_text(choice_, form, letters, 30);
        for (uint32_t flags : {0u, kUpperPlain, kLowerPlain, LX_MAP_DIGITS, LX_MAP_H2F | LX_OPT_CHARS}) {
          if (form.follows_shifts() && (flags & LX_OPT_CHARS) == 0) continue;
          size_t all = (flags & LX_OPT_CHARS) != 0 ? characters_of(form, text).list.size() : text.size();
          if ((flags & LX_OPT_CHARS) != 0 && !form.is_bytes()) continue;
          MapCall mapping = {&test_languages()[english],
                             form,
                             text,
                             static_cast<int32_t>(all),
                             static_cast<int32_t>((flags & LX_OPT_CHARS) != 0 ? all / 3 : all),
                             flags};
          MapResult expected = map_model(mapping);
          if (expected.written.size() > text.size()) continue;
          EXPECT_EQ(runner_.run(mapping, expected.written.size(), true), expected) << mapping.describe();
        }
      }
    }
  }
}

TEST(MapStringWithoutALocale, DefaultOrNothing) {
  char out[4] = "xyz";
  EXPECT_EQ(LXMapString(nullptr, out, 4, "a", 1, LX_MAP_UPPER), -1);
  EXPECT_STREQ(out, "xyz");
  Session session;
  ASSERT_EQ(LXSetLocale("English_UnitedStates.Latin1@BINARY", 0), LX_OK);
  EXPECT_EQ(LXMapString(nullptr, out, 4, "a", 1, LX_MAP_UPPER), 1);
  EXPECT_STREQ(out, "Ayz");
}

}  // namespace
}  // namespace lx::test
