// SPDX-License-Identifier: Apache-2.0
// Steps over the characters of a text, and cuts, beside what the list of its characters says.
#include "text/text_runner.hpp"

namespace lx::test {
namespace {

constexpr Family<LXNumChars, LXNumCharsEx, nullptr, nullptr> kNumChars;
constexpr Family<LXMoveStringPointer, LXMoveStringPointerEx, nullptr, nullptr> kMove;
constexpr Family<LXTruncateString, LXTruncateStringEx, nullptr, nullptr> kTruncate;
constexpr Family<LXNextChar, LXNextCharEx, nullptr, nullptr> kNextChar;
constexpr Family<LXPrevChar, LXPrevCharEx, nullptr, nullptr> kPrevChar;

template <class Function, class... Args>
auto call(const Form& form, Function function, Args... args) {
  return form.kind == Form::plain ? Calls<Form::plain>()(function, args...) : Calls<Form::shifted>()(function, args...);
}

// A text without zeros cut to fit: the result, and the memory with its terminator.
std::pair<int32_t, Units> truncated(const Form& form, const Units& text, size_t size, uint32_t flags) {
  const bool strip = (flags & LX_TRUNC_STRIP) != 0, full_width = (flags & LX_CMP_NOWIDTH) == LX_CMP_NOWIDTH;
  Units memory = text;
  memory.push_back(0);
  const bool fits = text.size() < size;
  if (fits && !strip) return {0, memory};
  const std::vector<Character> list = characters_of(form, text).list;
  auto end = [&](size_t count) { return count == 0 ? 0 : list[count - 1].own_end(); };
  auto leaves = [&](size_t count) {
    return form.follows_shifts() && (count == 0 ? form.state : list[count - 1].state) != 0;
  };
  size_t kept = 0;  // characters
  while (kept < list.size() && (fits || end(kept + 1) + leaves(kept + 1) < size)) ++kept;
  if (strip) {
    const std::string blank = form.page->ascii_family ? " " : "\x40", wide = form.page->encode(0x3000);
    auto is_blank = [&](size_t count) {
      const std::string bytes = bytes_of_code(list[count - 1].code, list[count - 1].size);
      return bytes == blank || (full_width && bytes == wide && wide.size() > 1);
    };
    // On long pages a byte that ends the text goes with the blanks before it.
    const bool last_byte =
        form.page->max_length > 1 && kept > 1 && list[kept - 1].size == 1 && end(kept) == text.size();
    if (last_byte && is_blank(kept - 1)) --kept;
    while (kept != 0 && is_blank(kept)) --kept;
  }
  size_t at = end(kept);
  if (leaves(kept) && at != text.size() && at + 1 < size) memory[at++] = form.page->leave;
  memory[at] = 0;
  return {static_cast<int32_t>(at + 1), memory};
}

class Navigation : public testing::Test {
 protected:
  // For all short texts, which stand terminated at the edge of memory; use(form, text, s).
  void for_all_texts(const std::function<void(const Form&, const Units&, char*)>& use) {
    for (const Lettered& lettered : text_forms()) {
      const Form& form = lettered.form;
      const Units& letters = lettered.letters;
      if (!form.is_bytes()) continue;
      locale_ = runner_.locale(*form.page);
      Units units = letters;
      std::erase(units, 0u);
      units.push_back(form.page->ascii_family ? 0x20 : 0x40);
      for_all_strings(units, 4, [&](const Units& text) {
        if (HasFailure()) return;  // one fault makes many
        SCOPED_TRACE(form.name() + ": " + hex_units(text));
        use(form, text, place<char>(edge_, text, -1));
      });
    }
  }

  TextRunner runner_;
  EdgeBuffer edge_{4096}, out_{64};
  LXLocale* locale_ = nullptr;
};

TEST_F(Navigation, CountsAndMoves) {
  for_all_texts([&](const Form& form, const Units& text, char* s) {
    auto count = [&](int32_t n) { return call(form, kNumChars, locale_, s, State{form.state}, n); };
    auto move = [&](size_t n, uint32_t flags) {
      return call(form, kMove, locale_, s, State{form.state}, static_cast<int32_t>(n), flags) - s;
    };
    Characters all = characters_of(form, text);
    EXPECT_EQ(static_cast<size_t>(count(-1)), all.list.size());
    for (size_t n = 0; n <= text.size(); ++n) {
      Characters part = characters_of(form, first_units(text, n));
      EXPECT_EQ(static_cast<size_t>(count(static_cast<int32_t>(n))), part.list.size()) << n;
      EXPECT_EQ(static_cast<size_t>(move(n, 0)), part.whole) << n << " units";
      if (form.kind != Form::shifted) continue;
      const char* part_at = place<char>(out_, first_units(text, n), 0);
      part = characters_of(form, first_units(text, n), 1);
      EXPECT_EQ(static_cast<size_t>(AdjustLength(locale_, part_at, form.state, static_cast<int32_t>(n))), part.whole);
    }
    for (size_t n = 1; n <= all.list.size(); ++n) {
      EXPECT_EQ(static_cast<size_t>(move(n, LX_OPT_CHARS)), all.list[n - 1].end) << n << " characters";
    }
  });
  EXPECT_EQ(AdjustLength(locale_, "a", 0, -1), 0);
}

TEST_F(Navigation, StepsOverCharacters) {
  for_all_texts([&](const Form& form, const Units& text, char* s) {
    Characters all = characters_of(form, text);
    uint32_t state = form.state;
    uint32_t after = 77;
    for (size_t i = 0; i < all.list.size(); ++i) {
      const Character& c = all.list[i];
      size_t from = i == 0 ? 0 : all.list[i - 1].end;
      if (form.follows_shifts()) {
        uint32_t behind = i + 1 < all.list.size() ? all.list[i + 1].state : all.state;
        // One shift byte is skipped on either side, and taken for one that changes the state.
        bool plain_end = c.size == 1 || !form.is_shift(text[c.own_end() - 1]);
        if (c.at != from + (c.state != state) || c.end != c.own_end() + (c.state != behind) || !plain_end) return;
        EXPECT_EQ(LXNextCharEx(locale_, s + from, state, &after), s + c.end);
        EXPECT_EQ(after, behind);
        EXPECT_EQ(LXPrevCharEx(locale_, s, s + c.end, behind, &after), s + c.at);
        EXPECT_EQ(after, c.state);
        state = behind;
        EXPECT_EQ(LXGetCharEx(locale_, s + c.at, c.state), c.code);
        EXPECT_EQ(static_cast<size_t>(LXByteLengthEx(locale_, s + from, i == 0 ? form.state : c.state)), c.size);
        char* out = out_.room(c.size);
        LXPutCharEx(locale_, out, c.code, c.state);
        EXPECT_EQ(packed({out, c.size}), c.code);
        EXPECT_EQ(static_cast<size_t>(LXValidCharEx(locale_, s + c.at, c.state)), c.size);
      } else {
        EXPECT_EQ(call(form, kNextChar, locale_, s + c.at, State{form.state}, StateAt{nullptr}), s + c.end);
        for (size_t inside = 1; inside <= c.size; ++inside) {
          const char* current = s + c.at + inside;
          EXPECT_EQ(call(form, kPrevChar, locale_, s, current, State{0}, StateAt{nullptr}), s + c.at);
        }
        auto first = static_cast<uint8_t>(text[c.at]);
        EXPECT_EQ(LXByteLength(locale_, s + c.at), form.page->lengths[first]) << "as it stands in the table";
        EXPECT_EQ(LXGetChar(locale_, s + c.at), form.page->lengths[first] == 0 ? 0 : c.code);
        EXPECT_EQ(static_cast<size_t>(LXValidChar(locale_, s + c.at)), c.size);
      }
    }
    EXPECT_EQ(LXPrevCharEx(locale_, s, s, form.state, &after), s) << "never before the text";
    EXPECT_EQ(LXPrevChar(locale_, s, s), s);
    if (!form.follows_shifts() && all.whole < text.size()) {
      EXPECT_EQ(static_cast<size_t>(LXValidChar(locale_, s + all.whole)), text.size() - all.whole) << "cut character";
    }
    EXPECT_EQ(LXValidChar(locale_, s + text.size()), 0) << "the terminator";
  });
}

TEST_F(Navigation, CutsToEverySize) {
  for_all_texts([&](const Form& form, const Units& text, char*) {
    for (uint32_t flags : {0u, LX_TRUNC_STRIP, LX_TRUNC_STRIP | LX_CMP_NOWIDTH}) {
      for (size_t size = 1; size <= text.size() + 2; ++size) {
        char* at = place<char>(edge_, text, -1);
        const auto expected = truncated(form, text, size, flags);
        const int32_t result = call(form, kTruncate, locale_, at, State{form.state}, static_cast<int32_t>(size), flags);
        EXPECT_EQ(std::pair(result, units_of({at, expected.second.size()})), expected) << size << ' ' << flags;
      }
    }
  });
}

}  // namespace
}  // namespace lx::test
