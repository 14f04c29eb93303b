// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/terminal_text.hpp"

#include <langinfo.h>

#include <algorithm>
#include <clocale>

#include "tools/lexaro/code_page_names.hpp"
#include "tools/lexaro/environment_locale.hpp"
#include "tools/lexaro/output_file.hpp"

namespace lx::tool {
namespace {

constexpr LXUChar kReplacement = 0xFFFD;

struct Range {
  LXUChar first;
  LXUChar last;
};

constexpr Range kWide[] = {{0x1100, 0x115F}, {0x2E80, 0x303E}, {0x3041, 0x4DBF}, {0x4E00, 0xA4CF}, {0xA960, 0xA97C},
                           {0xAC00, 0xD7A3}, {0xF900, 0xFAFF}, {0xFE30, 0xFE6F}, {0xFF01, 0xFF60}, {0xFFE0, 0xFFE6}};
constexpr Range kCombining[] = {{0x0300, 0x036F}, {0x0483, 0x0489}, {0x0591, 0x05BD}, {0x064B, 0x065F},
                                {0x0E34, 0x0E3A}, {0x0E47, 0x0E4E}, {0x200B, 0x200F}, {0x20D0, 0x20F0},
                                {0x302A, 0x302D}, {0x3099, 0x309A}, {0xFE20, 0xFE2F}};

template <std::size_t count>
bool is_in(const Range (&ranges)[count], LXUChar unit) {
  return std::any_of(ranges, ranges + count, [unit](Range r) { return unit >= r.first && unit <= r.last; });
}

bool is_control(LXUChar unit) { return unit < 0x20 || (unit >= 0x7F && unit < 0xA0); }

// The code set of the user's locale, which need not be installed here.
std::string terminal_code_set() {
  if (std::setlocale(LC_CTYPE, "")) return ::nl_langinfo(CODESET);
  return code_set_of(environment_locale("LC_CTYPE"));
}

// The code page of the terminal, or null: it is UTF-8, or unknown and best taken for UTF-8.
const LXObjEntry* terminal_page() {
  LXObjEntry* entry = find_code_page(terminal_code_set());
  uint32_t rc = 0;
  if (!entry || LXGetObjId(entry) == LX_CP_UTF8) return nullptr;
  return LXLoadObj(LXGetObjManager(), entry, &rc) && rc == LX_OK ? entry : nullptr;
}

std::string in_code_page(const std::vector<LXUChar>& text, const LXObjEntry* page) {
  std::string bytes(text.size() * 4 + 1, '\0');
  const int32_t length = LXCpUnicodeToStr(page, bytes.data(), static_cast<int32_t>(bytes.size()), text.data(),
                                          static_cast<int32_t>(text.size()), 0);
  bytes.resize(static_cast<std::size_t>(std::max(length, 0)));
  // The page's own substitution byte is mostly a control that a terminal does not show.
  LXCodePageInfo info{};
  if (LXGetCodePageInfo(page, &info) == LX_OK && info.substitution < 0x20) {
    std::replace(bytes.begin(), bytes.end(), static_cast<char>(info.substitution), '?');
  }
  return bytes;
}

bool is_number(const std::string& cell) {
  return !cell.empty() && cell.find_first_not_of("0123456789") == std::string::npos;
}

}  // namespace

std::string utf8_of(const std::vector<LXUChar>& text) {
  std::string utf8;
  const auto put = [&](unsigned byte) { utf8.push_back(static_cast<char>(byte)); };
  for (LXUChar unit : text) {
    const unsigned value = unit >= 0xD800 && unit < 0xE000 ? kReplacement : unit;
    if (value < 0x80) {
      put(value);
    } else if (value < 0x800) {
      put(0xC0 | value >> 6);
      put(0x80 | (value & 0x3F));
    } else {
      put(0xE0 | value >> 12);
      put(0x80 | (value >> 6 & 0x3F));
      put(0x80 | (value & 0x3F));
    }
  }
  return utf8;
}

std::vector<LXUChar> ucs2_of(std::string_view text) {
  std::vector<LXUChar> units;
  for (std::size_t i = 0; i < text.size();) {
    const auto byte = [&](std::size_t at) { return at < text.size() ? static_cast<unsigned char>(text[at]) : 0U; };
    const auto trail = [&](std::size_t at) { return (byte(at) & 0xC0) == 0x80; };
    const unsigned lead = byte(i);
    unsigned unit = lead < 0x80 ? lead : kReplacement;
    std::size_t length = 1;
    if (lead >= 0xC2 && lead < 0xE0 && trail(i + 1)) {
      unit = (lead & 0x1F) << 6 | (byte(i + 1) & 0x3F);
      length = 2;
    } else if (lead >= 0xE0 && lead < 0xF0 && trail(i + 1) && trail(i + 2)) {
      unit = (lead & 0x0F) << 12 | (byte(i + 1) & 0x3F) << 6 | (byte(i + 2) & 0x3F);
      length = 3;
    }
    units.push_back(static_cast<LXUChar>(unit));
    i += length;
  }
  return units;
}

std::size_t display_width(std::string_view utf8) {
  std::size_t width = 0;
  for (LXUChar unit : ucs2_of(utf8)) width += is_in(kWide, unit) ? 2 : is_in(kCombining, unit) ? 0 : 1;
  return width;
}

std::vector<LXUChar> terminal_ucs2(std::string_view text) {
  constexpr uint16_t kAscii = 367;  // the C locale, in which text beyond ASCII is UTF-8 today
  const LXObjEntry* page = terminal_page();
  if (!page || LXGetObjId(page) == kAscii) return ucs2_of(text);
  std::vector<LXUChar> units(text.size() + 1);
  const int32_t length = LXCpStrToUnicode(page, units.data(), static_cast<int32_t>(units.size()), text.data(),
                                          static_cast<int32_t>(text.size()), 0);
  units.resize(static_cast<std::size_t>(std::max(length, 0)));
  return units;
}

Terminal::Terminal() : page_(terminal_page()) {}

std::string Terminal::encode(std::string_view utf8) const {
  std::vector<LXUChar> text = ucs2_of(utf8);
  std::replace_if(
      text.begin(), text.end(), [](LXUChar unit) { return unit != '\n' && is_control(unit); }, LXUChar{'?'});
  return page_ ? in_code_page(text, page_) : utf8_of(text);
}

std::string terminal_text(std::string_view utf8) { return Terminal().encode(utf8); }

void print_text(std::string_view utf8) { print(terminal_text(utf8)); }

std::string TextTable::text() const {
  const std::size_t columns = rows_.front().size();
  std::vector<std::size_t> widths(columns, 0);
  std::vector<bool> numeric(columns, rows_.size() > 1);
  for (const Row& row : rows_) {
    for (std::size_t i = 0; i < columns; ++i) {
      widths[i] = std::max(widths[i], display_width(row[i]));
      if (&row != &rows_.front() && !is_number(row[i])) numeric[i] = false;
    }
  }
  std::string text;
  for (const Row& row : rows_) {
    std::string line;
    for (std::size_t i = 0; i < columns; ++i) {
      const std::string blanks(widths[i] - display_width(row[i]), ' ');
      line += (i == 0 ? "" : "  ") + (numeric[i] ? blanks + row[i] : row[i] + blanks);
    }
    line.erase(line.find_last_not_of(' ') + 1);
    text += line + "\n";
  }
  return text;
}

}  // namespace lx::tool
