// SPDX-License-Identifier: Apache-2.0
// The four families of text functions under one set of names, so that a test is written once for all kinds of text.
// Arguments that a kind does not have are left out on the way.
#pragma once

#include <lexaro/lexaro.h>

namespace lx::test {

using State = uint32_t;

struct PlainCalls {
  using Unit = char;
  static int32_t cpy(LXLocale* l, char* out, int32_t size, const char* s, State, int32_t n, uint32_t options) {
    return LXStrcpy(l, out, size, s, n, options);
  }
  static int32_t cat(LXLocale* l, char* out, const char* s, State, int32_t n, uint32_t options) {
    return LXStrcat(l, out, s, n, options);
  }
  static char* chr(LXLocale* l, const char* s, State, int32_t n, const char* c, State, State*, uint32_t options) {
    return LXStrchr(l, s, n, c, options);
  }
  static char* str(LXLocale* l, const char* s, State, int32_t n, const char* sub, State, int32_t m, State*,
                   uint32_t options) {
    return LXStrstr(l, s, n, sub, m, options);
  }
  static int32_t spn(LXLocale* l, const char* s, State, int32_t n, const char* set, State, int32_t m,
                     uint32_t options) {
    return LXStrspn(l, s, n, set, m, options);
  }
  static int32_t cspn(LXLocale* l, const char* s, State, int32_t n, const char* set, State, int32_t m,
                      uint32_t options) {
    return LXStrcspn(l, s, n, set, m, options);
  }
  static char* tok(LXLocale* l, char* s, State*, int32_t* n, const char* set, State, int32_t m, char** next,
                   uint32_t options) {
    return LXStrtok(l, s, n, set, m, next, options);
  }
  static char* eol(LXLocale* l, const char* s, State, int32_t n, uint32_t* type, int32_t* size, uint32_t flags) {
    return LXGetEol(l, s, n, type, size, flags);
  }
  static char* put_eol(LXLocale* l, char* out, State, uint32_t flags) { return LXPutEol(l, out, flags); }
  static int32_t cmp(LXLocale* l, const char* a, State, int32_t n, const char* b, State, int32_t m, uint32_t options) {
    return LXStrcmp(l, a, n, b, m, options);
  }
  static int32_t map(LXLocale* l, char* out, int32_t size, const char* s, State, int32_t n, uint32_t flags) {
    return LXMapString(l, out, size, s, n, flags);
  }
};

struct ShiftedCalls {
  using Unit = char;
  static constexpr auto cpy = &LXStrcpyEx;
  static constexpr auto cat = &LXStrcatEx;
  static constexpr auto chr = &LXStrchrEx;
  static constexpr auto str = &LXStrstrEx;
  static constexpr auto spn = &LXStrspnEx;
  static constexpr auto cspn = &LXStrcspnEx;
  static constexpr auto tok = &LXStrtokEx;
  static constexpr auto eol = &LXGetEolEx;
  static constexpr auto put_eol = &LXPutEolEx;
  static int32_t cmp(LXLocale* l, const char* a, State s, int32_t n, const char* b, State t, int32_t m,
                     uint32_t options) {
    return LXStrcmpEx(l, a, s, n, b, t, m, options);
  }
  static constexpr auto map = &LXMapStringEx;
};

// W and U: the same shapes with other names.
template <class U, auto Cpy, auto Cat, auto Chr, auto Str, auto Spn, auto Cspn, auto Tok, auto Eol, auto PutEol,
          auto Cmp, auto Map>
struct UnitCalls {
  using Unit = U;
  static int32_t cpy(LXLocale* l, U* out, int32_t size, const U* s, State, int32_t n, uint32_t options) {
    return Cpy(l, out, size, s, n, options);
  }
  static int32_t cat(LXLocale* l, U* out, const U* s, State, int32_t n, uint32_t options) {
    return Cat(l, out, s, n, options);
  }
  static U* chr(LXLocale* l, const U* s, State, int32_t n, const U* c, State, State*, uint32_t options) {
    return Chr(l, s, n, *c, options);
  }
  static U* str(LXLocale* l, const U* s, State, int32_t n, const U* sub, State, int32_t m, State*, uint32_t options) {
    return Str(l, s, n, sub, m, options);
  }
  static int32_t spn(LXLocale* l, const U* s, State, int32_t n, const U* set, State, int32_t m, uint32_t options) {
    return Spn(l, s, n, set, m, options);
  }
  static int32_t cspn(LXLocale* l, const U* s, State, int32_t n, const U* set, State, int32_t m, uint32_t options) {
    return Cspn(l, s, n, set, m, options);
  }
  static U* tok(LXLocale* l, U* s, State*, int32_t* n, const U* set, State, int32_t m, U** next, uint32_t options) {
    return Tok(l, s, n, set, m, next, options);
  }
  static U* eol(LXLocale* l, const U* s, State, int32_t n, uint32_t* type, int32_t* size, uint32_t flags) {
    return Eol(l, s, n, type, size, flags);
  }
  static U* put_eol(LXLocale* l, U* out, State, uint32_t flags) { return PutEol(l, out, flags); }
  static int32_t cmp(LXLocale* l, const U* a, State, int32_t n, const U* b, State, int32_t m, uint32_t options) {
    return Cmp(l, a, n, b, m, options);
  }
  static int32_t map(LXLocale* l, U* out, int32_t size, const U* s, State, int32_t n, uint32_t flags) {
    return Map(l, out, size, s, n, flags);
  }
};
using WideCalls = UnitCalls<LXWChar, LXWcscpy, LXWcscat, LXWcschr, LXWcsstr, LXWcsspn, LXWcscspn, LXWcstok, LXGetEolW,
                            LXPutEolW, LXWcscmp, LXMapStringW>;
using Ucs2Calls = UnitCalls<LXUChar, LXStrcpyU, LXStrcatU, LXStrchrU, LXStrstrU, LXStrspnU, LXStrcspnU, LXStrtokU,
                            LXGetEolU, LXPutEolU, LXStrcmpU, LXMapStringU>;

}  // namespace lx::test
