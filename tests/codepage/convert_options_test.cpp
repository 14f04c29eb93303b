// SPDX-License-Identifier: Apache-2.0
// What a conversion handle can be told: strict reading, line ends, leaving out, and who is called for each problem.
// Each case is run whole, cut at every place of its input, and into every small room; all must agree.
#include "support/session.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

using namespace std::string_literals;

constexpr char kReplacement[] = "\xEF\xBF\xBD";

std::string times(int count, std::string_view text) {
  std::string all;
  for (; count > 0; --count) all += text;
  return all;
}

struct Outcome {
  std::string output;
  std::string problems;  // "M2:E381 ": kind, offset, bytes; of substituted ones "=" and the character
  LXConversionCounts counts = {};

  uint64_t of_kind(char kind) const {
    uint64_t count = 0;
    for (char c : problems) count += c == kind;
    return count;
  }
};

std::string number(uint32_t value) {
  char text[16];
  std::snprintf(text, sizeof text, "%04X", value);
  return text;
}

void note(void* context, const LXConversionProblem* problem) {
  std::string& list = *static_cast<std::string*>(context);
  static constexpr char kKinds[] = "?smhc";
  list += problem->kind <= LX_PROBLEM_CUT ? kKinds[problem->kind] : '?';
  list += std::to_string(problem->offset) + ":";
  list += hex({reinterpret_cast<const char*>(problem->bytes), std::min<size_t>(problem->length, 5)});
  if (problem->kind == LX_PROBLEM_SUBSTITUTED) {
    list += "=" + number(problem->unicode);
  } else if (problem->unicode != 0xFFFD) {
    list += "=?";
  }
  list += ' ';
}

// A text through a handle, given in pieces of at most `piece` bytes with a first one of `first`, into rooms of `room`.
class Feed {
 public:
  Feed(LXLocale* target, LXLocale* source, uint32_t options) : handle_(LXOpenConversion(target, source, 0)) {
    EXPECT_EQ(LXSetConversionOptions(handle_.get(), options, note, &outcome_.problems), LX_OK);
  }

  Outcome run(std::string_view text, size_t first, size_t piece, size_t room) {
    size_t given = first;
    while (!text.empty()) {
      given = std::min(given, text.size());
      text.remove_prefix(convert(text.substr(0, given), room));
      given = piece;
    }
    finish(room);
    EXPECT_EQ(LXGetConversionCounts(handle_.get(), &outcome_.counts), LX_OK);
    return outcome_;
  }

 private:
  size_t convert(std::string_view text, size_t room) {
    Guarded memory(text);
    const char* in = memory.data();
    auto left = static_cast<int32_t>(text.size());
    for (uint32_t status = LX_E_FULL; status == LX_E_FULL;) {
      status = into_room(room, [&](char*& out, int32_t& out_room) {
        return LXConvertBuffer(handle_.get(), &out, &out_room, &in, &left, 0);
      });
    }
    EXPECT_EQ(left, 0);
    return text.size();
  }
  void finish(size_t room) {
    for (uint32_t status = LX_E_FULL; status == LX_E_FULL;) {
      status = into_room(
          room, [&](char*& out, int32_t& out_room) { return LXFinishConversion(handle_.get(), &out, &out_room); });
    }
  }
  template <class Work>
  uint32_t into_room(size_t room, Work work) {
    Guarded memory(room);
    char* out = memory.data();
    auto left = static_cast<int32_t>(room);
    uint32_t status = work(out, left);
    auto written = static_cast<size_t>(out - memory.data());
    EXPECT_EQ(written + static_cast<size_t>(left), room);
    outcome_.output.append(memory.data(), written);
    return status;
  }

  Conversion handle_;
  Outcome outcome_;
};

class ConversionOptions : public testing::Test {
 protected:
  static void SetUpTestSuite() { session = std::make_unique<Session>(); }
  static void TearDownTestSuite() { session.reset(); }
  static std::unique_ptr<Session> session;
};
std::unique_ptr<Session> ConversionOptions::session;

struct Case {
  const char* name;
  const char* source;
  const char* target;
  uint32_t options;
  std::string in;
  std::string out;
  std::string problems;
};

bool expect_outcome(const Case& c, const Outcome& got, const std::string& how) {
  const LXConversionCounts& counts = got.counts;
  bool counted = counts.bytes_in == c.in.size() && counts.bytes_out == c.out.size() &&
                 counts.substituted == got.of_kind('s') && counts.malformed == got.of_kind('m') &&
                 counts.shifts == got.of_kind('h') && counts.cut == got.of_kind('c');
  if (got.output == c.out && got.problems == c.problems && counted) return true;
  ADD_FAILURE() << c.name << " (" << c.source << " to " << c.target << ", " << how << "): " << hex(got.output) << " "
                << got.problems << "\n  not " << hex(c.out) << " " << c.problems
                << (counted ? "" : "\n  and wrong counts");
  return false;
}

// Stops at the first difference of a case; the others would look alike.
void check(const Case& c) {
  Locale source = locale_of(c.source);
  Locale target = locale_of(c.target);
  bool right = true;
  auto run = [&](size_t first, size_t piece, size_t room) {
    if (!right) return;
    Feed feed(target.get(), source.get(), c.options);
    right = expect_outcome(
        c, feed.run(c.in, first, piece, room),
        "pieces of " + std::to_string(first) + " and " + std::to_string(piece) + ", room " + std::to_string(room));
  };
  size_t all = c.in.size();
  run(all, all, 200);
  for (size_t room = 1; room <= 6; ++room) run(all, all, room);
  for (size_t cut = 1; cut < all; ++cut) {
    run(cut, all, 200);
    run(cut, all, 1);
  }
  run(1, 1, 200);
  run(1, 1, 1);
  run(2, 2, 3);
}

void check_all(std::initializer_list<Case> cases) {
  for (const Case& c : cases) check(c);
}

TEST_F(ConversionOptions, StrictUtf8) {
  const uint32_t strict = LX_CONV_STRICT;
  check_all({
      {"well-formed", "UTF-8", "UTF-8", strict, "aÿ߿ࠀ\xEF\xBF\xBF", "aÿ߿ࠀ\xEF\xBF\xBF", ""},
      {"overlong, two bytes", "UTF-8", "UTF-8", strict, "\xC0\xAF", times(2, kReplacement), "m0:C0 m1:AF "},
      {"overlong, three bytes", "UTF-8", "UTF-8", strict, "\xE0\x80\xAFz", times(3, kReplacement) + "z",
       "m0:E0 m1:80 m2:AF "},
      {"overlong, four bytes", "UTF-8", "UTF-8", strict, "\xF0\x80\x80\x80", times(4, kReplacement),
       "m0:F0 m1:80 m2:80 m3:80 "},
      {"surrogate", "UTF-8", "UTF-8", strict, "\xED\xA0\x80", times(3, kReplacement), "m0:ED m1:A0 m2:80 "},
      {"last before the surrogates", "UTF-8", "UTF-8", strict, "\xED\x9F\xBF", "\xED\x9F\xBF", ""},
      {"beyond UCS-2", "UTF-8", "UTF-8", strict, "a\xF0\x9F\x98\x80z", "a" + times(1, kReplacement) + "z",
       "s1:F09F9880=1F600 "},
      {"beyond UCS-2 for a page without U+FFFD", "UTF-8", "Latin1", strict, "\xF0\x9F\x98\x80", "\x1A",
       "s0:F09F9880=1F600 "},
      {"beyond Unicode", "UTF-8", "UTF-8", strict, "\xF4\x90\x80\x80\xF5\xFF", times(6, kReplacement),
       "m0:F4 m1:90 m2:80 m3:80 m4:F5 m5:FF "},
      {"lone continuation byte", "UTF-8", "UTF-8", strict, "a\x80z", "a" + times(1, kReplacement) + "z", "m1:80 "},
      {"ended by a letter", "UTF-8", "UTF-8", strict, "\xE3\x81z", times(1, kReplacement) + "z", "m0:E381 "},
      {"ended by a lead byte", "UTF-8", "UTF-8", strict, "\xE3\xE3\x81\x82", times(1, kReplacement) + "\xE3\x81\x82",
       "m0:E3 "},
      {"two bytes ended by a line end", "UTF-8", "UTF-8", strict, "\xC3\n", times(1, kReplacement) + "\n", "m0:C3 "},
      {"four bytes ended by a letter", "UTF-8", "UTF-8", strict, "\xF0\x9F\x98z", times(1, kReplacement) + "z",
       "m0:F09F98 "},
      {"cut at the end", "UTF-8", "UTF-8", strict, "a\xE3\x81", "a" + times(1, kReplacement), "c1:E381 "},
      {"four bytes cut at the end", "UTF-8", "UTF-8", strict, "\xF0\x9F\x98", times(1, kReplacement), "c0:F09F98 "},
      {"U+FFFD itself", "UTF-8", "UTF-8", strict, kReplacement, kReplacement, ""},
      {"U+FFFD itself, missing in the target", "UTF-8", "Latin1", strict, kReplacement, "\x1A", "s0:EFBFBD=FFFD "},
  });
}

// Without strict reading bytes are decoded by the length of their lead byte; the problems are seen all the same.
TEST_F(ConversionOptions, LenientUtf8) {
  check_all({
      {"overlong becomes the character", "UTF-8", "UTF-8", 0, "\xE0\x80\xAF", "/", "m0:E080AF "},
      {"surrogate passes", "UTF-8", "UTF-8", 0, "\xED\xA0\x80", "\xED\xA0\x80", "m0:EDA080 "},
      {"letter taken for a continuation byte", "UTF-8", "UTF-8", 0, "\xE3\x81z", "\xE3\x81\xBA", "m0:E3817A "},
      {"bytes that begin nothing", "UTF-8", "UTF-8", 0, "\xF0\x80\xC0", times(3, kReplacement), "m0:F0 m1:80 m2:C0 "},
      {"cut at the end", "UTF-8", "UTF-8", 0, "a\xE3", "a" + times(1, kReplacement), "c1:E3 "},
  });
}

TEST_F(ConversionOptions, MultibytePages) {
  const uint32_t strict = LX_CONV_STRICT;
  check_all({
      {"lead byte before a line end", "MS932", "UTF-8", strict, "\x81\na", times(1, kReplacement) + "\na", "m0:81 "},
      {"lead byte before a space", "MS932", "UTF-8", strict, "\x83 a", times(1, kReplacement) + " a", "m0:83 "},
      {"unassigned pair", "MS932", "UTF-8", strict,
       "\x81\xAD"
       "a",
       times(1, kReplacement) + "a", "m0:81AD "},
      {"unassigned byte", "MS932", "UTF-8", strict, "a\xA0z", "a" + times(1, kReplacement) + "z", "m1:A0 "},
      {"cut at the end", "MS932", "UTF-8", strict, "a\x83", "a" + times(1, kReplacement), "c1:83 "},
      {"three bytes ended by a line end", "JapanEUC", "UTF-8", strict, "\x8F\xB0\n", times(1, kReplacement) + "\n",
       "m0:8FB0 "},
      {"four bytes ended by a letter", "EUC-TW", "UTF-8", strict, "\x8E\xA2\xA1z", times(1, kReplacement) + "z",
       "m0:8EA2A1 "},
      {"three bytes ended by the last line end", "JapanEUC", "UTF-8", strict, "a\x8F\n",
       "a" + times(1, kReplacement) + "\n", "m1:8F "},
      {"four bytes ended early", "EUC-TW", "UTF-8", strict, "\x8E\nz", times(1, kReplacement) + "\nz", "m0:8E "},
      {"lenient: the line end is swallowed", "MS932", "UTF-8", 0, "\x81\na", times(1, kReplacement) + "a", "m0:810A "},
      {"missing in the target", "MS932", "Latin1", 0, "a\x83\x41z", "a\x1Az", "s1:8341=30A2 "},
      {"unassigned single byte", "US-ASCII", "Latin1", 0, "a\xFFz", "a\x1Az", "m1:FF "},
      {"missing single byte", "Latin1", "US-ASCII", 0, "a\xE9\xE9z", "a\x1A\x1Az", "s1:E9=00E9 s2:E9=00E9 "},
      {"the substitution byte is a character too", "Latin1", "US-ASCII", 0, "a\x1Az", "a\x1Az", ""},
      {"... also between host pages", "IBM037", "IBM273", 0, "\xC1\x3F", "\xC1\x3F", ""},
  });
}

TEST_F(ConversionOptions, ShiftBytes) {
  const uint32_t strict = LX_CONV_STRICT;
  const char space[] = "\xE3\x80\x80";  // U+3000, 4040
  check_all({
      {"well-formed", "IBM930", "UTF-8", strict, "\xC1\x0E\x40\x40\x0F\xC2", "A" + times(1, space) + "B", ""},
      {"repeated", "IBM930", "UTF-8", strict, "\x0E\x0E\x40\x40\x0F\x0F\xC1", times(1, space) + "A", "h1:0E h5:0F "},
      {"empty run", "IBM930", "UTF-8", strict, "\xC1\x0E\x0F\xC2", "AB", ""},
      {"leave byte that ends nothing", "IBM930", "UTF-8", strict, "\xC1\x0F\xC2", "AB", "h1:0F "},
      {"run left open", "IBM930", "UTF-8", strict, "\x0E\x40\x40", space, "h3: "},
      {"half a character, then the end of the run", "IBM930", "UTF-8", strict, "\x0E\x41\x0F\xC1\xC2",
       times(1, kReplacement) + "AB", "m1:41 "},
      {"cut in a run", "IBM930", "UTF-8", strict, "\x0E\x40", kReplacement, "c1:40 h2: "},
      {"unassigned in a run", "IBM930", "UTF-8", strict, "\x0E\x41\xFE\x40\x40\x0F", kReplacement + times(1, space),
       "m1:41FE "},
      {"lenient: a second shift byte is text", "IBM930", "UTF-8", 0, "\x0E\x0E\x41\x0F\xC1", kReplacement + "A"s,
       "m1:0E41 "},
      {"lenient: leave byte that ends nothing", "IBM930", "UTF-8", 0, "\xC1\x0F\xC2", "AB", "h1:0F "},
      {"target closes its run", "UTF-8", "IBM930", strict, "a" + times(2, space), "\x62\x0E\x40\x40\x40\x40\x0F", ""},
      {"target changes to and fro", "UTF-8", "IBM930", 0, space + std::string("a") + space,
       "\x0E\x40\x40\x0F\x62\x0E\x40\x40\x0F", ""},
      {"substitution in a run", "UTF-8", "IBM930", 0, space + std::string("\xF0") + space,
       "\x0E\x40\x40\x0F\x3F\x0E\x40\x40\x0F", "m3:F0 "},
  });
}

TEST_F(ConversionOptions, Discard) {
  const uint32_t discard = LX_CONV_DISCARD;
  const uint32_t strict = LX_CONV_STRICT;
  check_all({
      {"missing in the target", "UTF-8", "Latin1", discard, "a\xE3\x81\x82z", "az", "s1:E38182=3042 "},
      {"single-byte pages", "Latin1", "US-ASCII", discard, "a\xE9z\xE9", "az", "s1:E9=00E9 s3:E9=00E9 "},
      {"malformed", "MS932", "UTF-8", discard | strict, "\x81\na\xA0", "\na", "m0:81 m3:A0 "},
      {"malformed, lenient", "UTF-8", "UTF-8", discard, "a\xED\xA0\x80z", "az", "m1:EDA080 "},
      {"beyond UCS-2", "UTF-8", "UTF-8", discard | strict, "a\xF0\x9F\x98\x80z", "az", "s1:F09F9880=1F600 "},
      {"cut at the end", "UTF-8", "UTF-8", discard, "a\xE3\x81", "a", "c1:E381 "},
      {"U+FFFD itself stays", "UTF-8", "UTF-8", discard, kReplacement, kReplacement, ""},
      {"no shift bytes for what is left out", "UTF-8", "IBM930", discard, "\xE3\x80\x80\xC3\xBF\xE3\x80\x80",
       "\x0E\x40\x40\x40\x40\x0F", "s3:C3BF=00FF "},
  });
}

// ---- Line ends
// ----------------------------------------------------------------------------------------------------------

std::u16string with_line_ends(std::u16string_view text, std::u16string_view line_end) {
  std::u16string changed;
  for (size_t i = 0; i < text.size(); ++i) {
    bool pair = text[i] == u'\r' && i + 1 < text.size() && text[i + 1] == u'\n';
    if (pair) ++i;
    if (pair || text[i] == u'\n' || text[i] == u'\u0085') {
      changed += line_end;
    } else {
      changed += text[i];
    }
  }
  return changed;
}

TEST_F(ConversionOptions, LineEnds) {
  struct {
    uint32_t option;
    const char16_t* line_end;
  } kLines[] = {{LX_CONV_LINES_LF, u"\n"}, {LX_CONV_LINES_NEL, u"\u0085"}, {LX_CONV_LINES_CRLF, u"\r\n"}};
  const char16_t* kTexts[] = {
      u"a\nb\u0085c\r\nd\re", u"\r\n", u"\n\r", u"\r", u"\r\r\n\r\r\n\n", u"\u0085\u0085\r\u0085", u"\n\n\u0085\r\n\r",
  };
  constexpr uint16_t kIds[] = {819, 37, 57352, 930};
  for (const auto& line : kLines) {
    for (const char16_t* text : kTexts) {
      for (uint16_t source : kIds) {
        for (uint16_t target : kIds) {
          const PageSource& from = PageSource::of(source);
          const PageSource& to = PageSource::of(target);
          check({"line ends", from.name.c_str(), to.name.c_str(), line.option, encoded(from, text),
                 encoded(to, with_line_ends(text, line.line_end)), ""});
        }
      }
    }
  }
  // Around double-byte runs the line end stands in the single-byte state.
  const PageSource& host = PageSource::of(930);
  std::u16string mixed = u"\u3000\r\n\u3000\u3000\r\u3000\u0085\u3000\r";
  for (const auto& line : kLines) {
    check({"line ends beside runs", "UTF-8", "IBM930", line.option, encoded(PageSource::of(57352), mixed),
           encoded(host, with_line_ends(mixed, line.line_end)), ""});
    check({"line ends beside runs", "IBM930", "IBM930", line.option, encoded(host, mixed),
           encoded(host, with_line_ends(mixed, line.line_end)), ""});
  }
}

// A line end that the target lacks is a character that it lacks.
TEST_F(ConversionOptions, MissingLineEndIsReported) {
  check_all({
      {"no next line in ASCII", "Latin1", "US-ASCII", LX_CONV_LINES_NEL, "a\nb",
       "a\x1A"
       "b",
       "s1:0A=0085 "},
      {"next line itself", "Latin1", "US-ASCII", LX_CONV_LINES_NEL,
       "a\x85"
       "b",
       "a\x1A"
       "b",
       "s1:85=0085 "},
      {"of two characters", "Latin1", "MS932", LX_CONV_LINES_NEL, "a\r\nb",
       "a\x1A"
       "b",
       "s2:0A=0085 "},
  });
}

TEST_F(ConversionOptions, LineEndsWithProblems) {
  const uint32_t all = LX_CONV_LINES_LF | LX_CONV_STRICT | LX_CONV_DISCARD;
  check_all({
      {"between return and line feed", "UTF-8", "Latin1", all, "a\r\xE3\x81\n", "a\r\n", "m2:E381 "},
      {"cut behind a return", "UTF-8", "UTF-8", LX_CONV_LINES_LF | LX_CONV_STRICT, "\r\xE3",
       "\r" + times(1, kReplacement), "c1:E3 "},
      {"missing beside line ends", "Latin1", "US-ASCII", LX_CONV_LINES_LF, "\xE9\r\n\xE9\r\xE9", "\x1A\n\x1A\r\x1A",
       "s0:E9=00E9 s3:E9=00E9 s5:E9=00E9 "},
  });
}

// ---- The end of a text, and the handle
// ------------------------------------------------------------------------------------

TEST_F(ConversionOptions, FinishingMakesTheHandleNew) {
  Locale source = locale_of("IBM930");
  Locale target = locale_of("IBM939");
  std::string problems;
  Conversion handle(LXOpenConversion(target.get(), source.get(), 0));
  ASSERT_EQ(LXSetConversionOptions(handle.get(), LX_CONV_LINES_LF, note, &problems), LX_OK);
  uint64_t in_total = 0;
  uint64_t out_total = 0;
  for (size_t room = 0; room <= 6; ++room) {
    char memory[16];
    char* out = memory;
    int32_t out_room = sizeof memory;
    std::string_view text = "\x0E\x40\x40\x0F\x0D\x0E\x40\x40\x40";
    const char* in = text.data();
    auto left = static_cast<int32_t>(text.size());
    // The return is not held any longer, because something follows it; the cut character is.
    EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &out_room, &in, &left, 0), LX_E_PARTIAL);
    std::string output(memory, out);
    EXPECT_EQ(hex(output), "0E40400F0D0E4040");
    LXConversionCounts counts = {};
    EXPECT_EQ(LXGetConversionCounts(handle.get(), &counts), LX_OK);
    EXPECT_EQ(counts.bytes_in, in_total + text.size());  // held bytes too
    EXPECT_EQ(counts.bytes_out, out_total + output.size());
    // U+FFFD is the substitution byte, in the single-byte state.
    std::string rest;
    Guarded edge(room);
    for (uint32_t status = LX_E_FULL; status == LX_E_FULL;) {
      out = edge.data();
      out_room = static_cast<int32_t>(room);
      status = LXFinishConversion(handle.get(), &out, &out_room);
      rest.append(edge.data(), out);
      if (room == 0) {
        EXPECT_EQ(status, LX_E_FULL);
        out = memory;
        out_room = sizeof memory;
        status = LXFinishConversion(handle.get(), &out, &out_room);
        rest.append(memory, out);
      }
    }
    EXPECT_EQ(hex(rest), "0F3F") << room;
    EXPECT_EQ(problems, "c" + std::to_string(in_total + 8) + ":40 h" + std::to_string(in_total + 9) + ": ") << room;
    problems.clear();
    in_total += text.size();
    out_total += output.size() + rest.size();
  }
}

TEST_F(ConversionOptions, FinishingDeliversWhatIsPending) {
  Locale source = locale_of("UTF-8");
  Locale target = locale_of("IBM930");
  Conversion handle(LXOpenConversion(target.get(), source.get(), 0));
  const char* in = "\xE3\x80\x80";
  int32_t left = 3;
  Guarded none(0);
  char* out = none.data();
  int32_t room = 0;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_E_FULL);
  EXPECT_EQ(LXFinishConversion(handle.get(), &out, &room), LX_E_FULL);
  std::string output;
  for (uint32_t status = LX_E_FULL; status == LX_E_FULL;) {
    Guarded one(1);
    out = one.data();
    room = 1;
    status = LXFinishConversion(handle.get(), &out, &room);
    output.append(one.data(), out);
  }
  EXPECT_EQ(hex(output), "0E40400F");
  EXPECT_EQ(LXFinishConversion(handle.get(), &out, &room), LX_OK);  // nothing more
}

TEST_F(ConversionOptions, Arguments) {
  Locale latin = locale_of("Latin1");
  Conversion handle(LXOpenConversion(latin.get(), latin.get(), 0));
  for (uint32_t bad : {0x04u, 0x08u, 0x40u, 0x8000u, 0x80000000u, 0xFFFFFFFFu}) {
    EXPECT_EQ(LXSetConversionOptions(handle.get(), bad, nullptr, nullptr), LX_E_ARGUMENT) << bad;
  }
  EXPECT_EQ(LXSetConversionOptions(nullptr, 0, nullptr, nullptr), LX_E_ARGUMENT);
  for (uint32_t good : {0x00u, 0x01u, 0x02u, 0x03u, 0x10u, 0x20u, 0x33u}) {
    EXPECT_EQ(LXSetConversionOptions(handle.get(), good, nullptr, nullptr), LX_OK) << good;
  }
  LXConversionCounts counts = {};
  EXPECT_EQ(LXGetConversionCounts(nullptr, &counts), LX_E_ARGUMENT);
  EXPECT_EQ(LXGetConversionCounts(handle.get(), nullptr), LX_E_ARGUMENT);
  char memory[4];
  char* out = memory;
  int32_t room = 4;
  EXPECT_EQ(LXFinishConversion(nullptr, &out, &room), LX_E_ARGUMENT);
  EXPECT_EQ(LXFinishConversion(handle.get(), nullptr, &room), LX_E_ARGUMENT);
  const char* in = "a";
  int32_t left = 1;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_OK);
  EXPECT_EQ(LXSetConversionOptions(handle.get(), 0, nullptr, nullptr), LX_E_ARGUMENT);  // too late
}

}  // namespace
}  // namespace lx::test
