// SPDX-License-Identifier: Apache-2.0
// What characters and pairs weigh, and the readers that take a text apart into weights.
#include "collate/collation.hpp"

namespace lx::test {
namespace {

using Weights = CollationTest;

TEST_F(Weights, OfEveryCharacterAndPair) {
  for (const char* name : {"Plain", "Combining"}) {
    TextForm form(Kind::ucs2, "Single", name);
    const LXObjEntry* sort = LXGetLocaleObject(form.locale(), LX_SORT);
    for (unsigned unit = 0; unit < 0x10000; ++unit) {
      auto character = static_cast<char16_t>(unit);
      uint16_t primary[2] = {}, special[2] = {};
      uint8_t secondary[2] = {}, tertiary[2] = {}, mask = 0xEE;
      int32_t count = LXSortGetWeights(sort, character, &primary[0], &secondary[0], &tertiary[0], &special[0],
                                       &primary[1], &secondary[1], &tertiary[1], &special[1], &mask);
      ModelWeights got = {{}, mask == 0xEE ? -1 : mask};
      for (int i = 0; i < count; ++i) got.sets.push_back({primary[i], secondary[i], tertiary[i], special[i]});
      ASSERT_EQ(got, model_weights(form.sort(), character)) << name << ' ' << unit;
      for (char16_t second : {u'b', u'c', u'-', u'\u3041'}) {
        got = {{}, -1};
        mask = 0xEE;
        if (LXSortGetCombination(sort, character, second, &primary[0], &secondary[0], &tertiary[0], &special[0],
                                 &mask) == 1) {
          got = {{{primary[0], secondary[0], tertiary[0], special[0]}}, mask};
        }
        ModelWeights wanted;
        model_combination(form.sort(), character, second, wanted);
        ASSERT_EQ(got, wanted) << name << ' ' << unit << ' ' << unsigned{second};
      }
    }
  }
}

// The state of the reader is compared after every call, also of texts that end inside a character.
void expect_readings(const TextForm& form, std::u16string_view text) {
  static EdgeBuffer edge(4096);
  Stored stored = form.store(text);
  int last = stored.pieces.empty() ? 0 : stored.pieces.back().units;
  for (int32_t units = stored.units; units >= stored.units - (last > 1 ? last - 1 : 0); --units) {
    const char* at = edge.text(std::string_view(stored.raw).substr(0, static_cast<size_t>(units * form.unit_size())));
    ModelReader model = form.reader(stored);
    model.remaining = units;
    Reading reading = {0, units, 0, 0, 0xFFFF};
    for (int call = 0; model.more(); ++call) {
      ModelWeights wanted = model.next();
      ModelWeights got = form.next_weight(at, reading);
      Reading after = {model.offset, model.remaining, model.state, model.position, model.pending};
      auto where = [&] { return form.name() + ' ' + shown(text) + " call " + std::to_string(call); };
      ASSERT_EQ(got, wanted) << where();
      ASSERT_EQ(reading, after) << where() << ": offset " << reading.offset << '/' << after.offset << ", remaining "
                                << reading.remaining << '/' << after.remaining << ", state " << reading.state << '/'
                                << after.state << ", position " << reading.position << '/' << after.position
                                << ", pending " << reading.pending << '/' << after.pending;
    }
    // At the end nothing comes, and nothing moves.
    Reading end = reading;
    EXPECT_EQ(form.next_weight(at, reading), ModelWeights());
    EXPECT_EQ(reading, end);
  }
}

TEST_F(Weights, AreReadOneCharacterAtATime) {
  for (const char* sort : {"Plain", "Combining"}) {
    for (const TextForm& form : own_forms(sort)) {
      for (const std::u16string& text : all_texts(u"abcxz-\u3041", 4)) {
        expect_readings(form, text);
        if (HasFatalFailure()) break;
      }
    }
  }
}

TEST_F(Weights, OfCharactersOfEveryLength) {
  for (const char* sort : {"Plain", "Combining"}) {
    for (Kind kind : {Kind::plain, Kind::wide, Kind::ucs2}) {
      TextForm form(kind, "Small", sort);
      for (const std::u16string& text : all_texts(u"ac\u3041\u4E03\u5001", 3)) {
        expect_readings(form, text);
        if (HasFatalFailure()) break;
      }
    }
  }
}

// A character that could not be told from none stays in the text until it is its turn.
TEST_F(Weights, OfTheLastUnit) {
  TextForm form(Kind::ucs2, "Single", "Combining");
  const LXUChar text[] = {'b', 0xFFFF, 'c', 0xFFFF};
  Reading reading = {0, 4, 0, 0, 0xFFFF};
  EXPECT_EQ(form.next_weight(text, reading), model_weights(form.sort(), u'b'));
  EXPECT_EQ(reading, (Reading{1, 3, 0, 1, 0xFFFF}));
  EXPECT_EQ(form.next_weight(text, reading), ModelWeights());
  EXPECT_EQ(reading, (Reading{3, 2, 0, 2, 'c'}));
  EXPECT_EQ(form.next_weight(text, reading).sets.at(0).primary, 0x111u);
  EXPECT_EQ(reading, (Reading{4, 0, 0, 3, 0xFFFF}));
}

// Without a sort object there is nothing to read.
TEST_F(Weights, OfABinaryLocale) {
  uint32_t rc = 99;
  Locale locale(LXGetLocale("English_UnitedStates.Single@BINARY", 0, &rc));
  ASSERT_NE(locale, nullptr);
  const char* text = "ab";
  int32_t remaining = 2;
  uint16_t position = 0, pending = 0xFFFF, primary[2], special[2];
  uint8_t secondary[2], tertiary[2], mask;
  EXPECT_EQ(LXStrGetNextWeight(locale.get(), &text, &remaining, &position, primary, secondary, tertiary, special,
                               primary + 1, secondary + 1, tertiary + 1, special + 1, &mask, &pending),
            0);
  EXPECT_EQ(remaining, 0);
  EXPECT_EQ(LXSortGetWeights(nullptr, 'a', primary, secondary, tertiary, special, primary, secondary, tertiary, special,
                             &mask),
            0);
  EXPECT_EQ(LXSortGetCombination(LXGetLocaleObject(locale.get(), LX_CODEPAGE), 'c', 'b', primary, secondary, tertiary,
                                 special, &mask),
            0);
}

TEST_F(Weights, AreFiledInOrderOrBackwards) {
  uint32_t seed = 1;
  for (int round = 0; round < 200; ++round) {
    uint16_t primary[24], *p_ins = primary, *p_end = primary;
    uint8_t secondary[24], *s_ins = secondary, *s_end = secondary;
    uint8_t tertiary[24], *t_ins = tertiary, *t_end = tertiary;
    LXSpecialWeight special[24], *x_ins = special, *x_end = special;
    ModelLevels model;
    for (uint16_t position = 1; position <= 24; ++position) {
      auto next = [&] { return (seed = seed * 1664525 + 1013904223) >> 16; };
      ModelSet set = {next() % 4 * 300, next() % 4, next() % 4, next() % 4 * 300};
      auto mask = static_cast<uint8_t>(next());
      LXStrInsertWeights(static_cast<uint16_t>(set.primary), &p_ins, &p_end, static_cast<uint8_t>(set.secondary),
                         &s_ins, &s_end, static_cast<uint8_t>(set.tertiary), &t_ins, &t_end,
                         static_cast<uint16_t>(set.special), &x_ins, &x_end, position, mask);
      model.file(set, position, mask);
    }
    ASSERT_EQ(std::vector<unsigned>(primary, p_end), model.primary.list);
    ASSERT_EQ(std::vector<unsigned>(secondary, s_end), model.secondary.list);
    ASSERT_EQ(std::vector<unsigned>(tertiary, t_end), model.tertiary.list);
    std::vector<std::pair<unsigned, unsigned>> specials;
    for (const LXSpecialWeight* at = special; at != x_end; ++at) specials.emplace_back(at->position, at->weight);
    ASSERT_EQ(specials, model.special.list);
    ASSERT_EQ(p_ins - primary, static_cast<ptrdiff_t>(model.primary.insertion));
    ASSERT_EQ(x_ins - special, static_cast<ptrdiff_t>(model.special.insertion));
  }
}

}  // namespace
}  // namespace lx::test
