// SPDX-License-Identifier: Apache-2.0
// What a program may want to know of a code page before it converts.
#include <cstring>

#include "frame/records.hpp"
#include "objects/entry.hpp"

using namespace lx;

extern "C" uint32_t LXGetCodePageInfo(const LXObjEntry* code_page, LXCodePageInfo* info) noexcept {
  if (!is_loaded_code_page(code_page) || info == nullptr) return LX_E_ARGUMENT;
  const CodePage& page = code_page_of(*code_page);
  *info = {code_page->id,     page.max_length,      page.substitution, {},
           page.ascii_family, page.shift_sensitive, page.enter_byte,   page.leave_byte};
  std::memcpy(info->line_bytes, page.raw.header->line_bytes, sizeof info->line_bytes);
  return LX_OK;
}
