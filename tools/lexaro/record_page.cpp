// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/record_page.hpp"

#include <stdexcept>

#include "tools/lexaro/conversion.hpp"

namespace lx::tool {

RecordPage::RecordPage(const CodePage& code_page) : page(code_page) {
  if (LXGetCodePageInfo(LXGetLocaleObject(page.locale.get(), LX_CODEPAGE), &info) != LX_OK) {
    throw std::logic_error("a loaded code page does not describe itself");
  }
  blank = info.ascii_family != 0 ? '\x20' : '\x40';
  wide_blank = encode("\xE3\x80\x80").value_or("");
  if (info.shift_sensitive != 0 && wide_blank.size() > 2) wide_blank = wide_blank.substr(1, wide_blank.size() - 2);
  line_ends = info.ascii_family != 0 ? "\x0A" : "\x15\x25";
}

std::optional<std::string> RecordPage::encode(std::string_view utf8) const {
  const CodePage unicode = open_code_page("UTF-8");
  std::string text;
  Conversion conversion(unicode, page, LX_CONV_STRICT, [&](std::string_view converted) { text += converted; });
  conversion.convert(utf8);
  conversion.finish();
  if (conversion.counts().substituted != 0) return std::nullopt;
  return text;
}

}  // namespace lx::tool
