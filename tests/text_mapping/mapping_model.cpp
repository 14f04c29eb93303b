// SPDX-License-Identifier: Apache-2.0
#include "text_mapping/mapping_model.hpp"

#include <lexaro/lexaro.h>

#include <algorithm>
#include <iterator>

#include "text_mapping/unicode_model.hpp"

namespace lx::test {
namespace {

const PageObject& object_of(uint16_t id) {
  static std::map<uint16_t, PageObject> objects;
  auto at = objects.find(id);
  if (at == objects.end()) {
    std::string number = std::to_string(id);
    number.insert(0, 5 - number.size(), '0');
    at = objects.emplace(id, PageObject(LEXARO_DATA "/cp_" + number + ".nls")).first;
  }
  return at->second;
}

uint8_t byte(uint32_t value) { return static_cast<uint8_t>(value); }

Units first(const Units& text, size_t count) {
  return {text.begin(), text.begin() + static_cast<ptrdiff_t>(std::min(count, text.size()))};
}

// The text of a call, which has been given with a length or is measured.
Units given(const Form& form, const Units& text, int32_t length, bool characters) {
  if (length < 0) return first(text, static_cast<size_t>(std::find(text.begin(), text.end(), 0u) - text.begin()));
  auto count = static_cast<size_t>(length);
  if (!characters || !form.is_bytes() || count == 0) return first(text, count);
  TextCharacter last = characters_of(form, text).list.at(count - 1);
  return first(text, last.at + last.size);
}

}  // namespace

// ---- Characters ----

Meanings::Meanings(const Form& form)
    : form_(form), object_(form.page != nullptr ? &object_of(form.page->id) : nullptr) {}

// As they are written: zero bytes behind the first are left out of packed values.
std::string Meanings::bytes_of(Glyph glyph) const {
  std::string bytes = unpacked(glyph.code);
  if (form_.kind != Form::wide) return std::string(glyph.size - std::min(glyph.size, bytes.size()), '\0') + bytes;
  char last = bytes.back();
  bytes.pop_back();
  std::erase(bytes, '\0');
  return bytes + last;
}

Glyph Meanings::spelled(uint32_t packed) const {
  if (form_.kind == Form::wide) return {packed, 1};
  return {packed, unpacked(packed).size()};
}

bool Meanings::has(uint16_t unicode) const {
  return form_.page->has(unicode) && form_.page->decode(form_.page->encode(unicode)) == unicode;
}

std::pair<uint32_t, int32_t> Meanings::entry(Glyph glyph) const {
  std::string bytes = bytes_of(glyph);
  if (!form_.page->mixed() && form_.page->lengths[byte(static_cast<uint32_t>(bytes[0]))] < 2) return {1024, 0};
  return object_->type(bytes);
}

uint32_t Meanings::type(Glyph glyph) const {
  if (ucs2()) return type_model(glyph.code);
  if (!one_byte(glyph)) return entry(glyph).first;
  uint16_t character = unicode(glyph);
  return character == kNoCharacter ? 1024 : type_model(character);
}

// A byte changes only into a byte; longer characters change as their type says.
Glyph Meanings::cased(Glyph glyph, bool upper) const {
  uint16_t mapped = upper ? upper_model(unicode(glyph)) : lower_model(unicode(glyph));
  if (ucs2()) return {mapped, 1};
  if (one_byte(glyph)) {
    bool byte_too = mapped != unicode(glyph) && has(mapped) && form_.page->encode(mapped).size() == 1;
    return byte_too ? this->glyph(mapped) : glyph;
  }
  auto [flags, delta] = entry(glyph);
  return (flags & (upper ? LX_CT_LOWER : LX_CT_UPPER)) != 0 ? spelled(glyph.code + static_cast<uint32_t>(delta))
                                                            : glyph;
}

Glyph Meanings::full(Glyph glyph) const {
  if (ucs2()) return {full_model(glyph.code), 1};
  if (form_.page->max_length == 1) return glyph;
  if (!one_byte(glyph)) return form_or(object_->full_width(glyph.code), glyph);
  uint16_t wide = full_model(unicode(glyph));
  bool longer = wide != unicode(glyph) && has(wide) && form_.page->encode(wide).size() > 1;
  return longer ? this->glyph(wide) : glyph;
}

Glyph Meanings::half(Glyph glyph) const {
  if (ucs2()) return {half_model(glyph.code), 1};
  return form_.page->max_length == 1 ? glyph : form_or(object_->half_width(glyph.code), glyph);
}

Glyph Meanings::digit(Glyph glyph) const {
  uint16_t ascii = (type(glyph) & LX_CT_DIGIT) != 0 ? digit_model(unicode(glyph)) : uint16_t{0};
  return ascii != 0 ? this->glyph(ascii) : glyph;
}

uint16_t Meanings::unicode(Glyph glyph) const {
  return ucs2() ? static_cast<uint16_t>(glyph.code) : form_.page->decode(bytes_of(glyph));
}

Glyph Meanings::glyph(uint16_t unicode) const {
  return ucs2() ? Glyph{unicode, 1} : spelled(packed(form_.page->encode(unicode)));
}

// ---- Mapping ----

const std::vector<TestLanguage>& test_languages() {
  static const std::vector<TestLanguage> kLanguages = [] {
    std::vector<TestLanguage> all = {
        {"English_UnitedStates.", {}, {}},
        {"German_Germany.", {{0xDF, 0, 'S', 'S'}}, {}},
        {"Turkish_Turkey.", {{'i', 0, 0x130, 0}}, {{'I', 0, 0x131, 0}}},
        {"Lithuanian_Lithuania.", {{'i', 0x307, 'I', 0}, {'j', 0x307, 'J', 0}, {0x12F, 0x307, 0x12E, 0}}, {}},
        {"Greek_Greece.", {}, {}}};
    for (char16_t c : std::u16string_view(u"\t\n\r !\"(),-./:;?]}\u00A0\u00B7\u00BB\u2013\u2014\u2015\u201D\u2026")) {
      all.back().lower.push_back({0x3A3, c, 0x3C2, c});
    }
    return all;
  }();
  return kLanguages;
}

namespace {

struct Mapper {
  const MapCall& call;
  Meanings meanings{call.form};
  uint32_t flags = call.flags & ~LX_OPT_CHARS;
  bool by_characters = (call.flags & LX_OPT_CHARS) != 0 && call.form.is_bytes();

  const std::vector<Special>& specials() const {
    static const std::vector<Special> kNone;
    return flags == LX_MAP_UPPER ? call.language->upper : flags == LX_MAP_LOWER ? call.language->lower : kNone;
  }
  const Special* special(uint16_t key1, uint16_t key2) const {
    for (const Special& one : specials()) {
      if (one.key1 == key1 && one.key2 == key2) return &one;
    }
    return nullptr;
  }
  Glyph form(Glyph glyph) const {
    switch (flags & ~LX_MAP_PLAIN) {
      case LX_MAP_H2F:
        return meanings.full(glyph);
      case LX_MAP_F2H:
        return meanings.half(glyph);
      case LX_MAP_LOWER:
        return meanings.lower(glyph);
      case LX_MAP_UPPER:
        return meanings.upper(glyph);
      default:
        return meanings.digit(glyph);
    }
  }
  std::vector<Glyph> mapped(const std::vector<TextCharacter>& text) const {
    std::vector<Glyph> out;
    for (size_t i = 0; i < text.size(); ++i) {
      Glyph glyph = {text[i].code, text[i].size};
      const Special* pair = special(meanings.unicode(glyph), 0);
      if (pair == nullptr && i + 1 < text.size()) {
        uint16_t next = meanings.unicode({text[i + 1].code, text[i + 1].size});
        if (next != 0) pair = special(meanings.unicode(glyph), next);
        if (pair != nullptr) ++i;
      }
      if (pair == nullptr) {
        out.push_back(form(glyph));
      } else {
        out.push_back(meanings.glyph(pair->value1));
        if (pair->value2 != 0) out.push_back(meanings.glyph(pair->value2));
      }
    }
    return out;
  }

  // Shift bytes go before characters of the other width, and at the end, where the output comes to the state in which
  // the text ends; its terminator stands behind that as it does in the text.
  MapResult write(const Characters& text) const {
    MapResult result;
    size_t size = call.size > 0 ? static_cast<size_t>(call.size) : 0;
    size_t units = by_characters ? std::min<size_t>(6 * size, 512) : size;
    size_t characters = by_characters ? size : SIZE_MAX;
    uint32_t state = call.form.state;
    auto turn = [&](uint32_t wanted) {
      if (!call.form.follows_shifts() || wanted == state) return Units{};
      return Units{wanted != 0 ? call.form.page->enter : call.form.page->leave};
    };
    size_t count = 0;
    auto put = [&](Glyph glyph) {
      Units piece = turn(glyph.size > 1);
      std::string bytes(glyph.size, '\0');
      for (size_t i = 0; i < glyph.size; ++i) {
        uint32_t unit = glyph.size == 1 ? glyph.code : byte(glyph.code >> 8 * (glyph.size - 1 - i));
        piece.push_back(unit);
      }
      if (result.written.size() + piece.size() > units || count == characters) return false;
      result.written.insert(result.written.end(), piece.begin(), piece.end());
      if (call.form.follows_shifts()) state = glyph.size > 1;
      ++count;
      return true;
    };
    bool fits = true;
    for (Glyph glyph : mapped(text.list)) fits = fits && put(glyph);
    if (fits && size != 0) {
      Units end = turn(text.state);
      if (result.written.size() + end.size() <= units) {
        result.written.insert(result.written.end(), end.begin(), end.end());
        if (call.length < 0 && result.written.size() < units && count < characters) {
          result.written.push_back(0);
          ++count;
        }
      }
    }
    result.count = static_cast<int32_t>(by_characters ? count : result.written.size());
    return result;
  }
};

}  // namespace

MapResult map_model(const MapCall& call) {
  uint32_t flags = call.flags & ~LX_OPT_CHARS;
  bool copy = flags == 0 || flags == LX_MAP_COPY;
  bool plain = flags == (LX_MAP_LOWER | LX_MAP_PLAIN) || flags == (LX_MAP_UPPER | LX_MAP_PLAIN);
  bool known = (flags >= LX_MAP_H2F && flags <= LX_MAP_UPPER) || flags == LX_MAP_DIGITS || copy || plain;
  if (!known) return {-1, LX_E_ARGUMENT};
  Mapper mapper{call};
  if (!copy)
    return mapper.write(characters_of(call.form, given(call.form, call.text, call.length, mapper.by_characters)));
  TextCall copying = {Function::cpy, call.form, call.text, call.length};
  copying.size = call.size;
  copying.options = mapper.by_characters ? LX_OPT_CHARS : 0;
  Outcome outcome = reference(copying);
  auto count = static_cast<size_t>(outcome.result);
  if (mapper.by_characters) return {static_cast<int32_t>(count), 0, outcome.memory};
  return {static_cast<int32_t>(count), 0, first(outcome.memory, count)};
}

// ---- Comparison ----

Units trimmed(const Form& form, const Units& text, bool full_width) {
  uint32_t blank = form.kind == Form::ucs2 || form.page->ascii_family ? 0x20 : 0x40;
  Glyph wide = full_width ? Meanings(form).full({blank, 1}) : Glyph{blank, 1};
  std::vector<TextCharacter> list = characters_of(form, text).list;
  auto is_blank = [&](const TextCharacter& c) {
    Glyph glyph = {c.code, c.size};
    return glyph == Glyph{blank, 1} || glyph == wide;
  };
  size_t kept = list.size();
  // On multibyte pages a byte that ends the text goes with the blanks before it.
  bool odd = form.is_bytes() && form.page->max_length > 1 && kept > 1 && list[kept - 1].at + 1 == text.size();
  if (odd && !is_blank(list[kept - 1]) && is_blank(list[kept - 2])) --kept;
  while (kept != 0 && is_blank(list[kept - 1])) --kept;
  if (kept == list.size()) return first(text, characters_of(form, text).whole);
  return first(text, kept == 0 ? list[0].at : list[kept].at);
}

namespace {

struct Comparer {
  const CompareCall& call;
  Meanings meanings{call.form};
  bool width = (call.options & LX_CMP_NOWIDTH) == LX_CMP_NOWIDTH;
  bool upper = !width && (call.options & (LX_CMP_NOWIDTH | LX_CMP_NOCASE)) != 0;
  bool by_characters = call.form.follows_shifts() || !call.form.is_bytes();

  Units prepared(const Form& form, const Units& text, int32_t length) const {
    Units units = given(form, text, length, (call.options & LX_OPT_CHARS) != 0);
    if (length > 0) units = first(units, characters_of(form, units).whole);
    if ((call.options & LX_CMP_TRIM) == 0 || units.empty()) return units;
    if (form.is_bytes())
      units = first(units, static_cast<size_t>(std::find(units.begin(), units.end(), 0u) - units.begin()));
    return trimmed(form, units, width);
  }
  size_t expected_size(const Form& form, uint32_t state, uint32_t unit) const {
    if (!form.is_bytes()) return 1;
    if (form.follows_shifts()) return state != 0 ? form.page->max_length : 1;
    return form.page->length_of(byte(unit));
  }

  CompareResult bytes(const Units& a, const Units& b) const {
    for (size_t i = 0; i < std::min(a.size(), b.size()); ++i) {
      if (a[i] != b[i]) return {a[i] < b[i] ? -1 : 1, false};
    }
    return {static_cast<int32_t>(a.size()) - static_cast<int32_t>(b.size())};
  }
  Glyph folded(Glyph glyph) const { return width ? meanings.half(glyph) : upper ? meanings.upper(glyph) : glyph; }
  // The first of four bytes that differs, or the unit.
  int32_t difference(Glyph a, Glyph b) const {
    if (call.form.kind == Form::wide) return a.code == b.code ? 0 : a.code < b.code ? -1 : 1;
    if (call.form.kind == Form::ucs2) return static_cast<int32_t>(a.code) - static_cast<int32_t>(b.code);
    auto at = [](Glyph glyph, size_t i) {
      return i < glyph.size ? int32_t{byte(glyph.code >> 8 * (glyph.size - 1 - i))} : 0;
    };
    for (size_t i = 0; i < 4; ++i) {
      if (at(a, i) != at(b, i)) return at(a, i) - at(b, i);
    }
    return 0;
  }
  CompareResult characters(const Units& a, const Units& b, const Form& form_b, bool fold) const {
    Characters x = characters_of(call.form, a);
    Characters y = characters_of(form_b, b);
    size_t common = std::min(x.list.size(), y.list.size());
    for (size_t i = 0; i < common; ++i) {
      Glyph p = {x.list[i].code, x.list[i].size};
      Glyph q = {y.list[i].code, y.list[i].size};
      Glyph p_folded = fold ? folded(p) : p;
      Glyph q_folded = fold ? folded(q) : q;
      auto lengths =
          static_cast<int32_t>(width ? p_folded.size : p.size) - static_cast<int32_t>(width ? q_folded.size : q.size);
      if (lengths != 0) return {lengths};
      if (int32_t result = difference(p_folded, q_folded)) return {result};
    }
    size_t at_a = common < x.list.size() ? x.list[common].at : x.whole;
    size_t at_b = common < y.list.size() ? y.list[common].at : y.whole;
    // One of them ends here, perhaps inside a character; that has the length that it should have.
    if (at_a < a.size() && at_b < b.size()) {
      uint32_t state_a = common < x.list.size() ? x.list[common].state : x.state;
      uint32_t state_b = common < y.list.size() ? y.list[common].state : y.state;
      auto lengths = static_cast<int32_t>(expected_size(call.form, state_a, a[at_a])) -
                     static_cast<int32_t>(expected_size(form_b, state_b, b[at_b]));
      if (lengths != 0) return {lengths};
    }
    // Of shift bytes some may count, but they decide nothing.
    auto rest = static_cast<int32_t>(a.size() - at_a) - static_cast<int32_t>(b.size() - at_b);
    return {rest, !call.form.follows_shifts()};
  }
  Units in_upper_case(const Form& form, const Units& text) const {
    auto length = static_cast<int32_t>(text.size());
    return map_model({call.language, form, text, length, 8 * length, LX_MAP_UPPER}).written;
  }

  CompareResult compare() const {
    Form form_b = call.form;
    form_b.state = call.state2;
    Units a = prepared(call.form, call.text1, call.length1);
    Units b = prepared(form_b, call.text2, call.length2);
    bool specials = upper && !call.language->upper.empty();
    if (specials && (call.form.follows_shifts() || (!a.empty() && !b.empty()))) {
      a = in_upper_case(call.form, a);
      b = in_upper_case(form_b, b);
    }
    bool fold = (upper && !specials) || width;
    if (!by_characters && !fold) return bytes(a, b);
    return characters(a, b, form_b, fold);
  }
};

const char* const kKinds[] = {"plain ", "Ex ", "W ", "U "};
std::string name_of(const Form& form) {
  return kKinds[form.kind] + (form.page != nullptr ? form.page->name : "") + " state " + std::to_string(form.state);
}

}  // namespace

CompareResult compare_model(const CompareCall& call) { return Comparer{call}.compare(); }

CompareCall CompareCall::swapped() const {
  Form other = form;
  other.state = state2;
  return {language, other, text2, length2, text1, length1, form.state, options};
}

std::string MapCall::describe() const {
  return language->name + name_of(form) + " text " + hex_units(text) + "length " + std::to_string(length) + " size " +
         std::to_string(size) + " flags " + hex(unpacked(flags));
}
std::string MapResult::describe() const {
  return std::to_string(count) + " status " + std::to_string(status) + " text " + hex_units(written);
}
std::string CompareCall::describe() const {
  return language->name + name_of(form) + " text " + hex_units(text1) + "length " + std::to_string(length1) +
         " with state " + std::to_string(state2) + " text " + hex_units(text2) + "length " + std::to_string(length2) +
         " options " + hex(unpacked(options));
}

}  // namespace lx::test
