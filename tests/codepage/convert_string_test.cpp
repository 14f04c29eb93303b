// SPDX-License-Identifier: Apache-2.0
// Whole strings between code pages, UCS-2 and packed characters: every room, with and without terminator, counted in
// bytes and in characters, measured and given, against the slow model.
#include <functional>
#include <memory>

#include "support/edge_buffer.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

constexpr const char16_t* kTexts[] = {
    u"", u"A", u"Grüße 7", u"アイあ漢字", u"a漢b字cd漢", u"中文 Б한글ﾊ€", u"字字\uE000\u00E9字z",
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
    auto needed = static_cast<int32_t>(
        convert_model(function_.to, function_.from, text, options, function_.packed_transfer).written.size());
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
    StringResult expected = convert_model(function_.to, function_.from, text, options, function_.packed_transfer);
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
      check_texts({"LXConvertString " + pair,
                   {Form::plain, &target->source},
                   {Form::plain, &source->source},
                   to,
                   false,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXConvertString(to, static_cast<char*>(out), size, from, static_cast<const char*>(in),
                                            length, flags);
                   }});
      check_texts({"LXConvertStringW " + pair,
                   {Form::wide, &target->source},
                   {Form::wide, &source->source},
                   to,
                   false,
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
                   return LXStringToUnicodeW(locale, static_cast<LXUChar*>(out), size, static_cast<const LXWChar*>(in),
                                             length, flags);
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
                   return LXUnicodeToStringW(locale, static_cast<LXWChar*>(out), size, static_cast<const LXUChar*>(in),
                                             length, flags);
                 }});
    for (uint32_t state : states_of(page->source)) {
      Form shifted = {Form::shifted, &page->source, state};
      check_texts({"LXStringToUnicodeEx " + name, ucs2, shifted, locale, false,
                   [=](void* out, int32_t size, const void* in, int32_t length, uint32_t flags) {
                     return LXStringToUnicodeEx(locale, static_cast<LXUChar*>(out), size, static_cast<const char*>(in),
                                                state, length, flags);
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
                    static_cast<int32_t>(expected.consumed))
              << bytes << " " << size << " " << length;
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

// ---- Character and byte counts
// ----------------------------------------------------------------------------------------

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

}  // namespace
}  // namespace lx::test
