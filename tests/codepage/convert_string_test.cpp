// SPDX-License-Identifier: Apache-2.0
// Whole strings between code pages, UCS-2 and packed characters: every room, with and without terminator, counted in
// bytes and in characters, measured and given, against the slow model.
#include <memory>

#include "support/edge_buffer.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

constexpr const char16_t* kTexts[] = {
    u"",
    u"A",
    u"Grüße 7",
    u"アイあ漢字",
    u"a漢b字cd漢",
    u"中文 Б한글ﾊ€",
    u"字字\uE000\u00E9字z",
};

struct Page {
  explicit Page(uint16_t id) : source(PageSource::of(id)), locale(locale_of(source.name)) {}
  const PageSource& source;
  Locale locale;
};

class ConvertString : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    session = std::make_unique<Session>();
    static constexpr uint16_t kIds[] = {37, 819, 367, 932, 954, 964, 57352, 930, 1388};
    for (uint16_t id : kIds) pages.push_back(std::make_unique<Page>(id));
  }
  static void TearDownTestSuite() {
    pages.clear();
    session.reset();
  }
  static std::unique_ptr<Session> session;
  static std::vector<std::unique_ptr<Page>> pages;
};
std::unique_ptr<Session> ConvertString::session;
std::vector<std::unique_ptr<Page>> ConvertString::pages;

// One exported function bound to its pages; text and room are given as untyped memory.
struct Function {
  std::string name;
  Form to;
  Form from;
  LXLocale* locale;  // whose status is set; null: none
  bool packed_transfer;
  std::function<int32_t(void* out, int32_t out_size, const void* in, int32_t in_length, uint32_t flags)> call;
};

size_t width(const Form& form) { return form.is_bytes() ? 1 : form.kind == Form::wide ? 4 : 2; }

const void* placed(EdgeBuffer& buffer, const Form& form, const Units& units) {
  char* at = buffer.room(units.size() * width(form));
  for (size_t i = 0; i < units.size(); ++i) {
    if (form.is_bytes()) at[i] = static_cast<char>(units[i]);
    if (form.kind == Form::ucs2) reinterpret_cast<LXUChar*>(at)[i] = static_cast<LXUChar>(units[i]);
    if (form.kind == Form::wide) reinterpret_cast<LXWChar*>(at)[i] = units[i];
  }
  return at;
}

Units read_back(const Form& form, const void* memory, size_t count) {
  Units units;
  for (size_t i = 0; i < count; ++i) {
    if (form.is_bytes()) units.push_back(static_cast<const uint8_t*>(memory)[i]);
    if (form.kind == Form::ucs2) units.push_back(static_cast<const LXUChar*>(memory)[i]);
    if (form.kind == Form::wide) units.push_back(static_cast<const LXWChar*>(memory)[i]);
  }
  return units;
}

class Check {
 public:
  explicit Check(const Function& function) : function_(function) {}

  // Every room and option for the text measured, given whole, and given up to each of its units.
  void all(const Units& text) {
    for (bool terminate : {false, true}) {
      for (bool characters : {false, true}) {
        every_room(text, {0, -1, terminate, characters});
        every_length(text, terminate, characters);
      }
    }
  }

 private:
  void every_room(const Units& text, StringOptions options) {
    options.out_size = 10000;
    auto needed = static_cast<int32_t>(convert_model(function_.to, function_.from, text, options,
                                                     function_.packed_transfer).written.size());
    for (options.out_size = -1; options.out_size <= needed + 3; ++options.out_size) one(text, options);
  }
  void every_length(const Units& text, bool terminate, bool characters) {
    bool counted = characters && function_.from.is_bytes();
    // Lengths in characters reach the last character, no further: nothing stands behind it.
    auto longest = static_cast<int32_t>(text.size());
    if (counted) longest = byte_to_char_model(*function_.from.page, bytes_of_units(text), function_.from.state);
    if (counted && function_.from.kind == Form::plain && function_.from.page->mixed()) return;
    for (int32_t length = 0; length <= longest; ++length) {
      if (length == longest) {
        every_room(text, {0, length, terminate, characters});
      } else {
        for (int32_t size : {0, 1, 2, 5, 10000}) one(text, {size, length, terminate, characters});
      }
    }
  }

  void one(const Units& text, const StringOptions& options) {
    static EdgeBuffer in_buffer(4096);
    static EdgeBuffer out_buffer(65536);
    StringResult expected =
        convert_model(function_.to, function_.from, text, options, function_.packed_transfer);
    bool measured = options.in_length < 0;
    bool counted = options.characters && function_.from.is_bytes();
    Units placed_text = text;
    if (!measured && !counted) placed_text.resize(static_cast<size_t>(options.in_length));
    if (measured) placed_text.push_back(0);
    const void* in = placed(in_buffer, function_.from, placed_text);
    // A room counted in characters says nothing about bytes: exactly those that are due are there.
    size_t room = options.characters && function_.to.is_bytes() ? expected.written.size()
                  : options.out_size > 0                        ? static_cast<size_t>(options.out_size)
                                                                : 0;
    void* out = out_buffer.room(room * width(function_.to));
    uint32_t flags = (options.terminate ? LX_OPT_TERMINATE : 0) | (options.characters ? LX_OPT_CHARS : 0);
    int32_t count = function_.call(out, options.out_size, in, options.in_length, flags);
    Units written = read_back(function_.to, out, expected.written.size());
    bool right = count == expected.count && written == expected.written;
    bool clean = function_.locale == nullptr || LXGetError(function_.locale) == LX_OK;
    if (right && clean) return;
    ADD_FAILURE() << function_.name << " of " << hex_units(text) << "length " << options.in_length << ", room "
                  << options.out_size << (options.terminate ? ", terminated" : "")
                  << (options.characters ? ", in characters" : "") << "\n  gives  " << count << ": "
                  << hex_units(written) << "\n  not    " << expected.count << ": " << hex_units(expected.written)
                  << (clean ? "" : "\n  and a status");
  }

  const Function& function_;
};

// Leaves a status behind that a later success has to clear.
void spoil_status(LXLocale* locale) {
  if (locale == nullptr) return;
  EXPECT_EQ(LXStringToUnicode(locale, nullptr, 0, nullptr, 0, 1), -1);
}

void check_texts(const Function& function) {
  spoil_status(function.locale);
  for (const char16_t* text : kTexts) {
    Units units;
    if (function.from.kind == Form::ucs2) {
      for (; *text != 0; ++text) units.push_back(*text);
    } else if (function.from.kind == Form::wide) {
      for (; *text != 0; ++text) units.push_back(packed(function.from.page->encode(*text)));
    } else {
      std::string bytes = encoded(*function.from.page, text);
      // From the double-byte state on, a text without its enter byte.
      if (function.from.state != 0 && !bytes.empty() && bytes[0] == static_cast<char>(function.from.page->enter)) {
        bytes.erase(0, 1);
      }
      units = units_of(bytes);
    }
    Check(function).all(units);
    if (testing::Test::HasFailure()) return;  // one is enough of hundreds that look alike
  }
}

std::vector<uint32_t> states_of(const PageSource& page) {
  return page.mixed() ? std::vector<uint32_t>{0, 1} : std::vector<uint32_t>{0};
}

TEST_F(ConvertString, BetweenPages) {
  for (const auto& source : pages) {
    for (const auto& target : pages) {
      LXLocale* from = source->locale.get();
      LXLocale* to = target->locale.get();
      std::string pair = source->source.name + " to " + target->source.name;
      check_texts({"LXConvertString " + pair, {Form::plain, &target->source}, {Form::plain, &source->source}, to, false,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXConvertString(to, static_cast<char*>(out), size, from, static_cast<const char*>(in),
                                            length, flags);
                   }});
      check_texts({"LXConvertStringW " + pair, {Form::wide, &target->source}, {Form::wide, &source->source}, to, false,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXConvertStringW(to, static_cast<LXWChar*>(out), size, from,
                                             static_cast<const LXWChar*>(in), length, flags);
                   }});
      for (uint32_t from_state : states_of(source->source)) {
        for (uint32_t to_state : states_of(target->source)) {
          check_texts({"LXConvertStringEx " + pair,
                       {Form::shifted, &target->source, to_state},
                       {Form::shifted, &source->source, from_state},
                       to,
                       false,
                       [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                         return LXConvertStringEx(to, static_cast<char*>(out), to_state, size, from,
                                                  static_cast<const char*>(in), from_state, length, flags);
                       }});
        }
      }
    }
  }
}

TEST_F(ConvertString, ToAndFromUnicode) {
  for (const auto& page : pages) {
    LXLocale* locale = page->locale.get();
    const LXObjEntry* record = LXGetLocaleObject(locale, LX_CODEPAGE);
    Form ucs2 = {Form::ucs2, nullptr};
    Form plain = {Form::plain, &page->source};
    Form wide = {Form::wide, &page->source};
    const std::string& name = page->source.name;
    check_texts({"LXStringToUnicode " + name, ucs2, plain, locale, false,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXStringToUnicode(locale, static_cast<LXUChar*>(out), size, static_cast<const char*>(in),
                                            length, flags);
                 }});
    check_texts({"LXCpStrToUnicode " + name, ucs2, plain, nullptr, false,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXCpStrToUnicode(record, static_cast<LXUChar*>(out), size, static_cast<const char*>(in),
                                           length, flags);
                 }});
    check_texts({"LXStringToUnicodeW " + name, ucs2, wide, locale, false,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXStringToUnicodeW(locale, static_cast<LXUChar*>(out), size,
                                             static_cast<const LXWChar*>(in), length, flags);
                 }});
    check_texts({"LXUnicodeToString " + name, plain, ucs2, locale, false,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXUnicodeToString(locale, static_cast<char*>(out), size, static_cast<const LXUChar*>(in),
                                            length, flags);
                 }});
    check_texts({"LXCpUnicodeToStr " + name, plain, ucs2, nullptr, false,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXCpUnicodeToStr(record, static_cast<char*>(out), size, static_cast<const LXUChar*>(in),
                                           length, flags);
                 }});
    check_texts({"LXUnicodeToStringW " + name, wide, ucs2, locale, false,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXUnicodeToStringW(locale, static_cast<LXWChar*>(out), size,
                                             static_cast<const LXUChar*>(in), length, flags);
                 }});
    for (uint32_t state : states_of(page->source)) {
      Form shifted = {Form::shifted, &page->source, state};
      check_texts({"LXStringToUnicodeEx " + name, ucs2, shifted, locale, false,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXStringToUnicodeEx(locale, static_cast<LXUChar*>(out), size,
                                                static_cast<const char*>(in), state, length, flags);
                   }});
      check_texts({"LXUnicodeToStringEx " + name, shifted, ucs2, locale, false,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXUnicodeToStringEx(locale, static_cast<char*>(out), state, size,
                                                static_cast<const LXUChar*>(in), length, flags);
                   }});
    }
  }
}

TEST_F(ConvertString, ToAndFromPackedCharacters) {
  for (const auto& page : pages) {
    LXLocale* locale = page->locale.get();
    Form plain = {Form::plain, &page->source};
    Form wide = {Form::wide, &page->source};
    const std::string& name = page->source.name;
    check_texts({"LXMbToWide " + name, wide, plain, locale, true,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXMbToWide(locale, static_cast<LXWChar*>(out), size, static_cast<const char*>(in), length,
                                     flags);
                 }});
    check_texts({"LXWideToMb " + name, plain, wide, locale, true,
                 [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                   return LXWideToMb(locale, static_cast<char*>(out), size, static_cast<const LXWChar*>(in), length,
                                     flags);
                 }});
    for (uint32_t state : states_of(page->source)) {
      Form shifted = {Form::shifted, &page->source, state};
      check_texts({"LXMbToWideEx " + name, wide, shifted, locale, true,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXMbToWideEx(locale, static_cast<LXWChar*>(out), size, static_cast<const char*>(in), state,
                                         length, flags);
                   }});
      check_texts({"LXWideToMbEx " + name, shifted, wide, locale, true,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXWideToMbEx(locale, static_cast<char*>(out), state, size, static_cast<const LXWChar*>(in),
                                         length, flags);
                   }});
    }
  }
}

TEST_F(ConvertString, AsciiWithoutALocale) {
  const PageSource& ascii = PageSource::of(367);
  Form ucs2 = {Form::ucs2, nullptr};
  Form plain = {Form::plain, &ascii};
  EdgeBuffer out_buffer(64);
  const Units texts[] = {units_of("x"), units_of("ASCII\x80\xFFz")};
  for (const Units& text : texts) {
    std::string bytes = bytes_of_units(text);
    Units unicode = convert_model(ucs2, plain, text, {100, static_cast<int32_t>(text.size()), false, false}).written;
    std::vector<LXUChar> wide(unicode.begin(), unicode.end());
    wide.push_back(0);
    for (int32_t size = 0; size < 12; ++size) {
      for (int32_t length : {-1, 1, static_cast<int32_t>(text.size())}) {
        for (bool terminate : {false, true}) {
          StringOptions options = {size, length, terminate, false};
          uint32_t flags = terminate ? LX_OPT_TERMINATE : 0;
          auto* units = out_buffer.room<LXUChar>(static_cast<size_t>(size));
          StringResult expected = convert_model(ucs2, plain, text, options);
          EXPECT_EQ(LXComStrToUnicode(units, size, bytes.c_str(), length, flags),
                    static_cast<int32_t>(expected.consumed)) << bytes << " " << size << " " << length;
          EXPECT_EQ(read_back(ucs2, units, expected.written.size()), expected.written);
          char* out = out_buffer.room(static_cast<size_t>(size));
          expected = convert_model(plain, ucs2, unicode, options);
          EXPECT_EQ(LXComUnicodeToStr(out, size, wide.data(), length, flags), expected.count);
          EXPECT_EQ(read_back(plain, out, expected.written.size()), expected.written);
        }
      }
    }
  }
  LXUChar units[4] = {};
  const LXUChar letter[] = {'a', 0};
  char out[4];
  EXPECT_EQ(LXComStrToUnicode(units, 4, "", -1, 0), -1);
  EXPECT_EQ(LXComStrToUnicode(units, 4, "a", 0, 0), -1);
  EXPECT_EQ(LXComUnicodeToStr(out, 4, letter + 1, -1, 0), -1);
  EXPECT_EQ(LXComUnicodeToStr(out, 4, letter, 0, 0), -1);
}

// ---- Character and byte counts ----------------------------------------------------------------------------------------

TEST_F(ConvertString, CountsCharactersAndBytes) {
  for (const auto& page : pages) {
    const LXObjEntry* record = LXGetLocaleObject(page->locale.get(), LX_CODEPAGE);
    for (const char16_t* text : kTexts) {
      std::string bytes = encoded(page->source, text);
      for (uint32_t state : states_of(page->source)) {
        std::string_view whole = bytes;
        if (state != 0 && !bytes.empty() && bytes[0] == static_cast<char>(page->source.enter)) whole.remove_prefix(1);
        std::string terminated(whole);
        int32_t characters = byte_to_char_model(page->source, whole, state);
        EXPECT_EQ(LXCpStrByteToCharLen(record, terminated.c_str(), state, -1), characters) << page->source.name;
        for (size_t length = 0; length <= whole.size(); ++length) {
          Guarded cut(whole.substr(0, length));
          EXPECT_EQ(LXCpStrByteToCharLen(record, cut.data(), state, static_cast<int32_t>(length)),
                    byte_to_char_model(page->source, whole.substr(0, length), state))
              << page->source.name << " " << hex(whole.substr(0, length));
        }
        for (int32_t count = 0; count <= characters; ++count) {
          EXPECT_EQ(LXCpStrCharToByteLen(record, terminated.c_str(), state, count),
                    char_to_byte_model(page->source, whole, state, count))
              << page->source.name << " " << hex(whole) << " " << count << " characters, state " << state;
        }
      }
    }
  }
}

// ---- Single cases -----------------------------------------------------------------------------------------------------

struct Case {
  const char* name;
  const char* target;
  const char* source;
  bool shifted;  // LXConvertStringEx
  std::string in;
  int32_t in_length;
  int32_t out_size;
  uint32_t flags;
  int32_t count;
  std::string out;
};

std::string zeros(std::string_view text) { return std::string(text); }

TEST_F(ConvertString, SingleCases) {
  using namespace std::string_view_literals;
  const Case kCases[] = {
      {"measured: a terminator when there is room", "Latin1", "Latin1", false, "abc", -1, 4, 0, 4, zeros("abc\0"sv)},
      {"measured: none when the text just fits", "Latin1", "Latin1", false, "abc", -1, 3, 0, 3, "abc"},
      {"measured: any negative length", "Latin1", "Latin1", false, "abc", -7, 9, 0, 4, zeros("abc\0"sv)},
      {"given: no terminator", "Latin1", "Latin1", false, "abc", 3, 9, 0, 3, "abc"},
      {"terminator takes one from the text", "Latin1", "Latin1", false, "abc", -1, 3, 8, 3, zeros("ab\0"sv)},
      {"room for the terminator alone", "Latin1", "Latin1", false, "abc", -1, 1, 8, 1, zeros("\0"sv)},
      {"no text, terminator", "Latin1", "Latin1", false, "", 0, 5, 8, 1, zeros("\0"sv)},
      {"no room, terminator", "Latin1", "Latin1", false, "abc", 3, 0, 8, 0, ""},
      {"negative room is none", "Latin1", "Latin1", false, "abc", 3, -4, 8, 0, ""},
      {"zero bytes inside a given length", "Latin1", "IBM037", false, zeros("\xC1\0\xC2"sv), 3, 9, 0, 3,
       zeros("A\0B"sv)},
      {"cut character dropped silently", "Latin1", "MS932", false, "ab\x83", 3, 9, 0, 2, "ab"},
      {"cut character dropped silently, measured: not all consumed", "Latin1", "MS932", false, "ab\x83", -1, 9, 0, 2,
       "ab"},
      {"unmapped becomes the substitution byte", "IBM037", "Latin1", false, "\x41", 1, 9, 0, 1, "\xC1"},
      {"unassigned bytes become U+FFFD", "UTF-8", "US-ASCII", false, "\x80", 1, 9, 0, 3, "\xEF\xBF\xBD"},
      {"byte that begins nothing is a character", "UTF-8", "UTF-8", false, "\x80" "a", 2, 9, 0, 4, "\xEF\xBF\xBD" "a"},
      {"never half a character", "UTF-8", "Latin1", false, "\xE4\xE4", 2, 3, 0, 2, "\xC3\xA4"},
      {"characters: room and result", "UTF-8", "Latin1", false, "\xE4\xF6\xFC", 3, 2, 0x4000, 2, "\xC3\xA4\xC3\xB6"},
      {"characters: length", "UTF-8", "MS932", false, "\x83\x41\x83\x42z", 2, 9, 0x4008, 3,
       zeros("\xE3\x82\xA2\xE3\x82\xA3\0"sv)},
      {"shift bytes are left alone by the plain form", "UTF-8", "IBM930", false, "\x0E\xC1\x0F", 3, 9, 0, 3,
       "\x0E" "A\x0F"},
      {"double-byte characters without shift bytes in the plain form", "IBM930", "UTF-8", false, "\xE3\x80\x80", 3, 9,
       0, 2, "\x40\x40"},
      {"shift bytes followed", "UTF-8", "IBM930", true, "\xC1\x0E\x40\x40\x0F\xC2", 6, 9, 0, 5, "A\xE3\x80\x80" "B"},
      {"one shift byte before each character: a second one is text", "UTF-8", "IBM930", true, "\x0E\x0E\x41\x41", 4, 9,
       0, 3, "\xEF\xBF\xBD"},
      {"shift byte at the end is consumed", "UTF-8", "IBM930", true, "\xC1\x0E", -1, 9, 0, 2, zeros("A\0"sv)},
      {"run is closed", "IBM930", "UTF-8", true, "a\xE3\x80\x80", 4, 9, 0, 5, "\x62\x0E\x40\x40\x0F"},
      {"run is closed before the terminator", "IBM930", "UTF-8", true, "\xE3\x80\x80", 3, 9, 8, 5,
       zeros("\x0E\x40\x40\x0F\0"sv)},
      {"character that the leave byte pushes out, and its enter byte", "IBM930", "UTF-8", true, "a\xE3\x80\x80", 4, 4,
       0, 1, "\x62"},
      {"... and what is before stays", "IBM930", "UTF-8", true, "\xE3\x80\x80\xE3\x80\x80", 6, 5, 0, 4,
       "\x0E\x40\x40\x0F"},
      {"reserved terminator is no room for the leave byte", "IBM930", "UTF-8", true, "a\xE3\x80\x80", 4, 5, 8, 2,
       zeros("\x62\0"sv)},
      {"measured: the terminator takes a character when only the leave byte fits", "IBM930", "UTF-8", true,
       "\xE3\x80\x80\xE3\x80\x80", -1, 6, 0, 5, zeros("\x0E\x40\x40\x0F\0"sv)},
      {"measured: none due when the text just fits", "IBM930", "UTF-8", true, "\xE3\x80\x80\xE3\x80\x80", -1, 5, 0, 4,
       "\x0E\x40\x40\x0F"},
  };
  for (const Case& c : kCases) {
    Locale target = locale_of(c.target);
    Locale source = locale_of(c.source);
    spoil_status(target.get());
    std::string in = c.in;
    if (c.in_length < 0) in += '\0';
    Guarded text{std::string_view(in)};
    size_t room = (c.flags & LX_OPT_CHARS) != 0 ? c.out.size() : static_cast<size_t>(std::max(c.out_size, 0));
    Guarded out(room);
    int32_t count = c.shifted ? LXConvertStringEx(target.get(), out.data(), 0, c.out_size, source.get(), text.data(), 0,
                                                  c.in_length, c.flags)
                              : LXConvertString(target.get(), out.data(), c.out_size, source.get(), text.data(),
                                                c.in_length, c.flags);
    EXPECT_EQ(count, c.count) << c.name;
    EXPECT_EQ(hex(out.view().substr(0, c.out.size())), hex(c.out)) << c.name;
    EXPECT_EQ(LXGetError(target.get()), LX_OK) << c.name;
  }
}

TEST_F(ConvertString, OpenTargetStateIsClosed) {
  using namespace std::string_view_literals;
  Locale target = locale_of("IBM930");
  Locale source = locale_of("UTF-8");
  struct {
    std::string in;
    int32_t size;
    uint32_t flags;
    int32_t count;
    std::string out;
  } cases[] = {
      {"", 3, 8, 2, zeros("\x0F\0"sv)},           // no text: the leave byte before the terminator
      {"", 1, 8, 0, ""},                          // ... needs room for both
      {"", 1, 0x4008, 1, zeros("\x0F\0"sv)},      // ... of which in characters only one counts
      {"", 3, 0, 0, ""},                          // ... and comes only with it
      {"a", 9, 0, 2, "\x0F\x62"},                 // a single-byte character ends the run
      {"\xE3\x80\x80", 9, 0, 3, "\x40\x40\x0F"},  // a double-byte one needs no enter byte
      {"\xE3\x80\x80", 2, 0, 1, "\x0F"},          // backed up to the very start
      {"\xE3\x80\x80", 1, 0, 1, "\x0F"},          // nothing but the leave byte fits
      {"\xE3\x80\x80", 1, 8, 0, ""},              // not even that: neither it nor the terminator
  };
  for (const auto& c : cases) {
    Guarded out((c.flags & LX_OPT_CHARS) != 0 ? c.out.size() : static_cast<size_t>(c.size));
    int32_t count = LXConvertStringEx(target.get(), out.data(), 1, c.size, source.get(), c.in.data(), 0,
                                      static_cast<int32_t>(c.in.size()), c.flags);
    EXPECT_EQ(count, c.count) << hex(c.in) << " " << c.size << " " << c.flags;
    EXPECT_EQ(hex(out.view().substr(0, c.out.size())), hex(c.out)) << hex(c.in) << " " << c.size << " " << c.flags;
  }
}

// The terminator of a measured text is packed and counted like any character, once.
TEST_F(ConvertString, PackedTextCarriesItsTerminator) {
  Locale locale = locale_of("MS932");
  struct {
    int32_t size;
    uint32_t flags;
    std::vector<LXWChar> out;
  } cases[] = {
      {9, 0, {'a', 0x8341, 0}}, {9, 8, {'a', 0x8341, 0}}, {3, 8, {'a', 0x8341, 0}},
      {2, 0, {'a', 0x8341}},    {2, 8, {'a', 0}},         {1, 0, {'a'}},
  };
  for (const auto& c : cases) {
    Guarded out(static_cast<size_t>(c.size) * sizeof(LXWChar));
    auto count = static_cast<size_t>(LXMbToWide(locale.get(), out.as<LXWChar>(), c.size, "a\x83\x41", -1, c.flags));
    EXPECT_EQ(count, c.out.size()) << c.size << " " << c.flags;
    EXPECT_TRUE(std::equal(c.out.begin(), c.out.end(), out.as<LXWChar>())) << c.size << " " << c.flags;
  }
}

// What is written counts, not how long the value looks: zero bytes in the middle are skipped.
TEST_F(ConvertString, PackedValuesWithZeroBytes) {
  Locale locale = locale_of("EUC-TW");
  const LXWChar text[] = {0x410041, 0x41000041, 0x8EA20000};
  char out[8];
  EXPECT_EQ(LXWideToMb(locale.get(), out, 8, text, 3, 0), 7);
  EXPECT_EQ(hex({out, 7}), "41414141" "8EA200");
  EXPECT_EQ(LXWideToMb(locale.get(), out, 6, text, 3, 0), 4);
}

// ---- Locales and flags ------------------------------------------------------------------------------------------------

// All functions of the family that take a locale, with a minimal text.
struct LocaleFunction {
  const char* name;
  std::function<int32_t(LXLocale*, uint32_t flags)> call;
};

std::vector<LocaleFunction> locale_functions() {
  static char bytes[8];
  static LXUChar units[8];
  static LXWChar wides[8];
  static const LXUChar unit_text[] = {'x', 0};
  static const LXWChar wide_text[] = {'x', 0};
  return {
      {"LXConvertString", [](LXLocale* l, uint32_t f) { return LXConvertString(l, bytes, 8, l, "x", 1, f); }},
      {"LXConvertStringW", [](LXLocale* l, uint32_t f) { return LXConvertStringW(l, wides, 8, l, wide_text, 1, f); }},
      {"LXConvertStringEx", [](LXLocale* l, uint32_t f) { return LXConvertStringEx(l, bytes, 0, 8, l, "x", 0, 1, f); }},
      {"LXStringToUnicode", [](LXLocale* l, uint32_t f) { return LXStringToUnicode(l, units, 8, "x", 1, f); }},
      {"LXStringToUnicodeW", [](LXLocale* l, uint32_t f) { return LXStringToUnicodeW(l, units, 8, wide_text, 1, f); }},
      {"LXStringToUnicodeEx", [](LXLocale* l, uint32_t f) { return LXStringToUnicodeEx(l, units, 8, "x", 0, 1, f); }},
      {"LXUnicodeToString", [](LXLocale* l, uint32_t f) { return LXUnicodeToString(l, bytes, 8, unit_text, 1, f); }},
      {"LXUnicodeToStringW", [](LXLocale* l, uint32_t f) { return LXUnicodeToStringW(l, wides, 8, unit_text, 1, f); }},
      {"LXUnicodeToStringEx",
       [](LXLocale* l, uint32_t f) { return LXUnicodeToStringEx(l, bytes, 0, 8, unit_text, 1, f); }},
      {"LXMbToWide", [](LXLocale* l, uint32_t f) { return LXMbToWide(l, wides, 8, "x", 1, f); }},
      {"LXMbToWideEx", [](LXLocale* l, uint32_t f) { return LXMbToWideEx(l, wides, 8, "x", 0, 1, f); }},
      {"LXWideToMb", [](LXLocale* l, uint32_t f) { return LXWideToMb(l, bytes, 8, wide_text, 1, f); }},
      {"LXWideToMbEx", [](LXLocale* l, uint32_t f) { return LXWideToMbEx(l, bytes, 0, 8, wide_text, 1, f); }},
  };
}

TEST_F(ConvertString, FlagsAndTheDefaultLocale) {
  ASSERT_EQ(LXSetLocale("English_UnitedStates.IBM037@BINARY", 0), LX_OK);
  Locale latin = locale_of("Latin1");
  Locale host = locale_of("IBM930");
  for (const LocaleFunction& function : locale_functions()) {
    for (LXLocale* locale : {latin.get(), host.get(), static_cast<LXLocale*>(nullptr)}) {
      LXLocale* meant = locale != nullptr ? locale : lxglocale;
      for (uint32_t good : {0u, 8u, 0x4000u, 0x4008u}) {
        EXPECT_EQ(function.call(locale, good), (good & 8) != 0 ? 2 : 1) << function.name << " " << good;
        EXPECT_EQ(LXGetError(meant), LX_OK) << function.name;
      }
      for (uint32_t bad : {1u, 9u, 0x4001u, 0x8000u, 0x80000000u, 0xFFFFFFFFu}) {
        EXPECT_EQ(function.call(locale, bad), -1) << function.name << " " << bad;
        EXPECT_EQ(LXGetError(meant), LX_E_ARGUMENT) << function.name;
      }
    }
  }
  const LXObjEntry* record = LXGetLocaleObject(latin.get(), LX_CODEPAGE);
  LXUChar unit = 'x';
  char byte = 0;
  EXPECT_EQ(LXCpStrToUnicode(nullptr, &unit, 1, "x", 1, 0), -1);
  EXPECT_EQ(LXCpUnicodeToStr(nullptr, &byte, 1, &unit, 1, 0), -1);
  for (uint32_t bad : {1u, 0x80000000u}) {
    EXPECT_EQ(LXCpStrToUnicode(record, &unit, 1, "x", 1, bad), -1);
    EXPECT_EQ(LXCpUnicodeToStr(record, &byte, 1, &unit, 1, bad), -1);
    EXPECT_EQ(LXComStrToUnicode(&unit, 1, "x", 1, bad), -1);
    EXPECT_EQ(LXComUnicodeToStr(&byte, 1, &unit, 1, bad), -1);
  }
}

// The default stands in on either side.
TEST_F(ConvertString, DefaultLocaleOnOneSide) {
  ASSERT_EQ(LXSetLocale("English_UnitedStates.IBM037@BINARY", 0), LX_OK);
  Locale latin = locale_of("Latin1");
  char out[4];
  EXPECT_EQ(LXConvertString(nullptr, out, 4, latin.get(), "A", 1, 0), 1);
  EXPECT_EQ(out[0], '\xC1');
  EXPECT_EQ(LXConvertString(latin.get(), out, 4, nullptr, "\xC1", 1, 0), 1);
  EXPECT_EQ(out[0], 'A');
  EXPECT_EQ(LXConversionRatio(nullptr, nullptr, 0), 1);
}

// Only the target's status changes.
TEST_F(ConvertString, SourceKeepsItsStatus) {
  Locale target = locale_of("Latin1");
  Locale source = locale_of("IBM037");
  spoil_status(source.get());
  char out[4];
  EXPECT_EQ(LXConvertString(target.get(), out, 4, source.get(), "\xC1", 1, 0), 1);
  EXPECT_EQ(LXGetError(target.get()), LX_OK);
  EXPECT_EQ(LXGetError(source.get()), LX_E_ARGUMENT);
}

void expect_no_conversions() {
  ASSERT_EQ(lxglocale, nullptr);
  for (const LocaleFunction& function : locale_functions()) {
    EXPECT_EQ(function.call(nullptr, 0), -1) << function.name;
    EXPECT_EQ(function.call(nullptr, 1), -1) << function.name;
  }
  EXPECT_EQ(LXConversionRatio(nullptr, nullptr, 0), -1);
  EXPECT_EQ(LXOpenConversion(nullptr, nullptr, 0), nullptr);
}

TEST(WithoutADefaultLocale, ConversionsWithoutLocalesFail) {
  expect_no_conversions();  // before the library is up,
  LXUChar unit = 0;
  EXPECT_EQ(LXComStrToUnicode(&unit, 1, "x", 1, 0), -1);
  {
    Session session;
    expect_no_conversions();  // while nobody has set a default,
    EXPECT_EQ(LXComStrToUnicode(&unit, 1, "x", 1, 0), 1);
    ASSERT_EQ(LXSetLocale("English", 0), LX_OK);
    EXPECT_EQ(LXConversionRatio(nullptr, nullptr, 0), 1);
  }
  expect_no_conversions();  // and after the library is down
}

}  // namespace
}  // namespace lx::test
