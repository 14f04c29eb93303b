// SPDX-License-Identifier: Apache-2.0
// Mapping and comparison, of the functions done slowly.
#include <lexaro/lexaro.h>

#include <algorithm>

#include "text/text_functions.hpp"

namespace lx::test {
namespace {

struct Glyph {
  uint32_t code;  // packed
  size_t size;    // units

  bool operator==(const Glyph&) const = default;
};
Glyph glyph_of(const Character& c) { return {c.code, c.size}; }

const PageObject& object_of(uint16_t id) {
  static std::map<uint16_t, PageObject> objects;
  const std::string number = std::to_string(100000u + id).substr(1);
  return objects.try_emplace(id, LEXARO_DATA "/cp_" + number + ".nls").first->second;
}

// What a character means in texts of a form.
struct Meanings {
  Form form;
  const PageObject* object = form.page != nullptr ? &object_of(form.page->id) : nullptr;

  bool ucs2() const { return form.kind == Form::ucs2; }
  bool one_byte(Glyph glyph) const { return glyph.size == 1 && glyph.code < 0x100; }
  std::string bytes_of(Glyph glyph) const {
    return form.kind == Form::wide ? written_bytes(glyph.code) : bytes_of_code(glyph.code, glyph.size);
  }
  Glyph spelled(uint32_t packed) const { return {packed, form.kind == Form::wide ? 1 : unpacked(packed).size()}; }
  Glyph glyph(uint16_t unicode) const {
    return ucs2() ? Glyph{unicode, 1} : spelled(packed(form.page->encode(unicode)));
  }
  uint16_t unicode(Glyph glyph) const {
    return ucs2() ? static_cast<uint16_t>(glyph.code) : form.page->decode(bytes_of(glyph));
  }
  bool has(uint16_t unicode) const {
    return form.page->has(unicode) && form.page->decode(form.page->encode(unicode)) == unicode;
  }
  std::pair<uint32_t, int32_t> entry(Glyph glyph) const {
    std::string bytes = bytes_of(glyph);
    if (!form.page->mixed() && form.page->lengths[static_cast<uint8_t>(bytes[0])] < 2) return {1024, 0};
    return object->type(bytes);
  }
  uint32_t type(Glyph glyph) const {
    if (ucs2()) return type_model(glyph.code);
    if (!one_byte(glyph)) return entry(glyph).first;
    return unicode(glyph) == kNoCharacter ? 1024 : type_model(unicode(glyph));
  }
  // A byte changes only into a byte; longer characters change as their type says.
  Glyph cased(Glyph glyph, bool upper) const {
    uint16_t mapped = upper ? upper_model(unicode(glyph)) : lower_model(unicode(glyph));
    if (ucs2()) return {mapped, 1};
    if (one_byte(glyph)) {
      bool byte_too = mapped != unicode(glyph) && has(mapped) && form.page->encode(mapped).size() == 1;
      return byte_too ? this->glyph(mapped) : glyph;
    }
    auto [flags, delta] = entry(glyph);
    bool changes = (flags & (upper ? LX_CT_LOWER : LX_CT_UPPER)) != 0;
    return changes ? spelled(glyph.code + static_cast<uint32_t>(delta)) : glyph;
  }
  Glyph full(Glyph glyph) const {
    if (ucs2()) return {full_model(glyph.code), 1};
    if (form.page->max_length == 1) return glyph;
    if (!one_byte(glyph)) return form_or(object->full_width(glyph.code), glyph);
    uint16_t wide = full_model(unicode(glyph));
    // Two characters that a page may have under either of two names.
    for (auto [name, other] : {std::pair<uint16_t, uint16_t>{0xFF0D, 0x2212}, {0xFF5E, 0x301C}}) {
      if (wide == name && !has(name) && has(other) && form.page->encode(name) == form.page->encode(other)) wide = other;
    }
    bool longer = wide != unicode(glyph) && has(wide) && form.page->encode(wide).size() > 1;
    return longer ? this->glyph(wide) : glyph;
  }
  Glyph half(Glyph glyph) const {
    if (ucs2()) return {half_model(glyph.code), 1};
    return form.page->max_length == 1 ? glyph : form_or(object->half_width(glyph.code), glyph);
  }
  Glyph digit(Glyph glyph) const {
    uint16_t ascii = (type(glyph) & LX_CT_DIGIT) != 0 ? digit_model(unicode(glyph)) : uint16_t{0};
    return ascii != 0 ? this->glyph(ascii) : glyph;
  }
  Glyph form_or(uint32_t packed, Glyph glyph) const { return packed != 0 ? spelled(packed) : glyph; }
};

struct Mapper {
  const TextCall& call;
  Meanings meanings{call.form};
  uint32_t flags = call.options & ~LX_OPT_CHARS;

  const Special* special(uint16_t key1, uint16_t key2) const {
    if (flags != LX_MAP_UPPER && flags != LX_MAP_LOWER) return nullptr;
    for (const Special& one : flags == LX_MAP_UPPER ? call.language->upper : call.language->lower) {
      if (one.key1 == key1 && one.key2 == key2) return &one;
    }
    return nullptr;
  }
  Glyph mapped(Glyph glyph) const {
    const uint32_t kind = flags & ~LX_MAP_PLAIN;
    if (kind == LX_MAP_H2F) return meanings.full(glyph);
    if (kind == LX_MAP_F2H) return meanings.half(glyph);
    if (kind == LX_MAP_LOWER || kind == LX_MAP_UPPER) return meanings.cased(glyph, kind == LX_MAP_UPPER);
    return meanings.digit(glyph);
  }
  std::vector<Glyph> mapped(const std::vector<Character>& text) const {
    std::vector<Glyph> out;
    for (size_t i = 0; i < text.size(); ++i) {
      const Glyph glyph = glyph_of(text[i]);
      const uint16_t next = i + 1 < text.size() ? meanings.unicode(glyph_of(text[i + 1])) : uint16_t{0};
      const Special* pair = special(meanings.unicode(glyph), 0);
      if (pair == nullptr && next != 0) {
        pair = special(meanings.unicode(glyph), next);
        i += pair != nullptr;
      }
      out.push_back(pair != nullptr ? meanings.glyph(pair->value1) : mapped(glyph));
      if (pair != nullptr && pair->value2 != 0) out.push_back(meanings.glyph(pair->value2));
    }
    return out;
  }

  // Shift bytes go before characters of the other width, and at the end, where the output comes to the state in which
  // the text ends; its terminator stands behind that as it does in the text.
  Outcome write(const Characters& text) const {
    bool by_characters = call.counts_characters();
    size_t size = call.size > 0 ? static_cast<size_t>(call.size) : 0;
    size_t room = by_characters ? std::min<size_t>(6 * size, 512) : size;
    Writer out{call.form};
    size_t count = 0;
    auto put = [&](Glyph glyph) {
      Units piece = {glyph.code};
      if (glyph.size > 1 || call.form.is_bytes()) piece = out.piece_of_bytes(bytes_of_code(glyph.code, glyph.size));
      if (out.units.size() + piece.size() > room || (by_characters && count == size)) return false;
      out.units.insert(out.units.end(), piece.begin(), piece.end());
      if (call.form.follows_shifts()) out.inside = glyph.size > 1;
      ++count;
      return true;
    };
    bool fits = size != 0;
    for (Glyph glyph : mapped(text.list)) fits = fits && put(glyph);
    bool turns = call.form.follows_shifts() && (text.state != 0) != out.inside;
    if (fits && out.units.size() + turns <= room) {
      if (turns) out.units.push_back(text.state != 0 ? call.form.page->enter : call.form.page->leave);
      if (call.length < 0 && out.units.size() < room && (!by_characters || count < size)) {
        out.units.push_back(0);
        ++count;
      }
    }
    Outcome outcome;
    outcome.result = static_cast<int64_t>(by_characters ? count : out.units.size());
    outcome.memory = out.units;
    return outcome;
  }
};

struct Comparer {
  const TextCall& call;
  Meanings meanings{call.form};
  bool width = (call.options & LX_CMP_NOWIDTH) == LX_CMP_NOWIDTH;
  bool upper = !width && (call.options & (LX_CMP_NOWIDTH | LX_CMP_NOCASE)) != 0;

  Units prepared(const Form& form, const Units& text, int32_t length) const {
    Units units = told(form, text, length, call.counts_characters());
    if (length > 0) units = first_units(units, characters_of(form, units).whole);
    if ((call.options & LX_CMP_TRIM) == 0 || units.empty()) return units;
    return trimmed(form, form.is_bytes() ? told(form, units, -1, false) : units);
  }
  Units trimmed(const Form& form, const Units& text) const {
    const Glyph blank = {form.kind == Form::ucs2 || form.page->ascii_family ? 0x20u : 0x40u, 1};
    const Glyph wide = width ? meanings.full(blank) : blank;
    const Characters all = characters_of(form, text);
    auto is_blank = [&](size_t i) { return glyph_of(all.list[i]) == blank || glyph_of(all.list[i]) == wide; };
    size_t kept = all.list.size();
    // On multibyte pages a byte that ends the text goes with the blanks before it.
    const bool odd =
        form.is_bytes() && form.page->max_length > 1 && kept > 1 && all.list[kept - 1].at + 1 == text.size();
    if (odd && !is_blank(kept - 1) && is_blank(kept - 2)) --kept;
    while (kept != 0 && is_blank(kept - 1)) --kept;
    return first_units(text, kept == all.list.size() ? all.whole : all.list[kept].at);
  }
  Outcome bytes(const Units& a, const Units& b) const {
    const size_t common = std::min(a.size(), b.size());
    size_t i = 0;
    while (i < common && a[i] == b[i]) ++i;
    if (i == common) return decided(a.size(), b.size());
    Outcome outcome = decided(a[i], b[i]);
    outcome.sign_only = true;
    return outcome;
  }
  static Outcome decided(size_t a, size_t b) { return {static_cast<int64_t>(a) - static_cast<int64_t>(b)}; }
  Glyph folded(Glyph glyph) const { return width ? meanings.half(glyph) : upper ? meanings.cased(glyph, true) : glyph; }
  // The first of four bytes that differs, or the unit.
  int64_t difference(Glyph a, Glyph b) const {
    if (call.form.kind == Form::wide) return a.code == b.code ? 0 : a.code < b.code ? -1 : 1;
    if (call.form.kind == Form::ucs2) return decided(a.code, b.code).result;
    Units x = units_of(bytes_of_code(a.code, a.size)), y = units_of(bytes_of_code(b.code, b.size));
    x.resize(4), y.resize(4);
    size_t i = 0;
    while (i < 3 && x[i] == y[i]) ++i;
    return decided(x[i], y[i]).result;
  }
  Outcome characters(const Units& a, const Units& b, bool fold) const {
    const Form form_b = call.other_form();
    const Characters x = characters_of(call.form, a), y = characters_of(form_b, b);
    const size_t common = std::min(x.list.size(), y.list.size());
    for (size_t i = 0; i < common; ++i) {
      const Glyph p = glyph_of(x.list[i]), q = glyph_of(y.list[i]);
      const Glyph p_folded = fold ? folded(p) : p, q_folded = fold ? folded(q) : q;
      const Outcome lengths = width ? decided(p_folded.size, q_folded.size) : decided(p.size, q.size);
      if (lengths.result != 0) return lengths;
      if (int64_t result = difference(p_folded, q_folded)) return {result};
    }
    // One of them ends here, perhaps inside a character; that has the length that it should have.
    auto next = [&](const Characters& text) {
      return common < text.list.size() ? text.list[common] : Character{text.whole, 0, 0, 0, text.state};
    };
    const Character p = next(x), q = next(y);
    if (p.at < a.size() && q.at < b.size()) {
      const Outcome lengths = decided(call.form.length_of(a[p.at], p.state), form_b.length_of(b[q.at], q.state));
      if (lengths.result != 0) return lengths;
    }
    Outcome outcome = decided(a.size() - p.at, b.size() - q.at);
    outcome.sign_only = call.form.follows_shifts();  // of shift bytes some may count, but they decide nothing
    return outcome;
  }
  Units in_upper_case(const Form& form, const Units& text) const {
    auto length = static_cast<int32_t>(text.size());
    TextCall mapping = {Function::map, form, text, length};
    mapping.size = 8 * length;
    mapping.options = LX_MAP_UPPER;
    mapping.language = call.language;
    Outcome outcome = map_model(mapping);
    return first_units(outcome.memory, static_cast<size_t>(outcome.result));
  }

  Outcome compare() const {
    Units a = prepared(call.form, call.text, call.length);
    Units b = prepared(call.other_form(), call.other, call.other_length);
    bool specials = upper && !call.language->upper.empty();
    if (specials && (call.form.follows_shifts() || (!a.empty() && !b.empty()))) {
      a = in_upper_case(call.form, a);
      b = in_upper_case(call.other_form(), b);
    }
    bool fold = (upper && !specials) || width;
    return call.form.is_bytes() && !call.form.follows_shifts() && !fold ? bytes(a, b) : characters(a, b, fold);
  }
};

}  // namespace

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

Outcome map_model(const TextCall& call) {
  const uint32_t flags = call.options & ~LX_OPT_CHARS;
  const bool copy = flags == 0 || flags == LX_MAP_COPY;
  const bool plain = flags == (LX_MAP_LOWER | LX_MAP_PLAIN) || flags == (LX_MAP_UPPER | LX_MAP_PLAIN);
  const bool known = (flags >= LX_MAP_H2F && flags <= LX_MAP_UPPER) || flags == LX_MAP_DIGITS || copy || plain;
  if (!known) return {-1, LX_E_ARGUMENT};
  const bool counted = call.counts_characters();
  Outcome outcome;
  if (copy) {
    TextCall copying = call;
    copying.function = Function::cpy;
    copying.options = counted ? LX_OPT_CHARS : 0;
    outcome = model(copying);
  } else {
    const Units text = told(call.form, call.text, call.length, counted);
    outcome = Mapper{call}.write(characters_of(call.form, text));
  }
  if (!counted) outcome.memory.resize(static_cast<size_t>(std::max(call.size, 0)), kUnwritten);
  return outcome;
}

Outcome compare_model(const TextCall& call) { return Comparer{call}.compare(); }

}  // namespace lx::test
