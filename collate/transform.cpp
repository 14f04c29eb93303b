// SPDX-License-Identifier: Apache-2.0
#include "collate/transform.hpp"

#include <algorithm>
#include <bit>

#include "objects/special_pairs.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "transform", 0};

// A length as the calls return it; -1: no result holds it.
int32_t key_length(size_t length) { return length <= INT32_MAX ? static_cast<int32_t>(length) : -1; }

// Of a key that could be made, or the failure.
int32_t length_or_failure(LocaleCall& call, int32_t length) {
  return length >= 0 ? length : call.fail(LX_E_MEMORY, -1);
}

// ---- Keys ----

// The lengths of the parts of a key, once what goes without saying is left out.
struct KeyParts {
  size_t primary;
  size_t secondary;
  size_t tertiary;
  size_t special;
  size_t length() const { return primary + secondary + tertiary + special + 3; }
};

void drop_trailing(Level<uint8_t>& level, uint8_t weight) {
  while (level.end != level.begin && level.end[-1] == weight) --level.end;
}

void to_big_endian(uint16_t* at, size_t count) {
  if (std::endian::native == std::endian::big) return;
  for (size_t i = 0; i < count; ++i) at[i] = static_cast<uint16_t>(at[i] << 8 | at[i] >> 8);
}

// Alone, special weights need no positions.
size_t pack_specials(Level<LXSpecialWeight>& level, bool alone) {
  auto* words = reinterpret_cast<uint16_t*>(level.begin);
  size_t count = level.size() * 2;
  if (alone) {
    count = level.size();
    for (size_t i = 0; i < count; ++i) words[i] = level.begin[i].weight;
  }
  to_big_endian(words, count);
  return count * sizeof(uint16_t);
}

KeyParts finish_levels(const SortTables& sort, Levels& levels) {
  levels.finish();
  drop_trailing(levels.secondary, sort.default_secondary);
  drop_trailing(levels.tertiary, sort.default_tertiary);
  bool alone = levels.primary.size() + levels.secondary.size() + levels.tertiary.size() == 0;
  to_big_endian(levels.primary.begin, levels.primary.size());
  return {levels.primary.size() * sizeof(uint16_t), levels.secondary.size(), levels.tertiary.size(),
          pack_specials(levels.special, alone)};
}

// Puts the parts together, which may stand in the same buffer: those that move down go first, in order, then those
// that move up, the last one first. So no part is overwritten before it has moved.
void assemble(uint8_t* key, const Levels& levels, const KeyParts& parts) {
  const uint8_t* const from[4] = {reinterpret_cast<const uint8_t*>(levels.primary.begin), levels.secondary.begin,
                                  levels.tertiary.begin, reinterpret_cast<const uint8_t*>(levels.special.begin)};
  const size_t sizes[4] = {parts.primary, parts.secondary, parts.tertiary, parts.special};
  uint8_t* to[4];
  uint8_t* at = key;
  for (unsigned i = 0; i < 4; ++i) {
    to[i] = at;
    at += sizes[i] + 1;
  }
  for (unsigned i = 0; i < 4; ++i) {
    if (to[i] <= from[i]) std::memmove(to[i], from[i], sizes[i]);
  }
  for (unsigned i = 4; i-- > 0;) {
    if (to[i] > from[i]) std::memmove(to[i], from[i], sizes[i]);
  }
  for (unsigned i = 1; i < 4; ++i) to[i][-1] = 0;
}

// A run of plain characters from `i` on; returns where it ends.
size_t file_plain(const SortTables& sort, Levels& levels, const LXUChar* characters, size_t i, size_t count) {
  uint16_t* primary = levels.primary.end;
  uint8_t* secondary = levels.secondary.end;
  uint8_t* tertiary = levels.tertiary.end;
  for (; i < count && characters[i] < SortTables::kQuickCharacters; ++i) {
    uint32_t weights = sort.quick[characters[i]];
    if ((weights & 0xFFFF) == 0) break;
    *primary++ = static_cast<uint16_t>(weights >> 16);
    *secondary++ = static_cast<uint8_t>(weights >> 8);
    *tertiary++ = static_cast<uint8_t>(weights);
  }
  if (primary != levels.primary.end) {
    levels.primary.end_run();
    levels.secondary.end_run();
    levels.tertiary.end_run();
    levels.primary.end = levels.primary.run = primary;
    levels.secondary.end = levels.secondary.run = secondary;
    levels.tertiary.end = levels.tertiary.run = tertiary;
  }
  return i;
}

void file_characters(const SortTables& sort, Levels& levels, const LXUChar* characters, size_t count) {
  for (size_t i = 0; i < count; ++i) {
    i = file_plain(sort, levels, characters, i, count);
    if (i == count) break;
    auto position = static_cast<uint16_t>(i + 1);
    Weights weights;
    if (i + 1 < count && sort.has_combinations() && sort.combination_of(characters[i], characters[i + 1], weights)) {
      ++i;
    } else {
      weights = sort.weights_of(characters[i]);
    }
    for (unsigned set = 0; set < weights.count; ++set) levels.file(weights.sets[set], position, weights.mask);
  }
}

int32_t make_empty_key(uint8_t* key, size_t size) {
  constexpr int32_t kLength = 3;
  if (size >= kLength) std::memset(key, 0, kLength);
  return kLength;
}

// ---- Characters ----

// The characters of a text as UCS-2, made alike as the fold says. `out` has room for two for each of them.
template <class Walker, class Characters>
size_t read_folded(Walker text, const Characters& characters, Fold fold, const SpecialPairs& specials, LXUChar* out) {
  LXUChar* at = out;
  for (Character character; text.next(character);) {
    if (fold == Fold::half_width) character = characters.full_to_half(character);
    LXUChar ucs2 = characters.to_unicode(character);
    if (fold == Fold::upper) {
      const SpecialPair* pair = nullptr;
      if (specials.may_begin(ucs2)) {
        pair = specials.find(ucs2, 0);
        Walker behind = text;
        Character second;
        if (pair == nullptr && behind.next(second)) {
          pair = specials.find(ucs2, characters.to_unicode(second));
          if (pair != nullptr) text = behind;
        }
      }
      if (pair != nullptr) {
        *at++ = pair->value1;
        if (pair->value2 != 0) *at++ = pair->value2;
        continue;
      }
      ucs2 = characters.to_unicode(characters.upper(character));
    }
    *at++ = ucs2;
  }
  return static_cast<size_t>(at - out);
}

// ---- Without a sort object ----

// Texts as they stand, in an order of bytes.
template <class Unit>
int32_t copy_as_key(uint8_t* key, size_t size, const Text<Unit>& text) {
  size_t length = text.length * sizeof(Unit);
  if (length <= size) {
    for (size_t i = 0; i < text.length; ++i) {
      for (size_t byte = sizeof(Unit); byte-- > 0;) *key++ = static_cast<uint8_t>(text.at[i] >> 8 * byte);
    }
  }
  return key_length(length);
}

// The page's bytes of the characters, as many as fit; the length of all.
int32_t write_as_key(const CodePage& page, uint8_t* key, size_t size, const LXUChar* characters, size_t count) {
  WideWriter codes(page, nullptr, 0);
  size_t length = 0;
  for (size_t i = 0; i < count; ++i) {
    uint8_t bytes[kMaxCharacterLength];
    size_t added = unpack(bytes, codes.code(characters[i]));
    if (length + added <= size) std::memcpy(key + length, bytes, added);
    length += added;
  }
  return key_length(length);
}

// ---- The calls ----

// One weight into a level whose weights may be read at any time.
template <class Element>
void insert(Element** insertion, Element** end, const Element& element, bool in_order) {
  Element* at = in_order ? *end : *insertion;
  std::memmove(at + 1, at, static_cast<size_t>(*end - at) * sizeof(Element));
  *at = element;
  ++*end;
  if (in_order) *insertion = *end;
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t transform_call(const char* function, LXLocale* locale, void* key, int32_t key_size, const Unit* str,
                       uint32_t state, int32_t length, uint32_t options) {
  constexpr uint32_t kAny = ~0u;
  return locale_call(trace_unit, function, locale, options, kAny, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    uint32_t transform = options & ~LX_OPT_CHARS;
    if (!is_transform(transform)) return call.fail(LX_E_ARGUMENT, -1);
    const Purpose purpose = sort_of(call.locale) == nullptr && transform == 0 ? Purpose::copying : Purpose::reading;
    Text<Unit> text =
        given_text<Kind>(page_of(call.locale), str, state, length, options, Terminator::excluded, purpose);
    size_t size = key != nullptr && key_size > 0 ? static_cast<size_t>(key_size) : 0;
    return transform_text<Kind>(call, static_cast<uint8_t*>(key), size, text, transform);
  });
}

}  // namespace

int32_t make_key(const SortTables& sort, uint8_t* key, size_t size, const LXUChar* characters, size_t count) {
  if (count == 0) return make_empty_key(key, size);
  size_t area_size = Levels::area_size(count);
  size_t gap = (4 - (reinterpret_cast<uintptr_t>(key) & 3)) & 3;
  bool inside = size >= gap + area_size;
  WorkArea area;
  if (!inside && !area.reserve(area_size)) return -1;
  Levels levels(inside ? key + gap : area.get(), count);
  file_characters(sort, levels, characters, count);
  KeyParts parts = finish_levels(sort, levels);
  if (parts.length() <= size) {
    assemble(key, levels, parts);
    if (inside) std::memset(key + parts.length(), 0, size - parts.length());
  }
  return key_length(parts.length());
}

template <class Kind>
int32_t transform_text(LocaleCall& call, uint8_t* key, size_t size, const Text<typename Kind::Unit>& text,
                       uint32_t options) {
  const CodePage& page = page_of(call.locale);
  const SortTables* sort = sort_of(call.locale);
  if (text.length == 0) {
    if (size == 0) return 0;
    std::memset(key, 0, std::min(size, size_t{3}));
    return 3;
  }
  if (sort == nullptr && options == 0) return length_or_failure(call, copy_as_key(key, size, text));
  if constexpr (std::same_as<Kind, Ucs2Kind>) {
    if (options == 0) return length_or_failure(call, make_key(*sort, key, size, text.at, text.length));
  }
  WorkArea area;
  if (!area.reserve(text.length * 2 * sizeof(LXUChar))) return call.fail(LX_E_MEMORY, -1);
  auto* characters = reinterpret_cast<LXUChar*>(area.get());
  const SpecialPairs specials(options == LX_CMP_NOCASE ? call.locale.language : nullptr, kUpperSpecialSlot);
  size_t count = Kind::with_walker(page, text, [&](auto walker) {
    return read_folded(walker, CharactersOf<Kind>(page), fold_of(options), specials, characters);
  });
  return length_or_failure(call, sort != nullptr ? make_key(*sort, key, size, characters, count)
                                                 : write_as_key(page, key, size, characters, count));
}

template int32_t transform_text<PlainKind>(LocaleCall&, uint8_t*, size_t, const Text<char>&, uint32_t);
template int32_t transform_text<ShiftedKind>(LocaleCall&, uint8_t*, size_t, const Text<char>&, uint32_t);
template int32_t transform_text<WideKind>(LocaleCall&, uint8_t*, size_t, const Text<LXWChar>&, uint32_t);
template int32_t transform_text<Ucs2Kind>(LocaleCall&, uint8_t*, size_t, const Text<LXUChar>&, uint32_t);

}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrxfrm(LXLocale* locale, void* key, int32_t key_size, const char* str, int32_t len,
                  uint32_t options) noexcept {
  return transform_call<PlainKind>(__func__, locale, key, key_size, str, 0, len, options);
}

int32_t LXStrxfrmEx(LXLocale* locale, void* key, int32_t key_size, const char* str, int32_t len, uint32_t state,
                    uint32_t options) noexcept {
  return transform_call<ShiftedKind>(__func__, locale, key, key_size, str, state, len, options);
}

int32_t LXWcsxfrm(LXLocale* locale, void* key, int32_t key_size, const LXWChar* wstr, int32_t len,
                  uint32_t options) noexcept {
  return transform_call<WideKind>(__func__, locale, key, key_size, wstr, 0, len, options);
}

int32_t LXStrxfrmU(LXLocale* locale, void* key, int32_t key_size, const LXUChar* ustr, int32_t len,
                   uint32_t options) noexcept {
  return transform_call<Ucs2Kind>(__func__, locale, key, key_size, ustr, 0, len, options);
}

int32_t LXStrGenSortKey(LXLocale* locale, void* key, int32_t key_size, const LXUChar* chars, int32_t count) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    Text<LXUChar> text = given_text<Ucs2Kind>(page_of(call.locale), chars, 0, count, 0, Terminator::excluded);
    size_t size = key != nullptr && key_size > 0 ? static_cast<size_t>(key_size) : 0;
    auto* bytes = static_cast<uint8_t*>(key);
    if (text.length == 0) return make_empty_key(bytes, size);
    const SortTables* sort = sort_of(call.locale);
    if (sort == nullptr) return call.fail(LX_E_ARGUMENT, -1);
    return length_or_failure(call, make_key(*sort, bytes, size, text.at, text.length));
  });
}

void LXStrInsertWeights(uint16_t primary, uint16_t** p_ins, uint16_t** p_end, uint8_t secondary, uint8_t** s_ins,
                        uint8_t** s_end, uint8_t tertiary, uint8_t** t_ins, uint8_t** t_end, uint16_t special,
                        LXSpecialWeight** x_ins, LXSpecialWeight** x_end, uint16_t position, uint8_t mask) noexcept {
  exported(trace_unit, __func__, [&] {
    if (primary != 0) insert(p_ins, p_end, primary, (mask & kPrimaryInOrder) != 0);
    if (secondary != 0) insert(s_ins, s_end, secondary, (mask & kSecondaryInOrder) != 0);
    if (tertiary != 0) insert(t_ins, t_end, tertiary, (mask & kTertiaryInOrder) != 0);
    if (special != 0) insert(x_ins, x_end, LXSpecialWeight{position, special}, (mask & kSpecialInOrder) != 0);
  });
}

}  // extern "C"
