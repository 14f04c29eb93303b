// SPDX-License-Identifier: Apache-2.0
#include "catalog_text.hpp"

#include <algorithm>
#include <optional>

#include "source_text.hpp"

namespace lx::compiler {

namespace {

tool::LocalePtr open_locale(const std::string& name) {
  uint32_t rc = LX_OK;
  tool::LocalePtr locale(LXGetLocale(name.c_str(), 0, &rc));
  if (!locale) throw Fault(name + ": " + tool::describe_status(rc));
  return locale;
}

// A text on its way to another page, and the first character that does not come through.
struct Conversion {
  std::string out;
  std::optional<LXConversionProblem> problem;

  Conversion(LXLocale* to, LXLocale* from, uint32_t options, std::string_view text) {
    tool::ConversionPtr handle(LXOpenConversion(to, from, 0));
    if (!handle) throw Fault("out of memory");
    auto note = [](void* context, const LXConversionProblem* found) {
      auto& first = static_cast<Conversion*>(context)->problem;
      if (!first) first = *found;
    };
    LXSetConversionOptions(handle.get(), LX_CONV_STRICT | options, note, this);
    char block[4096];
    for (bool more = true; more;) {
      auto piece = static_cast<int32_t>(std::min<size_t>(text.size(), 1 << 20));
      const char* in = text.data();
      char* at = block;
      int32_t room = sizeof block;
      int32_t left = piece;
      uint32_t status = LXConvertBuffer(handle.get(), &at, &room, &in, &left, 0);
      text.remove_prefix(static_cast<size_t>(piece - left));
      more = status == LX_E_FULL || !text.empty();
      if (!more) more = LXFinishConversion(handle.get(), &at, &room) == LX_E_FULL;
      out.append(block, static_cast<size_t>(at - block));
    }
  }
};

// Bytes of the sequence that begins so; 0: none does.
size_t sequence_length(unsigned char first) {
  if (first < 0x80) return 1;
  if (first >= 0xC2 && first < 0xE0) return 2;
  if (first >= 0xE0 && first < 0xF0) return 3;
  return first >= 0xF0 && first < 0xF5 ? 4 : 0;
}

}  // namespace

std::u32string decode_utf8(std::string_view bytes, bool& valid) {
  constexpr char32_t kLeast[] = {0, 0, 0x80, 0x800, 0x10000};
  std::u32string text;
  valid = false;
  while (!bytes.empty()) {
    auto first = static_cast<unsigned char>(bytes[0]);
    size_t length = sequence_length(first);
    if (length == 0 || length > bytes.size()) return text;
    char32_t c = length == 1 ? first : first & (0x7Fu >> length);
    for (size_t i = 1; i < length; ++i) {
      auto byte = static_cast<unsigned char>(bytes[i]);
      if ((byte & 0xC0) != 0x80) return text;
      c = c << 6 | (byte & 0x3F);
    }
    if (c < kLeast[length] || c > 0x10FFFF || (c >= 0xD800 && c < 0xE000)) return text;
    text.push_back(c);
    bytes.remove_prefix(length);
  }
  valid = true;
  return text;
}

CatalogText::CatalogText(const std::string& locale_name)
    : locale_(open_locale(locale_name)), utf8_(open_locale("English_UnitedStates.UTF-8@BINARY")) {
  if (LXGetCodePageInfo(page(), &info_) != LX_OK) throw Fault(tool::message("{0}: no code page", locale_name));
}

std::string CatalogText::locale_name() const {
  LXUChar name[256] = {};
  int32_t count = LXGetLocaleTextInfoU(locale_.get(), LX_ITEM_LOCALE_NAME, name, 256, 0);
  std::string text;
  for (int32_t i = 0; i + 1 < count; ++i) text.push_back(static_cast<char>(name[i]));
  return text;
}

std::string CatalogText::encode(const MessageParts& parts) const {
  std::string bytes;
  for (size_t at = 0; at < parts.size();) {
    if (parts[at].is_byte) {
      bytes.push_back(static_cast<char>(parts[at++].value));
      continue;
    }
    std::string utf8;
    std::vector<Spot> spots;  // of each byte
    for (; at < parts.size() && !parts[at].is_byte; ++at) {
      append_utf8(utf8, parts[at].value);
      spots.resize(utf8.size(), parts[at].spot);
    }
    if (info_.id == LX_CP_UTF8) {  // as it is: the library's own conversion ends at U+FFFF
      bytes += utf8;
      continue;
    }
    Conversion conversion(locale_.get(), utf8_.get(), 0, utf8);
    if (conversion.problem) {
      throw SourceError(spots[conversion.problem->offset], tool::message("{0} is not in the catalog's code page",
                                                                         unicode_name(conversion.problem->unicode)));
    }
    bytes += conversion.out;
  }
  return bytes;
}

// A character, or on a page with shift bytes a run between two of them.
size_t CatalogText::piece_length(std::string_view bytes) const {
  if (info_.shift_sensitive == 0) {
    int32_t length = LXByteLength(locale_.get(), std::string(bytes.substr(0, 8)).c_str());
    return std::min(bytes.size(), static_cast<size_t>(std::max(length, 1)));
  }
  if (bytes[0] != static_cast<char>(info_.enter_byte)) return 1;
  size_t end = bytes.find(static_cast<char>(info_.leave_byte));
  return end == std::string_view::npos ? bytes.size() : end + 1;
}

bool CatalogText::decode_piece(std::string_view bytes, MessageParts& parts) const {
  bool valid = true;
  std::u32string text;
  if (info_.id == LX_CP_UTF8) {
    text = decode_utf8(bytes, valid);
  } else {
    Conversion conversion(utf8_.get(), locale_.get(), 0, bytes);
    text = decode_utf8(conversion.out, valid);
    valid = valid && !conversion.problem;
  }
  // Controls that have no escape would not be seen.
  valid = valid && !text.empty() && std::none_of(text.begin(), text.end(), [](char32_t c) {
            return std::u32string_view(U"\n\t\v\b\r\f").find(c) == std::u32string_view::npos && must_be_escaped(c) &&
                   c < 0xA0;
          });
  if (valid) {
    for (char32_t c : text) parts.push_back({c, false, {}});
  }
  return valid;
}

MessageParts CatalogText::decode(std::string_view bytes) const {
  MessageParts parts;
  auto as_bytes = [&](std::string_view raw) {
    for (char byte : raw) parts.push_back({static_cast<unsigned char>(byte), true, {}});
  };
  for (std::string_view rest = bytes; !rest.empty();) {
    size_t length = piece_length(rest);
    if (info_.id == LX_CP_UTF8)
      length = std::clamp<size_t>(sequence_length(static_cast<unsigned char>(rest[0])), 1, rest.size());
    if (!decode_piece(rest.substr(0, length), parts)) as_bytes(rest.substr(0, length));
    rest.remove_prefix(length);
  }
  auto comes_back = [&] {
    try {
      return encode(parts) == bytes;
    } catch (const SourceError&) {
      return false;
    }
  };
  if (!comes_back()) {
    parts.clear();
    as_bytes(bytes);
  }
  return parts;
}

std::string CatalogText::to_utf8(std::string_view bytes) const {
  if (info_.id == LX_CP_UTF8) return std::string(bytes);
  Conversion conversion(utf8_.get(), locale_.get(), LX_CONV_LINES_LF, bytes);
  if (!conversion.problem) return conversion.out;
  std::string before =
      Conversion(utf8_.get(), locale_.get(), LX_CONV_LINES_LF, bytes.substr(0, conversion.problem->offset)).out;
  bool valid = true;
  std::u32string line = decode_utf8(before.substr(before.rfind('\n') + 1), valid);
  auto lines = static_cast<unsigned>(std::count(before.begin(), before.end(), '\n'));
  throw SourceError({lines + 1, static_cast<unsigned>(line.size()) + 1},
                    "this is no character of the source's encoding");
}

}  // namespace lx::compiler
