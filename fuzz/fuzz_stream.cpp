// SPDX-License-Identifier: Apache-2.0
// A code page and a direction, and then calls on a stream with what its routine moves and answers, byte after byte.
#include <algorithm>

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

// Moves what the input says, and often says something else.
int32_t transfer(void* context, void* buffer, int32_t count) {
  auto& input = *static_cast<InputBytes*>(context);
  demand(count > 0 && count <= 80, "count of a transfer");
  auto* bytes = static_cast<volatile uint8_t*>(buffer);
  auto answer = static_cast<int8_t>(input.byte());
  for (int32_t i = 0; i < count; ++i) {
    if (i < answer) bytes[i] = input.byte();
  }
  if (answer == 100) return INT32_MAX;
  if (answer == 101) return 0xFFFF;
  return answer > 90 ? count + 1 : std::min<int32_t>(answer, count);
}

class Streams : public Target {
 public:
  Streams() {
    start(LEXARO_DATA, "English_UnitedStates.", {"UTF-8", "MS932", "IBM930", "IBM1388", "EUC-TW", "Latin1"}, "@BINARY");
  }
  void run(InputBytes input) override {
    l_ = locales_[input.byte() % locales_.size()];
    const bool writes = input.byte() % 2 != 0;
    stream_ = LXOpenStream(l_, transfer, &input, writes ? LX_STREAM_WRITE : LX_STREAM_READ);
    while (input.size() != 0) {
      const uint8_t call = input.byte();
      character(call % 12, input);
      if (!writes) line(call % 4, input);
    }
    demand(LXCloseStream(stream_, l_, 0) == (LXGetError(l_) == LX_OK ? 1 : 0), "result of LXCloseStream");
  }

 private:
  void character(unsigned call, InputBytes& input) {
    uint32_t state = input.byte();
    if (call == 0) LXReadCharU(stream_, l_, 0);
    if (call == 1) LXReadCharW(stream_, l_, 0);
    if (call == 2) LXReadCharEx(stream_, l_, &state, 0);
    if (call < 3) return;
    std::vector<char> text{static_cast<char>(state), static_cast<char>(input.byte()), 0};
    if (text[0] == 0 || text[1] == 0) text.resize(text[0] == 0 ? 1 : 2);
    const char* s = text.data();
    const auto value = static_cast<LXUChar>(state << 8 | input.byte());
    const int32_t result = call == 3    ? LXUngetCharU(stream_, l_, value, 0)
                           : call == 4  ? LXUngetCharW(stream_, l_, value * state, 0)
                           : call == 5  ? LXUngetChar(stream_, l_, s, 0)
                           : call == 6  ? LXUngetCharEx(stream_, l_, s, value & 1, 0)
                           : call == 7  ? LXWriteCharU(stream_, l_, value)
                           : call == 8  ? LXWriteCharW(stream_, l_, value * state)
                           : call == 9  ? LXWriteChar(stream_, l_, s)
                           : call == 10 ? LXWriteCharEx(stream_, l_, s, value & 1)
                                        : LXFlushStream(stream_, l_, 0);
    demand(result == (LXGetError(l_) == LX_OK ? 1 : 0), "result");
  }

  void line(unsigned kind, InputBytes& input) {
    const uint32_t flags = (input.byte() & 0x1Fu) << 8 | (input.byte() & 0xC1u) << 8 | (input.byte() & 8u);
    const int32_t size = static_cast<int8_t>(input.byte());
    auto units = static_cast<size_t>(std::max(size, 0));
    if ((flags & LX_OPT_CHARS) != 0) units *= 6;  // no character and shift byte are longer
    std::unique_ptr<uint8_t[]> out(new uint8_t[units * (kind == 3 ? 4 : kind == 2 ? 2 : 1)]);
    auto* bytes = reinterpret_cast<char*>(out.get());
    const int32_t result = kind == 0   ? LXReadString(stream_, l_, bytes, size, flags)
                           : kind == 1 ? LXReadStringEx(stream_, l_, bytes, size, flags)
                           : kind == 2 ? LXReadStringU(stream_, l_, reinterpret_cast<LXUChar*>(bytes), size, flags)
                                       : LXReadStringW(stream_, l_, reinterpret_cast<LXWChar*>(bytes), size, flags);
    demand(result >= -2 && result <= std::max(size, 0), "length of a line");
    demand(result != -2 || LXGetError(l_) != LX_OK, "a failure without a status");
  }

  LXLocale* l_ = nullptr;
  LXStream* stream_ = nullptr;
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Streams>(); }

}  // namespace lx::fuzz
