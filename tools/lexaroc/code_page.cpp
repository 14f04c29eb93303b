// SPDX-License-Identifier: Apache-2.0
#include "code_page.hpp"

namespace lx::compiler {

unsigned CodePage::max_length() const {
  // Codes are ordered as numbers, so the last is the longest.
  return to_unicode.empty() ? 1 : code_length(to_unicode.rbegin()->first);
}

uint16_t CodePage::unicode_of(Code code) const {
  auto found = to_unicode.find(code);
  return found == to_unicode.end() ? kUnassigned : found->second;
}

Code CodePage::exact_code(uint16_t unicode) const {
  Code code = from_unicode[unicode];
  return code != kNoCode && unicode_of(code) == unicode ? code : kNoCode;
}

std::map<uint16_t, Code> default_codes(const std::map<Code, uint16_t>& to_unicode) {
  std::map<uint16_t, Code> codes;
  for (auto [code, unicode] : to_unicode) codes.emplace(unicode, code);
  return codes;
}

void fill_utf8(CodePage& page) {
  for (uint32_t unicode = 0; unicode < 0x10000; ++unicode) {
    if (unicode >= 0xD800 && unicode <= 0xDFFF) continue;
    Code code = unicode;
    if (unicode >= 0x800) {
      code = 0xE08080 | (unicode & 0xF000) << 4 | (unicode & 0x0FC0) << 2 | (unicode & 0x3F);
    } else if (unicode >= 0x80) {
      code = 0xC080 | (unicode & 0x07C0) << 2 | (unicode & 0x3F);
    }
    page.to_unicode.emplace_hint(page.to_unicode.end(), code, static_cast<uint16_t>(unicode));
    page.from_unicode[unicode] = code;
  }
}

}  // namespace lx::compiler
