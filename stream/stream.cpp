// SPDX-License-Identifier: Apache-2.0
// Streams opened, flushed and closed, and the bytes that they keep.
#include "stream/stream.hpp"

#include <cstring>

#include "codepage/text/text_kinds.hpp"
#include "frame/memory.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "stream", 0};

enum class Sent : uint8_t {
  all,
  failed,
  odd,  // the routine took nothing, or says that it took more than there was
};

// Hands the kept bytes to the routine. What it does not take stays.
Sent send_kept(LXStream& stream, const CodePage& page) {
  while (stream.kept != 0) {
    int32_t taken = stream.routine(stream.context, stream.bytes, stream.kept);
    if ((taken & 0xFFFF) == 0xFFFF) return Sent::failed;  // routines that count in 16 bits say -1 like this
    if (taken <= 0 || taken > stream.kept) return Sent::odd;
    auto count = static_cast<size_t>(taken);
    for (size_t i = 0; stream.shifts && i < count; ++i) {
      if (is_shift(page, stream.bytes[i])) stream.sent_double_byte = stream.bytes[i] == page.enter_byte;
    }
    drop_front(stream, count);
  }
  return Sent::all;
}

uint32_t flush(LXStream& stream, const CodePage& page) {
  switch (send_kept(stream, page)) {
    case Sent::all:
      return LX_OK;
    case Sent::failed:
      stream.kept = 0;
      stream.double_byte = stream.sent_double_byte;  // shift bytes may have been among what is gone
      return LX_E_FLUSH;
    default:
      return LX_E_COUNT;
  }
}

// Writes what is kept and ends the output in the single-byte state. The first failure counts; what it leaves is lost.
uint32_t finish(LXStream& stream, const CodePage& page) {
  uint32_t status = flush(stream, page);
  bool run_is_open = status == LX_OK ? stream.double_byte : stream.sent_double_byte;
  if (!page.shift_sensitive || !run_is_open) return status;
  stream.bytes[0] = page.leave_byte;
  stream.kept = 1;
  uint32_t closed = flush(stream, page);
  return status != LX_OK ? status : closed;
}

// The first bytes at s, as a character.
StreamCharacter leading_bytes(const char* s, size_t length) {
  size_t there = 1;
  while (there < length && s[there - 1] != '\0' && s[there] != '\0') ++there;
  return {{pack(bytes_of(s), there), static_cast<uint32_t>(there)}, false};
}

}  // namespace

StreamCharacter character_of(const CodePage& page, LXWChar packed) {
  auto length = static_cast<uint32_t>(unpacked_length(packed));
  uint8_t bytes[kMaxCharacterLength];
  unpack(bytes, packed);
  return {{pack(bytes, length), length}, page.shift_sensitive && length > 1};
}

StreamCharacter character_at(const CodePage& page, const char* s) {
  return leading_bytes(s, page.char_length[static_cast<uint8_t>(*s)]);
}

StreamCharacter character_at(const CodePage& page, const char* s, uint32_t state) {
  if (!page.shift_sensitive) return character_at(page, s);
  bool double_byte = state != 0;
  auto first = static_cast<uint8_t>(*s);
  if (is_shift(page, first)) {
    double_byte = first == page.enter_byte;
    ++s;
  }
  StreamCharacter character = leading_bytes(s, double_byte ? page.max_length : 1);
  character.double_byte = double_byte;
  return character;
}

void drop_front(LXStream& stream, size_t count) {
  stream.kept = static_cast<uint16_t>(stream.kept - count);
  std::memmove(stream.bytes, stream.bytes + count, stream.kept);
}

bool insert_front(LXStream& stream, const uint8_t* bytes, size_t count) {
  if (count > kKeptBytes - stream.kept) return false;
  std::memmove(stream.bytes + count, stream.bytes, stream.kept);
  std::memcpy(stream.bytes, bytes, count);
  stream.kept = static_cast<uint16_t>(stream.kept + count);
  return true;
}

uint32_t complete(LXStream& stream, size_t count) {
  while (stream.kept < count) {
    auto missing = static_cast<int32_t>(count - stream.kept);
    int32_t came = stream.routine(stream.context, stream.bytes + stream.kept, missing);
    if (came == -1) return LX_E_TRANSFER;
    if (came > missing) return LX_E_COUNT;
    if (came <= 0) return LX_E_HALF;
    stream.kept = static_cast<uint16_t>(stream.kept + came);
  }
  return LX_OK;
}

uint32_t send(LXStream& stream, const CodePage& page, const uint8_t* bytes, size_t count) {
  bool taken = send_kept(stream, page) == Sent::all;
  if (count > kKeptBytes - stream.kept) return LX_E_BUFFER;
  std::memcpy(stream.bytes + stream.kept, bytes, count);
  stream.kept = static_cast<uint16_t>(stream.kept + count);
  return taken && send_kept(stream, page) == Sent::all ? LX_OK : LX_E_REFUSED;
}

}  // namespace lx

using namespace lx;

extern "C" {

LXStream* LXOpenStream(LXLocale* locale, LXTransferFn routine, void* context, uint32_t mode) noexcept {
  constexpr LXStream* kNone = nullptr;
  return locale_call(trace_unit, __func__, locale, 0, 0, kNone, [&](LocaleCall& call) -> LXStream* {
    bool known = mode == LX_STREAM_READ || mode == LX_STREAM_WRITE;
    if (!known || routine == nullptr) return call.fail(LX_E_ARGUMENT, kNone);
    auto stream = Owned<LXStream>::zeroed();
    if (!stream) return call.fail(LX_E_MEMORY, kNone);
    stream->routine = routine;
    stream->context = context;
    stream->writes = mode == LX_STREAM_WRITE;
    return stream.give_up();
  });
}

int32_t LXCloseStream(LXStream* stream, LXLocale* locale, uint32_t /*reserved*/) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, int32_t{0}, [&](LocaleCall& call) -> int32_t {
    if (stream == nullptr) return call.fail(LX_E_ARGUMENT, 0);
    if (stream->writes) call.status = finish(*stream, page_of(call.locale));
    if (!release(stream) && call.status == LX_OK) call.status = LX_E_FREE;
    return call.status == LX_OK ? 1 : 0;
  });
}

int32_t LXFlushStream(LXStream* stream, LXLocale* locale, uint32_t /*reserved*/) noexcept {
  return stream_call(trace_unit, __func__, stream, locale, Direction::write, int32_t{0},
                     [](LocaleCall& call, LXStream& open) {
                       call.status = flush(open, page_of(call.locale));
                       return call.status == LX_OK ? 1 : 0;
                     });
}

}  // extern "C"
