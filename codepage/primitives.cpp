// SPDX-License-Identifier: Apache-2.0
// The primitives of a code page. They stand in inner loops of callers: nothing is checked or traced.
#include <cstring>

#include "codepage/text/page_forms.hpp"
#include "codepage/text/text_kinds.hpp"
#include "frame/records.hpp"
#include "objects/entry.hpp"

using namespace lx;

extern "C" {

int32_t LXCpMbToUnicode(const LXObjEntry* record, const char* bytes) noexcept {
  const CodePage& page = code_page_of(*record);
  return page.kind == PageKind::utf8 ? Utf8Reader::decode(bytes_of(bytes)) : page.decode(bytes_of(bytes));
}

int32_t LXCpMbToUnicodeW(const LXObjEntry* record, LXWChar packed) noexcept {
  uint8_t bytes[kMaxCharacterLength] = {};
  unpack(bytes, packed);
  return LXCpMbToUnicode(record, reinterpret_cast<const char*>(bytes));
}

int32_t LXCpUnicodeToChar(const LXObjEntry* record, LXUChar ucs2, char* out) noexcept {
  return static_cast<int32_t>(unpack(bytes_of(out), LXCpUnicodeToCharW(record, ucs2)));
}

LXWChar LXCpUnicodeToCharW(const LXObjEntry* record, LXUChar ucs2) noexcept {
  const CodePage& page = code_page_of(*record);
  return page.kind == PageKind::utf8 ? utf8_packed(ucs2) : page.packed(ucs2);
}

LXWChar LXCpMbHalfToFullW(const LXObjEntry* record, LXWChar packed) noexcept {
  return full_width(code_page_of(*record), packed);
}

LXWChar LXCpFullToHalfW(const LXObjEntry* record, LXWChar packed) noexcept {
  return code_page_of(*record).half_width(packed);
}

LXWChar LXMbToW(const LXObjEntry* record, const char* bytes) noexcept {
  // The table itself, not the walking length: a byte that begins no character packs to nothing.
  const CodePageHeader& header = *code_page_of(*record).raw.header;
  return pack(bytes_of(bytes), header.char_length[static_cast<uint8_t>(*bytes)]);
}

LXWChar LXMbToWS(const LXObjEntry* record, const char* bytes, uint32_t whole) noexcept {
  return pack(bytes_of(bytes), whole != 0 ? code_page_of(*record).max_length : 1);
}

uint16_t LXWToMb(char* out, LXWChar packed) noexcept { return static_cast<uint16_t>(unpack(bytes_of(out), packed)); }

const LXCharType* LXGetMbCtype(const LXObjEntry* record, const char* bytes) noexcept {
  return &type_entry(code_page_of(*record), bytes_of(bytes));
}

const LXCharType* LXGetMbCtypeW(const LXObjEntry* record, LXWChar packed) noexcept {
  uint8_t bytes[kMaxCharacterLength] = {};
  unpack(bytes, packed);
  return &type_entry(code_page_of(*record), bytes);
}

void LXCpMbCaseConv(const LXObjEntry* record, const char* src, char* dst, uint32_t mask) noexcept {
  const CodePage& page = code_page_of(*record);
  size_t length = page.char_length[static_cast<uint8_t>(*src)];
  if (length == 1) {  // of such characters the case is in a table of bytes
    *dst = *src;
    return;
  }
  const LXCharType& type = type_entry(page, bytes_of(src));
  if ((type.flags & mask) == 0) {
    std::memcpy(dst, src, length);
  } else {
    unpack(bytes_of(dst), other_case(pack(bytes_of(src), length), type));
  }
}

int32_t LXCpMbCaseConvS(const LXObjEntry* record, const char* src, char* dst, uint32_t mask) noexcept {
  const CodePage& page = code_page_of(*record);
  const LXCharType& type = type_entry(page, bytes_of(src));
  if ((type.flags & mask) == 0) {
    std::memcpy(dst, src, page.max_length);
    return page.max_length;
  }
  return static_cast<int32_t>(unpack(bytes_of(dst), other_case(pack(bytes_of(src), page.max_length), type)));
}

LXWChar LXCpMbCaseConvW(const LXObjEntry* record, LXWChar packed, uint32_t mask) noexcept {
  const LXCharType& type = *LXGetMbCtypeW(record, packed);
  return (type.flags & mask) == 0 ? packed : other_case(packed, type);
}

}  // extern "C"
