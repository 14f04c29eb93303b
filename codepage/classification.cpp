// SPDX-License-Identifier: Apache-2.0
// Character types.
#include "codepage/text/characters.hpp"
#include "codepage/text/text_kinds.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "classification", 0};

// The bits of one class of a character-type word.
uint32_t bits_of(LocaleCall& call, uint32_t type, uint32_t class_id) {
  switch (class_id) {
    case LX_CTYPE_1:
      return type & 0x3FF;
    case LX_CTYPE_2:
      return type >> 10 & 0xFFF;
    case LX_CTYPE_3:
      return type >> 22;
    default:
      return call.fail(LX_E_ARGUMENT, type & 0x3FF);
  }
}

// A character that a terminator cuts off goes on with zeros: what is behind it is not looked at.
uint32_t type_at(const CodePage& page, const char* s, uint32_t length) {
  uint8_t bytes[kMaxCharacterLength] = {static_cast<uint8_t>(*s)};
  for (size_t i = 1; i < length && s[i - 1] != '\0'; ++i) bytes[i] = static_cast<uint8_t>(s[i]);
  return PageCharacters<false>(page).type({pack(bytes, length), length});
}

template <class Type>
uint32_t type_call(const char* function, LXLocale* locale, uint32_t class_id, Type type) {
  return locale_call(trace_unit, function, locale, 0, 0, uint32_t{0},
                     [&](LocaleCall& call) { return bits_of(call, type(page_of(call.locale)), class_id); });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

uint32_t LXGetCharType(LXLocale* locale, const char* s, uint32_t class_id) noexcept {
  return type_call(__func__, locale, class_id,
                   [&](const CodePage& page) { return type_at(page, s, page.char_length[static_cast<uint8_t>(*s)]); });
}

uint32_t LXGetCharTypeW(LXLocale* locale, LXWChar packed, uint32_t class_id) noexcept {
  return type_call(__func__, locale, class_id, [&](const CodePage& page) {
    return PageCharacters<true>(page).type({packed, 1});
  });
}

uint32_t LXGetCharTypeU(LXLocale* locale, LXUChar ch, uint32_t class_id) noexcept {
  return type_call(__func__, locale, class_id, [&](const CodePage&) { return type_of(ch); });
}

uint32_t LXGetCharTypeEx(LXLocale* locale, const char* s, uint32_t state, uint32_t class_id) noexcept {
  return type_call(__func__, locale, class_id, [&](const CodePage& page) {
    uint32_t in_state = state != 0 ? page.max_length : 1;
    return type_at(page, s, page.shift_sensitive ? in_state : page.char_length[static_cast<uint8_t>(*s)]);
  });
}

}  // extern "C"
