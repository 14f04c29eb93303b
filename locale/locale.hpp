// SPDX-License-Identifier: Apache-2.0
// Parts of a locale that more than one file of this folder works on.
#pragma once

#include "frame/records.hpp"
#include "objects/entry.hpp"

namespace lx {

// The locale's own copies of texts, in the order of its fields.
enum class LocaleText : unsigned {
  grouping,           // item 62
  currency,           // 64
  monetary_grouping,  // 68
  positive_sign,      // 71
  negative_sign,      // 72
  time_format,        // 79
  short_date,         // 80
  long_date,          // 81
};

// Bits of the set mask.
inline constexpr uint32_t kSetFractionDigits = 0x001;
inline constexpr uint32_t kSetCurrencyDigits = 0x002;
inline constexpr uint32_t kSetCurrencyIntlDigits = 0x004;
inline constexpr uint32_t kSetYesNo[] = {0x008, 0x010, 0x020, 0x040, 0x080, 0x100};  // items 73-76, 82, 83
inline constexpr uint32_t kSetPositiveSignPosition = 0x200;
inline constexpr uint32_t kSetNegativeSignPosition = 0x400;
inline constexpr uint32_t kSetFirstSeparator = 0x800;  // items 59, 60, 61, 66, 67 in ascending bits,
inline constexpr uint32_t kSetFirstText = 0x10000;     // then the texts

// Bits of the mirror word: separators, then texts.
inline constexpr uint16_t kMirrorFirstText = 0x20;

// Takes the page's properties into the locale's flags.
void note_code_page(LXLocale& locale);

// Stores a text of the caller as the locale's own: `length` bytes of its code page, cut to whole characters, with a
// UCS-2 copy. 0 or LX_E_MEMORY; on failure the former text stays.
uint32_t store_text(LXLocale& locale, LocaleText which, const char* text, size_t length);

// The values that the system's locale of that name defines go into the locale; an empty name is the user's.
void map_native_info(const char* native_name, LXLocale& locale);

// The process-wide system locale, saved while it is switched to another.
class SavedSystemLocale {
 public:
  static constexpr int kRoom = 1024;

  SavedSystemLocale();
  ~SavedSystemLocale();
  SavedSystemLocale(const SavedSystemLocale&) = delete;
  SavedSystemLocale& operator=(const SavedSystemLocale&) = delete;

  bool saved() const { return saved_; }

 private:
  char name_[kRoom];
  bool saved_ = false;
};

}  // namespace lx
