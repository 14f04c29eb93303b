// SPDX-License-Identifier: Apache-2.0
#include "support/text_model.hpp"

#include <algorithm>
#include <optional>

namespace lx::test {
namespace {

constexpr uint32_t kFull = 52;
constexpr uint32_t kPartial = 53;

struct Character {
  uint16_t unicode;
  uint32_t packed;
};

struct Parsed {
  std::vector<Character> characters;
  std::vector<size_t> ends;  // units up to and with each character
  bool complete = true;      // no character is cut off by the end
};

bool is_shift(const PageSource& page, uint32_t unit) { return unit == page.enter || unit == page.leave; }

// The character of a packed value, whose zero bytes behind the first are not there.
uint16_t unicode_of_packed(const PageSource& page, uint32_t value) { return page.decode(unpacked(value)); }

Parsed parse_bytes(const Form& form, const Units& text) {
  const PageSource& page = *form.page;
  bool inside = form.state != 0;
  Parsed parsed;
  size_t at = 0;
  while (at < text.size()) {
    if (form.follows_shifts() && is_shift(page, text[at])) {
      inside = text[at] == page.enter;
      if (++at == text.size()) break;
    }
    size_t length =
        form.follows_shifts() ? (inside ? page.max_length : 1u) : page.length_of(static_cast<uint8_t>(text[at]));
    if (length > text.size() - at) {
      parsed.complete = false;
      break;
    }
    std::string bytes;
    for (size_t i = 0; i < length; ++i) bytes += static_cast<char>(text[at + i]);
    at += length;
    parsed.characters.push_back({page.decode(bytes), packed(bytes)});
    parsed.ends.push_back(at);
  }
  return parsed;
}

Parsed parse(const Form& form, const Units& text) {
  if (form.is_bytes()) return parse_bytes(form, text);
  Parsed parsed;
  for (uint32_t unit : text) {
    auto unicode = form.kind == Form::wide ? unicode_of_packed(*form.page, unit) : static_cast<uint16_t>(unit);
    parsed.characters.push_back({unicode, unit});
    parsed.ends.push_back(parsed.ends.size() + 1);
  }
  return parsed;
}

// Zero bytes in the middle of a packed value are not written.
std::string written_bytes(uint32_t value) {
  std::string bytes = unpacked(value);
  char last = bytes.back();
  bytes.pop_back();
  std::erase(bytes, '\0');
  return bytes + last;
}

// A target that grows by whole characters.
struct Written {
  const Form& form;
  Units units;
  bool inside;

  explicit Written(const Form& target) : form(target), inside(target.state != 0 && target.follows_shifts()) {}

  Units piece(const Character& character, bool packed_transfer) const {
    if (form.kind == Form::ucs2) return {character.unicode};
    std::string code = packed_transfer ? written_bytes(character.packed) : form.page->encode(character.unicode);
    if (form.kind == Form::wide) return {packed_transfer ? character.packed : packed(code)};
    bool shift = form.follows_shifts() && inside != (code.size() > 1);
    Units piece = units_of(code);
    if (shift) piece.insert(piece.begin(), inside ? form.page->leave : form.page->enter);
    return piece;
  }
  void add(const Units& piece) {
    if (form.follows_shifts() && is_shift(*form.page, piece[0])) inside = !inside;
    units.insert(units.end(), piece.begin(), piece.end());
  }
  // Back to the single-byte state; false when nothing can make way for the leave byte.
  bool close(size_t size, size_t needed) {
    if (!inside) return true;
    auto ends_with_enter = [&] { return !units.empty() && units.back() == form.page->enter; };
    if (!ends_with_enter() && size - units.size() < needed) {
      if (units.size() < form.page->max_length) return false;
      units.resize(units.size() - form.page->max_length);
    }
    inside = false;
    if (ends_with_enter()) {  // a run that nothing is left of
      units.pop_back();
    } else {
      units.push_back(form.page->leave);
    }
    return true;
  }
};

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

std::string encoded(const PageSource& page, std::u16string_view text) {
  Form form = {Form::shifted, &page};
  Written out(form);
  for (char16_t character : text) out.add(out.piece({character, 0}, false));
  if (out.inside) out.units.push_back(page.leave);
  return bytes_of_units(out.units);
}

StringResult convert_model(const Form& to, const Form& from, const Units& text, const StringOptions& options,
                           bool packed_transfer) {
  StringResult result;
  size_t size = options.out_size > 0 ? static_cast<size_t>(options.out_size) : 0;
  bool measured = options.in_length < 0;
  bool by_characters = options.characters && to.is_bytes();
  Written out(to);
  Units source = text;
  if (!measured && options.characters && from.is_bytes()) {
    auto ends = parse(from, text).ends;
    auto wanted = static_cast<size_t>(options.in_length);
    source.resize(wanted == 0 ? 0 : wanted <= ends.size() ? ends[wanted - 1] : text.size());
  } else if (!measured) {
    source.resize(static_cast<size_t>(options.in_length));
  }

  if ((!measured && source.empty()) || size == 0) {
    if (!options.terminate || size == 0) return result;
    if (out.inside) {
      if (!by_characters && size < 2) return result;
      out.units.push_back(to.page->leave);
    }
    out.units.push_back(0);
    result.written = out.units;
    result.count = by_characters ? 1 : static_cast<int32_t>(out.units.size());
    return result;
  }

  size_t text_size = options.terminate ? size - 1 : size;
  Parsed parsed = parse(from, source);
  // Packing takes the terminator for text, also behind a character that it cuts off.
  if (packed_transfer && to.kind == Form::wide) parsed.complete = true;
  size_t characters = 0;
  for (; characters < parsed.characters.size(); ++characters) {
    Units piece = out.piece(parsed.characters[characters], packed_transfer);
    if (by_characters ? characters + 1 > text_size : out.units.size() + piece.size() > text_size) break;
    out.add(piece);
    result.consumed = parsed.ends[characters];
  }
  bool all = parsed.complete && characters == parsed.characters.size();
  if (all) result.consumed = source.size();
  size_t used = by_characters ? characters : out.units.size();
  bool due = options.terminate || (measured && all && used < size);
  size_t room = by_characters ? out.units.size() + 8 : text_size;
  bool closed = out.close(room, options.terminate || !due ? 1 : 2);
  result.count = static_cast<int32_t>(by_characters ? characters : out.units.size());
  if (due && closed) {
    out.units.push_back(0);
    ++result.count;
  }
  result.written = out.units;
  return result;
}

int32_t char_to_byte_model(const PageSource& page, std::string_view text, uint32_t state, int32_t chars) {
  bool inside = state != 0;
  size_t at = 0;
  auto take_shift = [&] {
    if (at >= text.size() || !is_shift(page, static_cast<uint8_t>(text[at]))) return;
    inside = static_cast<uint8_t>(text[at]) == page.enter;
    ++at;
  };
  for (int32_t i = 0; i < chars; ++i) {
    if (page.mixed()) take_shift();
    at += page.mixed() ? (inside ? page.max_length : 1u) : page.length_of(static_cast<uint8_t>(text[at]));
    if (page.mixed()) take_shift();
  }
  return static_cast<int32_t>(at);
}

int32_t byte_to_char_model(const PageSource& page, std::string_view text, uint32_t state) {
  Form form = {Form::shifted, &page, state};
  return static_cast<int32_t>(parse_bytes(form, units_of(text)).characters.size());
}

size_t BufferModel::length_of(char first) const {
  if (source_.mixed()) return source_inside_ ? source_.max_length : 1u;
  return source_.length_of(static_cast<uint8_t>(first));
}

uint32_t BufferModel::convert(std::string& out, size_t room, std::string_view& in) {
  if (!pending_.empty()) {
    if (room == 0) return kFull;
    size_t count = std::min(room, pending_.size());
    out += pending_.substr(0, count);
    pending_.erase(0, count);
    room -= count;
    if (!pending_.empty()) return kFull;
  }
  for (;;) {
    std::string character;
    if (!held_.empty()) {
      size_t missing = length_of(held_[0]) - held_.size();
      if (in.size() < missing) {
        held_ += in;
        in = {};
        return kPartial;
      }
      character = held_ + std::string(in.substr(0, missing));
      held_.clear();
      in.remove_prefix(missing);
    } else {
      if (in.empty()) return 0;
      // One shift byte before a character, also when the text is cut behind it.
      if (source_.mixed() && !past_shift_ && is_shift(source_, static_cast<uint8_t>(in[0]))) {
        source_inside_ = static_cast<uint8_t>(in[0]) == source_.enter;
        in.remove_prefix(1);
        past_shift_ = true;
        if (in.empty()) return 0;
      }
      past_shift_ = false;
      size_t length = length_of(in[0]);
      if (in.size() < length) {
        held_ = in;
        in = {};
        return kPartial;
      }
      character = in.substr(0, length);
      in.remove_prefix(length);
    }
    std::string piece = target_.encode(source_.decode(character));
    if (target_.mixed() && target_inside_ != (piece.size() > 1)) {
      piece.insert(piece.begin(), static_cast<char>(target_inside_ ? target_.leave : target_.enter));
      target_inside_ = !target_inside_;
    }
    size_t count = std::min(room, piece.size());
    out += piece.substr(0, count);
    room -= count;
    if (count < piece.size()) {
      pending_ = piece.substr(count);
      return kFull;
    }
  }
}

}  // namespace lx::test
