// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/values.hpp"

#include <algorithm>
#include <cctype>

#include "tools/lexaro/conversion.hpp"
#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/input_file.hpp"
#include "tools/lexaro/sort_lines.hpp"
#include "tools/lexaro/terminal_text.hpp"

namespace lx::tool {

bool is_negative_value(const std::string& argument) {
  if (argument.size() < 2 || argument.front() != '-' || argument[1] == '-') return false;
  return std::isalpha(static_cast<unsigned char>(argument[1])) == 0;
}

void for_each_value(const std::vector<std::string>& arguments, const std::string& code_page,
                    const std::function<void(const Value&)>& take) {
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    const std::string& argument = arguments[i];
    const std::size_t mark = argument.starts_with(kValueMark) ? 1 : 0;
    const char* place = arguments.size() == 1 ? nullptr : "value {0}: ";
    take({terminal_ucs2(std::string_view(argument).substr(mark)), place, i + 1});
  }
  if (!arguments.empty()) return;

  const CodePage page = open_code_page(code_page);
  const CodePage utf8 = open_code_page("UTF-8");
  const LineEnds ends(page);
  InputFile input("-");
  LineReader reader(input, ends);
  for (Line line; reader.next(line);) {
    std::string text;
    Conversion conversion(page, utf8, 0, [&](std::string_view bytes) { text += bytes; });
    conversion.convert(line.text);
    conversion.finish();
    take({ucs2_of(text), "line {0}: ", reader.number()});
  }
}

void complain_about(const Value& value, const Message& why, std::optional<std::size_t> position) {
  std::vector<LXUChar> text = value.text;
  std::replace_if(
      text.begin(), text.end(), [](LXUChar unit) { return unit < 0x20 || (unit >= 0x7F && unit < 0xA0); },
      LXUChar{'?'});
  const Message shown = quoted_text(utf8_of(text));
  Message complaint = (value.place ? message(value.place, value.number) : Message()) + why;
  if (position) {
    const std::vector<LXUChar> before(text.begin(), text.begin() + static_cast<std::ptrdiff_t>(*position));
    complaint += "\n  " + shown + "\n  " + std::string(display_width(utf8_of(before)), ' ') + "^";
  } else {
    complaint += ": \"" + shown + "\"";
  }
  complain(complaint);
}

}  // namespace lx::tool
