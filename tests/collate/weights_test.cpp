// SPDX-License-Identifier: Apache-2.0
// What characters and pairs weigh, the readers that take a text apart into weights, and how weights are filed.
#include "collate/sort_model.hpp"

namespace lx::test {
namespace {

using Weights = CollationTest;

TEST_F(Weights, OfEveryCharacterAndPair) {
  for (const char* name : {"Plain", "Combining"}) {
    Collation form(Form::ucs2, 819, name);
    const LXObjEntry* sort = LXGetLocaleObject(form.locale(), LX_SORT);
    for (unsigned unit = 0; unit < 0x10000; ++unit) {
      auto character = static_cast<char16_t>(unit);
      uint16_t primary[2] = {}, special[2] = {};
      uint8_t secondary[2] = {}, tertiary[2] = {}, mask = 0xEE;
      int32_t count = LXSortGetWeights(sort, character, &primary[0], &secondary[0], &tertiary[0], &special[0],
                                       &primary[1], &secondary[1], &tertiary[1], &special[1], &mask);
      ModelWeights got = {{}, mask == 0xEE ? -1 : mask};
      for (int i = 0; i < count; ++i) got.sets.push_back({primary[i], secondary[i], tertiary[i], special[i]});
      ASSERT_EQ(got, model_weights(form.sort, character)) << name << ' ' << unit;
      for (char16_t second : {u'b', u'c', u'-', u'\u3041'}) {
        got = {{}, -1};
        mask = 0xEE;
        if (LXSortGetCombination(sort, character, second, primary, secondary, tertiary, special, &mask) == 1) {
          got = {{{primary[0], secondary[0], tertiary[0], special[0]}}, mask};
        }
        ModelWeights wanted;
        model_combination(form.sort, character, second, wanted);
        ASSERT_EQ(got, wanted) << name << ' ' << unit << ' ' << unsigned{second};
      }
    }
  }
}

// The state of the reader is compared after every call, also of texts that end inside a character.
TEST_F(Weights, AreReadOneCharacterAtATime) {
  for (const char* sort : {"Plain", "Combining"}) {
    std::vector<std::pair<Collation, std::vector<std::u16string>>> all;
    for (Collation& form : own_forms(sort)) all.emplace_back(std::move(form), all_texts(u"abcxz-\u3041", 4));
    // Characters of one to four bytes, and one that could not be told from none.
    for (Form::Kind kind : {Form::plain, Form::wide}) {
      all.emplace_back(Collation(kind, 964, sort), all_texts(u"ac\u3105\u4E00\u4E42", 3));
    }
    all.emplace_back(Collation(Form::ucs2, 819, sort), all_texts(u"bc\uFFFF", 4));
    for (const auto& [form, texts] : all) {
      for (const std::u16string& text : texts) {
        const Units stored = form.store(text);
        const auto list = characters_of(form.form, stored).list;
        for (size_t cut = 0; cut < (list.empty() ? 1 : list.back().size); ++cut) {
          const Units units = first_units(stored, stored.size() - cut);
          ModelReader model = form.reader(units);
          Reading reading = model.now;
          for (int call = 0; model.more(); ++call) {
            ModelWeights wanted = model.next();
            ASSERT_EQ(form.next_weight(units, reading), wanted) << form.name << hex_units(units) << call;
            ASSERT_EQ(reading, model.now) << form.name << hex_units(units) << call << ": offset " << reading.offset;
          }
          // At the end nothing comes, and nothing moves.
          Reading end = reading;
          ASSERT_EQ(form.next_weight(units, reading), ModelWeights());
          ASSERT_EQ(reading, end);
        }
      }
    }
  }
}

// Without a sort object there is nothing to read.
TEST_F(Weights, OfABinaryLocale) {
  Collation form(Form::plain, 819, "BINARY");
  Reading reading = {0, 2};
  EXPECT_EQ(form.next_weight({'a', 'b'}, reading), ModelWeights());
  EXPECT_EQ(reading.remaining, 0);
  uint16_t weight;
  uint8_t small;
  EXPECT_EQ(LXSortGetWeights(nullptr, 'a', &weight, &small, &small, &weight, &weight, &small, &small, &weight, &small),
            0);
  EXPECT_EQ(LXSortGetCombination(LXGetLocaleObject(form.locale(), LX_CODEPAGE), 'c', 'b', &weight, &small, &small,
                                 &weight, &small),
            0);
}

TEST_F(Weights, AreFiledInOrderOrBackwards) {
  uint32_t seed = 1;
  auto next = [&] { return (seed = seed * 1664525 + 1013904223) >> 16; };
  for (int round = 0; round < 200; ++round) {
    uint16_t primary[24], *p_ins = primary, *p_end = primary;
    uint8_t secondary[24], *s_ins = secondary, *s_end = secondary;
    uint8_t tertiary[24], *t_ins = tertiary, *t_end = tertiary;
    LXSpecialWeight special[24], *x_ins = special, *x_end = special;
    ModelLevels model;
    for (uint16_t position = 1; position <= 24; ++position) {
      const ModelSet set = {next() % 4 * 300, next() % 4, next() % 4, next() % 4 * 300};
      const auto mask = static_cast<uint8_t>(next());
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
