// SPDX-License-Identifier: Apache-2.0
// Whole strings between code pages, UCS-2 and packed characters: every room, with and without terminator, counted in
// bytes and in characters, measured and given, against the slow model.
#include <functional>

#include "support/text_calls.hpp"

namespace lx::test {
namespace {

using namespace std::string_view_literals;

constexpr const char16_t* kTexts[] = {
    u"", u"A", u"Grüße 7", u"アイあ漢字", u"a漢b字cd漢", u"中文 Б한글ﾊ€", u"字字\uE000\u00E9字z",
};
// Bytes that begin nothing, repeated shift bytes, zeros, characters cut off.
constexpr std::string_view kBrokenTexts[] = {"\xC1\x80z\0\xC2\x83"sv, "\x0E\x0E\x41\x41\x0F\xC1\x0E"sv, "\xE3\x80"sv};

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

template <Form::Kind kKind>
using UnitOf = typename Calls<kKind>::Unit;

// The arguments that the function has.
template <Form::Kind kOut, Form::Kind kIn, class Use>
Call bound(Use* use, const Side& to, const Side& from) {
  return [=](Units& out, size_t room, int32_t size, const Units& in, int32_t length, uint32_t flags) {
    static EdgeBuffer in_buffer(4096), out_buffer(65536);
    auto* memory = out_buffer.room<UnitOf<kOut>>(room);
    const auto* text = place<UnitOf<kIn>>(in_buffer, in, length);
    LXLocale *l = to.locale, *m = from.locale;
    int32_t count;
    if constexpr (requires { use(l, memory, to.state, size, m, text, from.state, length, flags); }) {
      count = use(l, memory, to.state, size, m, text, from.state, length, flags);
    } else if constexpr (requires { use(l, memory, size, m, text, length, flags); }) {
      count = use(l, memory, size, m, text, length, flags);
    } else if constexpr (requires { use(l, memory, to.state, size, text, length, flags); }) {
      count = use(l, memory, to.state, size, text, length, flags);
    } else if constexpr (requires { use(l, memory, size, text, from.state, length, flags); }) {
      count = use(m, memory, size, text, from.state, length, flags);
    } else if constexpr (requires { use(l, memory, size, text, length, flags); }) {
      count = use(kOut == Form::ucs2 ? m : l, memory, size, text, length, flags);
    } else {
      count = use(LXGetLocaleObject(l, LX_CODEPAGE), memory, size, text, length, flags);
    }
    out.clear();
    for (size_t i = 0; i < room; ++i) out.push_back(std::make_unsigned_t<UnitOf<kOut>>(memory[i]));
    return count;
  };
}

class Functions {
 public:
  Functions(const Side& to, const Side& from) : to_(to), from_(from) {}

  // Those between two pages, and for one page those that leave it.
  std::vector<Function> all() {
    add<Form::plain, Form::plain>("LXConvertString", LXConvertString);
    add<Form::shifted, Form::shifted>("LXConvertStringEx", LXConvertStringEx);
    add<Form::wide, Form::wide>("LXConvertStringW", LXConvertStringW);
    if (to_.page != from_.page) return all_;
    add<Form::ucs2, Form::plain>("LXStringToUnicode", LXStringToUnicode);
    add<Form::ucs2, Form::shifted>("LXStringToUnicodeEx", LXStringToUnicodeEx);
    add<Form::ucs2, Form::wide>("LXStringToUnicodeW", LXStringToUnicodeW);
    add<Form::plain, Form::ucs2>("LXUnicodeToString", LXUnicodeToString);
    add<Form::shifted, Form::ucs2>("LXUnicodeToStringEx", LXUnicodeToStringEx);
    add<Form::wide, Form::ucs2>("LXUnicodeToStringW", LXUnicodeToStringW);
    add<Form::wide, Form::plain>("LXMbToWide", LXMbToWide, true);
    add<Form::wide, Form::shifted>("LXMbToWideEx", LXMbToWideEx, true);
    add<Form::plain, Form::wide>("LXWideToMb", LXWideToMb, true);
    add<Form::shifted, Form::wide>("LXWideToMbEx", LXWideToMbEx, true);
    if (to_.locale == nullptr) return all_;
    add<Form::ucs2, Form::plain>("LXCpStrToUnicode", LXCpStrToUnicode);
    add<Form::plain, Form::ucs2>("LXCpUnicodeToStr", LXCpUnicodeToStr);
    return all_;
  }

 private:
  template <Form::Kind kOut, Form::Kind kIn, class Use>
  void add(const char* name, Use* use, bool packed = false) {
    if ((to_.state != 0 && kOut != Form::shifted) || (from_.state != 0 && kIn != Form::shifted)) return;
    all_.push_back({name, to_.form(kOut), from_.form(kIn), packed, bound<kOut, kIn>(use, to_, from_)});
  }

  Side to_, from_;
  std::vector<Function> all_;
};
std::vector<Function> functions(const Side& to, const Side& from) { return Functions(to, from).all(); }

// ---- Every room and length ----

class Check {
 public:
  explicit Check(const Function& function) : function_(function) {}

  // For the text measured, given whole, and given up to each of its units. Where text is broken, characters are not
  // counted: nobody knows what stands behind the last one.
  void all(const Units& text, bool broken) const {
    for (bool terminate : {false, true}) {
      for (bool characters : {false, true}) {
        if (characters && broken) continue;
        if (std::count(text.begin(), text.end(), 0u) == 0) every_room(text, {0, -1, terminate, characters});
        every_length(text, terminate, characters);
      }
    }
  }

 private:
  StringResult expected(const Units& text, const StringOptions& options) const {
    return convert_model(function_.to, function_.from, text, options, function_.packed_transfer);
  }
  void every_room(const Units& text, StringOptions options) const {
    options.out_size = 10000;
    auto needed = static_cast<int32_t>(expected(text, options).written.size());
    for (options.out_size = -1; options.out_size <= needed + 3; ++options.out_size) one(text, options);
  }
  void every_length(const Units& text, bool terminate, bool characters) const {
    bool counted = characters && function_.from.is_bytes();
    // Lengths in characters reach the last character, no further: nothing stands behind it.
    auto longest = static_cast<int32_t>(text.size());
    if (counted) longest = static_cast<int32_t>(characters_of(function_.from, text, 1).list.size());
    if (counted && function_.from.kind == Form::plain && function_.from.page->mixed()) return;
    for (int32_t length = 0; length < longest; ++length) {
      for (int32_t size : {0, 1, 2, 5, 10000}) one(text, {size, length, terminate, characters});
    }
    every_room(text, {0, longest, terminate, characters});
  }

  void one(const Units& text, const StringOptions& options) const {
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
        const Check check(function);
        for (const char16_t* text : kTexts) {
          bool plain = function.from.kind == Form::plain;  // with shift bytes too
          check.all(plain ? units_of(encoded(*from.page, text)) : spelled(function.from, text), false);
        }
        for (std::string_view text : kBrokenTexts) {
          if (function.from.is_bytes()) check.all(units_of(text), true);
        }
        if (testing::Test::HasFailure()) return;  // one is enough of hundreds that look alike
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
  const Form ucs2 = {Form::ucs2, nullptr}, plain = {Form::plain, &PageSource::of(367)};
  EdgeBuffer in_buffer(64), out_buffer(64);
  const Units text = units_of("ASCII\x80\xFFz"),
              unicode = convert_model(ucs2, plain, text, {100, 8, false, false}).written;
  for (int32_t size = 0; size < 12; ++size) {
    for (int32_t length : {-1, 1, 8}) {
      for (uint32_t flags : {0u, LX_OPT_TERMINATE}) {
        SCOPED_TRACE(std::to_string(size) + " " + std::to_string(length));
        const StringOptions options = {size, length, flags != 0, false};
        const StringResult up = convert_model(ucs2, plain, text, options);
        auto* units = out_buffer.room<LXUChar>(static_cast<size_t>(size));
        EXPECT_EQ(LXComStrToUnicode(units, size, place<char>(in_buffer, text, length), length, flags),
                  static_cast<int32_t>(up.consumed));
        EXPECT_TRUE(std::equal(up.written.begin(), up.written.end(), units));
        const StringResult down = convert_model(plain, ucs2, unicode, options);
        char* out = out_buffer.room(static_cast<size_t>(size));
        EXPECT_EQ(LXComUnicodeToStr(out, size, place<LXUChar>(in_buffer, unicode, length), length, flags), down.count);
        EXPECT_EQ(std::string(out, down.written.size()), bytes_of_units(down.written));
      }
    }
  }
  const LXUChar unit = 0;
  LXUChar units[1];
  char out;
  for (int32_t length : {-1, 0}) {
    EXPECT_EQ(LXComStrToUnicode(units, 1, "", length, 0), -1);
    EXPECT_EQ(LXComUnicodeToStr(&out, 1, &unit, length, 0), -1);
  }
}

TEST_F(ConvertString, CountsCharactersAndBytes) {
  EdgeBuffer edge(256);
  for (const Page& page : pages) {
    const LXObjEntry* record = LXGetLocaleObject(page.locale.get(), LX_CODEPAGE);
    for (const Side& side : page.sides()) {
      const Form form = side.form(Form::shifted);
      for (const char16_t* text : kTexts) {
        const Units whole = spelled(form, text);
        SCOPED_TRACE(form.name() + " " + hex_units(whole));
        auto characters_in = [&](const Units& part) {
          return static_cast<int32_t>(characters_of(form, part, 1).list.size());
        };
        const char* at = place<char>(edge, whole, -1);
        EXPECT_EQ(LXCpStrByteToCharLen(record, at, side.state, -1), characters_in(whole));
        int32_t count = 0;
        EXPECT_EQ(LXCpStrCharToByteLen(record, at, side.state, 0), 0);
        for (const Character& character : characters_of(form, whole, 1).list) {
          EXPECT_EQ(LXCpStrCharToByteLen(record, at, side.state, ++count), static_cast<int32_t>(character.end));
        }
        for (size_t length = 0; length <= whole.size(); ++length) {
          const Units cut = first_units(whole, length);
          EXPECT_EQ(LXCpStrByteToCharLen(record, place<char>(edge, cut, 0), side.state, static_cast<int32_t>(length)),
                    characters_in(cut));
        }
      }
    }
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
  Units out;
  for (const Function& function : functions({nullptr, nullptr}, {nullptr, nullptr})) {
    EXPECT_EQ(function.call(out, 8, 8, {'x'}, 1, 0), -1) << function.name << " without any locale";
  }
  Session session;
  ASSERT_EQ(LXSetLocale("English_UnitedStates.IBM037@BINARY", 0), LX_OK);
  Locale latin = locale_of("Latin1");
  for (LXLocale* locale : {latin.get(), static_cast<LXLocale*>(nullptr)}) {
    LXLocale* meant = locale != nullptr ? locale : lxglocale;
    for (const Function& function : functions({nullptr, locale}, {nullptr, locale})) {
      bool tells = function.name.substr(0, 4) != "LXCp";
      for (uint32_t bad : {1u, 9u, 0x4001u, 0x80000000u}) {
        EXPECT_EQ(function.call(out, 8, 8, {'x'}, 1, bad), -1) << function.name << " " << bad;
        EXPECT_TRUE(!tells || LXGetError(meant) == LX_E_ARGUMENT) << function.name;
      }
      EXPECT_EQ(function.call(out, 8, 8, {'x'}, 1, 0x4008), 2) << function.name;
      EXPECT_TRUE(!tells || LXGetError(meant) == LX_OK) << function.name;
    }
  }
  // The default stands in on either side, and the source keeps its status.
  char byte = 0;
  EXPECT_EQ(LXConvertString(latin.get(), &byte, 1, nullptr, "\xC1", 1, 1), -1);
  EXPECT_EQ(LXConvertString(nullptr, &byte, 1, latin.get(), "A", 1, 0), 1);
  EXPECT_EQ(byte, '\xC1');
  EXPECT_EQ(LXGetError(latin.get()), LX_E_ARGUMENT);
  EXPECT_EQ(LXConvertString(latin.get(), &byte, 1, nullptr, "\xC1", 1, 0), 1);
  EXPECT_EQ(byte, 'A');
}

}  // namespace
}  // namespace lx::test
