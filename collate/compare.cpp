// SPDX-License-Identifier: Apache-2.0
#include "collate/compare.hpp"

#include <algorithm>
#include <cstring>

#include "collate/trim.hpp"
#include "frame/memory.hpp"
#include "objects/special_pairs.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "compare", 0};

// ---- Characters ----

int32_t sign(bool less) { return less ? -1 : 1; }

// Bytes as they stand in four that are zero where there is no character.
uint32_t aligned(const Character& character) { return character.code << 8 * (4 - character.units); }

template <class Unit>
int32_t difference(const Character& a, const Character& b) {
  if constexpr (sizeof(Unit) == 1) {
    uint32_t x = aligned(a);
    uint32_t y = aligned(b);
    if (x == y) return 0;
    int first = __builtin_clz(x ^ y) & ~7;
    return static_cast<int32_t>(x << first >> 24) - static_cast<int32_t>(y << first >> 24);
  } else if constexpr (sizeof(Unit) == 2) {
    return static_cast<int32_t>(a.code) - static_cast<int32_t>(b.code);
  } else {
    return a.code == b.code ? 0 : sign(a.code < b.code);
  }
}

template <class Walker>
size_t left(const Walker& text) {
  return static_cast<size_t>(text.end - text.at);
}

int32_t difference_of_lengths(size_t a, size_t b) {
  return static_cast<int32_t>(static_cast<int64_t>(a) - static_cast<int64_t>(b));
}

// Length of the character at which the walker stands, all there or not.
uint32_t wanted_units(const MultibyteWalker& text) { return text.page->char_length[*text.at]; }
uint32_t wanted_units(const ShiftedWalker& text) { return text.length_here(); }
template <class Unit>
uint32_t wanted_units(const UnitWalker<Unit>&) {
  return 1;
}

// ---- Texts ----

void dump_both(const void* a, size_t bytes_a, const void* b, size_t bytes_b) {
  if (!traces(trace_unit, TRC1_LEVEL_DETAIL)) return;
  TRC1_Dump(&trace_unit, __LINE__, "String1", a, bytes_a);
  TRC1_Dump(&trace_unit, __LINE__, "String2", b, bytes_b);
}

// Of mixed text: two characters that differ, or that are of different length once they are made alike.
void trace_mismatch(const ShiftedWalker& a, const ShiftedWalker& b, bool lengths) {
  LX_TRACE(TRC1_LEVEL_DETAIL, "Strings are unequal: len1 = %d, len2 = %d", static_cast<int>(left(a)),
           static_cast<int>(left(b)));
  if (lengths) dump_both(a.at, left(a), b.at, left(b));
}

template <class Unit, class Walker, class Characters>
int32_t compare_characters(Walker a, Walker b, Fold fold, const Characters& characters) {
  const Walker begin_a = a;
  const Walker begin_b = b;
  for (;;) {
    Character x;
    Character y;
    Walker before_a = a;
    Walker before_b = b;
    if (!a.next(x) || !b.next(y)) {
      a = before_a;
      b = before_b;
      break;
    }
    int32_t lengths = static_cast<int32_t>(x.units) - static_cast<int32_t>(y.units);
    if (fold == Fold::half_width) {
      x = characters.full_to_half(x);
      y = characters.full_to_half(y);
      lengths = static_cast<int32_t>(x.units) - static_cast<int32_t>(y.units);
    } else if (fold == Fold::upper) {
      x = characters.upper(x);
      y = characters.upper(y);
    }
    if (int32_t result = lengths != 0 ? lengths : difference<Unit>(x, y)) {
      if constexpr (std::same_as<Walker, ShiftedWalker>) trace_mismatch(begin_a, begin_b, lengths != 0);
      return result;
    }
  }
  a.finish();
  b.finish();
  // A text may end inside a character; that has the length that it should have.
  if (left(a) != 0 && left(b) != 0 && wanted_units(a) != wanted_units(b)) {
    return static_cast<int32_t>(wanted_units(a)) - static_cast<int32_t>(wanted_units(b));
  }
  return difference_of_lengths(left(a), left(b));
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t compare_folded(const CodePage& page, const Text<Unit>& a, const Text<Unit>& b, Fold fold) {
  if (std::same_as<Unit, char> && fold == Fold::none && !(Kind::kShifted && page.shift_sensitive)) {
    int result = std::memcmp(a.at, b.at, std::min(a.length, b.length));
    return result != 0 ? result : difference_of_lengths(a.length, b.length);
  }
  return with_walkers<Kind>(
      page, a, b, [&](auto x, auto y) { return compare_characters<Unit>(x, y, fold, CharactersOf<Kind>(page)); });
}

// ---- Through the special pairs of the language: whole texts in upper case ----

int32_t map_upper(LXLocale& locale, char* out, int32_t size, const Text<char>& text, bool shifted) {
  auto length = static_cast<int32_t>(text.length);
  if (shifted) return LXMapStringEx(&locale, out, size, text.at, text.state, length, LX_MAP_UPPER);
  return LXMapString(&locale, out, size, text.at, length, LX_MAP_UPPER);
}
int32_t map_upper(LXLocale& locale, LXWChar* out, int32_t size, const Text<LXWChar>& text, bool) {
  return LXMapStringW(&locale, out, size, text.at, static_cast<int32_t>(text.length), LX_MAP_UPPER);
}
int32_t map_upper(LXLocale& locale, LXUChar* out, int32_t size, const Text<LXUChar>& text, bool) {
  return LXMapStringU(&locale, out, size, text.at, static_cast<int32_t>(text.length), LX_MAP_UPPER);
}

template <class Kind, class Unit = typename Kind::Unit>
struct UpperText {
  Owned<Unit> block;
  Text<Unit> text;

  // False: no memory.
  bool make(LXLocale& locale, const Text<Unit>& from) {
    constexpr size_t kGrowth = std::same_as<Unit, char> ? 8 : 2;
    size_t room = std::min(from.length * kGrowth, size_t{INT32_MAX} / sizeof(Unit));
    block = Owned<Unit>::array(room + 1);
    if (!block) return false;
    int32_t length =
        from.length != 0 ? map_upper(locale, block.get(), static_cast<int32_t>(room), from, Kind::kShifted) : 0;
    text = {block.get(), static_cast<size_t>(std::max(length, 0)), from.state};
    return true;
  }
};

template <class Kind, class Unit = typename Kind::Unit>
int32_t compare_mapped(LocaleCall& call, const Text<Unit>& a, const Text<Unit>& b) {
  UpperText<Kind> x;
  UpperText<Kind> y;
  if (!x.make(call.locale, a) || !y.make(call.locale, b)) return call.fail(LX_E_MEMORY, int32_t{0});
  return compare_folded<Kind>(page_of(call.locale), x.text, y.text, Fold::none);
}

// ---- The calls ----

// A shift byte that a text begins with is its state.
void take_state(const CodePage& page, Text<char>& text) {
  ShiftedWalker walker(page, bytes_of(text.at), text.length, text.state);
  if (walker.skip_shift()) text = {text.at + 1, text.length - 1, shift_state(walker)};
}

template <class Kind, class Unit = typename Kind::Unit>
Text<Unit> text_to_compare(const CodePage& page, const Unit* at, uint32_t state, int32_t length, uint32_t options) {
  Text<Unit> text = given_text<Kind>(page, at, state, length, options, Terminator::excluded);
  if (length > 0) text.length = Kind::with_walker(page, text, [](auto walker) { return whole_length(walker); });
  if ((options & LX_CMP_TRIM) != 0) trim<Kind>(trace_unit, page, text, (options & LX_CMP_NOWIDTH) == LX_CMP_NOWIDTH);
  if constexpr (Kind::kShifted) {
    if (page.shift_sensitive) take_state(page, text);
  }
  return text;
}

// Before each character one shift byte is looked at.
size_t whole_mixed_length(const CodePage& page, const Text<char>& text) {
  ShiftedWalker walker(page, bytes_of(text.at), text.length, text.state);
  while (left(walker) != 0) {
    if (walker.skip_shift() && left(walker) == 0) break;
    if (walker.length_here() > left(walker)) break;
    walker.at += walker.length_here();
  }
  return text.length - left(walker);
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t compare_call(const char* function, LXLocale* locale, const Unit* str1, uint32_t state1, int32_t len1,
                     const Unit* str2, uint32_t state2, int32_t len2, uint32_t options) {
  constexpr uint32_t kAny = ~0u;  // bad ones are traced too
  return locale_call(trace_unit, function, locale, options, kAny, int32_t{0}, [&](LocaleCall& call) -> int32_t {
    const CodePage& page = page_of(call.locale);
    const bool shifted = Kind::kShifted && page.shift_sensitive;
    if (shifted) LX_TRACE(TRC1_LEVEL_DETAIL, "Options = %08x", options);
    if (std::same_as<Unit, LXUChar>) LX_TRACE(TRC1_LEVEL_DETAIL, "options = %08x", options);
    if ((options & ~kCompareOptions) != 0) return call.fail(LX_E_ARGUMENT, 0);
    auto a = text_to_compare<Kind>(page, str1, state1, len1, options);
    auto b = text_to_compare<Kind>(page, str2, state2, len2, options);
    if (shifted) {
      LX_TRACE(TRC1_LEVEL_DETAIL, "len1 = %d, str1state = %d, len2 = %d, str2state = %d", static_cast<int>(a.length),
               static_cast<int>(a.state), static_cast<int>(b.length), static_cast<int>(b.state));
    }
    dump_both(a.at, a.length * sizeof(Unit), b.at, b.length * sizeof(Unit));
    return compare_texts<Kind>(call, a, b, options);
  });
}

}  // namespace

template <class Kind>
int32_t compare_texts(LocaleCall& call, Text<typename Kind::Unit> a, Text<typename Kind::Unit> b, uint32_t options) {
  Fold fold = fold_of(options);
  bool shifted = Kind::kShifted && page_of(call.locale).shift_sensitive;  // shift bytes alone are no text
  if (!shifted && (a.length == 0 || b.length == 0)) return difference_of_lengths(a.length, b.length);
  if (fold == Fold::upper && !SpecialPairs(call.locale.language, kUpperSpecialSlot).empty()) {
    return compare_mapped<Kind>(call, a, b);
  }
  return compare_folded<Kind>(page_of(call.locale), a, b, fold);
}

template int32_t compare_texts<PlainKind>(LocaleCall&, Text<char>, Text<char>, uint32_t);
template int32_t compare_texts<ShiftedKind>(LocaleCall&, Text<char>, Text<char>, uint32_t);
template int32_t compare_texts<WideKind>(LocaleCall&, Text<LXWChar>, Text<LXWChar>, uint32_t);
template int32_t compare_texts<Ucs2Kind>(LocaleCall&, Text<LXUChar>, Text<LXUChar>, uint32_t);

}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrcmp(LXLocale* locale, const char* str1, int32_t len1, const char* str2, int32_t len2,
                 uint32_t options) noexcept {
  return compare_call<PlainKind>(__func__, locale, str1, 0, len1, str2, 0, len2, options);
}

int32_t LXStrcmpEx(LXLocale* locale, const char* str1, uint32_t state1, int32_t len1, const char* str2, uint32_t state2,
                   int32_t len2, uint32_t options) noexcept {
  return compare_call<ShiftedKind>(__func__, locale, str1, state1, len1, str2, state2, len2, options);
}

int32_t LXWcscmp(LXLocale* locale, const LXWChar* wstr1, int32_t len1, const LXWChar* wstr2, int32_t len2,
                 uint32_t options) noexcept {
  return compare_call<WideKind>(__func__, locale, wstr1, 0, len1, wstr2, 0, len2, options);
}

int32_t LXStrcmpU(LXLocale* locale, const LXUChar* ustr1, int32_t len1, const LXUChar* ustr2, int32_t len2,
                  uint32_t options) noexcept {
  return compare_call<Ucs2Kind>(__func__, locale, ustr1, 0, len1, ustr2, 0, len2, options);
}

int32_t AdjustLength(LXLocale* locale, const char* str, uint32_t state, int32_t len) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, int32_t{0}, [&](LocaleCall& call) {
    const CodePage& page = page_of(call.locale);
    const Text<char> text = {str, len > 0 ? static_cast<size_t>(len) : 0, state};
    if (page.shift_sensitive) return static_cast<int32_t>(whole_mixed_length(page, text));
    return static_cast<int32_t>(PlainKind::with_walker(page, text, [](auto walker) { return whole_length(walker); }));
  });
}

}  // extern "C"
