// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/time_format.hpp"

namespace lx::tool {
namespace {

constexpr int kMostNested = 4;

std::vector<LXUChar> text_item(LXLocale* locale, uint32_t item, bool territory) {
  LXUChar text[128];
  const int32_t count = LXGetLocaleTextInfoU(locale, item, text, 128, territory ? LX_OPT_OBJECT : 0);
  return {text, text + (count > 0 ? count - 1 : 0)};
}

void append(std::vector<LXUChar>& to, const std::vector<LXUChar>& text) {
  to.insert(to.end(), text.begin(), text.end());
}

std::vector<LXUChar> expand(LXLocale* locale, const std::vector<LXUChar>& format, bool territory, int depth) {
  std::vector<LXUChar> whole;
  for (std::size_t i = 0; i < format.size(); ++i) {
    const bool directive = format[i] == '%' && i + 1 < format.size();
    const bool alternate = directive && format[i + 1] == '#' && i + 2 < format.size();
    const std::size_t letter = i + (alternate ? 2 : 1);
    const LXUChar which = directive ? format[letter] : LXUChar{0};
    const bool nested = which == 'c' || which == 'x' || which == 'X';
    if (!nested || depth == kMostNested) {
      const std::size_t end = directive ? letter : i;  // "%%" is no beginning of another directive
      for (; i < end; ++i) whole.push_back(format[i]);
      whole.push_back(format[i]);
      continue;
    }
    const auto add = [&](uint32_t item) {
      append(whole, expand(locale, text_item(locale, item, territory), territory, depth + 1));
    };
    if (which != 'X') add(alternate ? LX_ITEM_LONG_DATE : LX_ITEM_SHORT_DATE);
    if (which == 'c') whole.push_back(' ');
    if (which != 'x') add(LX_ITEM_TIME_FORMAT);
    i = letter;
  }
  return whole;
}

}  // namespace

std::vector<LXUChar> whole_format(LXLocale* locale, const std::vector<LXUChar>& format, bool territory) {
  return expand(locale, format, territory, 0);
}

}  // namespace lx::tool
