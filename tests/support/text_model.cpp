// SPDX-License-Identifier: Apache-2.0
#include "support/text_model.hpp"

#include <algorithm>

#include "support/stored_unit.hpp"

namespace lx::test {
namespace {

// Back to the single-byte state; false when nothing can make way for the leave byte.
bool close(Writer& out, size_t size, size_t needed) {
  if (!out.inside) return true;
  const PageSource& page = *out.form.page;
  auto ends_with_enter = [&] { return !out.units.empty() && out.units.back() == page.enter; };
  if (!ends_with_enter() && size - out.units.size() < needed) {
    if (out.units.size() < page.max_length) return false;
    out.units.resize(out.units.size() - page.max_length);
  }
  out.inside = false;
  if (ends_with_enter()) {  // a run that nothing is left of
    out.units.pop_back();
  } else {
    out.units.push_back(page.leave);
  }
  return true;
}

}  // namespace

Units units_of(std::string_view bytes) {
  Units units;
  for (char byte : bytes) units.push_back(static_cast<uint8_t>(byte));
  return units;
}

std::string bytes_of_units(const Units& units) {
  std::string bytes;
  for (uint32_t unit : units) bytes += static_cast<char>(unit);
  return bytes;
}

std::string hex_units(const Units& units) {
  std::string text;
  for (uint32_t unit : units) text += hex(unpacked(unit)) + " ";
  return text;
}

Units first_units(const Units& text, size_t count) {
  return {text.begin(), text.begin() + static_cast<ptrdiff_t>(std::min(count, text.size()))};
}

size_t Form::length_of(uint32_t first, uint32_t in_state) const {
  if (!is_bytes()) return 1;
  if (follows_shifts()) return in_state != 0 ? page->max_length : 1;
  return page->length_of(static_cast<uint8_t>(first));
}

std::string Form::name() const {
  static const char* const kKinds[] = {"plain ", "Ex ", "W ", "U "};
  return kKinds[kind] + (page != nullptr ? page->name : "") + (state != 0 ? " inside" : "");
}

Characters characters_of(const Form& form, const Units& text, size_t most_shifts) {
  Characters found;
  found.state = form.state;
  size_t at = 0;
  auto skip_shifts = [&] {
    for (size_t n = 0; n < most_shifts && at < text.size() && form.is_shift(text[at]); ++n, ++at) {
      found.state = text[at] == form.page->enter;
    }
    found.whole = at;
  };
  skip_shifts();
  while (at < text.size()) {
    size_t size = form.length_of(text[at], found.state);
    if (size > text.size() - at) break;
    Character character = {at, size, 0, text[at], found.state};
    while (++at < character.own_end()) character.code = character.code << 8 | text[at];
    skip_shifts();
    character.end = at;
    found.list.push_back(character);
  }
  found.cut = at < text.size();
  return found;
}

std::string bytes_of_code(uint32_t code, size_t size) {
  std::string bytes(size, '\0');
  for (; size != 0; code >>= 8) bytes[--size] = static_cast<char>(code);
  return bytes;
}

std::string written_bytes(uint32_t packed) {
  std::string bytes = unpacked(packed);
  std::erase(bytes, '\0');
  return (packed & 0xFF) != 0 ? bytes : bytes + '\0';
}

char16_t unicode_of(const Form& form, const Character& c) {
  if (form.kind == Form::ucs2) return static_cast<char16_t>(c.code);
  return form.page->decode(form.is_bytes() ? bytes_of_code(c.code, c.size) : unpacked(c.code));
}

Units Writer::piece(uint16_t unicode) const {
  return form.kind == Form::ucs2 ? Units{unicode} : piece_of_bytes(form.page->encode(unicode));
}

Units Writer::piece_of_bytes(const std::string& code) const {
  if (form.kind == Form::wide) return {packed(code)};
  Units piece = units_of(code);
  bool shift = form.follows_shifts() && inside != (code.size() > 1);
  if (shift) piece.insert(piece.begin(), inside ? form.page->leave : form.page->enter);
  return piece;
}

void Writer::add(const Units& piece) {
  if (form.is_shift(piece[0])) inside = !inside;
  units.insert(units.end(), piece.begin(), piece.end());
}

Units spelled(const Form& form, std::u16string_view text) {
  Writer out{form};
  for (char16_t character : text) out.add(out.piece(character));
  if (out.inside) out.units.push_back(form.page->leave);
  return out.units;
}

std::string encoded(const PageSource& page, std::u16string_view text) {
  return bytes_of_units(spelled({Form::shifted, &page}, text));
}

std::string raw(const Form& form, const Units& units) {
  std::string bytes;
  for (uint32_t unit : units) bytes += stored_unit(unit, form.unit_size());
  return bytes;
}

// ---- Conversion ----

StringResult convert_model(const Form& to, const Form& from, const Units& text, const StringOptions& options,
                           bool packed_transfer) {
  StringResult result;
  size_t size = options.out_size > 0 ? static_cast<size_t>(options.out_size) : 0;
  bool measured = options.in_length < 0;
  bool by_characters = options.characters && to.is_bytes();
  Writer out{to};
  Units source = text;
  if (!measured && options.characters && from.is_bytes()) {
    auto list = characters_of(from, text, 1).list;
    auto wanted = static_cast<size_t>(options.in_length);
    source.resize(wanted == 0 ? 0 : wanted <= list.size() ? list[wanted - 1].own_end() : text.size());
  } else if (!measured) {
    source.resize(static_cast<size_t>(options.in_length));
  }

  if ((!measured && source.empty()) || size == 0) {
    const bool room = size > 1 || (size == 1 && (!out.inside || by_characters));
    if (!options.terminate || !room) return result;
    if (out.inside) out.units.push_back(to.page->leave);
    out.units.push_back(0);
    result.written = out.units;
    result.count = by_characters ? 1 : static_cast<int32_t>(out.units.size());
    return result;
  }

  size_t text_size = options.terminate ? size - 1 : size;
  Characters parsed = characters_of(from, source, 1);
  // Packing takes the terminator for text, also behind a character that it cuts off.
  bool complete = !parsed.cut || (packed_transfer && to.kind == Form::wide);
  size_t characters = 0;
  for (; characters < parsed.list.size(); ++characters) {
    const Character& c = parsed.list[characters];
    Units piece = !packed_transfer        ? out.piece(unicode_of(from, c))
                  : to.kind == Form::wide ? Units{c.code}
                                          : out.piece_of_bytes(written_bytes(c.code));
    if (by_characters ? characters + 1 > text_size : out.units.size() + piece.size() > text_size) break;
    out.add(piece);
    result.consumed = c.own_end();
  }
  bool all = complete && characters == parsed.list.size();
  if (all) result.consumed = source.size();
  size_t used = by_characters ? characters : out.units.size();
  bool due = options.terminate || (measured && all && used < size);
  size_t room = by_characters ? out.units.size() + 8 : text_size;
  bool closed = close(out, room, options.terminate || !due ? 1 : 2);
  result.count = static_cast<int32_t>(by_characters ? characters : out.units.size());
  if (due && closed) {
    out.units.push_back(0);
    ++result.count;
  }
  result.written = out.units;
  return result;
}

}  // namespace lx::test
