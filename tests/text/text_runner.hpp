// SPDX-License-Identifier: Apache-2.0
// Makes the calls that the reference describes, on memory that ends where the text ends.
#pragma once

#include <algorithm>
#include <map>

#include "support/edge_buffer.hpp"
#include "text/text_calls.hpp"
#include "text/text_reference.hpp"

namespace lx::test {

class TextRunner {
 public:
  LXLocale* locale(const PageSource& page) {
    auto& locale = locales_[page.id];
    if (!locale) locale = locale_of(page.name);
    return locale.get();
  }

  // Compares the call with its reference. Gives up after some differences: one fault makes many.
  void check(const TextCall& call) { check(call, reference(call)); }
  void check(const TextCall& call, const Outcome& expected, const char* name = "") {
    if (differences_ > 10) return;
    Outcome got = run(call, expected.memory.size());
    if (got == expected) return;
    ++differences_;
    ADD_FAILURE() << name << " " << call.describe() << "\n     got " << got.describe() << "\nexpected "
                  << expected.describe();
  }

  // `room`: units that cpy and cat have.
  Outcome run(const TextCall& call, size_t room) {
    switch (call.form.kind) {
      case Form::plain:
        return run_as<PlainCalls>(call, room);
      case Form::shifted:
        return run_as<ShiftedCalls>(call, room);
      case Form::wide:
        return run_as<WideCalls>(call, room);
      case Form::ucs2:
        return run_as<Ucs2Calls>(call, room);
    }
    return {};
  }

 private:
  template <class U>
  static U* place(EdgeBuffer& buffer, Units units, int32_t length) {
    if (length < 0) units.push_back(0);
    U* at = buffer.room<U>(units.size());
    std::transform(units.begin(), units.end(), at, [](uint32_t unit) { return static_cast<U>(unit); });
    return at;
  }

  // A character stands alone, or before the terminator that cuts it off.
  template <class U>
  U* place_character(const TextCall& call) {
    Units units = call.other;
    auto whole = characters_of({call.form.kind, call.form.page, call.other_state}, units).list;
    if (!whole.empty()) units.resize(whole[0].size);
    auto zero = std::find(units.begin(), units.end(), 0u);
    bool terminated = zero != units.end();
    if (terminated) units.erase(zero + 1, units.end());
    return place<U>(other_, units, whole.empty() && !terminated ? -1 : 0);
  }

  template <class Calls>
  Outcome run_as(const TextCall& call, size_t room) {
    using U = typename Calls::Unit;
    LXLocale* l = locale(*call.form.page);
    LXStrcpy(l, nullptr, 0, nullptr, 0, 1);  // an error for the call to clear
    State state = call.form.state;
    Outcome outcome;
    U* other =
        call.function == Function::chr ? place_character<U>(call) : place<U>(other_, call.other, call.other_length);
    U* text = nullptr;
    if (call.writes_text()) {
      Units memory = call.text;
      if (call.function == Function::cat || call.length < 0) memory.push_back(0);
      memory.resize(std::max(room, memory.size()), kUnwritten);
      text = place<U>(text_, memory, 0);
      outcome.memory = memory;
    } else {
      text = place<U>(text_, call.text, call.length);
    }
    auto position = [&](const U* at) { return at == nullptr ? int64_t{-1} : at - text; };
    State match = kUnwritten;
    switch (call.function) {
      case Function::cpy: {
        outcome.memory.assign(room, kUnwritten);
        U* out = place<U>(out_, outcome.memory, 0);
        outcome.result = Calls::cpy(l, out, call.size, text, state, call.length, call.options);
        read_back(outcome.memory, out);
        break;
      }
      case Function::cat:
        outcome.result = Calls::cat(l, text, other, call.other_state, call.other_length, call.options);
        read_back(outcome.memory, text);
        break;
      case Function::chr:
        outcome.result =
            position(Calls::chr(l, text, state, call.length, other, call.other_state, &match, call.options));
        break;
      case Function::str:
        outcome.result = position(
            Calls::str(l, text, state, call.length, other, call.other_state, call.other_length, &match, call.options));
        break;
      case Function::spn:
      case Function::cspn:
        outcome.result = (call.function == Function::spn ? Calls::spn : Calls::cspn)(
            l, text, state, call.length, other, call.other_state, call.other_length, call.options);
        break;
      case Function::tok: {
        int32_t length = call.length;
        U* next = text;
        match = state;
        outcome.result = position(
            Calls::tok(l, text, &match, &length, other, call.other_state, call.other_length, &next, call.options));
        read_back(outcome.memory, text);
        outcome.next = position(next);
        outcome.rest = length;
        break;
      }
      case Function::eol:
        outcome.rest = -1;
        outcome.result = position(Calls::eol(l, text, state, call.length, &outcome.type, &outcome.rest, call.options));
        break;
    }
    bool has_state =
        call.form.follows_shifts() && (call.function == Function::tok ? outcome.next : outcome.result) >= 0;
    bool gives_state =
        call.function == Function::chr || call.function == Function::str || call.function == Function::tok;
    if (has_state && gives_state) outcome.state = match;
    outcome.status = LXGetError(l);
    return outcome;
  }

  template <class U>
  static void read_back(Units& memory, const U* from) {
    for (uint32_t& unit : memory) unit = static_cast<std::make_unsigned_t<U>>(*from++);
  }

  Session session_;
  std::map<uint16_t, Locale> locales_;
  EdgeBuffer text_{4096};
  EdgeBuffer other_{4096};
  EdgeBuffer out_{4096};
  int differences_ = 0;
};

}  // namespace lx::test
