// SPDX-License-Identifier: Apache-2.0
// Texts compared by the locale's sort object.
#include <algorithm>
#include <bit>

#include "collate/transform.hpp"
#include "collate/trim.hpp"
#include "objects/special_pairs.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "collate", 0};

int32_t sign_of(int32_t less) { return less < 0 ? -1 : less > 0 ? 1 : 0; }

// ---- Quick comparison ----

bool special_less(const LXSpecialWeight& a, const LXSpecialWeight& b) {
  return a.position != b.position ? a.position < b.position : a.weight < b.weight;
}

enum class Verdict : uint8_t { decided, undecided };

// The next character; most are ASCII.
template <class Reader>
Got next_character(Reader& in, uint16_t& character) {
  if constexpr (std::same_as<Reader, Utf8Reader>) {
    if (!in.done() && *in.at < 0x80 && in.page->standard_utf8) [[likely]] {
      character = *in.at++;
      return Got::character;
    }
  }
  return in.next(character);
}

// A text read as long as its characters are quick.
template <class Reader>
class QuickSide {
 public:
  enum class Step : uint8_t { weights, end, other };

  QuickSide(const SortTables& sort, const Reader& in, uint16_t position) : sort_(sort), in_(in), position_(position) {}

  // On to the next character with a primary weight; special weights on the way are kept.
  Step next(uint32_t& weights) {
    for (;;) {
      uint16_t character = 0;
      if (next_character(in_, character) != Got::character) return Step::end;
      ++position_;
      weights = character < SortTables::kQuickCharacters ? sort_.quick[character] : 0;
      if (!SortTables::is_special(weights)) return weights != 0 ? Step::weights : Step::other;
      if (count_ == kMostSpecials) return Step::other;
      specials_[count_++] = {position_, static_cast<uint16_t>(weights >> 16)};
    }
  }
  int32_t compare_specials(const QuickSide& other) const {
    for (unsigned i = 0; i < count_ && i < other.count_; ++i) {
      if (special_less(specials_[i], other.specials_[i])) return -1;
      if (special_less(other.specials_[i], specials_[i])) return 1;
    }
    return sign_of(static_cast<int32_t>(count_) - static_cast<int32_t>(other.count_));
  }

 private:
  static constexpr unsigned kMostSpecials = 16;

  const SortTables& sort_;
  Reader in_;
  uint16_t position_;
  unsigned count_ = 0;
  LXSpecialWeight specials_[kMostSpecials];
};

// The first difference below the primary level of texts whose primary weights are the same: secondary weights go before
// tertiary ones.
class LowerLevels {
 public:
  void note(uint32_t weights_x, uint32_t weights_y) {
    bool secondary = weights_x >> 8 != weights_y >> 8;
    if (secondary_ || (result_ != 0 && !secondary)) return;
    secondary_ = secondary;
    result_ = weights_x < weights_y ? -1 : 1;
  }
  int32_t result() const { return result_; }

 private:
  int32_t result_ = 0;
  bool secondary_ = false;
};

int32_t primary_difference(uint32_t weights_x, uint32_t weights_y) {
  return static_cast<int32_t>(weights_x >> 16) - static_cast<int32_t>(weights_y >> 16);
}

// What two texts begin with, as far as both have one quick character a unit there.
struct Beginning {
  size_t units = 0;
  bool decided = false;  // by `result`; otherwise `lower` is what the units passed have told
  int32_t result = 0;
  LowerLevels lower;

  void decide(int32_t difference) {
    decided = true;
    result = difference;
  }
};

// Units below this stand for the Unicode character of the same number.
template <class Kind>
uint32_t quick_units(const CodePage& page) {
  if constexpr (std::same_as<Kind, Ucs2Kind>) {
    return SortTables::kQuickCharacters;
  } else {
    return page.ascii_bytes && !(Kind::kShifted && page.shift_sensitive) ? 0x80 : 0;
  }
}

// How many units two texts share before the first that differs or is not ASCII: looked at in words of eight bytes, so
// that a part of the last word may be left.
template <class Unit>
size_t same_ascii(const Unit* a, const Unit* b, size_t count) {
  constexpr unsigned kBits = 8 * sizeof(Unit);
  constexpr size_t kStep = sizeof(uint64_t) / sizeof(Unit);
  constexpr uint64_t kUnit = (uint64_t{1} << kBits) - 1;
  constexpr uint64_t kNotAscii = ~uint64_t{0} / kUnit * (kUnit - 0x7F);
  size_t i = 0;
  for (; i + kStep <= count; i += kStep) {
    uint64_t x = 0;
    uint64_t y = 0;
    std::memcpy(&x, a + i, sizeof x);
    std::memcpy(&y, b + i, sizeof y);
    const uint64_t stop = (x ^ y) | (x & kNotAscii);
    if (stop == 0) continue;
    const int bits = std::endian::native == std::endian::little ? std::countr_zero(stop) : std::countl_zero(stop);
    return i + static_cast<unsigned>(bits) / kBits;
  }
  return i;
}

// Most comparisons end here, without a reader. Characters that are the same on both sides do not differ at any level.
template <class Kind>
[[gnu::always_inline]] inline Beginning compare_beginnings(const SortTables& sort, const CodePage& page,
                                                           const Text<typename Kind::Unit>& a,
                                                           const Text<typename Kind::Unit>& b) {
  using Value = std::make_unsigned_t<typename Kind::Unit>;
  Beginning begin;
  const uint32_t quick = quick_units<Kind>(page);
  const size_t both = std::min(a.length, b.length);
  size_t i = 0;
  if (quick != 0 && sort.ascii_in_order) {
    i = same_ascii(a.at, b.at, both);
    if (i != 0 && sort.quick[static_cast<Value>(a.at[i - 1])] == 0) i = 0;  // it may begin a pair
  }
  for (; i < both; ++i) {
    const uint32_t x = static_cast<Value>(a.at[i]);
    const uint32_t y = static_cast<Value>(b.at[i]);
    if (x >= quick || y >= quick) break;
    const uint32_t weights_x = sort.quick[x];
    const uint32_t weights_y = sort.quick[y];
    if (x == y && weights_x != 0) continue;
    if ((weights_x & 0xFFFF) == 0 || (weights_y & 0xFFFF) == 0) break;
    if ((weights_x ^ weights_y) >> 16 != 0) {
      begin.decide(primary_difference(weights_x, weights_y));
      return begin;
    }
    if (weights_x != weights_y) begin.lower.note(weights_x, weights_y);
  }
  begin.units = i;
  if (i != both) return begin;
  if (a.length == b.length) {
    begin.decide(begin.lower.result());
  } else {
    const bool longer = a.length > b.length;
    const uint32_t next = static_cast<Value>((longer ? a : b).at[i]);
    if (next < quick && (sort.quick[next] & 0xFFFF) != 0) begin.decide(longer ? 1 : -1);
  }
  return begin;
}

// Compares texts of quick characters, whose weights at each level stand side by side. Others leave it undecided.
template <class Reader>
Verdict compare_quickly(const SortTables& sort, const Beginning& begin, Reader a, Reader b, int32_t& result) {
  using Step = typename QuickSide<Reader>::Step;
  LowerLevels lower = begin.lower;
  a.at += begin.units;
  b.at += begin.units;
  QuickSide<Reader> x(sort, a, static_cast<uint16_t>(begin.units));
  QuickSide<Reader> y(sort, b, static_cast<uint16_t>(begin.units));
  for (;;) {
    uint32_t weights_x = 0;
    uint32_t weights_y = 0;
    Step step_x = x.next(weights_x);
    Step step_y = y.next(weights_y);
    if (step_x == Step::other || step_y == Step::other) return Verdict::undecided;
    if (step_x != step_y) {
      result = step_x == Step::end ? -1 : 1;
      return Verdict::decided;
    }
    if (step_x == Step::end) break;
    if (weights_x == weights_y) continue;
    result = primary_difference(weights_x, weights_y);
    if (result != 0) return Verdict::decided;
    lower.note(weights_x, weights_y);
  }
  result = lower.result() != 0 ? lower.result() : x.compare_specials(y);
  return Verdict::decided;
}

// ---- Comparison by levels ----

// One text, read set by set, each of which is filed at once.
template <class Reader>
class Side {
 public:
  Side(const SortTables& sort, Reader in, uint8_t* area, size_t characters)
      : reader_(sort, in), levels_(area, characters) {}

  const Levels& levels() const { return levels_; }
  uint16_t primary() const { return primary_; }
  bool waits() const { return primary_ != 0; }
  bool in_order() const { return in_order_; }

  // Reads on until a set has a primary weight. False: the text has ended.
  bool advance() {
    primary_ = 0;
    while (primary_ == 0) {
      if (next_set_ >= weights_.count) {
        if (reader_.done()) {
          levels_.finish();
          return false;
        }
        weights_ = reader_.next();
        next_set_ = 0;
        continue;
      }
      const WeightSet& set = weights_.sets[next_set_++];
      levels_.file(set, reader_.position(), weights_.mask);
      primary_ = set.primary;
      in_order_ = (weights_.mask & kPrimaryInOrder) != 0;
    }
    return true;
  }

 private:
  WeightReader<Reader> reader_;
  Levels levels_;
  Weights weights_;
  unsigned next_set_ = 0;
  uint16_t primary_ = 0;
  bool in_order_ = true;
};

template <class Element, class Less>
int32_t compare_level(const Level<Element>& a, const Level<Element>& b, Less less) {
  size_t count = std::min(a.size(), b.size());
  for (size_t i = 0; i < count; ++i) {
    if (less(a.begin[i], b.begin[i])) return -1;
    if (less(b.begin[i], a.begin[i])) return 1;
  }
  return 0;
}

template <class Element>
int32_t compare_sizes(const Level<Element>& a, const Level<Element>& b) {
  return a.size() == b.size() ? 0 : a.size() < b.size() ? -1 : 1;
}

// Where the primary weights do not decide. Those of different length are not compared by their length: what they have
// in common is the same, and the levels below go on.
int32_t compare_levels(const Levels& a, const Levels& b, bool primaries) {
  auto less = [](auto x, auto y) { return x < y; };
  int32_t result = primaries ? compare_level(a.primary, b.primary, less) : 0;
  if (result == 0) result = compare_level(a.secondary, b.secondary, less);
  if (result == 0) result = compare_sizes(a.secondary, b.secondary);
  if (result == 0) result = compare_level(a.tertiary, b.tertiary, less);
  if (result == 0) result = compare_sizes(a.tertiary, b.tertiary);
  if (result == 0) result = compare_level(a.special, b.special, special_less);
  if (result == 0) result = compare_sizes(a.special, b.special);
  return result;
}

// In step, as long as all primary weights stand in text order: then the first difference decides.
template <class Reader>
int32_t compare_sides(Side<Reader>& a, Side<Reader>& b) {
  bool fast = true;
  for (;;) {
    bool more_a = a.advance();
    bool more_b = b.advance();
    if ((more_a && !a.in_order()) || (more_b && !b.in_order())) fast = false;
    if (!more_a && !more_b) break;
    if (!fast) continue;
    if (!more_a || !more_b) return more_a ? 1 : -1;
    if (a.primary() != b.primary()) return static_cast<int32_t>(a.primary()) - static_cast<int32_t>(b.primary());
  }
  return compare_levels(a.levels(), b.levels(), !fast);
}

template <class Reader>
int32_t compare_weights(LocaleCall& call, const SortTables& sort, const Beginning& begin, Reader a, Reader b) {
  int32_t result = 0;
  if (compare_quickly(sort, begin, a, b, result) == Verdict::decided) return result;
  auto length = [](const Reader& text) { return static_cast<size_t>(text.end - text.at); };
  size_t half = Levels::area_size(length(a));
  WorkArea area;
  if (!area.reserve(half + Levels::area_size(length(b)))) return call.fail(LX_E_MEMORY, int32_t{0});
  Side<Reader> side_a(sort, a, area.get(), length(a));
  Side<Reader> side_b(sort, b, area.get() + half, length(b));
  return compare_sides(side_a, side_b);
}

template <class Kind>
[[gnu::noinline]] int32_t compare_rest(LocaleCall& call, const SortTables& sort, const Beginning& begin,
                                       const Text<typename Kind::Unit>& a, const Text<typename Kind::Unit>& b) {
  const CodePage& page = page_of(call.locale);
  if constexpr (std::same_as<Kind, WideKind>) {
    return compare_weights(call, sort, begin, WideReader(page, a.at, a.length), WideReader(page, b.at, b.length));
  } else if constexpr (std::same_as<Kind, Ucs2Kind>) {
    return compare_weights(call, sort, begin, Ucs2Reader(a.at, a.length), Ucs2Reader(b.at, b.length));
  } else {
    if (Kind::kShifted && page.shift_sensitive) {
      ShiftedReader x(page, bytes_of(a.at), a.length, a.state);
      ShiftedReader y(page, bytes_of(b.at), b.length, b.state);
      x.all_shifts = y.all_shifts = true;
      return compare_weights(call, sort, begin, x, y);
    }
    const uint8_t* x = bytes_of(a.at);
    const uint8_t* y = bytes_of(b.at);
    switch (page.kind) {
      case PageKind::single:
        return compare_weights(call, sort, begin, SingleByteReader(page, x, a.length),
                               SingleByteReader(page, y, b.length));
      case PageKind::utf8:
        return compare_weights(call, sort, begin, Utf8Reader(page, x, a.length), Utf8Reader(page, y, b.length));
      default:
        return compare_weights(call, sort, begin, MultibyteReader(page, x, a.length),
                               MultibyteReader(page, y, b.length));
    }
  }
}

template <class Kind>
int32_t compare_directly(LocaleCall& call, const SortTables& sort, const Text<typename Kind::Unit>& a,
                         const Text<typename Kind::Unit>& b) {
  const Beginning begin = compare_beginnings<Kind>(sort, page_of(call.locale), a, b);
  return begin.decided ? begin.result : compare_rest<Kind>(call, sort, begin, a, b);
}

// ---- Comparison by keys ----

// Room for the key of a text of which case may make twice as many characters.
size_t key_room(const LocaleCall& call, size_t length, uint32_t options) {
  bool doubled = options == LX_CMP_NOCASE && !SpecialPairs(call.locale.language, kUpperSpecialSlot).empty();
  return Levels::area_size(doubled ? 2 * length : length);
}

template <class Kind>
int32_t compare_keys(LocaleCall& call, const Text<typename Kind::Unit>& a, const Text<typename Kind::Unit>& b,
                     uint32_t options) {
  size_t room_a = key_room(call, a.length, options);
  size_t room_b = key_room(call, b.length, options);
  WorkArea area;
  if (!area.reserve(room_a + room_b)) return call.fail(LX_E_MEMORY, int32_t{0});
  int32_t size_a = transform_text<Kind>(call, area.get(), room_a, a, options);
  int32_t size_b = size_a < 0 ? -1 : transform_text<Kind>(call, area.get() + room_a, room_b, b, options);
  if (size_b < 0) return 0;
  int result = std::memcmp(area.get(), area.get() + room_a, static_cast<size_t>(std::min(size_a, size_b)));
  return result != 0 ? result : sign_of(size_a - size_b);
}

// ---- Trailing blanks ----

// The second text is cut to the length of the first before its own blanks are looked at.
template <class Kind>
void trim_both(const CodePage& page, Text<char>& a, Text<char>& b) {
  b.length = std::min(b.length, trim<Kind>(trace_unit, page, a, true));
  trim<Kind>(trace_unit, page, b, true);
}

// ---- The calls ----

template <class Kind, class Unit = typename Kind::Unit>
int32_t compare_by_sort(LocaleCall& call, const SortTables& sort, Text<Unit> a, Text<Unit> b, uint32_t options) {
  if constexpr (Kind::kBytes) {
    if ((options & LX_COLL_TRIM) != 0) {
      trim_both<Kind>(page_of(call.locale), a, b);
      options &= ~LX_CMP_TRIM;
      if (options == LX_COLL_TRIM) options = 0;
    }
  } else if ((options & LX_CMP_TRIM) != 0) {
    bool full_width = (options & LX_CMP_NOWIDTH) == LX_CMP_NOWIDTH;
    trim<Kind>(trace_unit, page_of(call.locale), a, full_width);
    trim<Kind>(trace_unit, page_of(call.locale), b, full_width);
    options &= ~LX_CMP_TRIM;
  }
  if (!is_transform(options)) return call.fail(LX_E_ARGUMENT, int32_t{0});
  return options != 0 ? compare_keys<Kind>(call, a, b, options) : compare_directly<Kind>(call, sort, a, b);
}

// Without a sort object the texts are compared in the order of the code page.
int32_t compare_binary(PlainKind, LXLocale& locale, const char* str1, uint32_t, int32_t len1, const char* str2,
                       uint32_t, int32_t len2, uint32_t options) {
  return LXStrcmp(&locale, str1, len1, str2, len2, options);
}
int32_t compare_binary(ShiftedKind, LXLocale& locale, const char* str1, uint32_t state1, int32_t len1, const char* str2,
                       uint32_t state2, int32_t len2, uint32_t options) {
  if (!page_of(locale).shift_sensitive) return LXStrcmp(&locale, str1, len1, str2, len2, options);
  bool width = (options & LX_CMP_NOWIDTH) == LX_CMP_NOWIDTH;
  options &= LX_CMP_TRIM | LX_OPT_CHARS | (width ? LX_CMP_NOWIDTH : LX_CMP_NOCASE);
  return LXStrcmpEx(&locale, str1, state1, len1, str2, state2, len2, options);
}
int32_t compare_binary(WideKind, LXLocale& locale, const LXWChar* str1, uint32_t, int32_t len1, const LXWChar* str2,
                       uint32_t, int32_t len2, uint32_t options) {
  return LXWcscmp(&locale, str1, len1, str2, len2, options & (LX_CMP_TRIM | LX_CMP_NOCASE));
}
int32_t compare_binary(Ucs2Kind, LXLocale& locale, const LXUChar* str1, uint32_t, int32_t len1, const LXUChar* str2,
                       uint32_t, int32_t len2, uint32_t options) {
  return LXStrcmpU(&locale, str1, len1, str2, len2, options);
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t collate_call(const char* function, LXLocale* locale, const Unit* str1, uint32_t state1, int32_t len1,
                     const Unit* str2, uint32_t state2, int32_t len2, uint32_t options) {
  constexpr uint32_t kAny = ~0u;
  return locale_call(trace_unit, function, locale, options, kAny, int32_t{0}, [&](LocaleCall& call) -> int32_t {
    const SortTables* sort = sort_of(call.locale);
    if (sort == nullptr) {
      int32_t result = compare_binary(Kind(), call.locale, str1, state1, len1, str2, state2, len2, options);
      call.status = call.locale.last_error;
      return result;
    }
    const CodePage& page = page_of(call.locale);
    auto a = given_text<Kind>(page, str1, state1, len1, options, Terminator::excluded);
    auto b = given_text<Kind>(page, str2, state2, len2, options, Terminator::excluded);
    options &= ~LX_OPT_CHARS;
    return options == 0 ? compare_directly<Kind>(call, *sort, a, b) : compare_by_sort<Kind>(call, *sort, a, b, options);
  });
}

}  // namespace

template <class Kind>
int32_t collate_texts(LocaleCall& call, const Text<typename Kind::Unit>& a, const Text<typename Kind::Unit>& b,
                      uint32_t options) {
  const SortTables* sort = sort_of(call.locale);
  return sort != nullptr ? compare_by_sort<Kind>(call, *sort, a, b, options) : compare_texts<Kind>(call, a, b, options);
}

template int32_t collate_texts<PlainKind>(LocaleCall&, const Text<char>&, const Text<char>&, uint32_t);
template int32_t collate_texts<ShiftedKind>(LocaleCall&, const Text<char>&, const Text<char>&, uint32_t);
template int32_t collate_texts<WideKind>(LocaleCall&, const Text<LXWChar>&, const Text<LXWChar>&, uint32_t);
template int32_t collate_texts<Ucs2Kind>(LocaleCall&, const Text<LXUChar>&, const Text<LXUChar>&, uint32_t);

}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrcoll(LXLocale* locale, const char* str1, int32_t len1, const char* str2, int32_t len2,
                  uint32_t options) noexcept {
  return collate_call<PlainKind>(__func__, locale, str1, 0, len1, str2, 0, len2, options);
}

int32_t LXStrcollEx(LXLocale* locale, const char* str1, int32_t len1, uint32_t state1, const char* str2, int32_t len2,
                    uint32_t state2, uint32_t options) noexcept {
  return collate_call<ShiftedKind>(__func__, locale, str1, state1, len1, str2, state2, len2, options);
}

int32_t LXWcscoll(LXLocale* locale, const LXWChar* wstr1, int32_t len1, const LXWChar* wstr2, int32_t len2,
                  uint32_t options) noexcept {
  return collate_call<WideKind>(__func__, locale, wstr1, 0, len1, wstr2, 0, len2, options);
}

int32_t LXStrcollU(LXLocale* locale, const LXUChar* ustr1, int32_t len1, const LXUChar* ustr2, int32_t len2,
                   uint32_t options) noexcept {
  return collate_call<Ucs2Kind>(__func__, locale, ustr1, 0, len1, ustr2, 0, len2, options);
}

}  // extern "C"
