// SPDX-License-Identifier: Apache-2.0
// Whole strings between code pages, UCS-2 and packed characters: every room, with and without terminator, counted in
// bytes and in characters, measured and given, against the slow model.
#include <functional>
#include <memory>

#include "support/text_calls.hpp"

namespace lx::test {
namespace {

using namespace std::string_literals;

constexpr const char16_t* kTexts[] = {
    u"", u"A", u"Grüße 7", u"アイあ漢字", u"a漢b字cd漢", u"中文 Б한글ﾊ€", u"字字\uE000\u00E9字z",
};

// ---- The functions under one signature ----

// A text is placed, and its result with the whole room read back.
using Call = std::function<int32_t(Units& out, size_t room, int32_t size, const Units& in, int32_t length, uint32_t)>;

struct Function {
  std::string name;
  Form to;
  Form from;
  bool packed_transfer;
  Call call;
};

struct Side {
  const PageSource* page;
  LXLocale* locale;
  uint32_t state = 0;

  Form form(Form::Kind kind) const {
    return {kind, kind == Form::ucs2 ? nullptr : page, kind == Form::shifted ? state : 0};
  }
};

template <class Out, class In, class Use>
Call in_memory(Use use) {
  return [=](Units& out, size_t room, int32_t size, const Units& in, int32_t length, uint32_t flags) {
    static EdgeBuffer in_buffer(4096);
    static EdgeBuffer out_buffer(65536);
    Out* memory = out_buffer.room<Out>(room);
    int32_t count = use(memory, size, place<In>(in_buffer, in, length), length, flags);
    out.assign(room, 0);
    std::transform(memory, memory + room, out.begin(), [](Out unit) { return std::make_unsigned_t<Out>(unit); });
    return count;
  };
}

template <class Head>
Head* head_of(LXLocale* locale) {
  if constexpr (std::is_same_v<Head, LXLocale>) {
    return locale;
  } else {
    return LXGetLocaleObject(locale, LX_CODEPAGE);
  }
}

template <class Head, class Out, class In>
Call bound(int32_t (*function)(Head*, Out*, int32_t, const In*, int32_t, uint32_t), Side to, Side) {
  return in_memory<Out, In>([=](Out* out, int32_t size, const In* in, int32_t length, uint32_t flags) {
    return function(head_of<Head>(to.locale), out, size, in, length, flags);
  });
}
template <class Out, class In>
Call bound(int32_t (*function)(LXLocale*, Out*, int32_t, const In*, uint32_t, int32_t, uint32_t), Side, Side from) {
  return in_memory<Out, In>([=](Out* out, int32_t size, const In* in, int32_t length, uint32_t flags) {
    return function(from.locale, out, size, in, from.state, length, flags);
  });
}
template <class Out, class In>
Call bound(int32_t (*function)(LXLocale*, Out*, uint32_t, int32_t, const In*, int32_t, uint32_t), Side to, Side) {
  return in_memory<Out, In>([=](Out* out, int32_t size, const In* in, int32_t length, uint32_t flags) {
    return function(to.locale, out, to.state, size, in, length, flags);
  });
}
template <class Out, class In>
Call bound(int32_t (*function)(LXLocale*, Out*, int32_t, LXLocale*, const In*, int32_t, uint32_t), Side to, Side from) {
  return in_memory<Out, In>([=](Out* out, int32_t size, const In* in, int32_t length, uint32_t flags) {
    return function(to.locale, out, size, from.locale, in, length, flags);
  });
}
Call bound(decltype(LXConvertStringEx)* function, Side to, Side from) {
  return in_memory<char, char>([=](char* out, int32_t size, const char* in, int32_t length, uint32_t flags) {
    return function(to.locale, out, to.state, size, from.locale, in, from.state, length, flags);
  });
}

// Those between two pages, and for one page those that leave it.
std::vector<Function> functions(const Side& to, const Side& from) {
  std::vector<Function> all;
  auto add = [&](const char* name, auto* function, Form::Kind out, Form::Kind in, bool packed = false) {
    if ((to.state != 0 && out != Form::shifted) || (from.state != 0 && in != Form::shifted)) return;
    all.push_back({name, to.form(out), from.form(in), packed, bound(function, to, from)});
  };
  add("LXConvertString", LXConvertString, Form::plain, Form::plain);
  add("LXConvertStringEx", LXConvertStringEx, Form::shifted, Form::shifted);
  add("LXConvertStringW", LXConvertStringW, Form::wide, Form::wide);
  if (to.page != from.page) return all;
  add("LXStringToUnicode", LXStringToUnicode, Form::ucs2, Form::plain);
  add("LXStringToUnicodeEx", LXStringToUnicodeEx, Form::ucs2, Form::shifted);
  add("LXStringToUnicodeW", LXStringToUnicodeW, Form::ucs2, Form::wide);
  add("LXUnicodeToString", LXUnicodeToString, Form::plain, Form::ucs2);
  add("LXUnicodeToStringEx", LXUnicodeToStringEx, Form::shifted, Form::ucs2);
  add("LXUnicodeToStringW", LXUnicodeToStringW, Form::wide, Form::ucs2);
  add("LXMbToWide", LXMbToWide, Form::wide, Form::plain, true);
  add("LXMbToWideEx", LXMbToWideEx, Form::wide, Form::shifted, true);
  add("LXWideToMb", LXWideToMb, Form::plain, Form::wide, true);
  add("LXWideToMbEx", LXWideToMbEx, Form::shifted, Form::wide, true);
  if (to.locale == nullptr) return all;
  add("LXCpStrToUnicode", LXCpStrToUnicode, Form::ucs2, Form::plain);
  add("LXCpUnicodeToStr", LXCpUnicodeToStr, Form::plain, Form::ucs2);
  return all;
}

// ---- Every room and length ----

class Check {
 public:
  explicit Check(const Function& function) : function_(function) {}

  // For the text measured, given whole, and given up to each of its units.
  void all(const Units& text) {
    for (bool terminate : {false, true}) {
      for (bool characters : {false, true}) {
        every_room(text, {0, -1, terminate, characters});
        every_length(text, terminate, characters);
      }
    }
  }

 private:
  StringResult expected(const Units& text, const StringOptions& options) const {
    return convert_model(function_.to, function_.from, text, options, function_.packed_transfer);
  }
  void every_room(const Units& text, StringOptions options) {
    options.out_size = 10000;
    auto needed = static_cast<int32_t>(expected(text, options).written.size());
    for (options.out_size = -1; options.out_size <= needed + 3; ++options.out_size) one(text, options);
  }
  void every_length(const Units& text, bool terminate, bool characters) {
    bool counted = characters && function_.from.is_bytes();
    // Lengths in characters reach the last character, no further: nothing stands behind it.
    auto longest = static_cast<int32_t>(text.size());
    if (counted) longest = byte_to_char_model(*function_.from.page, bytes_of_units(text), function_.from.state);
    if (counted && function_.from.kind == Form::plain && function_.from.page->mixed()) return;
    for (int32_t length = 0; length < longest; ++length) {
      for (int32_t size : {0, 1, 2, 5, 10000}) one(text, {size, length, terminate, characters});
    }
    every_room(text, {0, longest, terminate, characters});
  }

  void one(const Units& text, const StringOptions& options) {
    StringResult result = expected(text, options);
    bool given = options.in_length >= 0 && !(options.characters && function_.from.is_bytes());
    // A room counted in characters says nothing about bytes: exactly those that are due are there.
    size_t room = options.characters && function_.to.is_bytes() ? result.written.size()
                                                                : static_cast<size_t>(std::max(options.out_size, 0));
    uint32_t flags = (options.terminate ? LX_OPT_TERMINATE : 0) | (options.characters ? LX_OPT_CHARS : 0);
    Units placed = given ? first_units(text, static_cast<size_t>(options.in_length)) : text;
    Units written;
    int32_t count = function_.call(written, room, options.out_size, placed, options.in_length, flags);
    written.resize(result.written.size());
    if (count == result.count && written == result.written) return;
    ADD_FAILURE() << function_.name << ", " << function_.from.name() << " to " << function_.to.name() << " of "
                  << hex_units(text) << "length " << options.in_length << ", room " << options.out_size << ", flags "
                  << flags << "\n  gives  " << count << ": " << hex_units(written) << "\n  not    " << result.count
                  << ": " << hex_units(result.written);
  }

  const Function& function_;
};

struct Page {
  explicit Page(uint16_t id) : source(PageSource::of(id)), locale(locale_of(source.name)) {}
  std::vector<Side> sides() const {
    std::vector<Side> all = {{&source, locale.get()}};
    if (source.mixed()) all.push_back({&source, locale.get(), 1});
    return all;
  }
  const PageSource& source;
  Locale locale;
};

class ConvertString : public testing::Test {
 protected:
  ConvertString() {
    for (int id : {37, 819, 367, 932, 954, 964, 57352, 930, 1388}) pages.push_back(Page(static_cast<uint16_t>(id)));
  }
  Session session;
  std::vector<Page> pages;
};

void check_pages(const Page& target, const Page& source) {
  for (const Side& to : target.sides()) {
    for (const Side& from : source.sides()) {
      for (const Function& function : functions(to, from)) {
        for (const char16_t* text : kTexts) {
          bool plain = function.from.kind == Form::plain;  // with shift bytes too
          Check(function).all(plain ? units_of(encoded(*from.page, text)) : spelled(function.from, text));
          if (testing::Test::HasFailure()) return;  // one is enough of hundreds that look alike
        }
      }
    }
  }
}

TEST_F(ConvertString, EveryRoomAndLength) {
  for (const Page& source : pages) {
    for (const Page& target : pages) check_pages(target, source);
  }
}

TEST_F(ConvertString, AsciiWithoutALocale) {
  const PageSource& ascii = PageSource::of(367);
  Form ucs2 = {Form::ucs2, nullptr};
  Form plain = {Form::plain, &ascii};
  EdgeBuffer in_buffer(64);
  EdgeBuffer out_buffer(64);
  for (const Units& text : {units_of("x"), units_of("ASCII\x80\xFFz")}) {
    auto whole = static_cast<int32_t>(text.size());
    Units unicode = convert_model(ucs2, plain, text, {100, whole, false, false}).written;
    for (int32_t size = 0; size < 12; ++size) {
      for (int32_t length : {-1, 1, whole}) {
        for (uint32_t flags : {0u, LX_OPT_TERMINATE}) {
          StringOptions options = {size, length, flags != 0, false};
          StringResult expected = convert_model(ucs2, plain, text, options);
          auto* units = out_buffer.room<LXUChar>(static_cast<size_t>(size));
          int32_t count = LXComStrToUnicode(units, size, place<char>(in_buffer, text, length), length, flags);
          EXPECT_EQ(count, static_cast<int32_t>(expected.consumed)) << size << " " << length;
          EXPECT_TRUE(std::equal(expected.written.begin(), expected.written.end(), units)) << size << " " << length;
          expected = convert_model(plain, ucs2, unicode, options);
          char* out = out_buffer.room(static_cast<size_t>(size));
          count = LXComUnicodeToStr(out, size, place<LXUChar>(in_buffer, unicode, length), length, flags);
          EXPECT_EQ(count, expected.count) << size << " " << length;
          EXPECT_EQ(std::string(out, expected.written.size()), bytes_of_units(expected.written));
        }
      }
    }
  }
  LXUChar units[4] = {};
  char out[4];
  for (int32_t length : {-1, 0}) {
    EXPECT_EQ(LXComStrToUnicode(units, 4, "", length, 0), -1);
    EXPECT_EQ(LXComUnicodeToStr(out, 4, units, length, 0), -1);
  }
}

TEST_F(ConvertString, CountsCharactersAndBytes) {
  for (const Page& page : pages) {
    const LXObjEntry* record = LXGetLocaleObject(page.locale.get(), LX_CODEPAGE);
    for (const Side& side : page.sides()) {
      for (const char16_t* text : kTexts) {
        std::string whole = bytes_of_units(spelled(side.form(Form::shifted), text));
        SCOPED_TRACE(page.source.name + " " + hex(whole) + " state " + std::to_string(side.state));
        int32_t characters = byte_to_char_model(page.source, whole, side.state);
        EXPECT_EQ(LXCpStrByteToCharLen(record, whole.c_str(), side.state, -1), characters);
        for (size_t length = 0; length <= whole.size(); ++length) {
          Guarded cut(std::string_view(whole).substr(0, length));
          EXPECT_EQ(LXCpStrByteToCharLen(record, cut.data(), side.state, static_cast<int32_t>(length)),
                    byte_to_char_model(page.source, cut.view(), side.state));
        }
        for (int32_t count = 0; count <= characters; ++count) {
          EXPECT_EQ(LXCpStrCharToByteLen(record, whole.c_str(), side.state, count),
                    char_to_byte_model(page.source, whole, side.state, count));
        }
      }
    }
  }
}

// ---- Case by case ----

// How strings end, what is cut off, and which shift bytes are due.
TEST_F(ConvertString, Ends) {
  enum Way { kPlain, kShifted, kInside };  // LXConvertString; LXConvertStringEx, also into an open double-byte run
  const struct {
    const char* name;
    const char* target;
    const char* source;
    Way way;
    std::string in;
    int32_t in_length;
    int32_t size;
    uint32_t flags;
    int32_t count;
    std::string out;
  } cases[] = {
      {"measured: a terminator when there is room", "Latin1", "Latin1", kPlain, "abc", -7, 4, 0, 4, "abc\0"s},
      {"measured: none when the text just fits", "Latin1", "Latin1", kPlain, "abc", -1, 3, 0, 3, "abc"},
      {"terminator takes one from the text", "Latin1", "Latin1", kPlain, "abc", -1, 3, 8, 3, "ab\0"s},
      {"no text, terminator", "Latin1", "Latin1", kPlain, "", 0, 5, 8, 1, "\0"s},
      {"negative room is none", "Latin1", "Latin1", kPlain, "abc", 3, -4, 8, 0, ""},
      {"zero bytes inside a given length", "Latin1", "IBM037", kPlain, "\xC1\0\xC2"s, 3, 9, 0, 3, "A\0B"s},
      {"cut character dropped: not all consumed", "Latin1", "MS932", kPlain, "ab\x83", -1, 9, 0, 2, "ab"},
      {"byte that begins nothing", "UTF-8", "UTF-8", kPlain, "\x80z", 2, 9, 0, 4, "\xEF\xBF\xBDz"},
      {"never half a character", "UTF-8", "Latin1", kPlain, "\xE4\xE4", 2, 3, 0, 2, "\xC3\xA4"},
      {"characters", "UTF-8", "MS932", kPlain, "\x83\x41\x83\x42z", 2, 9, 0x4008, 3, "\xE3\x82\xA2\xE3\x82\xA3\0"s},
      {"shift bytes are text", "UTF-8", "IBM930", kPlain, "\x0E\xC1\x0F", 3, 9, 0, 3, "\x0E\x41\x0F"},
      {"no shift bytes", "IBM930", "UTF-8", kPlain, "\xE3\x80\x80", 3, 9, 0, 2, "\x40\x40"},
      {"a second shift byte is text", "UTF-8", "IBM930", kShifted, "\x0E\x0E\x41\x41", 4, 9, 0, 3, "\xEF\xBF\xBD"},
      {"shift byte at the end is consumed", "UTF-8", "IBM930", kShifted, "\xC1\x0E", -1, 9, 0, 2, "A\0"s},
      {"run is closed before the terminator", "IBM930", "UTF-8", kShifted, "\xE3\x80\x80", 3, 9, 8, 5,
       "\x0E\x40\x40\x0F\0"s},
      {"character that the leave byte pushes out, and its enter byte", "IBM930", "UTF-8", kShifted, "a\xE3\x80\x80", 4,
       4, 0, 1, "\x62"},
      {"... and what is before stays", "IBM930", "UTF-8", kShifted, "\xE3\x80\x80\xE3\x80\x80", 6, 5, 0, 4,
       "\x0E\x40\x40\x0F"},
      {"reserved terminator is no room for the leave byte", "IBM930", "UTF-8", kShifted, "a\xE3\x80\x80", 4, 5, 8, 2,
       "\x62\0"s},
      {"measured: the terminator takes a character when only the leave byte fits", "IBM930", "UTF-8", kShifted,
       "\xE3\x80\x80\xE3\x80\x80", -1, 6, 0, 5, "\x0E\x40\x40\x0F\0"s},
      {"open run, no text: the leave byte before the terminator", "IBM930", "UTF-8", kInside, "", 0, 3, 8, 2,
       "\x0F\0"s},
      {"... needs room for both", "IBM930", "UTF-8", kInside, "", 0, 1, 8, 0, ""},
      {"... of which in characters only one counts", "IBM930", "UTF-8", kInside, "", 0, 1, 0x4008, 1, "\x0F\0"s},
      {"... and comes only with it", "IBM930", "UTF-8", kInside, "", 0, 3, 0, 0, ""},
      {"a single-byte character ends the run", "IBM930", "UTF-8", kInside, "a", 1, 9, 0, 2, "\x0F\x62"},
      {"a double-byte one goes on", "IBM930", "UTF-8", kInside, "\xE3\x80\x80", 3, 9, 0, 3, "\x40\x40\x0F"},
      {"backed up to the very start", "IBM930", "UTF-8", kInside, "\xE3\x80\x80", 3, 2, 0, 1, "\x0F"},
      {"not even the leave byte fits", "IBM930", "UTF-8", kInside, "\xE3\x80\x80", 3, 1, 8, 0, ""},
  };
  for (const auto& c : cases) {
    Locale target = locale_of(c.target);
    Locale source = locale_of(c.source);
    Guarded text(std::string_view(c.in_length < 0 ? c.in + '\0' : c.in));
    Guarded out((c.flags & LX_OPT_CHARS) != 0 ? c.out.size() : static_cast<size_t>(std::max(c.size, 0)));
    int32_t count = c.way == kPlain ? LXConvertString(target.get(), out.data(), c.size, source.get(), text.data(),
                                                      c.in_length, c.flags)
                                    : LXConvertStringEx(target.get(), out.data(), c.way == kInside, c.size,
                                                        source.get(), text.data(), 0, c.in_length, c.flags);
    EXPECT_EQ(count, c.count) << c.name;
    EXPECT_EQ(hex(out.view().substr(0, c.out.size())), hex(c.out)) << c.name;
  }
}

// What is written counts, not how long the value looks: zero bytes in the middle are skipped.
TEST_F(ConvertString, PackedValuesWithZeroBytes) {
  Locale locale = locale_of("EUC-TW");
  const LXWChar text[] = {0x410041, 0x41000041, 0x8EA20000};
  char out[8];
  EXPECT_EQ(LXWideToMb(locale.get(), out, 8, text, 3, 0), 7);
  EXPECT_EQ(hex({out, 7}), "414141418EA200");
  EXPECT_EQ(LXWideToMb(locale.get(), out, 6, text, 3, 0), 4);
}

// ---- Locales and flags ----

TEST(ConvertStringFlags, AreCheckedAndTold) {
  Session session;
  ASSERT_EQ(LXSetLocale("English_UnitedStates.IBM037@BINARY", 0), LX_OK);
  Locale latin = locale_of("Latin1");
  Locale host = locale_of("IBM930");
  for (LXLocale* locale : {latin.get(), host.get(), static_cast<LXLocale*>(nullptr)}) {
    LXLocale* meant = locale != nullptr ? locale : lxglocale;
    for (const Function& function : functions({nullptr, locale}, {nullptr, locale})) {
      bool tells = function.name.substr(0, 4) != "LXCp";
      Units out;
      for (uint32_t bad : {1u, 9u, 0x4001u, 0x8000u, 0x80000000u, 0xFFFFFFFFu}) {
        EXPECT_EQ(function.call(out, 8, 8, {'x'}, 1, bad), -1) << function.name << " " << bad;
        EXPECT_TRUE(!tells || LXGetError(meant) == LX_E_ARGUMENT) << function.name;
        for (uint32_t good : {0u, 8u, 0x4000u, 0x4008u}) {
          EXPECT_EQ(function.call(out, 8, 8, {'x'}, 1, good), (good & 8) != 0 ? 2 : 1) << function.name << " " << good;
          EXPECT_TRUE(!tells || LXGetError(meant) == LX_OK) << function.name;
        }
      }
    }
  }
  // The default stands in on either side, and the source keeps its status.
  char out[4];
  EXPECT_EQ(LXConvertString(latin.get(), out, 4, nullptr, "\xC1", 1, 1), -1);
  EXPECT_EQ(LXConvertString(nullptr, out, 4, latin.get(), "A", 1, 0), 1);
  EXPECT_EQ(out[0], '\xC1');
  EXPECT_EQ(LXGetError(latin.get()), LX_E_ARGUMENT);
  EXPECT_EQ(LXConvertString(latin.get(), out, 4, nullptr, "\xC1", 1, 0), 1);
  EXPECT_EQ(out[0], 'A');
}

void expect_no_conversions() {
  ASSERT_EQ(lxglocale, nullptr);
  Units out;
  for (const Function& function : functions({nullptr, nullptr}, {nullptr, nullptr})) {
    EXPECT_EQ(function.call(out, 8, 8, {'x'}, 1, 0), -1) << function.name;
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
