// SPDX-License-Identifier: Apache-2.0
// Two code pages, options and the sizes of pieces from the first bytes of the input, the rest is the text. However it
// is cut, a text must come out the same, with the same problems; and other ways to convert it must agree.
#include <algorithm>
#include <iterator>

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

const std::vector<std::string> kPages = {"US-ASCII", "Latin1",   "UTF-8",   "IBM037", "IBM1047", "IBM930",
                                         "IBM933",   "IBM935",   "IBM937",  "IBM939", "IBM1364", "IBM1371",
                                         "IBM1388",  "IBM1390",  "IBM1399", "MS932",  "MS936",   "MS949",
                                         "MS950",    "JapanEUC", "EUC-TW",  "EUC-KR", "IBM424",  "MS874"};
constexpr size_t kLongestText = 4096;

bool same(const LXConversionProblem& a, const LXConversionProblem& b) {
  return a.offset == b.offset && a.kind == b.kind && a.unicode == b.unicode && a.length == b.length &&
         std::memcmp(a.bytes, b.bytes, sizeof a.bytes) == 0;
}

// Sizes of pieces, from 0 to a few bytes, the same for the same seed.
class Sizes {
 public:
  explicit Sizes(uint8_t seed) : state_(seed * 2654435761u + 1) {}
  size_t next() {
    state_ = state_ * 1664525u + 1013904223u;
    return state_ >> 28;
  }

 private:
  uint32_t state_;
};

struct Outcome {
  std::string text;
  std::vector<LXConversionProblem> problems;
  LXConversionCounts counts;
};

struct Pair {
  LXLocale* target;
  LXLocale* source;
  uint32_t options;
};

void note(void* context, const LXConversionProblem* problem) {
  static_cast<Outcome*>(context)->problems.push_back(*problem);
}

// Calls until the step is done, each time with that room in memory of exactly that size.
template <class Room, class Step>
uint32_t deliver(Outcome& outcome, Room room_of_next, Step step) {
  for (int idle = 0; idle < 1000; ++idle) {
    size_t size = room_of_next();
    std::unique_ptr<char[]> memory(size != 0 ? new char[size] : nullptr);
    char* out = memory.get();
    auto room = static_cast<int32_t>(size);
    uint32_t status = step(out, room);
    auto written = static_cast<size_t>(out - memory.get());
    demand(room >= 0 && written + static_cast<size_t>(room) == size, "room that is left");
    outcome.text.append(memory.get(), written);
    if (written != 0) idle = 0;
    if (status != LX_E_FULL) return status;
  }
  demand("no end of a conversion");
  return LX_E_FULL;
}

template <class Piece, class Room>
Outcome convert(const Pair& pair, std::string_view text, Piece piece_of_next, Room room_of_next) {
  Outcome outcome = {};
  LXConversion* handle = LXOpenConversion(pair.target, pair.source, 0);
  demand(LXSetConversionOptions(handle, pair.options, note, &outcome) == LX_OK, "LXSetConversionOptions");
  while (!text.empty()) {
    size_t size = std::min(piece_of_next(), text.size());
    std::unique_ptr<char[]> piece(size != 0 ? new char[size] : nullptr);
    std::copy_n(text.data(), size, piece.get());
    text.remove_prefix(size);
    const char* in = piece.get();
    auto left = static_cast<int32_t>(size);
    uint32_t status = deliver(outcome, room_of_next, [&](char*& out, int32_t& room) {
      return LXConvertBuffer(handle, &out, &room, &in, &left, 0);
    });
    demand(status == LX_OK || status == LX_E_PARTIAL, "status of LXConvertBuffer");
    demand(left == 0 && in == piece.get() + size, "input that is left");
  }
  uint32_t status = deliver(outcome, room_of_next,
                            [&](char*& out, int32_t& room) { return LXFinishConversion(handle, &out, &room); });
  demand(status == LX_OK, "status of LXFinishConversion");
  LXGetConversionCounts(handle, &outcome.counts);
  LXCloseConversion(handle);
  return outcome;
}

void check_counts(const Outcome& outcome, std::string_view text) {
  const LXConversionCounts& counts = outcome.counts;
  demand(counts.bytes_in == text.size() && counts.bytes_out == outcome.text.size(), "counts of bytes");
  uint64_t problems = counts.substituted + counts.malformed + counts.shifts + counts.cut;
  demand(problems == outcome.problems.size(), "counts of problems");
  uint64_t last = 0;
  for (const LXConversionProblem& problem : outcome.problems) {
    demand(problem.offset >= last && problem.offset + problem.length <= text.size(), "place of a problem");
    demand(problem.length <= sizeof problem.bytes &&
               std::memcmp(problem.bytes, text.data() + problem.offset, problem.length) == 0,
           "bytes of a problem");
    last = problem.offset;
  }
}

// The ways that convert a whole string: directly, and through UCS-2.
void check_strings(const Pair& pair, std::string_view text, const Outcome& whole) {
  auto length = static_cast<int32_t>(text.size());
  auto room = length * 5 + 10;
  std::string direct(static_cast<size_t>(room), '\0');
  int32_t count = LXConvertStringEx(pair.target, direct.data(), 0, room, pair.source, text.data(), 0, length, 0);
  demand(count >= 0, "LXConvertStringEx");
  direct.resize(static_cast<size_t>(count));
  std::vector<LXUChar> units(text.size() + 1);
  int32_t unit_count =
      LXStringToUnicodeEx(pair.source, units.data(), static_cast<int32_t>(units.size()), text.data(), 0, length, 0);
  std::string through(static_cast<size_t>(room), '\0');
  int32_t through_count = LXUnicodeToStringEx(pair.target, through.data(), 0, room, units.data(), unit_count, 0);
  demand(through_count >= 0, "LXUnicodeToStringEx");
  through.resize(static_cast<size_t>(through_count));
  demand(direct == through, "conversion through UCS-2 differs");
  if (pair.options == 0 && whole.counts.cut == 0) demand(direct == whole.text, "conversion of a string differs");

  // In less room there is less of it, never more than fits.
  for (int32_t less : {0, 1, count / 2, count - 1}) {
    if (less < 0) continue;
    std::unique_ptr<char[]> memory(new char[static_cast<size_t>(less)]);
    int32_t got =
        LXConvertStringEx(pair.target, memory.get(), 0, less, pair.source, text.data(), 0, length, LX_OPT_TERMINATE);
    demand(got >= 0 && got <= less, "a result is larger than its room");
  }
}

class Conversions : public Target {
 public:
  Conversions() { start(LEXARO_DATA, "English_UnitedStates.", kPages, "@BINARY"); }

  void run(InputBytes input) override {
    LXLocale* source = locales_[input.byte() % locales_.size()];
    LXLocale* target = locales_[input.byte() % locales_.size()];
    Pair pair = {target, source, input.byte() & (LX_CONV_LINES_CRLF | LX_CONV_STRICT | LX_CONV_DISCARD)};
    Sizes pieces(input.byte());
    Sizes rooms(input.byte());
    std::string_view text = input.rest().substr(0, kLongestText);

    Outcome whole = convert(
        pair, text, [&] { return text.size(); }, [&] { return text.size() * 5 + 20; });
    check_counts(whole, text);
    Outcome cut = convert(
        pair, text, [&] { return pieces.next(); }, [&] { return rooms.next(); });
    demand(cut.text == whole.text, "text converted in pieces differs");
    demand(std::equal(cut.problems.begin(), cut.problems.end(), whole.problems.begin(), whole.problems.end(), same),
           "problems of text converted in pieces differ");
    demand(std::memcmp(&cut.counts, &whole.counts, sizeof cut.counts) == 0,
           "counts of text converted in pieces differ");
    check_strings(pair, text, whole);
  }

 private:
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Conversions>(); }

}  // namespace lx::fuzz
