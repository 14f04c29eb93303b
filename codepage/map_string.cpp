// SPDX-License-Identifier: Apache-2.0
// Maps whole texts character by character: case, width, digits.
#include <algorithm>
#include <cstring>
#include <type_traits>

#include "codepage/text/characters.hpp"
#include "codepage/text/copy.hpp"
#include "codepage/text/kinds.hpp"
#include "frame/call.hpp"
#include "objects/special_pairs.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "map_string", 0};

// With lengths in characters the output is made here, so many bytes a character.
constexpr size_t kAreaSize = 512;
constexpr size_t kAreaPerCharacter = 6;

template <class U>
struct Room {
  U* at;
  size_t units;
  size_t characters;
};

struct Written {
  size_t units;
  size_t characters;
};

// Outputs take characters as long as there is room for them.
//
//   put(character)      false: it does not fit
//   end_like(walker)    leaves the output in the shift state in which the input ends; false: no room
//   put_terminator()

// One unit a character.
template <class U>
class UnitOutput {
 public:
  explicit UnitOutput(const Room<U>& room)
      : begin_(room.at), at_(room.at), end_(room.at + std::min(room.units, room.characters)) {}

  bool put(const Character& character) {
    if (at_ == end_) return false;
    *at_++ = static_cast<U>(character.code);
    return true;
  }
  bool end_like(const UnitWalker<U>&) { return true; }
  void put_terminator() { put({0, 1}); }
  Written written() const { return {count(), count()}; }

 private:
  size_t count() const { return static_cast<size_t>(at_ - begin_); }

  U* begin_;
  U* at_;
  U* end_;
};

class ByteOutput {
 public:
  explicit ByteOutput(const Room<uint8_t>& room)
      : begin_(room.at), at_(room.at), end_(room.at + room.units), limit_(room.characters) {}

  bool put(const Character& character) {
    if (!fits(character.units)) return false;
    ++characters_;
    store(character);
    return true;
  }
  bool end_like(const MultibyteWalker&) { return true; }
  void put_terminator() { put({0, 1}); }
  Written written() const { return {static_cast<size_t>(at_ - begin_), characters_}; }

 protected:
  bool has_room(size_t bytes) const { return bytes <= static_cast<size_t>(end_ - at_); }
  bool fits(size_t bytes) const { return has_room(bytes) && characters_ != limit_; }
  void put_byte(uint8_t byte) { *at_++ = byte; }

 private:
  void store(const Character& character) {
    uint32_t code = character.code;
    if (character.units == 1) return put_byte(static_cast<uint8_t>(code));
    for (uint32_t i = character.units; i-- > 0; code >>= 8) at_[i] = static_cast<uint8_t>(code);
    at_ += character.units;
  }

  uint8_t* begin_;
  uint8_t* at_;
  uint8_t* end_;
  size_t limit_;
  size_t characters_ = 0;
};

// A shift byte goes before each character of the other width.
class ShiftedOutput : public ByteOutput {
 public:
  ShiftedOutput(const ShiftedWalker& in, const Room<uint8_t>& room)
      : ByteOutput(room), page_(in.page), double_byte_(in.double_byte) {}

  bool put(const Character& character) {
    if ((character.units > 1) != double_byte_) {
      if (!fits(character.units + size_t{1})) return false;
      turn();
    }
    return ByteOutput::put(character);
  }
  bool end_like(const ShiftedWalker& in) {
    if (in.double_byte == double_byte_) return true;
    if (!has_room(1)) return false;
    turn();
    return true;
  }

 private:
  void turn() {
    double_byte_ = !double_byte_;
    put_byte(double_byte_ ? page_->enter_byte : page_->leave_byte);
  }

  const CodePage* page_;
  bool double_byte_;
};

template <class U>
UnitOutput<U> output_for(const UnitWalker<U>&, const Room<U>& room) {
  return UnitOutput<U>(room);
}
ByteOutput output_for(const MultibyteWalker&, const Room<uint8_t>& room) { return ByteOutput(room); }
ShiftedOutput output_for(const ShiftedWalker& in, const Room<uint8_t>& room) { return {in, room}; }

// Each character for itself.
template <auto kForm, class Characters>
struct Forms {
  const Characters& characters;

  template <class In, class Out>
  bool operator()(In&, const Character& character, Out& out) const {
    return out.put((characters.*kForm)(character));
  }
};

// The special pairs of the language go first: a character alone, then with the one behind it.
template <auto kForm, class Characters>
struct SpecialForms {
  const Characters& characters;
  const SpecialPairs& pairs;

  template <class In, class Out>
  bool operator()(In& in, const Character& character, Out& out) const {
    const SpecialPair* pair = listed(in, character);
    if (pair == nullptr) return out.put((characters.*kForm)(character));
    return out.put(characters.from_unicode(pair->value1)) &&
           (pair->value2 == 0 || out.put(characters.from_unicode(pair->value2)));
  }

 private:
  template <class In>
  const SpecialPair* listed(In& in, const Character& character) const {
    uint16_t first = characters.to_unicode(character);
    if (!pairs.may_begin(first)) return nullptr;
    if (const SpecialPair* alone = pairs.find(first, 0)) return alone;
    In ahead = in;
    Character second;
    if (!ahead.next(second)) return nullptr;
    const SpecialPair* pair = pairs.find(first, characters.to_unicode(second));
    if (pair != nullptr) in = ahead;
    return pair;
  }
};

// Maps until the end of the text, or a character that does not fit.
template <class In, class U, class Step>
Written map_text(In in, const Room<U>& room, bool terminated, const Step& step) {
  auto out = output_for(in, room);
  Character character;
  while (in.next(character)) {
    if (!step(in, character, out)) return out.written();
  }
  if (out.end_like(in) && terminated) out.put_terminator();
  return out.written();
}

template <class Kind>
using Stored = std::conditional_t<sizeof(typename Kind::Unit) == 1, uint8_t, typename Kind::Unit>;

// The text of one call.
template <class Kind>
struct Mapping {
  using Characters = CharactersOf<Kind>;

  const LXLocale& locale;
  Text<typename Kind::Unit> text;
  bool terminated;  // the terminator behind the text belongs to it

  const CodePage& page() const { return page_of(locale); }

  template <class Step>
  Written run(const Room<Stored<Kind>>& room, const Step& step) const {
    return Kind::with_walker(page(), text, [&](auto in) { return map_text(in, room, terminated, step); });
  }

  template <auto kForm>
  Written each(const Room<Stored<Kind>>& room) const {
    Characters characters(page());
    return run(room, Forms<kForm, Characters>{characters});
  }
  template <auto kForm>
  Written with_specials(const Room<Stored<Kind>>& room, uint32_t slot) const {
    SpecialPairs pairs(locale.language, slot);
    if (pairs.empty()) return each<kForm>(room);
    Characters characters(page());
    return run(room, SpecialForms<kForm, Characters>{characters, pairs});
  }

  Written map(const Room<Stored<Kind>>& room, uint32_t mapping) const {
    switch (mapping) {
      case LX_MAP_H2F:
        return each<&Characters::half_to_full>(room);
      case LX_MAP_F2H:
        return each<&Characters::full_to_half>(room);
      case LX_MAP_LOWER:
        return with_specials<&Characters::lower>(room, kLowerSpecialSlot);
      case LX_MAP_UPPER:
        return with_specials<&Characters::upper>(room, kUpperSpecialSlot);
      case LX_MAP_LOWER | LX_MAP_PLAIN:
        return each<&Characters::lower>(room);
      case LX_MAP_UPPER | LX_MAP_PLAIN:
        return each<&Characters::upper>(room);
      default:
        return each<&Characters::digit>(room);
    }
  }
};

bool is_copy(uint32_t mapping) { return mapping == 0 || mapping == LX_MAP_COPY; }

bool is_mapping(uint32_t mapping) {
  uint32_t cases = mapping & ~LX_MAP_PLAIN;
  return is_copy(mapping) || mapping == LX_MAP_H2F || mapping == LX_MAP_F2H || mapping == LX_MAP_DIGITS ||
         cases == LX_MAP_LOWER || cases == LX_MAP_UPPER;
}

template <class Kind>
int32_t map_in_characters(const Mapping<Kind>& mapping, char* out, size_t out_size, uint32_t option) {
  uint8_t area[kAreaSize];
  Written written = mapping.map({area, std::min(out_size * kAreaPerCharacter, kAreaSize), out_size}, option);
  std::memcpy(out, area, written.units);
  return static_cast<int32_t>(written.characters);
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t map_call(const char* function, LXLocale* locale, Unit* out, int32_t out_size, const Unit* in, uint32_t state,
                 int32_t in_length, uint32_t flags) {
  constexpr bool kBytes = sizeof(Unit) == 1;
  return locale_call(trace_unit, function, locale, 0, 0, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    const CodePage& page = page_of(call.locale);
    uint32_t option = flags & ~LX_OPT_CHARS;
    bool characters = kBytes && (flags & LX_OPT_CHARS) != 0;
    if (!is_mapping(option)) return call.fail(LX_E_ARGUMENT, int32_t{-1});
    if (is_copy(option)) return copy_text<Kind>(page, out, out_size, in, state, in_length, characters);
    if (in == nullptr || out == nullptr || out_size <= 0) return 0;

    bool measured = in_length < 0;
    Text<Unit> text = {in, measured ? measured_length(in) : static_cast<size_t>(in_length), state};
    if (characters && !measured) text.length = Kind::length_of_characters(page, text, text.length);
    Mapping<Kind> mapping = {call.locale, text, measured};
    auto size = static_cast<size_t>(out_size);
    if constexpr (kBytes) {
      if (characters) return map_in_characters(mapping, out, size, option);
    }
    return static_cast<int32_t>(mapping.map({reinterpret_cast<Stored<Kind>*>(out), size, size}, option).units);
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXMapString(LXLocale* locale, char* out, int32_t out_size, const char* in, int32_t in_len,
                    uint32_t flags) noexcept {
  return map_call<PlainKind>(__func__, locale, out, out_size, in, 0, in_len, flags);
}

int32_t LXMapStringEx(LXLocale* locale, char* out, int32_t out_size, const char* in, uint32_t state, int32_t in_len,
                      uint32_t flags) noexcept {
  return map_call<ShiftedKind>(__func__, locale, out, out_size, in, state, in_len, flags);
}

int32_t LXMapStringW(LXLocale* locale, LXWChar* out, int32_t out_size, const LXWChar* in, int32_t in_len,
                     uint32_t flags) noexcept {
  return map_call<WideKind>(__func__, locale, out, out_size, in, 0, in_len, flags);
}

int32_t LXMapStringU(LXLocale* locale, LXUChar* out, int32_t out_size, const LXUChar* in, int32_t in_len,
                     uint32_t flags) noexcept {
  return map_call<Ucs2Kind>(__func__, locale, out, out_size, in, 0, in_len, flags);
}

}  // extern "C"
