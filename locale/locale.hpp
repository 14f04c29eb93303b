// SPDX-License-Identifier: Apache-2.0
// Parts of a locale that more than one file of this folder works on.
#pragma once

#include "codepage/text/text_kinds.hpp"
#include "frame/call.hpp"
#include "frame/memory.hpp"
#include "locale/items.hpp"

namespace lx {

inline constexpr int32_t kLocaleNameRoom = 132;  // of a locale name that is made from a native one

// ---- Filling and changing ----

// Takes the page's properties into the locale's flags.
void note_code_page(LXLocale& locale);

// The byte that stands for a separator in the locale. What needs more bytes, or is not in the page, is replaced there;
// its UCS-2 value in the record stays true.
char separator_byte(const CodePage& page, LXUChar character);

// A new text in a code page, without shift bytes; null: no memory.
Owned<char> text_in_page(const CodePage& page, const LXUChar* text);

// The locale's own text of a string item, from the territory. LX_OK or LX_E_MEMORY; on failure the former text stays.
uint32_t fill_string(LXLocale& locale, const Item& item);

// Makes another object the locale's. LX_OK or LX_E_MEMORY.
uint32_t take_object(LXLocale& locale, uint8_t type, LXObjEntry* entry);

// What a lookup without a result means for the one who set an id or a name. LX_OK: the binary sort.
inline uint32_t lookup_status(const LXObjEntry* entry, uint32_t rc) {
  if (entry != nullptr || rc == LX_OK) return LX_OK;
  return rc == LX_E_MEMORY ? LX_E_MEMORY : LX_E_NOTFOUND;
}

// ---- Texts ----

// A text in the locale's code page, and as UCS-2 where the bytes alone do not tell its characters.
struct GivenText {
  const char* bytes;
  size_t length;
  const LXUChar* ucs2 = nullptr;
  size_t characters = 0;
};

// Stores a text of the caller as the locale's own, cut to whole characters, with a UCS-2 copy. LX_OK or LX_E_MEMORY; on
// failure the former text stays.
uint32_t store_string(LXLocale& locale, const Item& item, const GivenText& text);

// Where the text of an item is. Bytes are of the locale's code page (form 2) or ASCII (form 3).
struct ItemText {
  uint32_t form = 0;
  const char* bytes = nullptr;
  size_t length = 0;
  const LXUChar* ucs2 = nullptr;  // forms 1 and 2
  size_t units = 0;
};

// LX_OK, LX_E_ITEM, or LX_E_NOTFOUND. The full name has no text of this kind.
uint32_t find_text(const LXLocale& locale, uint32_t number, bool own, ItemText& text);

// Where a text goes: the room in units, the code page of bytes and packed characters (null: the locale's), options as
// of LXGetLocaleTextInfo.
template <class Unit>
struct TextTarget {
  Unit* buffer;
  int32_t size;
  const CodePage* page = nullptr;
  Shifts shifts = {};
  uint32_t options = 0;
};

// Writes the text of an item, terminated, and counts it with its terminator. LX_OK or as find_text().
template <class Unit>
uint32_t read_text(const LXLocale& locale, uint32_t number, const TextTarget<Unit>& to, int32_t& count);

inline constexpr size_t kFullNameRoom = 136;  // four names, what stands between them, and a terminator
size_t write_full_name(const LXLocale& locale, char* buffer);

// The page that ASCII names go through.
const CodePage& ascii_code_page();

// ---- The system's locale ----

// The process-wide system locale, saved while it is switched to another.
class SavedSystemLocale {
 public:
  static constexpr int kRoom = 1024;

  SavedSystemLocale();
  ~SavedSystemLocale();
  SavedSystemLocale(const SavedSystemLocale&) = delete;
  SavedSystemLocale& operator=(const SavedSystemLocale&) = delete;

  bool saved() const { return saved_; }
  void forget() { saved_ = false; }

 private:
  char name_[kRoom];
  bool saved_ = false;
};

}  // namespace lx
