// SPDX-License-Identifier: Apache-2.0
// What comparisons of mixed text say about themselves.
#include "support/trace_capture.hpp"

#include "collate/sort_model.hpp"

namespace lx::test {
namespace {

using CollationTrace = CollationTest;

TEST_F(CollationTrace, OfComparisons) {
  const struct {
    std::string_view a, b;
    uint32_t options;
    std::vector<std::string> messages;  // between entry and exit
  } cases[] = {
      {"\x81", "\x81", 2, {"Options = 00000002"}},
      {"\x81",
       "\x82",
       0,
       {"Options = 00000000", "len1 = 1, str1state = 0, len2 = 1, str2state = 0", "String1: 1 bytes",
        "String2: 1 bytes", "Strings are unequal: len1 = 1, len2 = 1"}},
      {"\x81",
       "\x0E\x44\x81\x0F",
       LX_CMP_NOCASE,
       {"Options = 80000040", "len1 = 1, str1state = 0, len2 = 4, str2state = 0", "String1: 1 bytes",
        "String2: 4 bytes", "Strings are unequal: len1 = 1, len2 = 4", "String1: 1 bytes", "String2: 4 bytes"}},
  };
  const Collation form(Form::shifted, 930, "BINARY");
  for (const auto& one : cases) {
    TraceCapture trace;
    LXStrcmpEx(form.locale(), one.a.data(), 0, static_cast<int32_t>(one.a.size()), one.b.data(), 0,
               static_cast<int32_t>(one.b.size()), one.options);
    const auto& all = trace.messages();
    ASSERT_GE(all.size(), 2u);
    EXPECT_EQ(std::vector<std::string>(all.begin() + 1, all.end() - 1), one.messages) << trace.all();
  }
}

TEST_F(CollationTrace, OfWeightsFiled) {
  uint16_t primary = 0, *p_ins = &primary, *p_end = &primary;
  uint8_t none = 0, *at = &none, *end = &none;
  LXSpecialWeight special, *x_ins = &special, *x_end = &special;
  TraceCapture trace;
  LXStrInsertWeights(1, &p_ins, &p_end, 0, &at, &end, 0, &at, &end, 0, &x_ins, &x_end, 1, 15);
  EXPECT_EQ(trace.messages(), (std::vector<std::string>{"LXStrInsertWeights entry", "LXStrInsertWeights exit"}));
}

}  // namespace
}  // namespace lx::test
