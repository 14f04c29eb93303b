// SPDX-License-Identifier: Apache-2.0
// The four families of text functions under one name each, so that a test is written once for all kinds of text.
#pragma once

#include <lexaro/lexaro.h>

#include <algorithm>
#include <tuple>
#include <type_traits>

#include "support/edge_buffer.hpp"
#include "support/text_model.hpp"

namespace lx::test {

// Arguments that only the Ex functions have.
struct State {
  uint32_t value;
};
struct StateAt {
  uint32_t* value;
};

template <auto kPlain, auto kEx, auto kWide, auto kUcs2>
struct Family {};

template <Form::Kind kKind>
struct Calls {
  using Unit = std::conditional_t<kKind == Form::wide, LXWChar, std::conditional_t<kKind == Form::ucs2, LXUChar, char>>;

  template <auto kPlain, auto kEx, auto kWide, auto kUcs2, class... Args>
  auto operator()(Family<kPlain, kEx, kWide, kUcs2>, Args... args) const {
    auto all = std::tuple_cat(given(args)...);
    if constexpr (kKind == Form::plain) return std::apply(kPlain, all);
    if constexpr (kKind == Form::shifted) return std::apply(kEx, all);
    if constexpr (kKind == Form::wide) return std::apply(kWide, all);
    if constexpr (kKind == Form::ucs2) return std::apply(kUcs2, all);
  }

 private:
  template <class Arg>
  static auto given(Arg arg) {
    constexpr bool kIsState = std::is_same_v<Arg, State> || std::is_same_v<Arg, StateAt>;
    if constexpr (!kIsState) {
      return std::tuple(arg);
    } else if constexpr (kKind == Form::shifted) {
      return std::tuple(arg.value);
    } else {
      return std::tuple();
    }
  }
};

template <class Use>
auto with_calls(const Form& form, Use use) {
  switch (form.kind) {
    case Form::plain:
      return use(Calls<Form::plain>());
    case Form::shifted:
      return use(Calls<Form::shifted>());
    case Form::wide:
      return use(Calls<Form::wide>());
    default:
      return use(Calls<Form::ucs2>());
  }
}

// A text at the edge of memory, followed by a zero when its length is negative.
template <class U>
U* place(EdgeBuffer& buffer, Units units, int32_t length) {
  if (length < 0) units.push_back(0);
  U* at = buffer.room<U>(units.size());
  std::transform(units.begin(), units.end(), at, [](uint32_t unit) { return static_cast<U>(unit); });
  return at;
}

inline constexpr Family<LXStrcpy, LXStrcpyEx, LXWcscpy, LXStrcpyU> kStrcpy;
inline constexpr Family<LXStrcat, LXStrcatEx, LXWcscat, LXStrcatU> kStrcat;
inline constexpr Family<LXStrchr, LXStrchrEx, LXWcschr, LXStrchrU> kStrchr;
inline constexpr Family<LXStrstr, LXStrstrEx, LXWcsstr, LXStrstrU> kStrstr;
inline constexpr Family<LXStrspn, LXStrspnEx, LXWcsspn, LXStrspnU> kStrspn;
inline constexpr Family<LXStrcspn, LXStrcspnEx, LXWcscspn, LXStrcspnU> kStrcspn;
inline constexpr Family<LXStrtok, LXStrtokEx, LXWcstok, LXStrtokU> kStrtok;
inline constexpr Family<LXGetEol, LXGetEolEx, LXGetEolW, LXGetEolU> kGetEol;
inline constexpr Family<LXPutEol, LXPutEolEx, LXPutEolW, LXPutEolU> kPutEol;
inline constexpr Family<LXMapString, LXMapStringEx, LXMapStringW, LXMapStringU> kMapString;
inline constexpr Family<LXStrcmp, LXStrcmpEx, LXWcscmp, LXStrcmpU> kStrcmp;
inline constexpr Family<LXStrcoll, LXStrcollEx, LXWcscoll, LXStrcollU> kStrcoll;
inline constexpr Family<LXStrxfrm, LXStrxfrmEx, LXWcsxfrm, LXStrxfrmU> kStrxfrm;
inline constexpr Family<LXStrGetNextWeight, LXStrGetNextWeightEx, LXStrGetNextWeightW, LXStrGetNextWeightU>
    kGetNextWeight;

}  // namespace lx::test
