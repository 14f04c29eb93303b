// SPDX-License-Identifier: Apache-2.0
#include "text/text_reference.hpp"

#include <lexaro/lexaro.h>

#include <algorithm>

namespace lx::test {
namespace {

Units until(Units text, size_t length) {
  text.resize(std::min(length, text.size()));
  return text;
}

// The part of a text that a length tells.
Units told(const Form& form, Units text, int32_t length, bool by_characters, bool with_terminator) {
  if (length < 0) {
    text.push_back(0);
    auto zero = static_cast<size_t>(std::find(text.begin(), text.end(), 0u) - text.begin());
    return until(text, zero + with_terminator);
  }
  auto count = static_cast<size_t>(length);
  if (!by_characters || count == 0) return until(text, count);
  const TextCharacter last = characters_of(form, text).list.at(count - 1);
  return until(text, last.at + last.size);
}

struct Reference {
  const TextCall& call;
  const Form& form = call.form;
  const bool by_characters = (call.options & LX_OPT_CHARS) != 0;
  const Form other_form = {form.kind, form.page, call.other_state};
  Outcome outcome = {};

  Characters text(bool with_terminator) const {
    return characters_of(form, told(form, call.text, call.length, by_characters, with_terminator));
  }
  Characters other() const {
    return characters_of(other_form, told(other_form, call.other, call.other_length, by_characters, false));
  }
  void count(const Characters& found) {
    outcome.result = static_cast<int64_t>(by_characters ? found.list.size() : found.whole);
  }
  void found_at(const TextCharacter& character) {
    outcome.result = static_cast<int64_t>(character.at);
    if (form.follows_shifts()) outcome.state = character.state;
  }
  static bool contains(const Characters& set, const TextCharacter& character) {
    return std::any_of(set.list.begin(), set.list.end(), [&](const auto& one) { return one.same(character); });
  }

  void cpy() {
    Units source = told(form, call.text, call.length, by_characters, true);
    size_t size = call.size > 0 ? static_cast<size_t>(call.size) : 0;
    Characters found = characters_of(form, by_characters ? source : until(source, size));
    if (size == 0 || found.list.empty()) {
      found = {};
    } else if (by_characters && found.list.size() > size) {
      found = characters_of(form, until(source, found.list[size - 1].end));
    }
    count(found);
    outcome.memory = until(source, found.whole);
    if (size > found.whole && !by_characters) outcome.memory.resize(size, kUnwritten);
  }

  void cat() {
    Units appended = told(other_form, call.other, call.other_length, by_characters, false);
    if (call.other_length > 0) appended = until(appended, characters_of(other_form, appended).whole);
    bool terminate = call.other_length < 0 || (call.options & LX_OPT_TERMINATE) != 0;
    if (call.other_length == 0) {
      appended.clear();
      terminate = false;
    }
    Units joined = call.text;
    joined.insert(joined.end(), appended.begin(), appended.end());
    const Form into = {form.kind, form.page};
    size_t characters = characters_of(into, call.text).list.size() + characters_of(other_form, appended).list.size();
    outcome.result = static_cast<int64_t>(by_characters ? characters : joined.size());
    outcome.result += terminate || call.other_length == 0;
    if (terminate || appended.empty()) joined.push_back(0);
    outcome.memory = joined;
  }

  void chr() {
    Characters found = text(true);
    if (call.length == 0) return;
    Units bytes = call.other;
    bytes.push_back(0);
    size_t size = 1;
    if (bytes[0] == 0) {
      size = 1;
    } else if (form.follows_shifts()) {
      size = call.other_state != 0 ? form.page->max_length : 1;
    } else if (form.is_bytes()) {
      size = form.page->length_of(static_cast<uint8_t>(bytes[0]));
    }
    TextCharacter wanted = {0, 1, 0, bytes[0], 0};
    for (; wanted.size < size && bytes[wanted.size] != 0; ++wanted.size) {
      wanted.code = wanted.code << 8 | bytes[wanted.size];
    }
    for (const TextCharacter& character : found.list) {
      if (!character.same(wanted)) continue;
      found_at(character);
      if (call.options != LX_STR_LAST) return;
    }
  }

  void str() {
    Characters found = text(true);
    Characters pattern = other();
    if (call.length == 0) return;
    if (pattern.list.empty()) {
      if (pattern.cut) return;
      outcome.result = 0;
      if (form.follows_shifts()) outcome.state = form.state;
      return;
    }
    auto same = [](const TextCharacter& a, const TextCharacter& b) { return a.same(b); };
    auto at = std::search(found.list.begin(), found.list.end(), pattern.list.begin(), pattern.list.end(), same);
    if (at != found.list.end()) found_at(*at);
  }

  void span(bool wanted) {
    Characters found = text(false);
    Characters set = other();
    size_t passed = 0;
    while (passed < found.list.size() && contains(set, found.list[passed]) == wanted) ++passed;
    size_t end = passed == 0 ? 0 : found.list[passed - 1].end;
    outcome.result = static_cast<int64_t>(by_characters ? passed : end);
  }

  void tok() {
    outcome.memory = call.text;
    if (call.length < 0) outcome.memory.push_back(0);
    Units source = told(form, call.text, call.length, by_characters, false);
    Characters found = characters_of(form, source);
    Characters set = other();
    size_t first = 0;
    while (first < found.list.size() && contains(set, found.list[first])) ++first;
    size_t begin = first == 0 ? 0 : found.list[first - 1].end;
    if (first == found.list.size()) return;
    outcome.result = static_cast<int64_t>(begin);
    size_t last = first;
    while (last < found.list.size() && !contains(set, found.list[last])) ++last;
    if (last == found.list.size()) return;
    const TextCharacter& ending = found.list[last];
    // Its shift bytes go with it, but the token keeps the one that closes its double-byte run.
    const TextCharacter& before = found.list[last - 1];
    size_t from = before.at + before.size + (before.state > ending.state);
    std::fill(outcome.memory.begin() + static_cast<ptrdiff_t>(from),
              outcome.memory.begin() + static_cast<ptrdiff_t>(ending.end), 0u);
    if (ending.end == source.size()) return;
    outcome.next = static_cast<int64_t>(ending.end);
    outcome.rest = static_cast<int32_t>(by_characters ? found.list.size() - last - 1 : source.size() - ending.end);
    if (form.follows_shifts()) outcome.state = last + 1 < found.list.size() ? found.list[last + 1].state : found.state;
  }

  void eol() {
    uint32_t kinds = call.options & ~LX_OPT_CHARS;
    if (kinds == 0) kinds = LX_EOL_1;
    Units source = told(form, call.text, call.length, by_characters, false);
    Characters found = characters_of(form, source);
    auto line_end = [&](size_t number) -> uint32_t {
      static const uint32_t kUnicode[] = {0x0A, 0x0D, 0x2028, 0x2029};
      return form.kind == Form::ucs2 ? kUnicode[number - 1] : form.page->line_ends[number - 1];
    };
    auto is = [&](size_t i, size_t number) {
      return i < found.list.size() && found.list[i].size == 1 && found.list[i].code == line_end(number);
    };
    auto ends = [&](const TextCharacter& last, uint32_t type, int32_t size) {
      outcome.result = static_cast<int64_t>(last.at) + 1;
      outcome.type = type;
      outcome.rest = size;
    };
    outcome.type = LX_EOL_NONE;
    for (size_t i = 0; i < found.list.size(); ++i) {
      const TextCharacter& character = found.list[i];
      if ((kinds & LX_EOL_21) != 0 && is(i, 2) && is(i + 1, 1) && found.list[i + 1].at == character.at + 1) {
        return ends(found.list[i + 1], LX_EOL_21, 2);
      }
      if ((kinds & LX_EOL_1) != 0 && is(i, 1)) return ends(character, LX_EOL_1, 1);
      if ((kinds & LX_EOL_3) != 0 && is(i, 3)) return ends(character, LX_EOL_3, 1);
      if ((kinds & LX_EOL_4) != 0 && is(i, 4)) return ends(character, LX_EOL_4, 1);
    }
  }
};

}  // namespace

Characters characters_of(const Form& form, const Units& text) {
  Characters found;
  found.state = form.state;
  size_t at = 0;
  auto skip_shifts = [&] {
    if (!form.follows_shifts()) return;
    for (; at < text.size() && (text[at] == form.page->enter || text[at] == form.page->leave); ++at) {
      found.state = text[at] == form.page->enter;
    }
  };
  skip_shifts();
  found.whole = at;
  while (at < text.size()) {
    size_t size = 1;
    if (form.follows_shifts()) {
      size = found.state != 0 ? form.page->max_length : 1;
    } else if (form.is_bytes()) {
      size = form.page->length_of(static_cast<uint8_t>(text[at]));
    }
    if (size > text.size() - at) break;
    TextCharacter character = {at, size, 0, text[at], found.state};
    while (++at < character.at + size) character.code = character.code << 8 | text[at];
    skip_shifts();
    found.whole = character.end = at;
    found.list.push_back(character);
  }
  found.cut = at < text.size();
  return found;
}

const char* name_of(Function function) {
  static const char* const kNames[] = {"cpy", "cat", "chr", "str", "spn", "cspn", "tok", "eol"};
  return kNames[static_cast<size_t>(function)];
}

std::string TextCall::describe() const {
  static const char* const kKinds[] = {"plain ", "Ex ", "W ", "U "};
  return kKinds[form.kind] + form.page->name + " " + name_of(function) + " text " + hex_units(text) + "length " +
         std::to_string(length) + " state " + std::to_string(form.state) + " other " + hex_units(other) + "length " +
         std::to_string(other_length) + " state " + std::to_string(other_state) + " size " + std::to_string(size) +
         " options " + hex(unpacked(options));
}

std::string Outcome::describe() const {
  return "result " + std::to_string(result) + " status " + std::to_string(status) + " memory " + hex_units(memory) +
         "next " + std::to_string(next) + " rest " + std::to_string(rest) + " type " + hex(unpacked(type)) + " state " +
         std::to_string(state);
}

Outcome reference(const TextCall& call) {
  Reference doing{call};
  switch (call.function) {
    case Function::cpy:
      doing.cpy();
      break;
    case Function::cat:
      doing.cat();
      break;
    case Function::chr:
      doing.chr();
      break;
    case Function::str:
      doing.str();
      break;
    case Function::spn:
      doing.span(true);
      break;
    case Function::cspn:
      doing.span(false);
      break;
    case Function::tok:
      doing.tok();
      break;
    case Function::eol:
      doing.eol();
      break;
  }
  return doing.outcome;
}

}  // namespace lx::test
