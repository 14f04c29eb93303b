// SPDX-License-Identifier: Apache-2.0
// Conversion handles: their statuses, and what they can be told: strict reading, line ends, leaving out, and who is
// called for each problem. Each case is run whole, cut at every place of its input, and into every small room, twice
// through the same handle; all must agree.
#include <functional>
#include <random>

#include "support/edge_buffer.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

using namespace std::string_literals;

constexpr uint32_t kStrict = LX_CONV_STRICT;
constexpr uint32_t kDiscard = LX_CONV_DISCARD;

struct Outcome {
  std::string output;
  std::string problems;  // "m2:E381 ": kind, offset, bytes; of substituted ones "=" and the character
  LXConversionCounts counts = {};

  void add(uint32_t kind, uint64_t offset, std::string_view bytes, uint32_t unicode) {
    char character[16] = "";
    if (kind == LX_PROBLEM_SUBSTITUTED) std::snprintf(character, sizeof character, "=%04X", unicode);
    if (kind != LX_PROBLEM_SUBSTITUTED && unicode != kNoCharacter) character[0] = '?';
    problems += "?smhc"[kind <= LX_PROBLEM_CUT ? kind : 0];
    problems += std::to_string(offset) + ":" + hex(bytes) + character + " ";
  }
};

// A handle, through which texts go in pieces of at most `piece` bytes with a first one of `first`, into rooms of
// `room`.
class Feed {
 public:
  Feed(LXLocale* target, LXLocale* source, uint32_t options) : handle_(LXOpenConversion(target, source, 0)) {
    EXPECT_EQ(LXSetConversionOptions(handle_.get(), options, note, this), LX_OK);
  }

  Outcome run(std::string_view text, size_t first, size_t piece, size_t room) {
    outcome_ = {};
    begin_ = counts().bytes_in;
    for (size_t at = 0; at < text.size();) {
      std::string_view given = text.substr(at, at == 0 ? first : piece);
      convert(given, room);
      at += given.size();
      EXPECT_EQ(counts().bytes_in, begin_ + at);  // those that are held too
    }
    uint32_t status = LX_E_FULL;
    while (status == LX_E_FULL) {
      status = into_room(room, [&](char** out, int32_t* size) { return LXFinishConversion(handle_.get(), out, size); });
    }
    EXPECT_EQ(status, LX_OK);
    outcome_.counts = counts();
    return outcome_;
  }

 private:
  static void note(void* context, const LXConversionProblem* problem) {
    Feed& self = *static_cast<Feed*>(context);
    self.outcome_.add(problem->kind, problem->offset - self.begin_,
                      {reinterpret_cast<const char*>(problem->bytes), problem->length}, problem->unicode);
  }
  LXConversionCounts counts() const {
    LXConversionCounts counts = {};
    EXPECT_EQ(LXGetConversionCounts(handle_.get(), &counts), LX_OK);
    return counts;
  }
  // What is pending when all is taken is left to the next call.
  void convert(std::string_view text, size_t room) {
    static EdgeBuffer buffer(8192);
    const char* in = buffer.text(text);
    auto left = static_cast<int32_t>(text.size());
    for (uint32_t status = LX_E_FULL; status == LX_E_FULL && left != 0;) {
      status = into_room(
          room, [&](char** out, int32_t* size) { return LXConvertBuffer(handle_.get(), out, size, &in, &left, 0); });
    }
    EXPECT_EQ(left, 0);
  }
  uint32_t into_room(size_t room, const std::function<uint32_t(char**, int32_t*)>& work) {
    static EdgeBuffer buffer(8192);
    char *const memory = buffer.room(room), *out = memory;
    auto left = static_cast<int32_t>(room);
    const uint32_t status = work(&out, &left);
    const auto written = static_cast<size_t>(out - memory);
    EXPECT_EQ(written + static_cast<size_t>(left), room);
    EXPECT_TRUE(status != LX_E_FULL || left == 0);
    outcome_.output.append(memory, written);
    return status;
  }

  Conversion handle_;
  Outcome outcome_;
  uint64_t begin_ = 0;
};

// ---- Cases ----

struct Case {
  std::string name;
  std::string in;
  std::string out;
  std::string problems = "";
};

class ConvertBuffer : public testing::Test {
 protected:
  // Between two pages with these options.
  class Setting {
   public:
    Setting(const std::string& source, const std::string& target, uint32_t options)
        : name_(source + " to " + target), source_(locale_of(source)), target_(locale_of(target)), options_(options) {}

    // Stops at the first difference; the others would look alike.
    void check(const Case& c) const {
      size_t all = c.in.size();
      bool right = check(c, all, all, 200);
      for (size_t room = 1; room <= 6 && right; ++room) right = check(c, all, all, room);
      for (size_t cut = 1; cut < all && right; ++cut) right = check(c, cut, all, 200) && check(c, cut, all, 1);
      EXPECT_TRUE(right && check(c, 1, 1, 200) && check(c, 1, 1, 1) && check(c, 2, 2, 3));
    }
    bool check(const Case& c, size_t first, size_t piece, size_t room) const {
      Feed feed(target_.get(), source_.get(), options_);
      for (uint64_t texts : {1u, 2u}) {
        Outcome got = feed.run(c.in, first, piece, room);
        auto counted = [&](uint64_t count, char kind) {
          return count == texts * static_cast<uint64_t>(std::count(c.problems.begin(), c.problems.end(), kind));
        };
        const LXConversionCounts& counts = got.counts;
        bool right = got.output == c.out && got.problems == c.problems;
        bool sums = counts.bytes_in == texts * c.in.size() && counts.bytes_out == texts * c.out.size() &&
                    counted(counts.substituted, 's') && counted(counts.malformed, 'm') && counted(counts.shifts, 'h') &&
                    counted(counts.cut, 'c');
        if (right && sums) continue;
        ADD_FAILURE() << c.name << " (" << name_ << ", pieces of " << first << " and " << piece << ", room " << room
                      << ", text " << texts << "): " << hex(got.output) << " " << got.problems << "\n  not "
                      << hex(c.out) << " " << c.problems << (sums ? "" : "\n  and wrong counts");
        return false;
      }
      return true;
    }
    Outcome whole(const std::string& text) const {
      return Feed(target_.get(), source_.get(), options_).run(text, text.size(), text.size(), 8000);
    }
    size_t ratio() const { return static_cast<size_t>(LXConversionRatio(target_.get(), source_.get(), 0)); }
    // By the function for whole strings.
    std::string string(const std::string& text) const {
      std::string out(8000, ' ');
      const int32_t count = LXConvertStringEx(target_.get(), out.data(), 0, 8000, source_.get(), text.data(), 0,
                                              static_cast<int32_t>(text.size()), 0);
      return out.substr(0, static_cast<size_t>(count));
    }

   private:
    std::string name_;
    Locale source_, target_;
    uint32_t options_;
  };

  // In the output of UTF-8, ~ stands for U+FFFD.
  static void check_all(const char* source, const char* target, uint32_t options, std::vector<Case> cases) {
    Setting setting(source, target, options);
    for (Case& c : cases) {
      for (size_t at; target == "UTF-8"s && (at = c.out.find('~')) != std::string::npos;) {
        c.out.replace(at, 1, "\xEF\xBF\xBD");
      }
      setting.check(c);
    }
  }

  Session session_;
};

TEST_F(ConvertBuffer, Utf8) {
  check_all("UTF-8", "Latin1", kStrict,
            {
                {"beyond UCS-2 for a page without U+FFFD", "\xF0\x9F\x98\x80", "\x1A", "s0:F09F9880=1F600 "},
                {"U+FFFD itself, missing", "\xEF\xBF\xBD", "\x1A", "s0:EFBFBD=FFFD "},
            });
  // Otherwise bytes are decoded by the length of their lead byte; the problems are seen all the same.
  check_all("UTF-8", "UTF-8", 0,
            {
                {"overlong becomes the character", "\xE0\x80\xAF", "/", "m0:E080AF "},
                {"surrogate passes", "\xED\xA0\x80", "\xED\xA0\x80", "m0:EDA080 "},
                {"letter taken for a continuation byte", "\xE3\x81z", "\xE3\x81\xBA", "m0:E3817A "},
                {"bytes that begin nothing", "\xF0\x80\xC0", "~~~", "m0:F0 m1:80 m2:C0 "},
            });
}

TEST_F(ConvertBuffer, MultibytePages) {
  check_all("MS932", "UTF-8", kStrict,
            {
                {"lead byte before a line end", "\x81\na\x83 a", "~\na~ a", "m0:81 m3:83 "},
                {"unassigned", "\x81\xAD\xA0z", "~~z", "m0:81AD m2:A0 "},
                {"cut at the end", "a\x83", "a~", "c1:83 "},
            });
  check_all("JapanEUC", "UTF-8", kStrict,
            {{"three bytes ended by a line end", "\x8F\xB0\na\x8F\n", "~\na~\n", "m0:8FB0 m4:8F "}});
  check_all("EUC-TW", "UTF-8", kStrict,
            {{"four bytes ended early", "\x8E\xA2\xA1z\x8E\nz", "~z~\nz", "m0:8EA2A1 m4:8E "}});
  check_all("MS932", "UTF-8", 0, {{"lenient: the line end is swallowed", "\x81\na", "~a", "m0:810A "}});
  check_all("Latin1", "US-ASCII", 0, {{"the substitution byte is a character too", "a\x1Az", "a\x1Az"}});
  check_all("IBM037", "IBM273", 0, {{"... also between host pages", "\xC1\x3F", "\xC1\x3F"}});
}

TEST_F(ConvertBuffer, ShiftBytes) {  // E38080 is 4040
  check_all("IBM930", "UTF-8", kStrict,
            {
                {"well-formed", "\xC1\x0E\x40\x40\x0F\xC2\x0E\x0F", "A\xE3\x80\x80\x42"},
                {"repeated", "\x0E\x0E\x40\x40\x0F\x0F\xC1", "\xE3\x80\x80\x41", "h1:0E h5:0F "},
                {"leave byte that ends nothing", "\xC1\x0F\xC2", "AB", "h1:0F "},
                {"run left open", "\x0E\x40\x40", "\xE3\x80\x80", "h3: "},
                {"half a character, then the end of the run", "\x0E\x41\x0F\xC1\xC2", "~AB", "m1:41 "},
                {"cut in a run", "\x0E\x40", "~", "c1:40 h2: "},
                {"unassigned in a run", "\x0E\x41\xFE\x40\x40\x0F", "~\xE3\x80\x80", "m1:41FE "},
            });
  check_all("IBM930", "UTF-8", 0,
            {
                {"lenient: a second shift byte is text", "\x0E\x0E\x41\x0F\xC1", "~A", "m1:0E41 "},
                {"lenient: leave byte that ends nothing", "\xC1\x0F\xC2", "AB", "h1:0F "},
            });
  check_all(
      "UTF-8", "IBM930", 0,
      {
          {"target closes its run", "a\xE3\x80\x80", "\x62\x0E\x40\x40\x0F"},
          {"substitution in a run", "\xE3\x80\x80\xF0\xE3\x80\x80", "\x0E\x40\x40\x0F\x3F\x0E\x40\x40\x0F", "m3:F0 "},
      });
}

TEST_F(ConvertBuffer, Discard) {
  check_all("MS932", "UTF-8", kDiscard | kStrict, {{"malformed", "\x81\na\xA0", "\na", "m0:81 m3:A0 "}});
  check_all("UTF-8", "UTF-8", kDiscard | kStrict, {{"beyond UCS-2", "a\xF0\x9F\x98\x80", "a", "s1:F09F9880=1F600 "}});
  check_all("UTF-8", "UTF-8", kDiscard,
            {
                {"malformed, and cut", "a\xED\xA0\x80z\xE3\x81", "az", "m1:EDA080 c5:E381 "},
                {"U+FFFD itself stays", "\xEF\xBF\xBD", "~"},
            });
  check_all("UTF-8", "IBM930", kDiscard,
            {{"no shift bytes for what is left out", "\xE3\x80\x80\xC3\xBF\xE3\x80\x80", "\x0E\x40\x40\x40\x40\x0F",
              "s3:C3BF=00FF "}});
}

std::u16string with_line_ends(std::u16string_view text, std::u16string_view line_end) {
  std::u16string changed;
  for (size_t i = 0; i < text.size(); ++i) {
    const bool pair = text.substr(i, 2) == u"\r\n";
    const bool ends = pair || text[i] == u'\n' || text[i] == u'\u0085';
    changed += ends ? line_end : text.substr(i, 1);
    if (pair) ++i;
  }
  return changed;
}

TEST_F(ConvertBuffer, LineEnds) {
  const struct {
    uint32_t option;
    const char16_t* line_end;
  } lines[] = {{LX_CONV_LINES_LF, u"\n"}, {LX_CONV_LINES_NEL, u"\u0085"}, {LX_CONV_LINES_CRLF, u"\r\n"}};
  constexpr uint16_t kIds[] = {819, 37, 57352, 930};
  const char16_t* const texts[] = {
      u"a\nb\u0085c\r\nd\re",      u"\n\r", u"\r", u"\r\r\n\r\r\n\n", u"\u0085\u0085\r\u0085", u"\n\n\u0085\r\n\r",
      u"本\r\n本本\r本\u0085本\r",  // around double-byte runs the line end stands in the single-byte state
  };
  for (const auto& [option, line_end] : lines) {
    for (uint16_t source : kIds) {
      for (uint16_t target : kIds) {
        const PageSource &from = PageSource::of(source), &to = PageSource::of(target);
        Setting setting(from.name, to.name, option);
        for (const char16_t* text : texts) {
          if (*text == u'本' && (source < 900 || target < 900)) continue;
          setting.check({"line ends", encoded(from, text), encoded(to, with_line_ends(text, line_end))});
        }
      }
    }
  }
}

TEST_F(ConvertBuffer, LineEndsWithProblems) {
  // A line end that the target lacks is a character that it lacks.
  check_all("Latin1", "US-ASCII", LX_CONV_LINES_NEL,
            {{"no next line in ASCII", "a\nb\x85z", "a\x1A\x62\x1Az", "s1:0A=0085 s3:85=0085 "}});
  check_all("Latin1", "MS932", LX_CONV_LINES_NEL, {{"of two characters", "a\r\nb", "a\x1A\x62", "s2:0A=0085 "}});
  check_all("UTF-8", "Latin1", LX_CONV_LINES_LF | kStrict | kDiscard,
            {{"between return and line feed", "a\r\xE3\x81\n", "a\r\n", "m2:E381 "}});
  check_all("UTF-8", "UTF-8", LX_CONV_LINES_LF | kStrict, {{"cut behind a return", "\r\xE3", "\r~", "c1:E3 "}});
  check_all(
      "Latin1", "US-ASCII", LX_CONV_LINES_LF,
      {{"missing beside line ends", "\xE9\r\n\xE9\r\xE9", "\x1A\n\x1A\r\x1A", "s0:E9=00E9 s3:E9=00E9 s5:E9=00E9 "}});
  check_all("IBM930", "IBM939", LX_CONV_LINES_LF,
            {{"everything is left over", "\x0E\x40\x40\x0F\x0D\x0E\x40\x40\x40",
              "\x0E\x40\x40\x0F\x0D\x0E\x40\x40\x0F\x3F", "c8:40 h9: "}});
}

// ---- Long random text ----

// Runs of ASCII and of real text, now and then bytes that are anything, or that lead, shift or continue.
std::string random_text(const PageSource& page, std::mt19937& random) {
  static const std::u16string kPieces[] = {
      u"0123456789abcdefghijklmnopqrstuvwxyz", u"é漢字", u"Жук", u"アイウ", u"한글", u"漢a漢a", u"\n"};
  static constexpr std::string_view kTelling = "\x0E\x0F\x0E\x0F\x41\x42\x81\x8E\x8F\xA2\xE3";
  std::string text;
  while (text.size() < 600) {
    auto value = random();
    if (value % 8 == 0) {
      text += static_cast<char>(value >> 8);
    } else if (value % 8 == 1) {
      for (int i = 0; i < 3; ++i) text += kTelling[random() % kTelling.size()];
    } else {
      text += encoded(page, kPieces[value / 8 % std::size(kPieces)]);
    }
  }
  return text;
}

// Every character of the source in turn, where the first byte tells its length.
Case expected_case(const PageSource& to, const PageSource& from, const std::string& text, bool discard) {
  Outcome outcome;
  Writer out{{Form::shifted, &to}};
  for (size_t at = 0; at < text.size();) {
    size_t length = from.length_of(static_cast<uint8_t>(text[at]));
    std::string bytes = text.substr(at, length);
    bool cut = bytes.size() < length;
    uint16_t unicode = cut ? kNoCharacter : from.decode(bytes);
    uint32_t kind = cut                       ? LX_PROBLEM_CUT
                    : unicode == kNoCharacter ? LX_PROBLEM_MALFORMED
                    : !to.has(unicode)        ? LX_PROBLEM_SUBSTITUTED
                                              : 0;
    if (kind != 0) outcome.add(kind, at, bytes, unicode);
    if (kind == 0 || !discard) out.add(out.piece(unicode));
    at += bytes.size();
  }
  if (out.inside) out.units.push_back(to.leave);
  return {"random text", text, bytes_of_units(out.units), outcome.problems};
}

constexpr uint16_t kIds[] = {819, 367, 37, 932, 954, 964, 273, 57352, 930, 1388};

TEST_F(ConvertBuffer, EachProblemIsWhereItIs) {
  std::mt19937 random(2);
  for (uint16_t source : kIds) {
    for (uint16_t target : kIds) {
      const PageSource& from = PageSource::of(source);
      const PageSource& to = PageSource::of(target);
      for (uint32_t options : {0u, kDiscard}) {
        Setting setting(from.name, to.name, options);
        const size_t ratio = setting.ratio();
        EXPECT_EQ(ratio, target == source ? size_t{1} : size_t{to.max_length} + to.mixed())
            << from.name << " to " << to.name;
        for (int round = 0; round < 5; ++round) {
          std::string text = random_text(from, random);
          Case c = expected_case(to, from, text, options != 0);
          if (from.mixed() ||
              from.kind == PageSource::Kind::utf8) {  // whatever the problems are, they stay so when cut
            Outcome whole = setting.whole(text);
            c = {"random text", text, whole.output, whole.problems};
            const bool same = options != 0 || whole.counts.cut != 0 || whole.output == setting.string(text);
            ASSERT_TRUE(same) << from.name << " to " << to.name << ": " << hex(text);
          }
          EXPECT_TRUE(target == source || c.out.size() <= ratio * text.size() + to.mixed()) << hex(text);
          for (int cut = 0; cut < 3; ++cut) {
            ASSERT_TRUE(setting.check(c, 1 + random() % 100, 1 + random() % 100, 1 + random() % 100));
          }
          ASSERT_TRUE(setting.check(c, 1 + random() % 8, 1 + random() % 8, 1 + random() % 6));
        }
      }
    }
  }
}

// Lead bytes tell the length, and some of them narrow the second byte. A beginning that goes no further is one
// malformed character.
Case strict_utf8(const std::string& text) {
  Outcome outcome;
  for (size_t at = 0; at < text.size();) {
    auto byte = [&](size_t i) { return static_cast<unsigned>(static_cast<uint8_t>(text[at + i])); };
    const unsigned lead = byte(0);
    const size_t wanted = lead < 0x80 ? 1 : lead < 0xC2 ? 0 : lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : lead < 0xF5 ? 4 : 0;
    const unsigned low = lead == 0xE0 ? 0xA0 : lead == 0xF0 ? 0x90 : 0x80;
    const unsigned high = lead == 0xED ? 0x9F : lead == 0xF4 ? 0x8F : 0xBF;
    size_t length = 1;
    for (; length < wanted && at + length < text.size(); ++length) {
      if (byte(length) < (length == 1 ? low : 0x80) || byte(length) > (length == 1 ? high : 0xBF)) break;
    }
    const std::string bytes = text.substr(at, length);
    uint32_t kind = 0, unicode = kNoCharacter;
    if (length == 4) {
      kind = LX_PROBLEM_SUBSTITUTED;
      unicode = (lead & 7) << 18 | (byte(1) & 0x3F) << 12 | (byte(2) & 0x3F) << 6 | (byte(3) & 0x3F);
    } else if (length != wanted) {
      kind = length < wanted && at + length == text.size() ? LX_PROBLEM_CUT : LX_PROBLEM_MALFORMED;
    }
    if (kind != 0) outcome.add(kind, at, bytes, unicode);
    outcome.output += kind == 0 ? bytes : "\xEF\xBF\xBD";
    at += length;
  }
  return {"random UTF-8", text, outcome.output, outcome.problems};
}

TEST_F(ConvertBuffer, StrictUtf8) {
  std::mt19937 random(3);
  Setting setting("UTF-8", "UTF-8", kStrict);
  static constexpr unsigned char kBytes[] = {0x00, 0x41, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC0, 0xC1, 0xC2,
                                             0xDF, 0xE0, 0xE1, 0xEC, 0xED, 0xEE, 0xEF, 0xF0, 0xF1, 0xF4, 0xF5, 0xFF};
  for (int round = 0; round < 2000; ++round) {
    std::string text = round % 2 == 0 ? random_text(PageSource::of(57352), random) : "";
    for (int i = round % 2 == 0 ? 100 : 0; i < 100; ++i) text += static_cast<char>(kBytes[random() % sizeof kBytes]);
    ASSERT_TRUE(setting.check(strict_utf8(text), 1 + random() % 100, 1 + random() % 100, 1 + random() % 100));
  }
}

// Long enough for the runs that move many bytes at a time, at every place beside the edge of the memory.
TEST_F(ConvertBuffer, LongRunsBetweenOddCharacters) {
  for (uint16_t source : kIds) {
    for (uint16_t target : kIds) {
      const PageSource &from = PageSource::of(source), &to = PageSource::of(target);
      std::u16string text;
      for (size_t run = 0; run < 70; ++run) {
        text.append(run, u'a');
        text += run % 2 == 0 ? u'漢' : u'é';
      }
      for (char16_t& character : text) character = static_cast<char16_t>(from.decode(from.encode(character)));
      const Setting setting(from.name, to.name, 0);
      Case c = {"long runs", encoded(from, text), encoded(to, text)};
      c.problems = setting.whole(c.in).problems;
      for (size_t start : {1u, 2u, 3u, 7u, 15u, 31u, 32u}) {
        for (size_t room : {8000u, 17u, 64u, 129u}) ASSERT_TRUE(setting.check(c, start, c.in.size(), room));
      }
    }
  }
}

// ---- Statuses ----

// One call each, in order; every one of them says what is to be seen from outside.
struct Call {
  std::string in;
  size_t room;
  uint32_t status;
  std::string out;
  size_t unused = 0;  // bytes of the input that are left
};

void expect_calls(const char* name, LXLocale* target, LXLocale* source, const std::vector<Call>& calls) {
  SCOPED_TRACE(name);
  Conversion handle(LXOpenConversion(target, source, 0));
  for (const Call& call : calls) {
    Guarded text{std::string_view(call.in)}, room(call.room);
    const char* in = text.data();
    char* out = room.data();
    auto in_left = static_cast<int32_t>(call.in.size()), out_room = static_cast<int32_t>(call.room);
    EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &out_room, &in, &in_left, 0), call.status) << hex(call.in);
    EXPECT_EQ(hex({room.data(), static_cast<size_t>(out - room.data())}), hex(call.out));
    EXPECT_EQ(static_cast<size_t>(in_left), call.unused);
    EXPECT_EQ(static_cast<size_t>(out_room), call.room - call.out.size());
  }
}

TEST_F(ConvertBuffer, Statuses) {
  const Locale unicode = locale_of("UTF-8"), ms932 = locale_of("MS932"), ibm930 = locale_of("IBM930");
  LXLocale *utf8 = unicode.get(), *japanese = ms932.get(), *mixed = ibm930.get();
  expect_calls("nothing given, all consumed, room just enough", utf8, utf8, {{"", 0, 0, ""}, {"abc", 3, 0, "abc"}});
  expect_calls("no room: one character is taken in", utf8, utf8,
               {{"abc", 0, 52, "", 2}, {"bc", 0, 52, "", 2}, {"bc", 9, 0, "abc"}});
  expect_calls("a third of a character is held", japanese, utf8,
               {{"\xE3", 9, 53, ""}, {"", 9, 53, ""}, {"\x82", 9, 53, ""}, {"\xA2", 9, 0, "\x83\x41"}});
  expect_calls(
      "the rest is delivered before new text is looked at", utf8, japanese,
      {{"\x83\x41", 2, 52, "\xE3\x82"}, {"xyz", 0, 52, "", 3}, {"xyz", 1, 52, "\xA2", 2}, {"yz", 9, 0, "xyz"}});
  expect_calls("a shift byte goes out without its character, and the run stays open", mixed, utf8,
               {{"\xE3\x80\x80", 1, 52, "\x0E"}, {"", 2, 0, "\x40\x40"}, {"a", 9, 0, "\x0F\x62"}});
  expect_calls("shift bytes alone are consumed", utf8, mixed,
               {{"\x0E", 0, 0, ""}, {"\x40\x40\x0F", 9, 0, "\xE3\x80\x80"}});
}

TEST_F(ConvertBuffer, Arguments) {
  Locale latin = locale_of("Latin1");
  Conversion handle(LXOpenConversion(latin.get(), latin.get(), 0));
  for (uint32_t bit = 1; bit != 0; bit <<= 1) {
    uint32_t status = (bit & (LX_CONV_LINES_CRLF | kStrict | kDiscard)) != 0 ? LX_OK : LX_E_ARGUMENT;
    EXPECT_EQ(LXSetConversionOptions(handle.get(), bit, nullptr, nullptr), status) << bit;
  }
  char* out = nullptr;
  const char* in = "a";
  int32_t room = -3, left = -3;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_OK);  // less than nothing is nothing
  left = 1;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_E_FULL);
  EXPECT_EQ(LXConvertBuffer(nullptr, &out, &room, &in, &left, 0), LX_E_ARGUMENT);
  EXPECT_EQ(LXConvertBuffer(handle.get(), nullptr, &room, &in, &left, 0), LX_E_ARGUMENT);
  EXPECT_EQ(LXSetConversionOptions(handle.get(), 0, nullptr, nullptr), LX_E_ARGUMENT);  // too late
}

}  // namespace
}  // namespace lx::test
