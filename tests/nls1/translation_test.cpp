// SPDX-License-Identifier: Apache-2.0
// NLS1_TranslateString beside its slow model: all pairs of pages of every kind, all flags, all sizes; bad arguments,
// absent buffers, messages.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <algorithm>
#include <cstring>
#include <random>

#include "support/edge_buffer.hpp"
#include "support/text_model.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

using namespace std::string_literals;

// ---- The model: one character after the other ----

// Of the page; UCS-2 for 1200.
Form form_of(uint16_t page) {
  if (page == LX_CP_UCS2) return {Form::ucs2, nullptr};
  return {Form::shifted, &PageSource::of(page)};
}

// The elements of a text in memory; half a unit at the end is left out.
Units units_in(const Form& form, std::string_view bytes) {
  if (form.is_bytes()) return units_of(bytes);
  Units units;
  for (size_t at = 0; at + 2 <= bytes.size(); at += 2) {
    uint16_t unit = 0;
    std::memcpy(&unit, bytes.data() + at, sizeof unit);
    units.push_back(unit);
  }
  return units;
}

std::string spelled_bytes(uint16_t page, std::u16string_view text) {
  return raw(form_of(page), spelled(form_of(page), text));
}

struct FieldCall {
  Form to;
  Form from;
  std::string text;  // the whole input, bytes as they stand in memory
  bool measured;     // by its terminator, which is not part of the text
  size_t size;       // of the output: bytes, or characters
  uint32_t flags;

  bool has(uint32_t flag) const { return (flags & flag) != 0; }
};

struct FieldResult {
  int32_t count = 0;
  std::string written;
  int32_t consumed = 0;
  uint32_t error = 0;

  bool operator==(const FieldResult&) const = default;
};

class Model {
 public:
  explicit Model(const FieldCall& call) : call_(call) {}

  FieldResult result() {
    const bool half = !call_.from.is_bytes() && call_.to.is_bytes() && call_.to.page->kind == PageSource::Kind::single;
    if (!call_.to.is_bytes() && !call_.from.is_bytes()) {  // the room plays no part
      out_.units = in_;
      characters_ = in_.size();
      consumed_ = characters_;
    } else if (half) {
      characters_ = std::min(in_.size() * 2, limit_) / 2;
      for (size_t i = 0; i < characters_; ++i) out_.add(out_.piece(static_cast<uint16_t>(in_[i])));
      consumed_ = characters_;
      if (in_.size() * 2 > limit_) refuse(characters_, false);
    } else {
      carry();
    }
    return finish();
  }

 private:
  size_t used() const { return by_characters_ ? characters_ : out_.units.size(); }
  uint32_t blank(const Form& form) const { return form.is_bytes() ? units_of(form.page->encode(0x20))[0] : 0x20; }

  // What is left has no room, which is no error when nobody will miss it.
  void refuse(size_t at, bool inside) {
    refused_ = true;
    bool blanks = !inside && std::all_of(in_.begin() + static_cast<ptrdiff_t>(at), in_.end(),
                                         [&](uint32_t unit) { return unit == blank(call_.from); });
    if (!call_.has(NLS1_XLT_BLANKS) || !blanks) error_ = LX_E_BUFFER;
  }

  // A further call goes on before the shift bytes that were skipped last.
  void carry() {
    const Characters found = characters_of(call_.from, in_);
    size_t resume = 0, before = 0;
    Writer shorter = out_;
    for (const Character& c : found.list) {
      const Units piece = out_.piece(unicode_of(call_.from, c));
      if (by_characters_ ? characters_ == limit_ : out_.units.size() + piece.size() > limit_) {
        consumed_ = resume;
        refuse(c.at, c.state != 0);
        break;
      }
      shorter = out_;
      before = resume;
      out_.add(piece);
      resume = c.own_end();
      ++characters_;
    }
    if (!refused_) consumed_ = found.whole;
    cut_ = !refused_ && (found.cut || in_.size() * call_.from.unit_size() < call_.text.size());
    // A text ends in the single-byte state, if need be without its last character.
    if (!out_.inside) return;
    if (!by_characters_ && out_.units.size() == limit_) {
      out_ = shorter;
      consumed_ = before;
      refused_ = true;
      error_ = LX_E_BUFFER;
    }
    if (out_.inside) out_.units.push_back(call_.to.page->leave);
  }

  FieldResult finish() {
    size_t count = used();
    for (; call_.has(NLS1_XLT_PAD) && count < limit_; ++count) out_.units.push_back(blank(call_.to));
    const bool all = !refused_ && !cut_;
    if (call_.has(LX_OPT_TERMINATE) ? count <= limit_ : call_.measured && all && count < limit_) {
      out_.units.push_back(0);
      ++count;
    }
    return {static_cast<int32_t>(count * unit_), raw(call_.to, out_.units),
            static_cast<int32_t>(by_characters_ ? characters_ : consumed_ * call_.from.unit_size()), error_};
  }

  const FieldCall& call_;
  const bool by_characters_ = call_.has(LX_OPT_CHARS);
  const size_t unit_ = by_characters_ ? 1 : call_.to.unit_size();  // bytes that count as one in sizes and results
  const size_t limit_ = call_.size / unit_ - (call_.has(LX_OPT_TERMINATE) ? 1 : 0);  // without the terminator
  const Units in_ = units_in(call_.from, call_.text);
  Writer out_{call_.to};
  size_t characters_ = 0;
  size_t consumed_ = 0;
  bool refused_ = false;
  bool cut_ = false;
  uint32_t error_ = LX_OK;
};

FieldResult translate_model(const FieldCall& call) {
  if (call.text.empty() || call.size == 0) {
    if (!call.has(LX_OPT_TERMINATE) || call.size == 0) return {};
    const bool unit = !call.to.is_bytes() && (call.has(LX_OPT_CHARS) || call.size >= 2);
    return {1, std::string(unit ? 2 : 1, '\0'), 0, LX_OK};
  }
  if (!call.to.is_bytes() && !call.has(LX_OPT_CHARS) && call.size < 2) return {-1, "", 0, LX_E_BUFFER};
  return Model(call).result();
}

// ---- Everything beside it ----

constexpr uint16_t kPages[] = {LX_CP_UCS2, LX_CP_UTF8, 37, 290, 367, 819, 932, 954, 964, 930, 937, 1399};
constexpr uint32_t kAllFlags = LX_OPT_TERMINATE | LX_OPT_CHARS | NLS1_XLT_PAD | NLS1_XLT_BLANKS;

// Texts of a page: characters that many pages have, blanks, shift bytes and others where no one expects them.
class Texts {
 public:
  explicit Texts(uint16_t page) : page_(page), form_(form_of(page)) {}

  std::string make(size_t parts) {
    std::string text;
    const bool wild = chance(3);
    for (size_t i = 0; i < parts; ++i) text += wild && chance(3) ? stray() : ordinary();
    if (chance(2)) text += spelled_bytes(page_, std::u16string(random_() % 5, u' '));
    if (wild && !form_.is_bytes() && text.size() > 1 && chance(2)) text.pop_back();
    return text;
  }

 private:
  bool chance(unsigned of) { return random_() % of == 0; }

  std::string ordinary() {
    static constexpr std::u16string_view kWords[] = {u"A",      u"bc",     u" ",  u"  ",   u"9",        u"é",
                                                     u"ﾃ",      u"あ",     u"ア", u"東京", u"山田太郎", u"一二三",
                                                     u"\u00A5", u"\uFFFD", u"€",  u"(12)", u"漢 ",      u"あA"};
    return spelled_bytes(page_, kWords[random_() % std::size(kWords)]);
  }
  std::string stray() {
    if (form_.follows_shifts() && !chance(4)) {
      const uint8_t shift = chance(2) ? form_.page->enter : form_.page->leave;
      return std::string(1 + random_() % 3, static_cast<char>(shift));
    }
    std::string bytes;
    for (unsigned i = form_.is_bytes() ? 1 + random_() % 2 : 2; i != 0; --i) bytes += static_cast<char>(random_());
    return bytes;
  }

  const uint16_t page_;
  const Form form_;
  std::minstd_rand random_{11};
};

class Translation : public testing::TestWithParam<uint16_t> {
 protected:
  // The result with what was written; anything written behind that is reported as well.
  FieldResult translate(uint16_t to, const FieldCall& call, int32_t length, size_t expected) {
    std::string text = call.text;
    if (call.measured) text += std::string(call.from.unit_size(), '\0');
    if (!call.from.is_bytes() && text.size() % 2 != 0) text += '\x5A';
    size_t room = call.has(LX_OPT_CHARS) ? expected : std::max(expected, call.size);
    if (!call.to.is_bytes()) room += room % 2;
    const char* in = in_.text(text);
    char* out = out_.room(room);
    FieldResult result = {0, "", 0, 99};
    result.count = NLS1_TranslateString(to, out, static_cast<int32_t>(call.size), GetParam(), in, length,
                                        &result.consumed, call.flags, &result.error);
    result.written.assign(out, room);
    while (result.written.size() > expected && result.written.back() == '\x5A') result.written.pop_back();
    return result;
  }

  void compare(uint16_t to, FieldCall call, size_t size) {
    call.size = size;
    int32_t length = call.measured ? -1 : static_cast<int32_t>(call.text.size());
    if (!call.measured && call.has(LX_OPT_CHARS)) {
      const auto list = characters_of(call.from, units_in(call.from, call.text)).list;
      call.text.resize(list.empty() ? 0 : list.back().own_end() * call.from.unit_size());
      length = static_cast<int32_t>(list.size());
    }
    const FieldResult expected = translate_model(call);
    const FieldResult got = translate(to, call, length, expected.written.size());
    if (got == expected || ++failures_ > 20) return;
    auto shown = [](const FieldResult& result) {
      return "count " + std::to_string(result.count) + ", consumed " + std::to_string(result.consumed) + ", error " +
             std::to_string(result.error) + ", " + hex(result.written);
    };
    ADD_FAILURE() << GetParam() << " to " << to << ", text " << hex(call.text) << ", length " << length << ", size "
                  << call.size << ", flags " << std::hex << call.flags << "\n  got      " << shown(got)
                  << "\n  expected " << shown(expected);
  }

  void compare_flags(uint16_t to, const std::string& text, size_t first_size, size_t last_size) {
    for (uint32_t flags = kAllFlags;; flags = (flags - 1) & kAllFlags) {
      for (bool measured : {false, true}) {
        FieldCall call = {form_of(to), form_of(GetParam()), text, measured, 0, flags};
        if (measured) {
          Units units = units_in(call.from, text);
          units.erase(std::find(units.begin(), units.end(), 0u), units.end());
          call.text = raw(call.from, units);
        }
        for (size_t size = first_size; size <= last_size; ++size) compare(to, call, size);
      }
      if (flags == 0) break;
    }
  }

  static size_t needed(uint16_t to, const std::string& text) {
    return translate_model({form_of(to), form_of(GetParam()), text, false, 1000, LX_OPT_TERMINATE}).written.size();
  }

 private:
  EdgeBuffer in_{2000}, out_{4000};
  int failures_ = 0;
};

TEST_P(Translation, FollowsTheModel) {
  for (uint16_t to : kPages) {
    Texts texts(GetParam());
    for (size_t parts = 0; parts <= 6; ++parts) {
      const std::string text = texts.make(parts);
      compare_flags(to, text, 0, needed(to, text) + 3);
    }
    for (int i = 0; i < 3; ++i) {  // long enough for the ways that take many characters at once
      std::string text = texts.make(40);
      if (i == 0) text = spelled_bytes(GetParam(), std::u16string(100, u'A') + u"é" + std::u16string(30, u' '));
      const size_t most = needed(to, text);
      for (size_t size : {most / 2, most - std::min<size_t>(most, 5)}) compare_flags(to, text, size, size + 2);
    }
  }
}

INSTANTIATE_TEST_SUITE_P(FromPages, Translation, testing::ValuesIn(kPages));

// ---- Single calls ----

TEST(TranslationCases, WorkAsWritten) {
  const std::string units = raw(form_of(1200), {'A', 'B', 'C'});
  const struct {
    uint16_t to, from;
    std::string in;
    int32_t length;  // -1: measured
    int32_t size;
    uint32_t flags;
    FieldResult expected;
  } cases[] = {
      {1200, 367, "AB", 2, 1, 0, {-1, "", 0, 40}},
      {930, 57352, "日本", 6, 5, 0, {4, "\x0E\x45\x62\x0F", 3, 40}},  // the leave byte needs the last one's room
      {367, 930, "\x0E\x0E\x0F\x0F\xC1\x0F\x0F", 7, 9, 0, {1, "A", 7, 0}},
      {57352, 930, "\x0E\x41\x0E\x45\x66\x0F", 6, 3, 0, {3, "\xEF\xBF\xBD", 3, 40}},  // no enter byte
      {930, 933, "\xC1\x0E\x88\x61\x0F", 5, 2, 0, {2, "\xC1\x3F", 5, 0}},  // the shift byte behind goes with it
      {367, 1200, units, 6, 5, 0, {2, "AB", 4, 40}},                       // one byte each uses half of the room
      {367, 1200, units, 5, 4, 0, {2, "AB", 4, 0}},                        // half a unit is none
  };
  for (const auto& one : cases) {
    SCOPED_TRACE(std::to_string(one.from) + " to " + std::to_string(one.to) + ": " + hex(one.in));
    alignas(2) char in[64] = {}, out[64] = {};
    one.in.copy(in, sizeof in);
    FieldResult got;
    got.count =
        NLS1_TranslateString(one.to, out, one.size, one.from, in, one.length, &got.consumed, one.flags, &got.error);
    got.written.assign(out, one.expected.written.size());
    EXPECT_EQ(got, one.expected) << got.count << ' ' << hex(got.written) << got.consumed << ' ' << got.error;
  }
}

TEST(TranslationCases, AbsentBuffersHaveNoLength) {
  constexpr uint32_t kTerminate = LX_OPT_TERMINATE, kPad = NLS1_XLT_PAD;
  const char* in = "AB";
  alignas(2) char out[8];
  const struct {
    uint16_t to;
    char* out;
    int32_t size;
    const char* in;
    int32_t length;
    uint32_t flags;
    int32_t count;
  } cases[] = {{367, nullptr, 8, in, 2, kTerminate, 0},
               {367, out, -1, in, 2, kTerminate | kPad, 0},
               {367, out, 0, in, 2, kPad, 0},
               {367, out, 8, nullptr, 2, kPad, 0},
               {367, out, 8, nullptr, -1, kTerminate, 1},
               {1200, out, 1, nullptr, 0, kTerminate, 1},
               {1200, out, 2, nullptr, 0, kTerminate, 1},
               {1200, nullptr, 2, nullptr, -1, kTerminate, 0}};
  for (const auto& one : cases) {
    std::memset(out, 'Z', sizeof out);
    int32_t consumed = 99;
    uint32_t error = 99;
    EXPECT_EQ(NLS1_TranslateString(one.to, one.out, one.size, 367, one.in, one.length, &consumed, one.flags, &error),
              one.count);
    EXPECT_EQ(consumed, 0);
    EXPECT_EQ(error, LX_OK);
    const size_t zeros = one.count == 0 ? 0 : one.to == 1200 && one.size > 1 ? 2 : 1;
    EXPECT_EQ(std::string(out, sizeof out), std::string(zeros, '\0') + std::string(sizeof out - zeros, 'Z'));
  }
  EXPECT_EQ(NLS1_TranslateString(37, out, 8, 367, "A", 1, nullptr, 0, nullptr), 1) << "results are optional";
}

TEST(TranslationCases, RefuseFlagsAndPages) {
  char out[4] = "ZZZ";
  int32_t consumed = 99;
  uint32_t error = 99;
  for (uint32_t flag = 1; flag != 0; flag <<= 1) {
    if ((flag & kAllFlags) != 0) continue;
    EXPECT_EQ(NLS1_TranslateString(9999, out, 4, 367, "A", 1, &consumed, flag | NLS1_XLT_PAD, &error), -1);
    EXPECT_EQ(std::pair(error, consumed), std::pair(LX_E_ARGUMENT, 0)) << std::hex << flag;
  }
  for (auto [to, from, missing] : {std::tuple<uint16_t, uint16_t, int>{9999, 367, 9999},
                                   {367, 9999, 9999},
                                   {1200, 0, 0},
                                   {0xFFFF, 1200, 0xFFFF}}) {
    for (int32_t length : {0, 1}) {
      TraceCapture trace;
      EXPECT_EQ(NLS1_TranslateString(to, out, 4, from, "A", length, nullptr, LX_OPT_TERMINATE, &error), -1);
      EXPECT_EQ(error, LX_E_CODEPAGE) << from << " to " << to;
      EXPECT_TRUE(trace.has("Unable to locate codepage " + std::to_string(missing))) << trace.all();
    }
  }
  EXPECT_STREQ(out, "ZZZ");
}

TEST(TranslationCases, SayWhatTheyDo) {
  const struct {
    uint16_t to, from;
    const char *pages, *process;
  } cases[] = {{37, 819, "Source codepage 819 is single byte", "Target codepage 37 is single byte"},
               {932, 37, "Target codepage 932 is not shift sensitive", "Process SingleByte Input, Multi-byte output "},
               {930, 37, "Target codepage 930 is shift sensitive, Shift-In=0E, Shift-Out=0f",
                "Process SingleByte Input, Extended Multi-byte output "},
               {57352, 1399, "Source codepage 1399 is shift sensitive, Shift-In=0E, Shift-Out=0f",
                "Process Multi-Byte Input, Multi-byte output "},
               {930, 57352, "Source length = 1", "Process multi-byte Input, Extended Multi-byte output "}};
  for (const auto& one : cases) {
    TraceCapture trace;
    char out[8];
    NLS1_TranslateString(one.to, out, sizeof out, one.from, "\xC1", -1, nullptr, 0, nullptr);
    EXPECT_TRUE(trace.has(one.pages) && trace.has(one.process)) << trace.all();
  }
}

}  // namespace
}  // namespace lx::test
