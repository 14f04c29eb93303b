// SPDX-License-Identifier: Apache-2.0
// Steps over the characters of a text, cuts, and character types, beside what the list of its characters says.
#include "text/text_runner.hpp"
#include "text/text_samples.hpp"

namespace lx::test {
namespace {

struct Cut {
  int32_t result;
  Units text;  // with its terminator; what is behind it stays

  bool operator==(const Cut&) const = default;
};

// A text without zeros cut to fit. `wide_blank`: code of a full-width blank that is stripped too.
Cut truncated(const Form& form, const Units& text, size_t size, bool strip, uint32_t wide_blank = 0) {
  const PageSource& page = *form.page;
  const uint32_t blank = page.ascii_family ? 0x20 : 0x40;
  Units memory = text;
  memory.push_back(0);
  bool fits = text.size() < size;
  if (fits && !strip) return {0, memory};
  std::vector<TextCharacter> list = characters_of(form, text).list;
  size_t kept = 0;  // characters
  auto end = [&](size_t count) { return count == 0 ? 0 : list[count - 1].at + list[count - 1].size; };
  auto open = [&](size_t count) { return count == 0 ? form.state != 0 : list[count - 1].state != 0; };
  bool closes = form.follows_shifts();
  while (kept < list.size() && (fits || end(kept + 1) + (closes && open(kept + 1)) < size)) ++kept;
  if (strip && page.max_length == 1) {
    while (kept != 0 && list[kept - 1].code == blank) --kept;
  } else if (strip) {
    size_t run = kept + 1;  // where it begins
    for (size_t i = 0; i < kept; ++i) {
      bool is_blank = list[i].size == 1 ? list[i].code == blank : list[i].code == wide_blank;
      bool last = list[i].size == 1 && list[i].at + 1 == text.size();
      if (is_blank) run = std::min(run, i);
      if (!is_blank && !last) run = kept + 1;
    }
    kept = std::min(kept, run);
  }
  size_t at = end(kept);
  if (closes && open(kept) && at != text.size() && at + 1 < size) memory[at++] = page.leave;
  memory[at] = 0;
  return {static_cast<int32_t>(at + 1), memory};
}

bool is_shift(const Form& form, uint32_t unit) { return unit == form.page->enter || unit == form.page->leave; }

class Navigation : public testing::Test {
 protected:
  // For all short texts, which stand terminated at the edge of memory; use(form, text, s).
  template <class Use>
  void for_all_texts(size_t longest, Use use) {
    for (const Alphabet& alphabet : kAlphabets) {
      const PageSource& page = PageSource::of(alphabet.page);
      locale_ = runner_.locale(page);
      Units units = letters({Form::plain, &page}, alphabet.units);
      std::erase(units, 0u);
      units.push_back(page.ascii_family ? 0x20 : 0x40);
      for (const Form& form : forms_of(page)) {
        if (!form.is_bytes()) continue;
        for_all_strings(units, longest, [&](const Units& text) {
          if (HasFailure()) return;  // one fault makes many
          std::string bytes = bytes_of_units(text) + '\0';
          char* s = edge_.room(bytes.size());
          std::copy(bytes.begin(), bytes.end(), s);
          SCOPED_TRACE(page.name + (form.kind == Form::plain ? "" : " Ex ") + std::to_string(form.state) + ": " +
                       hex_units(text));
          use(form, text, s);
        });
      }
    }
  }

  TextRunner runner_;
  EdgeBuffer edge_{4096};
  LXLocale* locale_ = nullptr;
};

TEST_F(Navigation, CountsAndMoves) {
  for_all_texts(4, [&](const Form& form, const Units& text, char* s) {
    bool ex = form.kind == Form::shifted;
    auto count = [&](int32_t n) { return ex ? LXNumCharsEx(locale_, s, form.state, n) : LXNumChars(locale_, s, n); };
    auto move = [&](size_t n, uint32_t flags) {
      auto distance = static_cast<int32_t>(n);
      return (ex ? LXMoveStringPointerEx(locale_, s, form.state, distance, flags)
                 : LXMoveStringPointer(locale_, s, distance, flags)) -
             s;
    };
    Characters all = characters_of(form, text);
    EXPECT_EQ(static_cast<size_t>(count(-1)), all.list.size());
    for (size_t n = 0; n <= text.size(); ++n) {
      Characters part = characters_of(form, Units(text.begin(), text.begin() + static_cast<ptrdiff_t>(n)));
      EXPECT_EQ(static_cast<size_t>(count(static_cast<int32_t>(n))), part.list.size()) << n;
      EXPECT_EQ(static_cast<size_t>(move(n, 0)), part.whole) << n << " units";
    }
    for (size_t n = 1; n <= all.list.size(); ++n) {
      EXPECT_EQ(static_cast<size_t>(move(n, LX_OPT_CHARS)), all.list[n - 1].end) << n << " characters";
    }
  });
}

TEST_F(Navigation, StepsOverCharacters) {
  for_all_texts(4, [&](const Form& form, const Units& text, char* s) {
    Characters all = characters_of(form, text);
    const uint32_t kNoState = 77;
    uint32_t state = form.state;
    uint32_t after = kNoState;
    for (size_t i = 0; i < all.list.size(); ++i) {
      const TextCharacter& c = all.list[i];
      size_t from = i == 0 ? 0 : all.list[i - 1].end;
      if (form.follows_shifts()) {
        uint32_t behind = i + 1 < all.list.size() ? all.list[i + 1].state : all.state;
        // One shift byte is skipped on either side, and taken for one that changes the state.
        bool plain_end = c.size == 1 || !is_shift(form, text[c.at + c.size - 1]);
        if (c.at != from + (c.state != state) || c.end != c.at + c.size + (c.state != behind) || !plain_end) return;
        EXPECT_EQ(LXNextCharEx(locale_, s + from, state, &after), s + c.end);
        EXPECT_EQ(after, behind);
        EXPECT_EQ(LXPrevCharEx(locale_, s, s + c.end, behind, &after), s + c.at);
        EXPECT_EQ(after, c.state);
        state = behind;
        EXPECT_EQ(LXGetCharEx(locale_, s + c.at, c.state), c.code);
        EXPECT_EQ(static_cast<size_t>(LXByteLengthEx(locale_, s + from, i == 0 ? form.state : c.state)), c.size);
        char* out = edge_.room(c.size);
        LXPutCharEx(locale_, out, c.code, c.state);
        EXPECT_EQ(packed({out, c.size}), c.code);
        std::copy_n((bytes_of_units(text) + '\0').data(), text.size() + 1, s);  // which the room was part of
        EXPECT_EQ(static_cast<size_t>(LXValidCharEx(locale_, s + c.at, c.state)), c.size);
      } else {
        bool ex = form.kind == Form::shifted;
        EXPECT_EQ(ex ? LXNextCharEx(locale_, s + c.at, form.state, nullptr) : LXNextChar(locale_, s + c.at), s + c.end);
        for (size_t inside = 1; inside <= c.size; ++inside) {
          const char* current = s + c.at + inside;
          EXPECT_EQ(ex ? LXPrevCharEx(locale_, s, current, 0, nullptr) : LXPrevChar(locale_, s, current), s + c.at);
        }
        auto first = static_cast<uint8_t>(text[c.at]);
        EXPECT_EQ(LXByteLength(locale_, s + c.at), form.page->lengths[first]) << "as it stands in the table";
        EXPECT_EQ(LXGetChar(locale_, s + c.at), form.page->lengths[first] == 0 ? 0 : c.code);
        EXPECT_EQ(static_cast<size_t>(LXByteLengthW(locale_, c.code)), c.size);
        EXPECT_EQ(LXStrByteLength(locale_, c.code), LXByteLengthW(locale_, c.code));
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
  for_all_texts(4, [&](const Form& form, const Units& text, char*) {
    bool ex = form.kind == Form::shifted;
    for (bool strip : {false, true}) {
      for (size_t size = 1; size <= text.size() + 2; ++size) {
        std::string bytes = bytes_of_units(text) + '\0';
        char* at = edge_.room(bytes.size());
        std::copy(bytes.begin(), bytes.end(), at);
        Cut expected = truncated(form, text, size, strip);
        uint32_t flags = strip ? LX_TRUNC_STRIP : 0;
        Cut cut = {ex ? LXTruncateStringEx(locale_, at, form.state, static_cast<int32_t>(size), flags)
                      : LXTruncateString(locale_, at, static_cast<int32_t>(size), flags),
                   units_of({at, expected.text.size()})};
        EXPECT_TRUE(cut == expected) << "size " << size << " strip " << strip << ": " << cut.result << " "
                                     << hex_units(cut.text) << "expected " << expected.result << " "
                                     << hex_units(expected.text);
      }
    }
  });
}

TEST_F(Navigation, TypesAreThoseOfTheUnicodeCharacters) {
  for (const Alphabet& alphabet : kAlphabets) {
    const PageSource& page = PageSource::of(alphabet.page);
    LXLocale* locale = runner_.locale(page);
    auto check = [&](const std::string& code) {
      uint16_t unicode = page.decode(code);
      // What is no character has no type of its own in a page.
      if (unicode == kNoCharacter || LXGetCharTypeU(locale, unicode, LX_CTYPE_2) == 1) return;
      char* s = edge_.room(code.size());
      std::copy(code.begin(), code.end(), s);
      for (uint32_t type_class : {LX_CTYPE_1, LX_CTYPE_2, LX_CTYPE_3}) {
        uint32_t type = LXGetCharTypeU(locale, unicode, type_class);
        // Pages take title case for lower case: there is one other case to a character.
        if (type_class == LX_CTYPE_1 && (type & LX_CT_LOWER) != 0) type &= ~LX_CT_UPPER;
        uint32_t state = code.size() > 1;
        bool plain = !page.mixed() || state == 0;
        EXPECT_TRUE(!plain || LXGetCharType(locale, s, type_class) == type) << page.name << hex(code);
        EXPECT_EQ(LXGetCharTypeEx(locale, s, state, type_class), type) << page.name << hex(code);
        EXPECT_EQ(LXGetCharTypeW(locale, packed(code), type_class), type) << page.name << hex(code);
      }
    };
    for (unsigned byte = 0; byte < 256; ++byte) {
      if (page.lengths[byte] == 1) check(std::string(1, static_cast<char>(byte)));
    }
    for (const std::string& code : page.long_codes()) {
      check(code);
      if (HasFailure()) return;
    }
  }
}

TEST_F(Navigation, TypesOutsideTheTablesFollowRules) {
  struct {
    uint32_t first, last, type;
  } rules[] = {{0x06FA, 0x0900, 1024},
               {0x0EDE, 0x109F, 1024},
               {0x11FA, 0x1DFF, 1024},
               {0x2200, 0x2211, 0x2200020},
               {0x2212, 0x2213, 0x2008020},
               {0x2214, 0x221D, 0x2200020},
               {0x221E, 0x221E, 0x200020},
               {0x221F, 0x22F1, 0x2200020},
               {0x27BF, 0x2FFF, 1024},
               {0x33FF, 0x4DFF, 1024},
               {0x4E00, 0x9FA5, 0x40000801},
               {0x9FA6, 0xABFF, 1024},
               {0xAC00, 0xD7A3, 2049},
               {0xD7A4, 0xF8FF, 1024},
               {0xF900, 0xFA2D, 0x40000801},
               {0xFA2E, 0xFAFF, 1024},
               {0xFBD3, 0xFBE8, 4097},
               {0xFBE9, 0xFBE9, 1024},
               {0xFBEA, 0xFCE0, 4097},
               {0xFCE1, 0xFCE1, 1024},
               {0xFCE2, 0xFD3D, 4097},
               {0x0041, 0x0041, LX_UNICODE_Ctype1[0x41]},
               {0x0901, 0x0901, LX_UNICODE_Ctype2[0]},
               {0x10A0, 0x10A0, LX_UNICODE_Ctype3[0]},
               {0x21FF, 0x21FF, LX_UNICODE_Ctype4[0x3FF]},
               {0x22F2, 0x22F2, LX_UNICODE_Ctype5[0]},
               {0x33FE, 0x33FE, LX_UNICODE_Ctype6[0x3FE]},
               {0xFBD2, 0xFBD2, LX_UNICODE_Ctype7[210]},
               {0xFFFF, 0xFFFF, LX_UNICODE_Ctype8[705]}};
  LXLocale* locale = runner_.locale(PageSource::of(367));
  for (const auto& rule : rules) {
    for (uint32_t c = rule.first; c <= rule.last; ++c) {
      auto type = [&](uint32_t type_class) { return LXGetCharTypeU(locale, static_cast<LXUChar>(c), type_class); };
      ASSERT_EQ(type(LX_CTYPE_3) << 22 | type(LX_CTYPE_2) << 10 | type(LX_CTYPE_1), rule.type) << std::hex << c;
    }
  }
}

}  // namespace
}  // namespace lx::test
