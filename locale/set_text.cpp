// SPDX-License-Identifier: Apache-2.0
// Texts that a caller gives a locale: each form of the call brings its text into the locale's code page first.
#include "codepage/one_shot.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "set_text", 0};

constexpr size_t kNameLimit = 32;

bool one_byte(const CodePage& page, char byte) { return page.raw.header->char_length[static_cast<uint8_t>(byte)] == 1; }

bool is_digit(const CodePage& page, char byte) {
  auto zero = static_cast<char>(page.ascii_family ? 0x30 : 0xF0);
  return static_cast<uint8_t>(byte - zero) <= 9;
}

// Where the bytes do not tell it, the characters do.
bool only_one_byte(const CodePage& page, const GivenText& text, size_t length) {
  if (text.ucs2 == nullptr) {
    return std::all_of(text.bytes, text.bytes + length, [&](char byte) { return one_byte(page, byte); });
  }
  length = std::min(length, text.characters);
  WideWriter out(page, nullptr, 0);
  return std::all_of(text.ucs2, text.ucs2 + length, [&](LXUChar ucs2) { return out.code(ucs2) <= 0xFF; });
}

// ---- Objects ----

// A name of the locale's code page in ASCII; false: it cannot be one.
bool to_ascii(const CodePage& page, const GivenText& text, size_t length, char* ascii) {
  if (!only_one_byte(page, text, length)) return false;
  const CodePage& to = ascii_code_page();
  for (size_t i = 0; i < length; ++i) {
    ascii[i] = separator_byte(to, page.to_unicode[static_cast<uint8_t>(text.bytes[i])]);
  }
  return true;
}

uint32_t set_object_by_name(LXLocale& locale, uint8_t type, const GivenText& text) {
  const CodePage& page = page_of(locale);
  size_t length = std::min(text.length, kNameLimit);
  const char* name = text.bytes;
  char ascii[kNameLimit];
  if (!page.ascii_family) {
    if (!to_ascii(page, text, length, ascii)) return LX_E_NOTFOUND;
    name = ascii;
  }
  uint32_t rc = LX_OK;
  LXObjEntry* entry = LXGetObjFromName(LXGetObjManager(), type, name, static_cast<int32_t>(length), 0, &rc);
  uint32_t status = lookup_status(entry, rc);
  if (status != LX_OK || (type == LX_TERRITORY && entry == locale.territory)) return status;
  return take_object(locale, type, entry);
}

// ---- Separators ----

// The decimal separators differ from those of thousands, and neither is a digit. Numbers cannot do without the former.
bool acceptable(const LXLocale& locale, const CodePage& page, uint32_t number, const GivenText& text) {
  if (!only_one_byte(page, text, 1)) return false;
  char byte = *text.bytes;
  if (number == LX_ITEM_LIST) return true;
  bool decimal = number == LX_ITEM_DECIMAL || number == LX_ITEM_MON_DECIMAL;
  if (decimal && byte == 0) return false;
  unsigned index = item_of(number).index;
  unsigned partner = decimal ? index + 1 : index - 1;
  return !is_digit(page, byte) && byte != locale.separators[partner];
}

uint32_t set_separator(LXLocale& locale, uint32_t number, const GivenText& text) {
  const Item& item = item_of(number);
  const CodePage& page = page_of(locale);
  if (!acceptable(locale, page, number, text)) return LX_E_NOTFOUND;
  char byte = *text.bytes;
  locale.separators[item.index] = byte;
  locale.ucs2_separators[item.index] = page.to_unicode[static_cast<uint8_t>(byte)];
  locale.set_mask |= item.set_bit;
  locale.mirror_bits = static_cast<uint16_t>(locale.mirror_bits | item.mirror_bit);
  return LX_OK;
}

// ---- Strings ----

template <class Unit>
bool make_room(Owned<Unit>& grown, const Unit* current, size_t length) {
  if (current != nullptr && measured_length(current) >= length) return true;
  grown = Owned<Unit>::array(length + 1);
  return static_cast<bool>(grown);
}

// The text may be the locale's own.
template <class Unit>
void put_text(Unit*& place, Owned<Unit>& grown, const Unit* text, size_t length) {
  Unit* to = grown ? grown.get() : place;
  std::memmove(to, text, length * sizeof(Unit));
  to[length] = 0;
  if (grown) Owned<Unit>(std::exchange(place, grown.give_up()));
}

size_t whole_characters(const CodePage& page, const char* text, size_t length, size_t& characters) {
  size_t whole = 0;
  for (characters = 0; whole < length; ++characters) {
    size_t next = page.char_length[static_cast<uint8_t>(text[whole])];
    if (next > length - whole) break;
    whole += next;
  }
  return whole;
}

uint32_t set_text(LXLocale& locale, uint32_t number, const GivenText& text) {
  const Item& item = item_of(number);
  if (text.length == 0) return LX_OK;
  switch (item.kind) {
    case ItemKind::object_name:
      return set_object_by_name(locale, item.index, text);
    case ItemKind::separator:
      return set_separator(locale, number, text);
    case ItemKind::string:
      return store_string(locale, item, text);
    default:
      return LX_E_ITEM;
  }
}

// ---- The forms of the call ----

constexpr uint32_t kOptions = LX_OPT_CHARS;

void trace_text(uint32_t number, int32_t length, const char* text) {
  LX_TRACE(TRC1_LEVEL_PARAMETER, "type = %d, buffer size = %d, data = %.*s", static_cast<int>(number), length, length,
           text);
}

// `bytes` is the text of a call that gives bytes: what is traced, even when the call is refused.
template <class Body>
int32_t set_call(const char* function, LXLocale* locale, uint32_t number, const void* text, const char* bytes,
                 int32_t length, uint32_t options, Body body) {
  constexpr uint32_t kAny = ~0u;
  return locale_call(trace_unit, function, locale, options, kAny, int32_t{0}, [&](LocaleCall& call) -> int32_t {
    if (bytes != nullptr) trace_text(number, length, bytes);
    if (text == nullptr || (options & ~kOptions) != 0) return call.fail(LX_E_ARGUMENT, 0);
    call.status = length != 0 ? body(call.locale) : LX_OK;
    return call.status == LX_OK ? 1 : 0;
  });
}

// Characters as UCS-2 become bytes of the locale's page. Where these do not tell the characters, on shift-sensitive
// pages, the characters go along: as the page has them, like on other pages.
uint32_t set_characters(LXLocale& locale, uint32_t number, const LXUChar* ucs2, size_t count) {
  const CodePage& page = page_of(locale);
  auto bytes = Owned<char>::array(count * page.max_length + 1);
  auto characters = Owned<LXUChar>::array(page.shift_sensitive ? count + 1 : 1);
  if (!bytes || !characters) return LX_E_MEMORY;
  size_t length = with_writer(page, {}, bytes_of(bytes.get()), count * page.max_length, [&](auto out) {
    for (size_t i = 0; i < count; ++i) out.put(out.code(ucs2[i]));
    return static_cast<size_t>(out.at - out.begin);
  });
  GivenText text = {bytes.get(), length};
  if (page.shift_sensitive) {
    WideWriter out(page, nullptr, 0);
    for (size_t i = 0; i < count; ++i) {
      bool lacking = page.stands_in(out.code(ucs2[i]), ucs2[i]);
      characters[i] = lacking ? page.to_unicode[page.substitution] : ucs2[i];
    }
    text.ucs2 = characters.get();
    text.characters = count;
  }
  bytes[length] = '\0';
  trace_text(number, static_cast<int32_t>(length), bytes.get());
  return set_text(locale, number, text);
}

// The same for readers of other texts.
template <class In>
uint32_t set_read(LXLocale& locale, uint32_t number, In in, size_t limit) {
  auto ucs2 = Owned<LXUChar>::array(limit + 1);
  if (!ucs2) return LX_E_MEMORY;
  Ucs2Writer out(ucs2.get(), limit);
  NoWatch watch;
  transcode(in, out, watch);
  return set_characters(locale, number, ucs2.get(), static_cast<size_t>(out.at - out.begin));
}

uint32_t set_wide(LXLocale& locale, uint32_t number, const Source<LXWChar>& source) {
  const CodePage& page = page_of(locale);
  WideReader in(page, source.text, source.length);
  if (page.shift_sensitive) return set_read(locale, number, in, source.length);
  // Packed characters are the page's own bytes: the way through UCS-2 might find other codes for them.
  auto bytes = Owned<char>::array(source.length * kMaxCharacterLength + 1);
  if (!bytes) return LX_E_MEMORY;
  PackedWriter out(bytes_of(bytes.get()), source.length * kMaxCharacterLength);
  transfer(in, out);
  *out.at = 0;
  auto length = static_cast<size_t>(out.at - out.begin);
  trace_text(number, static_cast<int32_t>(length), bytes.get());
  return set_text(locale, number, {bytes.get(), length});
}

uint32_t set_bytes(LXLocale& locale, uint32_t number, const char* text, int32_t length, uint32_t options) {
  Source<uint8_t> source = byte_source(page_of(locale), text, {}, length, options);
  return set_text(locale, number, {text, source.length});
}

}  // namespace

uint32_t store_string(LXLocale& locale, const Item& item, const GivenText& given) {
  unsigned i = item.index;
  size_t length = given.length;
  size_t characters = given.characters;
  if (given.ucs2 == nullptr) {
    length = whole_characters(page_of(locale), given.bytes, given.length, characters);
  }
  Owned<char> text;
  Owned<LXUChar> mirror;
  if (!make_room(text, locale.strings[i], length) || !make_room(mirror, locale.ucs2_strings[i], characters)) {
    return LX_E_MEMORY;
  }
  if (given.ucs2 != nullptr) {
    put_text(locale.ucs2_strings[i], mirror, given.ucs2, characters);
    put_text(locale.strings[i], text, given.bytes, length);
  } else {
    put_text(locale.strings[i], text, given.bytes, length);
    LXUChar* to = mirror ? mirror.get() : locale.ucs2_strings[i];
    *to = 0;
    LXCpStrToUnicode(locale.code_page, to, static_cast<int32_t>(characters + 1), locale.strings[i],
                     static_cast<int32_t>(length), LX_OPT_TERMINATE);
    if (mirror) Owned<LXUChar>(std::exchange(locale.ucs2_strings[i], mirror.give_up()));
  }
  locale.set_mask |= item.set_bit;
  locale.mirror_bits = static_cast<uint16_t>(locale.mirror_bits | item.mirror_bit);
  return LX_OK;
}

}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXSetLocaleTextInfo(LXLocale* locale, uint32_t item, const char* text, int32_t length,
                            uint32_t options) noexcept {
  return set_call(__func__, locale, item, text, text, length, options,
                  [&](LXLocale& own) { return set_bytes(own, item, text, length, options); });
}

int32_t LXSetLocaleTextInfoW(LXLocale* locale, uint32_t item, const LXWChar* text, int32_t length,
                             uint32_t options) noexcept {
  return set_call(__func__, locale, item, text, nullptr, length, options,
                  [&](LXLocale& own) { return set_wide(own, item, Source<LXWChar>(text, length)); });
}

int32_t LXSetLocaleTextInfoU(LXLocale* locale, uint32_t item, const LXUChar* text, int32_t length,
                             uint32_t options) noexcept {
  return set_call(__func__, locale, item, text, nullptr, length, options, [&](LXLocale& own) {
    Source<LXUChar> source(text, length);
    return set_characters(own, item, source.text, source.length);
  });
}

int32_t LXSetLocaleTextInfoEx(LXLocale* locale, uint32_t item, const char* text, int32_t length,
                              const LXObjEntry* code_page, uint32_t options) noexcept {
  return set_call(__func__, locale, item, text, text, length, options, [&](LXLocale& own) -> uint32_t {
    if (code_page == nullptr) code_page = own.code_page;
    if (!is_loaded_code_page(code_page)) return LX_E_ARGUMENT;
    const CodePage& page = code_page_of(*code_page);
    // A text of the locale's own page without shift states is just a text.
    if (code_page == own.code_page && !page.shift_sensitive) return set_bytes(own, item, text, length, options);
    Source<uint8_t> source = byte_source(page, text, {true, 0}, length, options);
    return with_reader(page, {true, 0}, source.text, source.length,
                       [&](auto in) { return set_read(own, item, in, source.length); });
  });
}

}  // extern "C"
