// SPDX-License-Identifier: Apache-2.0
// Spans of characters and tokens between delimiters.
#include <algorithm>

#include "collate/search.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "span", 0};

template <class Kind, class Unit = typename Kind::Unit>
int32_t span_call(const char* function, LXLocale* locale, bool wanted, const Unit* str, uint32_t state, int32_t len,
                  const Unit* set, uint32_t set_state, int32_t set_len, uint32_t options) {
  return locale_call(trace_unit, function, locale, options, LX_OPT_CHARS, int32_t{0}, [&](LocaleCall& call) {
    const CodePage& page = page_of(call.locale);
    Text<Unit> text = given_text<Kind>(page, str, state, len, options, Terminator::excluded);
    Text<Unit> members = given_text<Kind>(page, set, set_state, set_len, options, Terminator::excluded);
    text.length = with_walkers<Kind>(page, text, members, [&](auto walker, auto listed) {
      const CharacterSet characters(listed);
      auto begin = walker;
      skip_while(walker, [&](const Character& character) { return characters.has(character) == wanted; });
      if (walker.at != begin.at) walker.finish();
      return passed(begin, walker);
    });
    return counted<Kind>(page, text, options);
  });
}

// A token in its text, and what follows it. The delimiter that ends it begins at `token_end`.
struct Token {
  size_t begin = 0;
  size_t token_end = 0;
  size_t rest = 0;
  uint32_t rest_state = 0;
  bool found = false;
};

template <class Walker, class Set>
Token next_token(Walker text, const Set& delimiters) {
  const Walker start = text;
  Token token;
  skip_while(text, [&](const Character& character) { return delimiters.has(character); });
  if (text.at != start.at) text.finish();
  token.begin = passed(start, text);
  skip_while(text, [&](const Character& character) {
    bool member = delimiters.has(character);
    if (!member) token.found = true;
    return !member;
  });
  token.token_end = token.rest = static_cast<size_t>(text.end - start.at);
  Walker behind = text;
  Character delimiter;
  if (!behind.next(delimiter)) return token;
  // The token keeps the shift byte that ends its double-byte run; others go with the delimiter.
  if (shift_state(text) != 0 && shift_state(behind) == 0) {
    if constexpr (requires { text.skip_shift(); }) text.skip_shift();
  }
  behind.finish();
  token.token_end = passed(start, text);
  token.rest = passed(start, behind);
  token.rest_state = shift_state(behind);
  return token;
}

template <class Kind, class Unit = typename Kind::Unit>
Unit* token_call(const char* function, LXLocale* locale, Unit* str, uint32_t* state, int32_t* len, const Unit* delims,
                 uint32_t delims_state, int32_t delims_len, Unit** next, uint32_t options) {
  constexpr Unit* kNone = nullptr;
  return locale_call(trace_unit, function, locale, options, LX_OPT_CHARS, kNone, [&](LocaleCall& call) -> Unit* {
    if (next != nullptr) *next = nullptr;
    if (str == nullptr) return kNone;
    const CodePage& page = page_of(call.locale);
    Text<Unit> text = given_text<Kind>(page, str, state != nullptr ? *state : 0, len != nullptr ? *len : -1, options,
                                       Terminator::excluded);
    Text<Unit> set = given_text<Kind>(page, delims, delims_state, delims_len, options, Terminator::excluded);
    Token token = with_walkers<Kind>(page, text, set,
                                     [](auto walker, auto listed) { return next_token(walker, CharacterSet(listed)); });
    std::fill(str + token.token_end, str + token.rest, Unit{0});
    Text<Unit> rest = {str + token.rest, text.length - token.rest, token.rest_state};
    if (len != nullptr) *len = counted<Kind>(page, rest, options);
    if (next != nullptr && rest.length != 0) *next = str + token.rest;
    if (state != nullptr) *state = token.rest_state;
    return token.found ? str + token.begin : kNone;
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrspn(LXLocale* locale, const char* str, int32_t len, const char* set, int32_t set_len,
                 uint32_t options) noexcept {
  return span_call<PlainKind>(__func__, locale, true, str, 0, len, set, 0, set_len, options);
}

int32_t LXStrspnEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* set, uint32_t set_state,
                   int32_t set_len, uint32_t options) noexcept {
  return span_call<ShiftedKind>(__func__, locale, true, str, state, len, set, set_state, set_len, options);
}

int32_t LXWcsspn(LXLocale* locale, const LXWChar* wstr, int32_t len, const LXWChar* set, int32_t set_len,
                 uint32_t options) noexcept {
  return span_call<WideKind>(__func__, locale, true, wstr, 0, len, set, 0, set_len, options);
}

int32_t LXStrspnU(LXLocale* locale, const LXUChar* ustr, int32_t len, const LXUChar* set, int32_t set_len,
                  uint32_t options) noexcept {
  return span_call<Ucs2Kind>(__func__, locale, true, ustr, 0, len, set, 0, set_len, options);
}

int32_t LXStrcspn(LXLocale* locale, const char* str, int32_t len, const char* set, int32_t set_len,
                  uint32_t options) noexcept {
  return span_call<PlainKind>(__func__, locale, false, str, 0, len, set, 0, set_len, options);
}

int32_t LXStrcspnEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* set, uint32_t set_state,
                    int32_t set_len, uint32_t options) noexcept {
  return span_call<ShiftedKind>(__func__, locale, false, str, state, len, set, set_state, set_len, options);
}

int32_t LXWcscspn(LXLocale* locale, const LXWChar* wstr, int32_t len, const LXWChar* set, int32_t set_len,
                  uint32_t options) noexcept {
  return span_call<WideKind>(__func__, locale, false, wstr, 0, len, set, 0, set_len, options);
}

int32_t LXStrcspnU(LXLocale* locale, const LXUChar* ustr, int32_t len, const LXUChar* set, int32_t set_len,
                   uint32_t options) noexcept {
  return span_call<Ucs2Kind>(__func__, locale, false, ustr, 0, len, set, 0, set_len, options);
}

char* LXStrtok(LXLocale* locale, char* str, int32_t* len, const char* delims, int32_t delims_len, char** next,
               uint32_t options) noexcept {
  return token_call<PlainKind>(__func__, locale, str, nullptr, len, delims, 0, delims_len, next, options);
}

char* LXStrtokEx(LXLocale* locale, char* str, uint32_t* state, int32_t* len, const char* delims, uint32_t delims_state,
                 int32_t delims_len, char** next, uint32_t options) noexcept {
  return token_call<ShiftedKind>(__func__, locale, str, state, len, delims, delims_state, delims_len, next, options);
}

LXWChar* LXWcstok(LXLocale* locale, LXWChar* wstr, int32_t* len, const LXWChar* delims, int32_t delims_len,
                  LXWChar** next, uint32_t options) noexcept {
  return token_call<WideKind>(__func__, locale, wstr, nullptr, len, delims, 0, delims_len, next, options);
}

LXUChar* LXStrtokU(LXLocale* locale, LXUChar* ustr, int32_t* len, const LXUChar* delims, int32_t delims_len,
                   LXUChar** next, uint32_t options) noexcept {
  return token_call<Ucs2Kind>(__func__, locale, ustr, nullptr, len, delims, 0, delims_len, next, options);
}

}  // extern "C"
