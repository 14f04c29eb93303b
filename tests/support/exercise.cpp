// SPDX-License-Identifier: Apache-2.0
#include "support/exercise.hpp"

#include <algorithm>
#include <cstring>
#include <string>
#include <vector>

namespace lx::test {
namespace {

// Rooms are vectors of exactly their size, where a memory checker guards the ends.
template <class Unit>
int32_t size_of(const std::vector<Unit>& room) {
  return static_cast<int32_t>(room.size());
}

// Every byte, lead bytes at the end, runs of double bytes between shift bytes, and the characters of the built pages.
const std::string& sample_bytes() {
  static const std::string kText = [] {
    std::string text = "Plain text, long enough for a word or two of the fast paths: 0123456789.";
    text += "\x81\x40\x81\x41\x8E\xA0\xA0\x8F\xA1\xA1\xA7z\x81";
    text += std::string("\x0E\x41\x40\x42\x41\x0F ab\x0E\x0E\x41\x40\x0F\x0F\x0E\x41", 18);
    text += "\xE3\x81\x82\xC3\xA9\xF0\x9F\x98\x80";
    for (int byte = 0; byte < 256; ++byte) text += {static_cast<char>(byte), 'a'};
    for (int byte = 255; byte >= 0x80; --byte) text += {static_cast<char>(byte), '\x7F'};
    return text + "\x8F\xA1\xA1";
  }();
  return kText;
}

const std::vector<LXUChar>& sample_units() {
  static const std::vector<LXUChar> kUnits = [] {
    std::vector<LXUChar> units;
    for (unsigned unit = 0; unit < 0x180; ++unit) units.push_back(static_cast<LXUChar>(unit));
    for (unsigned first : {0x3040u, 0x3100u, 0x4E00u, 0x5000u, 0xD800u, 0xFFF8u}) {
      for (unsigned i = 0; i < 8; ++i) units.insert(units.end(), {static_cast<LXUChar>(first + i), 'x'});
    }
    return units;
  }();
  return kUnits;
}

// `source` and `converted` have room for the longest character.
const char* use_character(const LXObjEntry* page, unsigned first, unsigned second, char* source, char* converted) {
  const char bytes[4] = {static_cast<char>(first), static_cast<char>(second), '\x40', '\x41'};
  std::memcpy(source, bytes, 4);
  auto is_unicode = [](int32_t value) { return value >= 0 && value <= 0xFFFF; };
  if (!is_unicode(LXCpMbToUnicode(page, source))) return "LXCpMbToUnicode";
  for (LXWChar value : {LXMbToW(page, source), LXMbToWS(page, source, 1), LXMbToWS(page, source, 0)}) {
    if (!is_unicode(LXCpMbToUnicodeW(page, value))) return "LXCpMbToUnicodeW";
    if (LXGetMbCtypeW(page, value) == nullptr) return "LXGetMbCtypeW";
    LXCpMbCaseConvW(page, value, 0xFFFFFFFF);
    LXCpMbHalfToFullW(page, value);
    if (first % 32 == 1) LXCpFullToHalfW(page, value);  // it searches long
  }
  const LXCharType* type = LXGetMbCtype(page, source);
  if (type == nullptr || LXGetMbCtype(page, source)->flags != type->flags) return "LXGetMbCtype";
  LXCpMbCaseConv(page, source, converted, LX_CT_LOWER);
  const int32_t length = LXCpMbCaseConvS(page, source, converted, 0xFFFFFFFF);
  return length < 1 || length > 4 ? "LXCpMbCaseConvS" : nullptr;
}

const char* use_unit(const LXObjEntry* page, LXUChar unit, std::vector<char>& out) {
  const int32_t length = LXCpUnicodeToChar(page, unit, out.data());
  if (length < 1 || length > size_of(out)) return "LXCpUnicodeToChar";
  char again[4];
  const bool same = LXWToMb(again, LXCpUnicodeToCharW(page, unit)) == length &&
                    std::memcmp(again, out.data(), static_cast<size_t>(length)) == 0;
  return same ? nullptr : "LXCpUnicodeToCharW";
}

const char* use_strings(LXLocale* locale) {
  const char* text = sample_bytes().data();
  const auto length = static_cast<int32_t>(sample_bytes().size());
  const LXUChar* given = sample_units().data();
  const int32_t count = size_of(sample_units());
  for (uint32_t state : {0u, 1u}) {
    for (int32_t room : {1, 7, 1500}) {
      std::vector<LXUChar> units(static_cast<size_t>(room));
      std::vector<LXWChar> wide(static_cast<size_t>(room));
      std::vector<char> bytes(static_cast<size_t>(room));
      const int32_t results[] = {
          LXStringToUnicode(locale, units.data(), room, text, length, 0),
          LXStringToUnicodeEx(locale, units.data(), room, text, state, length, LX_OPT_TERMINATE),
          LXMbToWideEx(locale, wide.data(), room, text, state, length, LX_OPT_TERMINATE),
          LXStringToUnicodeW(locale, units.data(), room, wide.data(), room, 0),
          LXWideToMbEx(locale, bytes.data(), state, room, wide.data(), room, LX_OPT_TERMINATE),
          LXUnicodeToStringEx(locale, bytes.data(), state, room, given, count, 0),
      };
      for (int32_t result : results) {
        if (result < 0 || result > room) return "a result is larger than its room";
      }
    }
  }
  return nullptr;
}

// A handle fed `piece` bytes at a time, with as much room.
std::string convert_in_pieces(LXLocale* target, LXLocale* source, size_t piece) {
  std::string result;
  LXConversion* handle = LXOpenConversion(target, source, 0);
  if (handle == nullptr) return "no handle";
  auto deliver = [&](auto step) {
    for (uint32_t status = LX_E_FULL; status == LX_E_FULL;) {
      std::vector<char> out(piece);
      char* at = out.data();
      int32_t room = size_of(out);
      status = step(at, room);
      result.append(out.data(), static_cast<size_t>(at - out.data()));
    }
  };
  for (size_t done = 0; done < sample_bytes().size(); done += piece) {
    const std::string part = sample_bytes().substr(done, piece);
    const std::vector<char> in(part.begin(), part.end());
    const char* from = in.data();
    int32_t left = size_of(in);
    deliver([&](char*& at, int32_t& room) { return LXConvertBuffer(handle, &at, &room, &from, &left, 0); });
  }
  deliver([&](char*& at, int32_t& room) { return LXFinishConversion(handle, &at, &room); });
  LXCloseConversion(handle);
  return result;
}

}  // namespace

const char* exercise_language(const LXObjEntry* language) {
  for (uint32_t item = 43; item < 48; ++item) {
    for (unsigned key = 0; key < 0x200; ++key) {
      uint16_t value1 = 0, value2 = 0;
      const int32_t result = LXLangGetSpecial(language, static_cast<uint16_t>(key), 0, &value1, &value2, item);
      if (result < 0 || result > 2 || (result == 2) != (result != 0 && value2 != 0)) return "LXLangGetSpecial";
    }
  }
  return nullptr;
}

const char* exercise_page(const LXObjEntry* page) {
  LXCodePageInfo info;
  if (LXGetCodePageInfo(page, &info) != LX_OK || info.max_length < 1 || info.max_length > 4) return "LXGetCodePageInfo";
  std::vector<char> source(4), converted(4), exact(info.max_length);
  const char* wrong = nullptr;
  for (unsigned byte = 0; byte < 256 && wrong == nullptr; ++byte) {
    wrong = use_character(page, byte, byte % 2 == 0 ? 0xA1 : byte * 7 & 0xFF, source.data(), converted.data());
  }
  for (unsigned high = 0; high < 256 && wrong == nullptr; ++high) {
    for (unsigned low : {0x00u, 0x41u, 0xFFu}) {
      if (wrong == nullptr) wrong = use_unit(page, static_cast<LXUChar>(high << 8 | low), exact);
    }
  }
  return wrong;
}

const char* exercise_conversions(LXLocale* locale, LXLocale* other) {
  if (const char* wrong = use_strings(locale)) return wrong;
  const char* text = sample_bytes().data();
  const auto length = static_cast<int32_t>(sample_bytes().size());
  for (auto [target, source] : {std::pair(other, locale), {locale, other}}) {
    for (int32_t room : {1, 100, 3000}) {
      std::vector<char> out(static_cast<size_t>(room));
      for (uint32_t flags : {0u, LX_OPT_TERMINATE}) {
        const int32_t plain = LXConvertString(target, out.data(), room, source, text, length, flags);
        const int32_t shifted = LXConvertStringEx(target, out.data(), 1, room, source, text, 1, length, flags);
        if (std::min(plain, shifted) < 0 || std::max(plain, shifted) > room) return "LXConvertString";
      }
    }
    if (LXConversionRatio(target, source, 0) < 1) return "LXConversionRatio";
    if (convert_in_pieces(target, source, 3) != convert_in_pieces(target, source, 5000)) {
      return "text converted in pieces differs";
    }
  }
  return nullptr;
}

}  // namespace lx::test
