// SPDX-License-Identifier: Apache-2.0
// The texts of a locale, delivered into the caller's buffer.
#include "codepage/one_shot.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "get_text", 0};

// A text on its way: the bytes of the locale as they are, or its characters.
struct Delivery {
  const CodePage& page;  // of the locale
  const ItemText& text;
  const Target& target;
  bool as_bytes;

  template <class Out>
  int32_t bytes_to(Out out) const {
    if constexpr (std::same_as<Out, PackedWriter>) {
      if (!target.characters && text.length <= out.room()) return all_bytes_to(out.begin);
    }
    Source<uint8_t> source(bytes_of(text.bytes), static_cast<int32_t>(text.length));
    return with_reader(page, {}, source.text, source.length,
                       [&](auto in) { return convert_source(source, in, out, target, AsPacked()).count; });
  }
  template <class Out>
  int32_t characters_to(Out out) const {
    if constexpr (!Out::kShifted) {
      if (!target.characters) return each_character_to(out);
    }
    Source<LXUChar> source(text.ucs2, static_cast<int32_t>(text.units));
    return convert_source(source, Ucs2Reader(source.text, source.length), out, target).count;
  }

 private:
  // Texts of a locale are short: what makes long ones quick would take more time than it saves. There is room for the
  // terminator.
  int32_t all_bytes_to(uint8_t* out) const {
    std::memcpy(out, text.bytes, text.length);
    out[text.length] = 0;
    return static_cast<int32_t>(text.length) + 1;
  }
  template <class Out>
  int32_t each_character_to(Out out) const {
    for (size_t i = 0; i < text.units; ++i) {
      uint32_t code = out.code(text.ucs2[i]);
      if (!out.fits(code)) break;
      out.put(code);
    }
    *out.at = 0;
    return static_cast<int32_t>(out.at - out.begin) + 1;
  }
};

int32_t write(const Delivery& from, char* buffer, const CodePage& page, Shifts shifts) {
  size_t room = from.target.byte_room();
  if (from.as_bytes) return from.bytes_to(PackedWriter(bytes_of(buffer), room));
  return with_writer(page, shifts, bytes_of(buffer), room, [&](auto out) { return from.characters_to(out); });
}

int32_t write(const Delivery& from, LXWChar* buffer, const CodePage& page, Shifts) {
  WideWriter out(page, buffer, from.target.text_size());
  return from.as_bytes ? from.bytes_to(out) : from.characters_to(out);
}

int32_t write(const Delivery& from, LXUChar* buffer, const CodePage&, Shifts) {
  return from.characters_to(Ucs2Writer(buffer, from.target.text_size()));
}

// The bytes that the locale holds are what the caller gets, wherever they tell the characters by themselves: not where
// double-byte characters stand without shift bytes. Names are good in every ASCII page; of separators, only the plain
// form wants no more than the byte.
bool goes_as_bytes(const ItemText& text, bool separator, bool plain, const CodePage& own) {
  if (text.form == LX_FORM_UCS2) return false;
  if (text.form == LX_FORM_NAME) return own.ascii_family;
  if (own.shift_sensitive) return plain && text.units == text.length;
  return plain || !separator;
}

}  // namespace

template <class Unit>
uint32_t read_text(const LXLocale& locale, uint32_t number, const TextTarget<Unit>& to, int32_t& count) {
  count = 0;
  if (to.size <= 0) return LX_OK;
  const Item& item = item_of(number);
  ItemText text;
  char full_name[kFullNameRoom];
  if (item.kind == ItemKind::full_name) {
    text = {.form = LX_FORM_NAME, .bytes = full_name, .length = write_full_name(locale, full_name)};
  } else {
    uint32_t status = find_text(locale, number, (to.options & LX_OPT_OBJECT) == 0, text);
    if (status != LX_OK) return status;
  }
  LXUChar name[kFullNameRoom];
  if (text.form == LX_FORM_NAME) {
    const CodePage& ascii = ascii_code_page();
    for (; text.units < text.length; ++text.units) {
      name[text.units] = ascii.to_unicode[static_cast<uint8_t>(text.bytes[text.units])];
    }
    text.ucs2 = name;
  }

  const CodePage& own = page_of(locale);
  const CodePage& wanted = to.page != nullptr ? *to.page : own;
  bool separator = item.kind == ItemKind::separator;
  bool plain = std::same_as<Unit, char> && !to.shifts.followed;
  bool as_bytes = !std::same_as<Unit, LXUChar> && &own == &wanted && goes_as_bytes(text, separator, plain, own);
  // A separator that needs more than a byte is none in the plain form, but for the byte that the locale keeps.
  if (separator && plain && !as_bytes && text.units != 0 && WideWriter(own, nullptr, 0).code(*text.ucs2) > 0xFF) {
    text.units = 0;
  }
  Target target(to.buffer, to.size, LX_OPT_TERMINATE | (to.options & LX_OPT_CHARS));
  Delivery delivery = {own, text, target, as_bytes};
  count = write(delivery, to.buffer, wanted, to.shifts);
  return LX_OK;
}

template uint32_t read_text(const LXLocale&, uint32_t, const TextTarget<char>&, int32_t&);
template uint32_t read_text(const LXLocale&, uint32_t, const TextTarget<LXWChar>&, int32_t&);
template uint32_t read_text(const LXLocale&, uint32_t, const TextTarget<LXUChar>&, int32_t&);

namespace {

template <class Unit>
int32_t get_text(const char* function, LXLocale* locale, uint32_t number, Unit* buffer, int32_t size,
                 const LXObjEntry* code_page, Shifts shifts, uint32_t options) {
  return locale_call(trace_unit, function, locale, options, LX_OPT_OBJECT | LX_OPT_CHARS, int32_t{-1},
                     [&](LocaleCall& call) -> int32_t {
                       if (code_page == nullptr) code_page = call.locale.code_page;
                       if (buffer == nullptr || !is_loaded_code_page(code_page)) return call.fail(LX_E_ARGUMENT, -1);
                       int32_t count = 0;
                       call.status = read_text<Unit>(call.locale, number,
                                                     {buffer, size, &code_page_of(*code_page), shifts, options}, count);
                       return call.status == LX_OK ? count : -1;
                     });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXGetLocaleTextInfo(LXLocale* locale, uint32_t item, char* buffer, int32_t size, uint32_t options) noexcept {
  return get_text(__func__, locale, item, buffer, size, nullptr, {}, options);
}

int32_t LXGetLocaleTextInfoEx(LXLocale* locale, uint32_t item, char* buffer, int32_t size, const LXObjEntry* code_page,
                              uint32_t options) noexcept {
  return get_text(__func__, locale, item, buffer, size, code_page, {true, 0}, options);
}

int32_t LXGetLocaleTextInfoW(LXLocale* locale, uint32_t item, LXWChar* buffer, int32_t size,
                             uint32_t options) noexcept {
  return get_text(__func__, locale, item, buffer, size, nullptr, {}, options);
}

int32_t LXGetLocaleTextInfoU(LXLocale* locale, uint32_t item, LXUChar* buffer, int32_t size,
                             uint32_t options) noexcept {
  return get_text(__func__, locale, item, buffer, size, nullptr, {}, options);
}

}  // extern "C"
