// SPDX-License-Identifier: Apache-2.0
// Characters and texts found in a text.
#include <algorithm>

#include "collate/transform.hpp"
#include "objects/special_pairs.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "find", 0};

// Where something was found: the first byte of its first character, and the state in force there.
struct Found {
  bool found = false;
  size_t at = 0;
  uint32_t state = 0;
};

template <class Walker>
Found found_before(const Walker& begin, const Walker& behind, const Character& character) {
  return {true, passed(begin, behind) - character.units, shift_state(behind)};
}

// ---- Characters ----

template <class Walker>
Found find_character(Walker text, const Character& wanted, bool last) {
  const Walker begin = text;
  Found result;
  for (Character character; text.next(character);) {
    if (character != wanted) continue;
    result = found_before(begin, text, character);
    if (!last) break;
  }
  return result;
}

template <class Kind, class Unit = typename Kind::Unit, class Wanted>
Unit* find_character_call(const char* function, LXLocale* locale, const Unit* str, uint32_t state, int32_t len,
                          uint32_t* match_state, uint32_t options, Wanted wanted) {
  constexpr Unit* kNone = nullptr;
  return locale_call(trace_unit, function, locale, options, LX_STR_LAST, kNone, [&](LocaleCall& call) -> Unit* {
    if (options != 0 && options != LX_STR_LAST) return call.fail(LX_E_ARGUMENT, kNone);
    const CodePage& page = page_of(call.locale);
    Text<Unit> text = given_text<Kind>(page, str, state, len, 0, Terminator::included);
    Character character = wanted(page);
    if (text.length == 0 || character.units == 0) return kNone;
    Found found = Kind::with_walker(
        page, text, [&](auto walker) { return find_character(walker, character, options == LX_STR_LAST); });
    if (!found.found) return kNone;
    if (match_state != nullptr) *match_state = found.state;
    return const_cast<Unit*>(str) + found.at;
  });
}

// The character at `ch`, as much of it as comes before a terminator.
Character wanted_bytes(const CodePage& page, const char* ch, bool shifted, uint32_t state) {
  if (ch == nullptr) return {};
  const uint8_t* bytes = bytes_of(ch);
  if (*bytes == 0) return {0, 1};
  size_t length = shifted && page.shift_sensitive ? (state != 0 ? page.max_length : 1) : page.char_length[*bytes];
  uint32_t there = 1;
  while (there < length && bytes[there] != 0) ++there;
  return {pack(bytes, there), there};
}

// ---- Texts ----

// The form of a character in which it is compared: in upper case, which may be two characters, or of half width.
template <class Kind>
class FirstForm {
 public:
  // `whole_texts`: what is compared is mapped as a whole, so that what one character becomes may be the same as what
  // two others do.
  FirstForm(const LXLocale& locale, Fold fold, bool whole_texts)
      : characters_(page_of(locale)),
        specials_(fold == Fold::upper ? locale.language : nullptr, kUpperSpecialSlot),
        fold_(fold),
        whole_texts_(whole_texts && !specials_.empty()) {}

  struct Form {
    Character first;  // no units: the next character has a part in it
    Character second;
    bool operator==(const Form&) const = default;
  };
  // False: texts that begin with these are not the same.
  bool may_begin_alike(const Form& a, const Form& b) const {
    if (!whole_texts_) return a == b;
    return a.first == b.first || a.first.units == 0 || b.first.units == 0;
  }
  Form of(const Character& character) const {
    if (fold_ == Fold::none) return {character, {}};
    if (fold_ == Fold::half_width) return {characters_.full_to_half(character), {}};
    if (!specials_.empty()) {
      uint16_t ucs2 = characters_.to_unicode(character);
      if (specials_.may_begin(ucs2)) {
        if (const SpecialPair* pair = specials_.find(ucs2, 0)) {
          return {characters_.from_unicode(pair->value1),
                  pair->value2 != 0 ? characters_.from_unicode(pair->value2) : Character{}};
        }
        if (whole_texts_) return {};
      }
    }
    return {characters_.upper(character), {}};
  }

 private:
  CharactersOf<Kind> characters_;
  SpecialPairs specials_;
  Fold fold_;
  bool whole_texts_;
};

template <class Walker>
bool starts_with(Walker text, Walker pattern) {
  Character wanted;
  Character character;
  while (pattern.next(wanted)) {
    if (!text.next(character) || character != wanted) return false;
  }
  return true;
}

template <class Kind, class Walker>
Found find_text(LocaleCall& call, Walker text, Walker pattern, const Text<typename Kind::Unit>& sub, uint32_t options) {
  const Walker begin = text;
  // Single-byte pages are compared by their bytes, of which each has one width.
  const bool whole_bytes = Kind::kBytes && page_of(call.locale).max_length == 1;
  const Fold fold = whole_bytes && fold_of(options) == Fold::half_width ? Fold::none : fold_of(options);
  const FirstForm<Kind> forms(call.locale, fold, whole_bytes);
  const size_t count = count_characters(pattern);
  Character first;
  Walker(pattern).next(first);
  const auto wanted = forms.of(first);
  Character character;
  for (Walker at = text; text.next(character); at = text) {
    if (!forms.may_begin_alike(forms.of(character), wanted)) continue;
    Found found = found_before(begin, text, character);
    if (fold == Fold::none) {
      if (starts_with(at, pattern)) return found;
      continue;
    }
    Walker behind = at;
    if (skip_characters(behind, count) < count) break;
    auto* start = reinterpret_cast<const typename Kind::Unit*>(begin.at) + found.at;
    Text<typename Kind::Unit> candidate = {start, passed(begin, behind) - found.at, found.state};
    int32_t result = whole_bytes ? compare_texts<Kind>(call, candidate, sub, options)
                                 : collate_texts<Kind>(call, candidate, sub, options);
    if (call.status != LX_OK) break;
    if (result == 0) return found;
  }
  return {};
}

template <class Kind, class Unit = typename Kind::Unit>
Unit* find_text_call(const char* function, LXLocale* locale, const Unit* str, uint32_t state, int32_t len,
                     const Unit* sub, uint32_t sub_state, int32_t sub_len, uint32_t* match_state, uint32_t options) {
  constexpr Unit* kNone = nullptr;
  constexpr uint32_t kOptions = LX_CMP_NOWIDTH | LX_OPT_CHARS;
  return locale_call(trace_unit, function, locale, options, kOptions, kNone, [&](LocaleCall& call) -> Unit* {
    const CodePage& page = page_of(call.locale);
    Text<Unit> text = given_text<Kind>(page, str, state, len, options, Terminator::included);
    Text<Unit> pattern = given_text<Kind>(page, sub, sub_state, sub_len, options, Terminator::excluded);
    if (Kind::kShifted && page.shift_sensitive) {
      LX_TRACE(TRC1_LEVEL_DETAIL, "len1 = %d, len2 = %d", static_cast<int>(text.length),
               static_cast<int>(pattern.length));
    }
    if (text.length == 0) return kNone;
    // Folded and trimmed, a terminator may be the same as nothing. What has none in it is not found there.
    bool ends_text = std::find(pattern.at, pattern.at + pattern.length, Unit{0}) == pattern.at + pattern.length;
    if (len < 0 && ends_text) --text.length;
    size_t given = pattern.length;
    size_t characters = Kind::with_walker(page, pattern, [](auto walker) { return count_characters(walker); });
    pattern.length = Kind::with_walker(page, pattern, [](auto walker) { return whole_length(walker); });
    Found found = {characters != 0 || given == pattern.length, 0, state};  // half a character is nowhere
    if (characters != 0) {
      found = with_walkers<Kind>(page, text, pattern, [&](auto walker, auto wanted) {
        return find_text<Kind>(call, walker, wanted, pattern, options & ~LX_OPT_CHARS);
      });
    }
    if (!found.found) return kNone;
    if (match_state != nullptr) *match_state = found.state;
    return const_cast<Unit*>(str) + found.at;
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

char* LXStrchr(LXLocale* locale, const char* str, int32_t len, const char* ch, uint32_t options) noexcept {
  return find_character_call<PlainKind>(__func__, locale, str, 0, len, nullptr, options,
                                        [&](const CodePage& page) { return wanted_bytes(page, ch, false, 0); });
}

char* LXStrchrEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* ch, uint32_t ch_state,
                 uint32_t* match_state, uint32_t options) noexcept {
  return find_character_call<ShiftedKind>(__func__, locale, str, state, len, match_state, options,
                                          [&](const CodePage& page) { return wanted_bytes(page, ch, true, ch_state); });
}

LXWChar* LXWcschr(LXLocale* locale, const LXWChar* wstr, int32_t len, LXWChar ch, uint32_t options) noexcept {
  return find_character_call<WideKind>(__func__, locale, wstr, 0, len, nullptr, options, [&](const CodePage&) {
    return Character{ch, 1};
  });
}

LXUChar* LXStrchrU(LXLocale* locale, const LXUChar* ustr, int32_t len, LXUChar ch, uint32_t options) noexcept {
  return find_character_call<Ucs2Kind>(__func__, locale, ustr, 0, len, nullptr, options, [&](const CodePage&) {
    return Character{ch, 1};
  });
}

char* LXStrstr(LXLocale* locale, const char* str, int32_t len, const char* sub, int32_t sub_len,
               uint32_t options) noexcept {
  return find_text_call<PlainKind>(__func__, locale, str, 0, len, sub, 0, sub_len, nullptr, options);
}

char* LXStrstrEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* sub, uint32_t sub_state,
                 int32_t sub_len, uint32_t* match_state, uint32_t options) noexcept {
  return find_text_call<ShiftedKind>(__func__, locale, str, state, len, sub, sub_state, sub_len, match_state, options);
}

LXWChar* LXWcsstr(LXLocale* locale, const LXWChar* wstr, int32_t len, const LXWChar* sub, int32_t sub_len,
                  uint32_t options) noexcept {
  return find_text_call<WideKind>(__func__, locale, wstr, 0, len, sub, 0, sub_len, nullptr, options);
}

LXUChar* LXStrstrU(LXLocale* locale, const LXUChar* ustr, int32_t len, const LXUChar* sub, int32_t sub_len,
                   uint32_t options) noexcept {
  return find_text_call<Ucs2Kind>(__func__, locale, ustr, 0, len, sub, 0, sub_len, nullptr, options);
}

}  // extern "C"
