// SPDX-License-Identifier: Apache-2.0
#include "text/text_functions.hpp"

#include <lexaro/lexaro.h>

#include <algorithm>

namespace lx::test {

Units told(const Form& form, Units text, int32_t length, bool by_characters, bool with_terminator, bool run_closed) {
  if (length < 0) {
    text.push_back(0);
    auto zero = static_cast<size_t>(std::find(text.begin(), text.end(), 0u) - text.begin());
    return first_units(text, zero + with_terminator);
  }
  auto count = static_cast<size_t>(length);
  if (!by_characters || count == 0) return first_units(text, count);
  const Character last = characters_of(form, text).list.at(count - 1);
  size_t end = last.own_end();
  for (bool open = run_closed && last.state != 0; open && end < last.end; ++end) open = text[end] != form.page->leave;
  return first_units(text, end);
}

namespace {

struct Model {
  const TextCall& call;
  const Form& form = call.form;
  const bool by_characters = (call.options & LX_OPT_CHARS) != 0;
  Outcome outcome = {};

  Characters text(bool with_terminator) const {
    return characters_of(form, told(form, call.text, call.length, by_characters, with_terminator));
  }
  Units other_units() const { return told(call.other_form(), call.other, call.other_length, by_characters); }
  Characters other() const { return characters_of(call.other_form(), other_units()); }
  void count(const Characters& found) {
    outcome.result = static_cast<int64_t>(by_characters ? found.list.size() : found.whole);
  }
  void found_at(const Character& character) {
    outcome.result = static_cast<int64_t>(character.at);
    if (form.follows_shifts()) outcome.state = character.state;
  }
  static bool contains(const Characters& set, const Character& character) {
    return std::any_of(set.list.begin(), set.list.end(), [&](const auto& one) { return one.same(character); });
  }

  void cpy() {
    size_t size = call.size > 0 ? static_cast<size_t>(call.size) : 0;
    int32_t length = by_characters && call.length > 0 ? std::min(call.length, std::max(call.size, 0)) : call.length;
    Units source = told(form, call.text, length, by_characters, true, true);
    Characters found = characters_of(form, by_characters ? source : first_units(source, size));
    if (size == 0 || found.list.empty()) {
      found = {};
    } else if (by_characters && found.list.size() > size) {
      found = characters_of(form, first_units(source, found.list[size - 1].end));
    }
    count(found);
    outcome.memory = first_units(source, found.whole);
    if (size > found.whole && !by_characters) outcome.memory.resize(size, kUnwritten);
  }

  void cat() {
    Units appended = told(call.other_form(), call.other, call.other_length, by_characters, false, true);
    if (call.other_length > 0) appended = first_units(appended, characters_of(call.other_form(), appended).whole);
    bool terminate = call.other_length < 0 || (call.options & LX_OPT_TERMINATE) != 0;
    if (call.other_length == 0) terminate = false;
    Units joined = call.text;
    joined.insert(joined.end(), appended.begin(), appended.end());
    size_t characters = characters_of({form.kind, form.page}, call.text).list.size() +
                        characters_of(call.other_form(), appended).list.size();
    outcome.result = static_cast<int64_t>(by_characters ? characters : joined.size());
    outcome.result += terminate || call.other_length == 0;
    if (terminate || appended.empty()) joined.push_back(0);
    outcome.memory = joined;
  }

  void chr() {
    Characters found = text(true);
    if (call.length == 0) return;
    Units units = call.other;
    units.push_back(0);
    size_t size = units[0] == 0 ? 1 : form.length_of(units[0], call.other_state);
    Character wanted = {0, 1, 0, units[0], 0};
    for (; wanted.size < size && units[wanted.size] != 0; ++wanted.size) {
      wanted.code = wanted.code << 8 | units[wanted.size];
    }
    for (const Character& character : found.list) {
      if (!character.same(wanted)) continue;
      found_at(character);
      if (call.options != LX_STR_LAST) return;
    }
  }

  void str() {
    const Units wanted = other_units();
    const bool terminator = std::find(wanted.begin(), wanted.end(), 0u) != wanted.end();
    const Units units = told(form, call.text, call.length, by_characters, terminator);
    const auto list = characters_of(form, units).list;
    const Characters pattern = other();
    const size_t count = pattern.list.size();
    if (call.length == 0 || (count == 0 && pattern.cut)) return;
    if (count == 0) return found_at({0, 0, 0, 0, form.state});
    const bool folds = (call.options & ~LX_OPT_CHARS) != 0;
    for (size_t i = 0; i + count <= list.size(); ++i) {
      bool same = true;
      for (size_t k = 0; k < count && !folds; ++k) same = same && list[i + k].same(pattern.list[k]);
      if (folds) {  // as many characters compare equal
        TextCall compared = call;
        compared.form.state = list[i].state;
        compared.text.assign(units.begin() + static_cast<ptrdiff_t>(list[i].at),
                             units.begin() + static_cast<ptrdiff_t>(list[i + count - 1].own_end()));
        compared.length = static_cast<int32_t>(compared.text.size());
        compared.other = wanted;
        compared.other_length = static_cast<int32_t>(wanted.size());
        compared.options &= ~LX_OPT_CHARS;
        same = compare_model(compared).result == 0;
      }
      if (same) return found_at(list[i]);
    }
  }

  void span(bool wanted) {
    const Characters found = text(false), set = other();
    size_t passed = 0;
    while (passed < found.list.size() && contains(set, found.list[passed]) == wanted) ++passed;
    size_t end = passed == 0 ? 0 : found.list[passed - 1].end;
    outcome.result = static_cast<int64_t>(by_characters ? passed : end);
  }

  void spn() { span(true); }
  void cspn() { span(false); }
  void map() { outcome = map_model(call); }
  void cmp() { outcome = compare_model(call); }

  void tok() {
    outcome.memory = call.text;
    if (call.length < 0) outcome.memory.push_back(0);
    const Characters found = text(false), set = other();
    const size_t all = told(form, call.text, call.length, by_characters).size();
    size_t first = 0;
    while (first < found.list.size() && contains(set, found.list[first])) ++first;
    if (first == found.list.size()) return;
    outcome.result = first == 0 ? 0 : static_cast<int64_t>(found.list[first - 1].end);
    size_t last = first;
    while (last < found.list.size() && !contains(set, found.list[last])) ++last;
    if (last == found.list.size()) return;
    const Character& ending = found.list[last];
    // Its shift bytes go with it, but the token keeps the one that closes its double-byte run.
    const Character& before = found.list[last - 1];
    for (size_t at = before.own_end() + (before.state > ending.state); at < ending.end; ++at) outcome.memory[at] = 0;
    if (ending.end == all) return;
    outcome.next = static_cast<int64_t>(ending.end);
    outcome.rest = static_cast<int32_t>(by_characters ? found.list.size() - last - 1 : all - ending.end);
    if (form.follows_shifts()) outcome.state = last + 1 < found.list.size() ? found.list[last + 1].state : found.state;
  }

  void eol() {
    uint32_t kinds = call.options & ~LX_OPT_CHARS;
    if (kinds == 0) kinds = LX_EOL_1;
    const auto list = text(false).list;
    auto is = [&](size_t i, size_t number) {
      static const uint32_t kUnicode[] = {0x0A, 0x0D, 0x2028, 0x2029};
      uint32_t code = form.kind == Form::ucs2 ? kUnicode[number - 1] : form.page->line_ends[number - 1];
      return i < list.size() && list[i].size == 1 && list[i].code == code;
    };
    auto ends = [&](size_t last, uint32_t type, int32_t size) {
      outcome.result = static_cast<int64_t>(list[last].at) + 1;
      outcome.type = type;
      outcome.rest = size;
    };
    outcome.type = LX_EOL_NONE;
    for (size_t i = 0; i < list.size(); ++i) {
      bool pair = is(i, 2) && is(i + 1, 1) && list[i + 1].at == list[i].at + 1;
      if ((kinds & LX_EOL_21) != 0 && pair) return ends(i + 1, LX_EOL_21, 2);
      if ((kinds & LX_EOL_1) != 0 && is(i, 1)) return ends(i, LX_EOL_1, 1);
      if ((kinds & LX_EOL_3) != 0 && is(i, 3)) return ends(i, LX_EOL_3, 1);
      if ((kinds & LX_EOL_4) != 0 && is(i, 4)) return ends(i, LX_EOL_4, 1);
    }
  }
};

}  // namespace

Outcome model(const TextCall& call) {
  static constexpr void (Model::*kFunctions[])() = {&Model::cpy,  &Model::cat, &Model::chr, &Model::str, &Model::spn,
                                                    &Model::cspn, &Model::tok, &Model::eol, &Model::map, &Model::cmp};
  Model doing{call};
  (doing.*kFunctions[static_cast<size_t>(call.function)])();
  return doing.outcome;
}

bool TextCall::counts_characters() const { return (options & LX_OPT_CHARS) != 0 && form.is_bytes(); }

TextCall TextCall::swapped() const {
  TextCall call = *this;
  std::swap(call.text, call.other);
  std::swap(call.length, call.other_length);
  std::swap(call.form.state, call.other_state);
  return call;
}

std::string TextCall::describe() const {
  static const char* const kNames[] = {"cpy", "cat", "chr", "str", "spn", "cspn", "tok", "eol", "map", "cmp"};
  return kNames[static_cast<size_t>(function)] + (" " + (language->name + form.name())) + ": text " + hex_units(text) +
         "length " + std::to_string(length) + ", other " + hex_units(other) + "length " + std::to_string(other_length) +
         " state " + std::to_string(other_state) + ", size " + std::to_string(size) + " options " +
         hex(unpacked(options));
}

std::string Outcome::describe() const {
  std::string text = "memory " + hex_units(memory) + "result, status, next, rest, type, state";
  for (int64_t number : {result, int64_t{status}, next, int64_t{rest}, int64_t{type}, int64_t{state}}) {
    text += " " + std::to_string(number);
  }
  return text;
}

}  // namespace lx::test
