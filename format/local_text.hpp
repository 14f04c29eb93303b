// SPDX-License-Identifier: Apache-2.0
// Texts of a locale that numbers, money and times are written and read with.
#pragma once

#include "codepage/text/kinds.hpp"
#include "locale/locale.hpp"

namespace lx {

// A text of the locale in the units of the call, cut to the room that it is given and terminated. Of the options of
// the call only LX_NUM_TEXTOPT counts.
template <class Kind, size_t kRoom>
class LocalText {
 public:
  using Unit = typename Kind::Unit;

  LocalText(const LXLocale& locale, uint32_t item, uint32_t options) {
    static_assert(LX_NUM_TEXTOPT == LX_OPT_OBJECT);
    const bool own = (options & LX_OPT_OBJECT) == 0;
    if (std::same_as<Kind, Ucs2Kind> ? take_characters(locale, item, own) : own && take_bytes(locale, item)) return;
    int32_t count = 0;
    TextTarget<Unit> target = {units_, kRoom, nullptr, {Kind::kShifted, 0}, options & LX_OPT_OBJECT};
    finish(read_text(locale, item, target, count) == LX_OK && count > 0 ? static_cast<size_t>(count) - 1 : 0);
  }

  const Unit* begin() const { return units_; }
  size_t length() const { return length_; }
  bool empty() const { return length_ == 0; }
  Unit front() const { return units_[0]; }  // 0: empty

 private:
  // What needs no conversion. Characters of one byte are stored as that byte in all forms but UCS-2.
  bool take_bytes(const LXLocale& locale, uint32_t number) {
    const Item& item = item_of(number);
    const CodePage& page = page_of(locale);
    if (item.kind != ItemKind::string || page.shift_sensitive || locale.strings[item.index] == nullptr) return false;
    size_t length = 0;
    for (const uint8_t* text = bytes_of(locale.strings[item.index]); text[length] != 0; ++length) {
      if (length + 1 == kRoom || page.char_length[text[length]] != 1) return false;
      units_[length] = static_cast<Unit>(text[length]);
    }
    finish(length);
    return true;
  }
  bool take_characters(const LXLocale& locale, uint32_t number, bool own) {
    ItemText text;
    if (find_text(locale, number, own, text) != LX_OK || text.form == LX_FORM_NAME || text.units >= kRoom) return false;
    for (size_t i = 0; i < text.units; ++i) units_[i] = static_cast<Unit>(text.ucs2[i]);
    finish(text.units);
    return true;
  }
  void finish(size_t length) {
    length_ = length;
    units_[length] = 0;
  }

  Unit units_[kRoom];
  size_t length_;
};

// The first unit of a separator, 0 where there is none: read from the record itself unless its territory is asked for.
template <class Kind>
typename Kind::Unit local_separator(const LXLocale& locale, uint32_t item, uint32_t options) {
  if ((options & LX_NUM_TEXTOPT) == 0) {
    const unsigned index = item_of(item).index;
    [[maybe_unused]] const CodePage& page = page_of(locale);
    const LXUChar character = locale.ucs2_separators[index];
    if constexpr (std::same_as<Kind, Ucs2Kind>) {
      return character;
    } else if constexpr (std::same_as<Kind, WideKind>) {
      return character != 0 ? WideWriter(page, nullptr, 0).code(character) : 0;
    } else if (!Kind::kShifted && !page.shift_sensitive) {
      return locale.separators[index];
    }
  }
  return LocalText<Kind, 5>(locale, item, options).front();
}

}  // namespace lx
