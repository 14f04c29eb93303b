// SPDX-License-Identifier: Apache-2.0
// Makes the calls that the model describes, on memory that ends where texts and rooms end.
#pragma once

#include <algorithm>
#include <map>

#include "support/edge_buffer.hpp"
#include "text/text_calls.hpp"
#include "text_mapping/mapping_model.hpp"

namespace lx::test {

class MappingRunner {
 private:
  static int32_t sign(int32_t value) { return value < 0 ? -1 : value > 0; }

  template <class Use>
  static auto with_calls(const Form& form, Use use) {
    switch (form.kind) {
      case Form::plain:
        return use(PlainCalls());
      case Form::shifted:
        return use(ShiftedCalls());
      case Form::wide:
        return use(WideCalls());
      default:
        return use(Ucs2Calls());
    }
  }

 public:
  LXLocale* locale(const TestLanguage& language, const PageSource& page) {
    auto& locale = locales_[{&language, page.id}];
    if (!locale) locale.reset(LXGetLocale((language.name + page.name + "@BINARY").c_str(), 0, nullptr));
    EXPECT_NE(locale, nullptr) << language.name << page.name;
    return locale.get();
  }

  void check(const MapCall& call) { check(call, map_model(call)); }
  void check(const MapCall& call, const MapResult& expected) {
    if (differences_ > 10) return;
    MapResult got = run(call, expected.written.size());
    if (got == expected) return;
    ++differences_;
    ADD_FAILURE() << call.describe() << "\n     got " << got.describe() << "\nexpected " << expected.describe();
  }
  // Also that the other way round the sign is the other one.
  void check(const CompareCall& call) { check(call, compare_model(call)); }
  void check(const CompareCall& call, const CompareResult& expected) {
    if (differences_ > 10) return;
    int32_t got = run(call);
    int32_t back = run(call.swapped());
    if ((expected.exact ? got == expected.value : sign(got) == sign(expected.value)) && sign(back) == -sign(got))
      return;
    ++differences_;
    ADD_FAILURE() << call.describe() << "\n     got " << got << " and back " << back << ", expected " << expected.value;
  }

  int32_t run(const CompareCall& call) {
    return with_calls(call.form, [&](auto calls) {
      using U = typename decltype(calls)::Unit;
      LXLocale* l = locale(*call.language, *call.form.page);
      LXStrcpy(l, nullptr, 0, nullptr, 0, 1);  // an error for the call to clear
      const U* text1 = place<U>(in_, call.text1, call.length1);
      const U* text2 = place<U>(other_, call.text2, call.length2);
      int32_t result =
          calls.cmp(l, text1, call.form.state, call.length1, text2, call.state2, call.length2, call.options);
      EXPECT_EQ(LXGetError(l), LX_OK) << call.describe();
      return result;
    });
  }
  // Texts are mapped in place when `in_place`.
  MapResult run(const MapCall& call, size_t room, bool in_place = false) {
    return with_calls(call.form, [&](auto calls) {
      using U = typename decltype(calls)::Unit;
      LXLocale* l = locale(*call.language, *call.form.page);
      LXStrcpy(l, nullptr, 0, nullptr, 0, 1);
      MapResult result;
      // The room that lengths in characters need is known only to the model.
      bool by_characters = call.form.is_bytes() && (call.flags & LX_OPT_CHARS) != 0;
      size_t size = by_characters ? room : static_cast<size_t>(std::max(call.size, 0));
      U* text = place<U>(in_, call.text, call.length);
      U* out = in_place ? text : out_.room<U>(size);
      result.count = calls.map(l, out, call.size, text, call.form.state, call.length, call.flags);
      result.status = LXGetError(l);
      size_t written = by_characters ? room : static_cast<size_t>(std::max(result.count, 0));
      for (size_t i = 0; i < written; ++i) result.written.push_back(static_cast<std::make_unsigned_t<U>>(out[i]));
      return result;
    });
  }

  template <class U>
  static U* place(EdgeBuffer& buffer, Units units, int32_t length) {
    if (length < 0) units.push_back(0);
    U* at = buffer.room<U>(units.size());
    std::transform(units.begin(), units.end(), at, [](uint32_t unit) { return static_cast<U>(unit); });
    return at;
  }

 private:
  Session session_;
  std::map<std::pair<const TestLanguage*, uint16_t>, Locale> locales_;
  EdgeBuffer in_{8192};
  EdgeBuffer other_{8192};
  EdgeBuffer out_{16384};
  int differences_ = 0;
};

}  // namespace lx::test
