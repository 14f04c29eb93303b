// SPDX-License-Identifier: Apache-2.0
// Catalogs opened and closed, and their messages in the caller's code page.
#include <algorithm>

#include "codepage/one_shot.hpp"
#include "codepage/text/algorithms.hpp"
#include "codepage/truncate.hpp"
#include "msgcat/catalog.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "catalog", 0};

// ---- Opening ----

LXCatalog* open_catalog(LocaleCall& call, const char* directory, const char* name, uint32_t flags) {
  constexpr LXCatalog* kNone = nullptr;
  if (name == nullptr || *name == '\0') return call.fail(LX_E_ARGUMENT, kNone);
  bool one_pass = (flags & LX_CAT_ONEPASS) == LX_CAT_ONEPASS;
  LXFile* file = find_catalog_file(call.locale, directory != nullptr ? directory : "", name, one_pass, call.status);
  if (file == nullptr) return kNone;
  LXCatalog* catalog = load_catalog(&call.locale, file, flags == LX_CAT_LOAD, call.status);
  if (catalog == nullptr) close_catalog_file(file);
  return catalog;
}

int32_t to_bytes(LXLocale& locale, char* out, int32_t size, const LXWChar* text) {
  return LXWideToMbEx(&locale, out, 0, size, text, -1, LX_OPT_TERMINATE);
}
int32_t to_bytes(LXLocale& locale, char* out, int32_t size, const LXUChar* text) {
  return LXUnicodeToStringEx(&locale, out, 0, size, text, -1, LX_OPT_TERMINATE);
}

// A given text in the locale's code page. False: no memory, or too long for a conversion.
template <class Unit>
bool convert_given(LXLocale& locale, const Unit* text, Owned<char>& bytes) {
  if (text == nullptr) return true;
  size_t room = measured_length(text) * (kMaxCharacterLength + 1) + 2;  // each character, a shift byte before it
  if (room > INT32_MAX) return false;
  bytes = Owned<char>::array(room);
  return bytes && to_bytes(locale, bytes.get(), static_cast<int32_t>(room), text) > 0;
}

template <class Unit>
LXCatalog* open_call(const char* function, LXLocale* locale, const Unit* directory, const Unit* name, uint32_t flags) {
  constexpr LXCatalog* kNone = nullptr;
  return locale_call(trace_unit, function, locale, flags, LX_CAT_LOAD, kNone, [&](LocaleCall& call) -> LXCatalog* {
    if constexpr (sizeof(Unit) == 1) {
      return open_catalog(call, directory, name, flags);
    } else {
      Owned<char> directory_bytes;
      Owned<char> name_bytes;
      if (!convert_given(call.locale, directory, directory_bytes) || !convert_given(call.locale, name, name_bytes)) {
        return call.fail(LX_E_MEMORY, kNone);
      }
      return open_catalog(call, directory_bytes.get(), name_bytes.get(), flags);
    }
  });
}

// ---- Messages ----

// Where a message goes. There is room for a terminator.
template <class Unit>
struct Output {
  LXLocale& locale;
  Unit* at;
  int32_t size;
  bool characters;  // the size counts them

  size_t room() const { return static_cast<size_t>(size); }
};

// The first characters of a text, without shift bytes behind them.
Cut cut_characters(const CodePage& page, const Text<char>& text, size_t limit) {
  return ShiftedKind::with_walker(page, text, [=](auto walker) {
    auto begin = walker;
    skip_characters(walker, limit);
    Cut cut = {passed(begin, walker), false};
    if constexpr (requires { walker.double_byte; }) cut.double_byte = walker.double_byte;
    return cut;
  });
}

// Bytes of the output's own page: all of them, or what fits. They may have to end with a shift byte.
[[gnu::noinline]] void cut_text(const Output<char>& out, const char* text, size_t length) {
  const CodePage& page = page_of(out.locale);
  Cut cut = out.characters ? cut_characters(page, {text, length}, out.room() - 1)
                           : find_cut(trace_unit, page, {text, length}, true, out.room(), {});
  std::memcpy(out.at, text, cut.at);
  char* end = out.at + cut.at;
  if (cut.double_byte) *end++ = static_cast<char>(page.leave_byte);
  *end = '\0';
}
void copy_text(const Output<char>& out, const char* text, size_t length) {
  if (length >= out.room() || (out.locale.flags & kLocaleShiftSensitive) != 0) return cut_text(out, text, length);
  out.at[length] = '\0';
  std::memcpy(out.at, text, length);
}
template <class Unit>
void copy_text(const Output<Unit>& out, const Unit* text, size_t length) {
  length = std::min(length, out.room() - 1);
  std::memcpy(out.at, text, length * sizeof *text);
  out.at[length] = 0;
}

// Bytes of the catalog's page.
[[gnu::noinline]] void convert_text(const Output<char>& out, LXLocale& from, const char* text, uint32_t length) {
  const CodePage& page = page_of(from);
  uint32_t options = LX_OPT_TERMINATE;
  if (out.characters) {  // then the length counts them too
    options |= LX_OPT_CHARS;
    length = ShiftedKind::with_walker(page, {text, length},
                                      [](auto walker) { return static_cast<uint32_t>(count_characters(walker)); });
  }
  LXConvertStringEx(&out.locale, out.at, 0, out.size, &from, text, 0, static_cast<int32_t>(length), options);
}
void carry_text(const Output<char>& out, LXLocale& from, const char* text, uint32_t length) {
  if (from.code_page != out.locale.code_page) return convert_text(out, from, text, length);
  copy_text(out, text, length);
}
void carry_text(const Output<LXWChar>& out, LXLocale& from, const char* text, uint32_t length) {
  const CodePage& page = page_of(from);
  const CodePage& wanted = page_of(out.locale);
  if (&page == &wanted) {
    LXMbToWideEx(&from, out.at, out.size, text, 0, static_cast<int32_t>(length), LX_OPT_TERMINATE);
    return;
  }
  Target target(out.at, out.size, LX_OPT_TERMINATE);
  Source<uint8_t> source(bytes_of(text), static_cast<int32_t>(length));
  with_reader(page, {true, 0}, source.text, source.length, [&](auto reader) {
    return convert_source(source, reader, WideWriter(wanted, out.at, target.text_size()), target);
  });
}
void carry_text(const Output<LXUChar>& out, LXLocale& from, const char* text, uint32_t length) {
  LXStringToUnicodeEx(&from, out.at, out.size, text, 0, static_cast<int32_t>(length), LX_OPT_TERMINATE);
}

// What is not in memory: on disk, or nowhere. LX_OK also with the default text, unless it stands in for a failure.
template <class Unit>
[[gnu::noinline]] uint32_t write_other(const Output<Unit>& out, LXCatalog& catalog, uint32_t set_number, int32_t number,
                                       const Unit* default_text) {
  uint32_t status = LX_OK;
  if (catalog.image == nullptr && number > 0) {
    LXCatSet scratch;
    const LXCatSet* set = read_set(catalog, set_number, scratch, status);
    uint32_t length = 0;
    Owned<char> text;
    if (set != nullptr) text = read_message(catalog, *set, static_cast<uint32_t>(number), length, status);
    if (text) {
      carry_text(out, catalog.own_locale, text.get(), length);
      return LX_OK;
    }
  }
  if (default_text != nullptr) {
    copy_text(out, default_text, measured_length(default_text));
    return status;
  }
  *out.at = 0;
  return status != LX_OK ? status : LX_E_MESSAGE;
}

template <class Unit>
uint32_t message_call(const char* function, LXCatalog* catalog, uint32_t set, int32_t number, Unit* out,
                      int32_t out_size, const Unit* default_text, uint32_t flags) {
  if (catalog == nullptr) return exported(trace_unit, function, [] { return LX_E_NOCATALOG; });
  constexpr uint32_t kOptions = LX_OPT_TERMINATE | LX_OPT_CHARS;
  return locale_call(trace_unit, function, catalog->locale, flags, kOptions, LX_E_ARGUMENT, [&](LocaleCall& call) {
    if (out == nullptr || out_size < 1) return call.status;
    const Output<Unit> output = {call.locale, out, out_size, (flags & LX_OPT_CHARS) != 0};
    const LXCatSet* loaded = number > 0 ? loaded_set(*catalog, set) : nullptr;
    MessageText text;
    if (loaded != nullptr) text = loaded_message(*loaded, static_cast<uint32_t>(number));
    if (text.at != nullptr) {
      carry_text(output, catalog->own_locale, text.at, text.length);
    } else {
      call.status = write_other(output, *catalog, set, number, default_text);
    }
    return call.status;
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

LXCatalog* LXOpenCatalog(LXLocale* locale, const char* directory, const char* name, uint32_t flags) noexcept {
  return open_call(__func__, locale, directory, name, flags);
}

LXCatalog* LXOpenCatalogW(LXLocale* locale, const LXWChar* directory, const LXWChar* name, uint32_t flags) noexcept {
  return open_call(__func__, locale, directory, name, flags);
}

LXCatalog* LXOpenCatalogU(LXLocale* locale, const LXUChar* directory, const LXUChar* name, uint32_t flags) noexcept {
  return open_call(__func__, locale, directory, name, flags);
}

uint32_t LXGetMessage(LXCatalog* catalog, uint32_t set, int32_t message, char* out, int32_t out_size,
                      const char* default_text, uint32_t flags) noexcept {
  return message_call(__func__, catalog, set, message, out, out_size, default_text, flags);
}

uint32_t LXGetMessageW(LXCatalog* catalog, uint32_t set, int32_t message, LXWChar* out, int32_t out_size,
                       const LXWChar* default_text, uint32_t flags) noexcept {
  return message_call(__func__, catalog, set, message, out, out_size, default_text, flags);
}

uint32_t LXGetMessageU(LXCatalog* catalog, uint32_t set, int32_t message, LXUChar* out, int32_t out_size,
                       const LXUChar* default_text, uint32_t flags) noexcept {
  return message_call(__func__, catalog, set, message, out, out_size, default_text, flags);
}

uint32_t LXCloseCatalog(LXCatalog* catalog, uint32_t /*reserved*/) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (catalog == nullptr) return LX_E_NOCATALOG;
    close_catalog(catalog);
    return LX_OK;
  });
}

}  // extern "C"
