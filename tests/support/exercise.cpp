// SPDX-License-Identifier: Apache-2.0
#include "support/exercise.hpp"

#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

namespace lx::test {
namespace {

// A buffer of exactly that size on the heap, where a memory checker guards its ends.
template <class Unit>
struct Room {
  explicit Room(size_t count) : units(new Unit[count]()), size(static_cast<int32_t>(count)) {}
  std::unique_ptr<Unit[]> units;
  int32_t size;
  Unit* data() { return units.get(); }
};

// Every byte, lead bytes at the end, runs of double bytes between shift bytes, and the characters of the built pages.
std::string sample_bytes() {
  std::string text = "Plain text, long enough for a word or two of the fast paths: 0123456789.";
  text += "\x81\x40\x81\x41\x8E\xA0\xA0\x8F\xA1\xA1\xA7z\x81";
  text += std::string("\x0E\x41\x40\x42\x41\x0F ab\x0E\x0E\x41\x40\x0F\x0F\x0E\x41", 18);
  text += "\xE3\x81\x82\xC3\xA9\xF0\x9F\x98\x80";
  for (int byte = 0; byte < 256; ++byte) text += {static_cast<char>(byte), 'a'};
  for (int byte = 255; byte >= 0x80; --byte) text += {static_cast<char>(byte), '\x7F'};
  return text + "\x8F\xA1\xA1";
}

std::vector<LXUChar> sample_units() {
  std::vector<LXUChar> units;
  for (unsigned unit = 0; unit < 0x180; ++unit) units.push_back(static_cast<LXUChar>(unit));
  for (unsigned first : {0x3040u, 0x3100u, 0x4E00u, 0x5000u, 0xD800u, 0xFFF8u}) {
    for (unsigned i = 0; i < 8; ++i) {
      units.push_back(static_cast<LXUChar>(first + i));
      if (i % 3 == 0) units.push_back('x');
    }
  }
  return units;
}

// `source` and `converted` have room for the longest character.
const char* use_character(const LXObjEntry* page, unsigned first, unsigned second, Room<char>& source,
                          Room<char>& converted) {
  const char bytes[4] = {static_cast<char>(first), static_cast<char>(second), '\x40', '\x41'};
  std::memcpy(source.data(), bytes, 4);
  if (int32_t value = LXCpMbToUnicode(page, source.data()); value < 0 || value > 0xFFFF) return "LXCpMbToUnicode";
  LXWChar packed = LXMbToW(page, source.data());
  for (LXWChar value : {packed, LXMbToWS(page, source.data(), 1), LXMbToWS(page, source.data(), 0)}) {
    if (int32_t unicode = LXCpMbToUnicodeW(page, value); unicode < 0 || unicode > 0xFFFF) return "LXCpMbToUnicodeW";
    if (LXGetMbCtypeW(page, value) == nullptr) return "LXGetMbCtypeW";
    LXCpMbCaseConvW(page, value, 0xFFFFFFFF);
    LXCpMbHalfToFullW(page, value);
    if (first % 32 == 1) LXCpFullToHalfW(page, value);  // it searches long
  }
  const LXCharType* type = LXGetMbCtype(page, source.data());
  if (type == nullptr || LXGetMbCtype(page, source.data())->flags != type->flags) return "LXGetMbCtype";
  LXCpMbCaseConv(page, source.data(), converted.data(), LX_CT_LOWER);
  int32_t length = LXCpMbCaseConvS(page, source.data(), converted.data(), 0xFFFFFFFF);
  return length < 1 || length > 4 ? "LXCpMbCaseConvS" : nullptr;
}

const char* use_unit(const LXObjEntry* page, LXUChar unit, Room<char>& out) {
  int32_t length = LXCpUnicodeToChar(page, unit, out.data());
  if (length < 1 || length > out.size) return "LXCpUnicodeToChar";
  char again[4];
  LXWChar packed = LXCpUnicodeToCharW(page, unit);
  if (LXWToMb(again, packed) != length || std::memcmp(again, out.data(), static_cast<size_t>(length)) != 0) {
    return "LXCpUnicodeToCharW";
  }
  return nullptr;
}

bool within(int32_t result, int32_t room) { return result >= 0 && result <= room; }

const char* use_strings(LXLocale* locale) {
  static const std::string text = sample_bytes();
  auto length = static_cast<int32_t>(text.size());
  for (uint32_t state : {0u, 1u}) {
    for (int32_t room : {1, 7, 1500}) {
      Room<LXUChar> units(static_cast<size_t>(room));
      Room<LXWChar> wide(static_cast<size_t>(room));
      Room<char> bytes(static_cast<size_t>(room));
      static const auto given = sample_units();
      auto count = static_cast<int32_t>(given.size());
      int32_t results[] = {
          LXStringToUnicode(locale, units.data(), room, text.data(), length, 0),
          LXStringToUnicodeEx(locale, units.data(), room, text.data(), state, length, LX_OPT_TERMINATE),
          LXMbToWide(locale, wide.data(), room, text.data(), length, 0),
          LXMbToWideEx(locale, wide.data(), room, text.data(), state, length, LX_OPT_TERMINATE),
          LXWideToMb(locale, bytes.data(), room, wide.data(), room, 0),
          LXWideToMbEx(locale, bytes.data(), state, room, wide.data(), room, LX_OPT_TERMINATE),
          LXUnicodeToString(locale, bytes.data(), room, given.data(), count, LX_OPT_TERMINATE),
          LXUnicodeToStringEx(locale, bytes.data(), state, room, given.data(), count, 0),
          LXUnicodeToStringW(locale, wide.data(), room, given.data(), count, 0),
          LXStringToUnicodeW(locale, units.data(), room, wide.data(), room, 0),
      };
      for (int32_t result : results) {
        if (!within(result, room)) return "a result is larger than its room";
      }
    }
  }
  return nullptr;
}

// A handle fed `piece` bytes at a time, with as much room.
std::string convert_in_pieces(LXLocale* target, LXLocale* source, const std::string& text, size_t piece) {
  std::string result;
  LXConversion* handle = LXOpenConversion(target, source, 0);
  if (handle == nullptr) return "no handle";
  auto deliver = [&](auto step) {
    for (uint32_t status = LX_E_FULL; status == LX_E_FULL;) {
      Room<char> out(piece);
      char* at = out.data();
      int32_t room = out.size;
      status = step(at, room);
      result.append(out.data(), static_cast<size_t>(at - out.data()));
    }
  };
  for (size_t done = 0; done < text.size();) {
    size_t count = std::min(piece, text.size() - done);
    Room<char> in(count);
    std::memcpy(in.data(), text.data() + done, count);
    const char* from = in.data();
    int32_t left = in.size;
    deliver([&](char*& at, int32_t& room) { return LXConvertBuffer(handle, &at, &room, &from, &left, 0); });
    done += count;
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
      int32_t result = LXLangGetSpecial(language, static_cast<uint16_t>(key), 0, &value1, &value2, item);
      if (result < 0 || result > 2 || (result == 2) != (result != 0 && value2 != 0)) return "LXLangGetSpecial";
    }
  }
  return nullptr;
}

const char* exercise_page(const LXObjEntry* page) {
  LXCodePageInfo info;
  if (LXGetCodePageInfo(page, &info) != LX_OK || info.max_length < 1 || info.max_length > 4) return "LXGetCodePageInfo";
  Room<char> source(4);
  Room<char> converted(4);
  Room<char> exact(info.max_length);
  const char* wrong = nullptr;
  for (unsigned byte = 0; byte < 256 && wrong == nullptr; ++byte) {
    wrong = use_character(page, byte, byte % 2 == 0 ? 0xA1 : byte * 7 & 0xFF, source, converted);
  }
  for (unsigned high = 0; high < 256 && wrong == nullptr; ++high) {
    for (unsigned low : {0x00u, 0x41u, 0xFFu}) wrong = use_unit(page, static_cast<LXUChar>(high << 8 | low), exact);
  }
  return wrong;
}

const char* exercise_conversions(LXLocale* locale, LXLocale* other) {
  if (const char* wrong = use_strings(locale)) return wrong;
  static const std::string text = sample_bytes();
  auto length = static_cast<int32_t>(text.size());
  for (auto [target, source] : {std::pair(other, locale), {locale, other}}) {
    for (int32_t room : {1, 100, 3000}) {
      Room<char> out(static_cast<size_t>(room));
      for (uint32_t flags : {0u, LX_OPT_TERMINATE}) {
        if (!within(LXConvertString(target, out.data(), room, source, text.data(), length, flags), room)) {
          return "LXConvertString";
        }
        if (!within(LXConvertStringEx(target, out.data(), 1, room, source, text.data(), 1, length, flags), room)) {
          return "LXConvertStringEx";
        }
      }
    }
    if (LXConversionRatio(target, source, 0) < 1) return "LXConversionRatio";
    if (convert_in_pieces(target, source, text, 3) != convert_in_pieces(target, source, text, 5000)) {
      return "text converted in pieces differs";
    }
  }
  return nullptr;
}

}  // namespace lx::test
