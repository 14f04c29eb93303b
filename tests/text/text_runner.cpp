// SPDX-License-Identifier: Apache-2.0
#include "text/text_runner.hpp"

namespace lx::test {
namespace {

int64_t sign(int64_t value) { return value < 0 ? -1 : value > 0; }

}  // namespace

LXLocale* TextRunner::locale(const PageSource& page, const TestLanguage& language) {
  auto& locale = locales_[{&language, page.id}];
  if (!locale) locale.reset(LXGetLocale((language.name + page.name + "@BINARY").c_str(), 0, nullptr));
  EXPECT_NE(locale, nullptr) << language.name << page.name;
  return locale.get();
}

void TextRunner::check(const TextCall& call) {
  if (differences_ > 10) return;
  Outcome wanted = model(call), got = run(call, wanted.memory.size());
  if (call.function == Function::cmp) {  // also that the other way round the sign is the other one
    const int64_t back = run(call.swapped(), 0).result;
    if (sign(back) != -sign(got.result)) ADD_FAILURE() << call.describe() << " and back " << back;
  }
  got.sign_only = wanted.sign_only;
  if (wanted.sign_only) got.result = sign(got.result), wanted.result = sign(wanted.result);
  if (got == wanted) return;
  ++differences_;
  ADD_FAILURE() << call.describe() << "\n     got " << got.describe() << "\nexpected " << wanted.describe();
}

Outcome TextRunner::run(const TextCall& call, size_t room, bool in_place) {
  return with_calls(call.form, [&](auto calls) { return run_as(calls, call, room, in_place); });
}

// A character stands alone, or before the terminator that cuts it off.
template <class U>
U* TextRunner::place_character(const TextCall& call) {
  Units units = call.other;
  const auto whole = characters_of(call.other_form(), units).list;
  if (!whole.empty()) units.resize(whole[0].size);
  const auto zero = std::find(units.begin(), units.end(), 0u);
  const bool terminated = zero != units.end();
  if (terminated) units.erase(zero + 1, units.end());
  return place<U>(other_, units, whole.empty() && !terminated ? -1 : 0);
}

template <class KindOfCalls>
Outcome TextRunner::run_as(KindOfCalls calls, const TextCall& call, size_t room, bool in_place) {
  using U = typename KindOfCalls::Unit;
  using enum Function;
  LXLocale* l = locale(*call.form.page, *call.language);
  LXStrcpy(l, nullptr, 0, nullptr, 0, 1);  // an error for the call to clear
  Outcome outcome;
  if (call.writes_text()) {
    outcome.memory = call.text;
    if (call.function == cat || call.length < 0) outcome.memory.push_back(0);
  }
  const bool makes_text = call.function == cpy || call.function == map;
  if (call.writes_text() || makes_text) outcome.memory.resize(std::max(room, outcome.memory.size()), kUnwritten);
  U* text = call.writes_text() ? place<U>(text_, outcome.memory, 0) : place<U>(text_, call.text, call.length);
  U* out = makes_text && !in_place ? place<U>(out_, outcome.memory, 0) : text;
  U* other = call.function == chr ? place_character<U>(call) : place<U>(other_, call.other, call.other_length);

  const State state = {call.form.state}, other_state = {call.other_state};
  auto position = [&](const U* at) { return at == nullptr ? int64_t{-1} : at - text; };
  auto two_texts = [&](auto family) {
    return calls(family, l, text, state, call.length, other, other_state, call.other_length, call.options);
  };
  auto text_to_out = [&](auto family) {
    return calls(family, l, out, call.size, text, state, call.length, call.options);
  };
  uint32_t match = kUnwritten;
  const Function function = call.function;
  if (function == cpy) outcome.result = text_to_out(kStrcpy);
  if (function == map) outcome.result = text_to_out(kMapString);
  if (function == spn) outcome.result = two_texts(kStrspn);
  if (function == cspn) outcome.result = two_texts(kStrcspn);
  if (function == cmp) outcome.result = two_texts(kStrcmp);
  if (function == cat) {
    outcome.result = calls(kStrcat, l, text, other, other_state, call.other_length, call.options);
  } else if (function == chr) {
    auto find = [&](auto wanted) {
      return calls(kStrchr, l, text, state, call.length, wanted, other_state, StateAt{&match}, call.options);
    };
    if constexpr (std::is_same_v<U, char>) {
      outcome.result = position(find(other));
    } else {
      outcome.result = position(find(*other));
    }
  } else if (function == str) {
    outcome.result = position(calls(kStrstr, l, text, state, call.length, other, other_state, call.other_length,
                                    StateAt{&match}, call.options));
  } else if (function == tok) {
    U* next = text;
    match = state.value;
    outcome.rest = call.length;
    outcome.result = position(calls(kStrtok, l, text, StateAt{&match}, &outcome.rest, other, other_state,
                                    call.other_length, &next, call.options));
    outcome.next = position(next);
  } else if (function == eol) {
    outcome.rest = -1;
    outcome.result = position(calls(kGetEol, l, text, state, call.length, &outcome.type, &outcome.rest, call.options));
  }
  for (uint32_t& unit : outcome.memory) unit = static_cast<std::make_unsigned_t<U>>(*out++);
  const bool found = function == chr || function == str;
  if (call.form.follows_shifts() && (found ? outcome.result : outcome.next) >= 0) outcome.state = match;
  outcome.status = LXGetError(l);
  return outcome;
}

// ---- Texts ----

std::vector<Form> forms_of(const PageSource& page, bool all) {
  std::vector<Form> forms = {{Form::plain, &page}, {Form::shifted, &page}};
  const bool common = page.id == 37 || page.id == 930;
  if (page.mixed() || page.id == 932) forms.push_back({Form::shifted, &page, 1});
  if (all || common) forms.push_back({Form::wide, &page});
  if (common || page.id == 819 || page.id == 57352) forms.push_back({Form::ucs2, &page});
  return forms;
}

std::vector<Lettered> text_forms() {
  static const std::pair<uint16_t, std::string_view> kLetters[] = {{367, "ab\x0A\xFF\0"sv},
                                                                   {819, "a\xE4\x0A\x0D\0"sv},
                                                                   {57352, "a\xC3\xA9\xE3\x80\xFF\0"sv},
                                                                   {932, "a\x81\x40\xB1\x0A\x0D\0"sv},
                                                                   {954, "a\x8E\x8F\xB1\xA4\x0A\xFF"sv},
                                                                   {964, "a\x8E\xA2\xA1\x0D\x0A\0"sv},
                                                                   {37, "\x81\x0E\x0F\x25\x15\0"sv},
                                                                   {930, "\x81\x0E\x0F\x41\x25\x0D\0"sv},
                                                                   {1364, "\x81\x0E\x0F\x40\xFE\x25\x15"sv}};
  std::vector<Lettered> all;
  for (const auto& [page, bytes] : kLetters) {
    for (const Form& form : forms_of(PageSource::of(page), false)) {
      Units letters = units_of(bytes);
      if (form.kind == Form::wide) letters = {0x81, 0x4181, 0x81000000, 0x25, 0x0D, 0};
      if (form.kind == Form::ucs2) letters = {'a', 0x2028, 0x0A, 0x0D, 0x2029, 0};
      all.push_back({form, letters});
    }
  }
  return all;
}

std::vector<Lettered> mapping_forms() {
  static const std::pair<uint16_t, std::string_view> kLetters[] = {
      {819, "ai\xDF\xFF\xB2 \0"sv},          {920, "iI\xDF\xDD\xFD "sv},
      {813, "\xC1\xE1\xD3\xF3. "sv},         {57352, "ai\xCC\x87\xC4\xB0\xEF\xFF "sv},
      {932, "a\x82\x81\x40\xB1\xDE "sv},     {954, "a\x8E\x8F\xB1\xA3\xC1\xFF "sv},
      {964, "a\x8E\xA2\xA1\xA3\xC1 \0"sv},   {37, "\x81\xC1\x0E\x0F\x59\x40\0"sv},
      {930, "\x81\xC1\x0E\x0F\x42\x40\0"sv}, {1364, "\x81\xC1\x0E\x0F\x42\x40\xFE"sv}};
  std::vector<Lettered> all;
  for (const auto& [page, bytes] : kLetters) {
    for (const Form& form : forms_of(PageSource::of(page), true)) {
      Units letters = form.is_bytes() ? units_of(bytes) : Units{0, 0x20};
      for (size_t i = 0; i < kMappingCharacters.size() && !form.is_bytes() && letters.size() < 9; i += 7) {
        const bool there = form.kind == Form::ucs2 || form.page->has(kMappingCharacters[i]);
        if (there) letters.push_back(spelled(form, kMappingCharacters.substr(i, 1))[0]);
      }
      all.push_back({form, letters});
    }
  }
  return all;
}

void for_all_strings(const Units& letters, size_t longest, const std::function<void(const Units&)>& use) {
  std::vector<Units> texts = {{}};
  for (size_t i = 0; i < texts.size(); ++i) {
    const Units text = texts[i];
    use(text);
    for (uint32_t letter : letters) {
      if (text.size() == longest) break;
      texts.push_back(text);
      texts.back().push_back(letter);
    }
  }
}

bool ends_inside_run(const Form& form, const Units& text) {
  const Characters all = characters_of(form, text);
  if (!form.follows_shifts() || all.list.empty() || all.cut || all.list.back().state == 0) return false;
  return std::find(text.begin() + static_cast<ptrdiff_t>(all.list.back().own_end()), text.end(), form.page->leave) ==
         text.end();
}

int32_t Choice::length(const Form& form, const Units& text, bool by_characters) {
  if (below(3) == 0) return -1 - static_cast<int32_t>(below(2));
  const size_t all = by_characters ? characters_of(form, text).list.size() : text.size();
  return static_cast<int32_t>(often() ? all : below(all + 1));
}

}  // namespace lx::test
