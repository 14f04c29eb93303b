// SPDX-License-Identifier: Apache-2.0
// NLS1_TranslateString beside its slow model: all pairs of pages of every kind, all flags, all sizes; bad arguments,
// absent buffers, messages.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <algorithm>
#include <cstring>
#include <random>
#include <tuple>

#include "support/edge_buffer.hpp"
#include "support/text_model.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kPages[] = {LX_CP_UCS2, LX_CP_UTF8, 37, 290, 367, 819, 932, 954, 964, 930, 933, 1399};
constexpr uint32_t kAllFlags = LX_OPT_TERMINATE | LX_OPT_CHARS | NLS1_XLT_PAD | NLS1_XLT_BLANKS;

// ---- The model: one character after the other ----

// Of the page; UCS-2 for 1200.
Form form_of(uint16_t page) {
  if (page == LX_CP_UCS2) return {Form::ucs2, nullptr};
  return {Form::shifted, &PageSource::of(page)};
}

// The elements of a text in memory; half a unit at the end is left out.
Units units_in(const Form& form, std::string_view bytes) {
  if (form.is_bytes()) return units_of(bytes);
  std::vector<uint16_t> units(bytes.size() / 2);
  std::memcpy(units.data(), bytes.data(), units.size() * 2);
  return {units.begin(), units.end()};
}

std::string spelled_bytes(const Form& form, std::u16string_view text) { return raw(form, spelled(form, text)); }

uint32_t blank(const Form& form) { return form.is_bytes() ? units_of(form.page->encode(0x20))[0] : 0x20; }

struct FieldCall {
  Form to;
  Form from;
  std::string text;  // the whole input, bytes as they stand in memory
  bool measured;     // by its terminator, which is not part of the text
  size_t size;       // of the output: bytes, or characters
  uint32_t flags;

  bool has(uint32_t flag) const { return (flags & flag) != 0; }
};

using FieldResult = std::tuple<int32_t, std::string, int32_t, uint32_t>;  // count, what is written, consumed, error

FieldResult translate_model(const FieldCall& call) {
  const bool by_characters = call.has(LX_OPT_CHARS), terminate = call.has(LX_OPT_TERMINATE);
  const size_t unit = by_characters || call.to.is_bytes() ? 1 : 2;  // bytes that count as one in sizes and results
  if (call.text.empty() || call.size == 0) {
    if (!terminate || call.size == 0) return {};
    return {1, std::string(call.to.is_bytes() || call.size < unit ? 1 : 2, '\0'), 0, LX_OK};
  }
  if (call.size < unit) return {-1, "", 0, LX_E_BUFFER};
  const size_t limit = call.size / unit - terminate;
  const bool copies = !call.to.is_bytes() && !call.from.is_bytes();  // the room plays no part
  const bool half = !call.from.is_bytes() && call.to.is_bytes() && call.to.page->kind == PageSource::Kind::single;

  const Units in = units_in(call.from, call.text);
  const Characters found = characters_of(call.from, in);
  Writer out{call.to}, shorter = out;
  size_t characters = 0, resume = 0, before = 0;  // a further call goes on before the shift bytes that came last
  bool refused = false;
  uint32_t error = LX_OK;
  for (const Character& c : found.list) {
    const Units piece = out.piece(unicode_of(call.from, c));
    const size_t needed = half            ? 2 * (characters + 1)
                          : by_characters ? characters + 1
                                          : out.units.size() + piece.size();
    refused = !copies && needed > limit;
    if (refused) {  // which is no error when nobody will miss it
      auto is_blank = [&](uint32_t each) { return each == blank(call.from); };
      const bool blanks = c.state == 0 && std::all_of(in.begin() + static_cast<ptrdiff_t>(c.at), in.end(), is_blank);
      if (!blanks || !call.has(NLS1_XLT_BLANKS)) error = LX_E_BUFFER;
      break;
    }
    shorter = out;
    before = resume;
    out.add(piece);
    resume = c.own_end();
    ++characters;
  }
  size_t consumed = refused ? resume : found.whole;
  // A text ends in the single-byte state, if need be without its last character.
  if (out.inside && !by_characters && out.units.size() == limit) {
    out = shorter;
    consumed = before;
    refused = true;
    error = LX_E_BUFFER;
  }
  if (out.inside) out.units.push_back(call.to.page->leave);

  size_t count = by_characters ? characters : out.units.size();
  for (; call.has(NLS1_XLT_PAD) && count < limit; ++count) out.units.push_back(blank(call.to));
  if (terminate ? count <= limit : call.measured && !refused && !found.cut && count < limit) {
    out.units.push_back(0);
    ++count;
  }
  return {static_cast<int32_t>(count * unit), raw(call.to, out.units),
          static_cast<int32_t>(by_characters ? characters : consumed * call.from.unit_size()), error};
}

// ---- Every text into every room ----

// Characters that many pages have and blanks; in some texts shift bytes and others where no one expects them.
std::string random_text(const Form& form, size_t parts, std::minstd_rand& random) {
  static constexpr std::u16string_view kWords[] = {u"A",      u"bc", u" ",    u"  ",       u"9",      u"é",  u"ﾃ",
                                                   u"あ",     u"ア", u"東京", u"山田太郎", u"一二三", u"한", u"\u00A5",
                                                   u"\uFFFD", u"€",  u"(12)", u"漢 ",      u"あA"};
  const bool wild = random() % 3 == 0;
  std::string text;
  for (; parts > 0; --parts) {
    const bool stray = wild && random() % 3 == 0;
    if (!stray) text += spelled_bytes(form, kWords[random() % std::size(kWords)]);
    for (size_t i = !stray ? 0 : form.is_bytes() ? 1 + random() % 3 : 2; i > 0; --i) {
      const bool shift = form.follows_shifts() && random() % 4 != 0;
      text += static_cast<char>(shift ? 0x0E + random() % 2 : random());
    }
  }
  if (random() % 2 == 0) text += spelled_bytes(form, std::u16string(random() % 5, u' '));
  if (wild && !form.is_bytes() && !text.empty()) text.pop_back();
  return text;
}

// Behind what the model writes the room stays as it was.
void compare(uint16_t to, uint16_t from, FieldCall call) {
  static EdgeBuffer in_block(2000), out_block(4000);
  auto length = static_cast<int32_t>(call.text.size());
  std::string text = call.text;
  if (call.measured) {
    length = -1;
    text.append(call.from.unit_size(), '\0');
  } else if (call.has(LX_OPT_CHARS)) {  // counted by the caller, who knows no part of a character
    const std::vector<Character> list = characters_of(call.from, units_in(call.from, text)).list;
    call.text.resize(list.empty() ? 0 : list.back().own_end() * call.from.unit_size());
    length = static_cast<int32_t>(list.size());
  }
  if (!call.from.is_bytes()) text.resize((text.size() + 1) / 2 * 2);
  FieldResult expected = translate_model(call);
  std::string& written = std::get<1>(expected);
  size_t room = call.has(LX_OPT_CHARS) ? written.size() : std::max(written.size(), call.size);
  if (!call.to.is_bytes()) room += room % 2;
  written.resize(room, '\x5A');

  const char* in = in_block.text(text);
  char* out = out_block.room(room);
  int32_t consumed = 99;
  uint32_t error = 99;
  const int32_t count =
      NLS1_TranslateString(to, out, static_cast<int32_t>(call.size), from, in, length, &consumed, call.flags, &error);
  ASSERT_EQ(FieldResult(count, std::string(out, room), consumed, error), expected)
      << from << " to " << to << ", text " << hex(text) << ", length " << length << ", size " << call.size << ", flags "
      << std::hex << call.flags;
}

TEST(Translation, FollowsTheModel) {
  std::minstd_rand random(11);
  for (size_t pair = 0; pair < std::size(kPages) * std::size(kPages); ++pair) {
    const uint16_t to = kPages[pair / std::size(kPages)], from = kPages[pair % std::size(kPages)];
    const Form to_form = form_of(to), from_form = form_of(from);
    for (size_t i = 0; i < 9; ++i) {
      const bool is_short = i < 7;  // long ones are taken many characters at once
      std::string text = random_text(from_form, is_short ? i : 40, random);
      if (i == 7) text = spelled_bytes(from_form, std::u16string(100, u'A') + u"é" + std::u16string(30, u' '));
      const size_t most = std::get<1>(translate_model({to_form, from_form, text, false, 1000, 0})).size() + 4;
      const Units units = units_in(from_form, text);
      const bool has_zero = std::count(units.begin(), units.end(), 0u) != 0;
      for (uint32_t flags = kAllFlags;; flags = (flags - 1) & kAllFlags) {
        for (size_t size = is_short ? 0 : most / 2; size <= most; ++size) {
          if (!is_short && size > most / 2 + 2 && size + 6 < most) continue;
          compare(to, from, {to_form, from_form, text, false, size, flags});
          if (!has_zero) compare(to, from, {to_form, from_form, raw(from_form, units), true, size, flags});
          if (HasFatalFailure()) return;
        }
        if (flags == 0) break;
      }
    }
  }
}

// ---- Single calls ----

TEST(Translation, AbsentBuffersHaveNoLength) {
  alignas(2) char out[8];
  const struct {
    uint16_t to;
    char* out;
    int32_t size;
    const char* in;
    int32_t length, count;
  } cases[] = {{367, nullptr, 8, "AB", 2, 0},
               {367, out, -1, "AB", 2, 0},
               {367, out, 8, nullptr, 2, 1},
               {367, out, 8, nullptr, -1, 1},
               {1200, nullptr, 2, nullptr, -1, 0}};
  for (const auto& one : cases) {
    std::memset(out, 'Z', sizeof out);
    int32_t consumed = 99;
    uint32_t error = 99;
    EXPECT_EQ(NLS1_TranslateString(one.to, one.out, one.size, 367, one.in, one.length, &consumed,
                                   LX_OPT_TERMINATE | NLS1_XLT_PAD, &error),
              one.count);
    EXPECT_EQ(std::pair(consumed, error), std::pair(0, LX_OK));
    EXPECT_EQ(std::string(out, sizeof out),
              std::string(one.count != 0, '\0') + std::string(8u - (one.count != 0), 'Z'));
  }
  EXPECT_EQ(NLS1_TranslateString(37, out, 8, 367, "A", 1, nullptr, 0, nullptr), 1) << "results are optional";
}

TEST(Translation, RefusesFlagsAndPages) {
  char out[4] = "ZZZ";
  uint32_t error = 99;
  for (uint32_t flag = 1; flag != 0; flag <<= 1) {
    if ((flag & kAllFlags) != 0) continue;
    int32_t consumed = 99;  // flags come before the page
    EXPECT_EQ(NLS1_TranslateString(9999, out, 4, 367, "A", 1, &consumed, flag | NLS1_XLT_PAD, &error), -1);
    EXPECT_EQ(std::pair(error, consumed), std::pair(LX_E_ARGUMENT, 0)) << std::hex << flag;
  }
  for (auto [to, from, missing] : {std::tuple(9999, 367, "9999"), {367, 9998, "9998"}, {1200, 0, "0"}}) {
    TraceCapture trace;
    EXPECT_EQ(NLS1_TranslateString(static_cast<uint16_t>(to), out, 4, static_cast<uint16_t>(from), "A", 0, nullptr,
                                   LX_OPT_TERMINATE, &error),
              -1);
    EXPECT_EQ(error, LX_E_CODEPAGE) << from << " to " << to;
    EXPECT_TRUE(trace.has(std::string("Unable to locate codepage ") + missing)) << trace.all();
  }
  EXPECT_STREQ(out, "ZZZ");
}

TEST(Translation, SaysWhatItDoes) {
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
