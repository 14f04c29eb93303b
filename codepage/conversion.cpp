// SPDX-License-Identifier: Apache-2.0
// Resumable conversion: what a call leaves over on either side waits in the handle.
#include "codepage/conversion.hpp"

#include <cstring>
#include <new>

#include "frame/call.hpp"
#include "frame/memory.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "conversion", 0};

constexpr uint32_t kOptions = LX_CONV_LINES_CRLF | LX_CONV_STRICT | LX_CONV_DISCARD;

// Either side of a call may be absent when it is empty, and then there is no pointer to copy from.
void copy_bytes(uint8_t* to, const uint8_t* from, size_t count) {
  if (count != 0) std::memcpy(to, from, count);
}

struct Input {
  const uint8_t* at;
  size_t left;

  void advance(size_t count) {
    at += count;
    left -= count;
  }
};

struct Output {
  uint8_t* at;
  size_t room;

  void write(const uint8_t* bytes, size_t count) {
    copy_bytes(at, bytes, count);
    at += count;
    room -= count;
  }
};

template <class In>
void set_up_reader(const LXConversion& handle, In& in) {
  in.strict = (handle.options & LX_CONV_STRICT) != 0;
  if constexpr (std::same_as<In, SingleByteReader>) in.map = handle.map;
}

template <class Side>
uint8_t state_of(const Side& side) {
  if constexpr (Side::kShifted) {
    return side.double_byte ? 1 : 0;
  } else {
    return 0;
  }
}

void deliver_pending(LXConversion& handle, Output& output) {
  size_t count = std::min<size_t>(output.room, handle.pending_count);
  output.write(handle.pending, count);
  handle.counts.bytes_out += count;
  handle.pending_count = static_cast<uint8_t>(handle.pending_count - count);
  std::memmove(handle.pending, handle.pending + count, handle.pending_count);
}

// One call of LXConvertBuffer for one pair of kinds.
template <class In, class Out>
class BufferCall {
 public:
  BufferCall(LXConversion& handle, Input& input, Output& output, In& in, Out& out)
      : handle_(handle), input_(input), output_(output), in_(in), out_(out) {
    set_up_reader(handle, in_);
  }

  uint32_t run() {
    if (handle_.held_count != 0) {
      uint32_t status = continue_held();
      if (status != LX_OK) return status;
    }
    const uint8_t* text = input_.at;
    ConversionWatch watch(handle_, text, handle_.counts.bytes_in);
    in_.at = in_.start = text;
    in_.end = text + input_.left;
    if constexpr (In::kShifted) in_.past_shift = handle_.past_shift;
    point_writer_at_output();
    Stop stop = transcode(in_, out_, watch);
    settle_output();
    if (stop == Stop::full) spill(in_, watch);
    handle_.source_state = state_of(in_);
    if constexpr (In::kShifted) handle_.past_shift = in_.past_shift && stop == Stop::done;
    consume(static_cast<size_t>(in_.at - text));
    if (stop == Stop::full) return LX_E_FULL;
    if (stop == Stop::done) return LX_OK;
    hold(input_.left);
    return LX_E_PARTIAL;
  }

 private:
  void point_writer_at_output() {
    out_.begin = out_.at = output_.at;
    out_.end = output_.at + output_.room;
  }
  void settle_output() {
    auto written = static_cast<size_t>(out_.at - out_.begin);
    output_.at += written;
    output_.room -= written;
    handle_.counts.bytes_out += written;
    handle_.target_state = state_of(out_);
  }
  void consume(size_t count) {
    input_.advance(count);
    handle_.counts.bytes_in += count;
  }
  void hold(size_t count) {
    copy_bytes(handle_.held + handle_.held_count, input_.at, count);
    handle_.held_count = static_cast<uint8_t>(handle_.held_count + count);
    consume(count);
  }

  // Carries the character that does not fit into the pending area, and as much of it as fits into the output.
  void spill(In& in, ConversionWatch& watch) {
    Out spare = out_;
    spare.begin = spare.at = handle_.pending;
    spare.end = handle_.pending + sizeof handle_.pending;
    carry_one(in, spare, watch);
    handle_.pending_count = static_cast<uint8_t>(spare.at - spare.begin);
    handle_.target_state = state_of(spare);
    deliver_pending(handle_, output_);
  }

  // The held beginning and the input behind it are put together for one character.
  uint32_t continue_held() {
    uint8_t assembly[sizeof handle_.held * 2];
    size_t held = handle_.held_count;
    size_t added = std::min(input_.left, sizeof handle_.held);
    std::memcpy(assembly, handle_.held, held);
    copy_bytes(assembly + held, input_.at, added);
    In in = in_;
    in.at = in.start = assembly;
    in.end = assembly + held + added;
    if constexpr (In::kShifted) in.past_shift = true;
    ConversionWatch watch(handle_, assembly, handle_.counts.bytes_in - held);
    point_writer_at_output();
    Stop stop = carry_one(in, out_, watch);
    settle_output();
    if (stop == Stop::partial) {
      hold(input_.left);
      return LX_E_PARTIAL;
    }
    if (stop == Stop::full) spill(in, watch);
    // Strict reading too takes what it held: it held no byte that does not fit.
    handle_.held_count = 0;
    consume(static_cast<size_t>(in.at - assembly) - held);
    return stop == Stop::full ? LX_E_FULL : LX_OK;
  }

 private:
  LXConversion& handle_;
  Input& input_;
  Output& output_;
  In& in_;
  Out& out_;
};

uint32_t convert(LXConversion& handle, Input& input, Output& output) {
  if (handle.pending_count != 0) {
    deliver_pending(handle, output);
    if (handle.pending_count != 0) return LX_E_FULL;
  }
  return with_reader(*handle.from, {true, handle.source_state}, input.at, input.left, [&](auto in) {
    return with_writer(*handle.to, {true, handle.target_state}, output.at, output.room,
                       [&](auto out) { return BufferCall(handle, input, output, in, out).run(); });
  });
}

// Puts what the end of a text adds into the pending area: a waiting carriage return, U+FFFD for a character that was
// cut off, and the way back to the single-byte state.
void finish_text(LXConversion& handle) {
  ConversionWatch watch(handle, nullptr, 0);
  with_writer(*handle.to, {true, handle.target_state}, handle.pending, sizeof handle.pending, [&](auto out) {
    if (handle.held_return) out.put(out.code(0x0D));
    if (handle.held_count != 0) {
      LXConversionProblem problem = {
          handle.counts.bytes_in - handle.held_count, LX_PROBLEM_CUT, kUnassigned, handle.held_count, {}};
      std::memcpy(problem.bytes, handle.held, handle.held_count);
      watch.add(problem);
      if ((handle.options & LX_CONV_DISCARD) == 0) out.put(out.code(kUnassigned));
    }
    if constexpr (decltype(out)::kShifted) {
      if (out.double_byte) *out.at++ = out.page->leave_byte;
    }
    handle.pending_count = static_cast<uint8_t>(out.at - out.begin);
  });
  if (handle.source_state != 0) watch.add({handle.counts.bytes_in, LX_PROBLEM_SHIFT, kUnassigned, 0, {}});
  handle.past_shift = false;
  handle.held_return = false;
  handle.held_count = 0;
  handle.source_state = 0;
  handle.target_state = 0;
}

bool in_use(const LXConversion& handle) {
  return handle.counts.bytes_in != 0 || handle.counts.bytes_out != 0 || handle.pending_count != 0;
}

// Both pages single-byte: their map lies behind the handle.
LXConversion* make_handle(LXLocale& target, LXLocale& source) {
  const CodePage& from = page_of(source);
  const CodePage& to = page_of(target);
  bool mapped = from.kind == PageKind::single && to.max_length == 1 && !from.shift_sensitive;
  auto block = Owned<uint8_t>::zeroed(sizeof(LXConversion) + (mapped ? sizeof(ByteMap) : 0));
  if (!block) return nullptr;
  auto* handle = reinterpret_cast<LXConversion*>(block.give_up());
  handle->source = &source;
  handle->target = &target;
  handle->from = &from;
  handle->to = &to;
  if (mapped) handle->map = new (handle + 1) ByteMap(from, to);
  return handle;
}

}  // namespace

void ConversionWatch::add(const LXConversionProblem& problem) {
  LXConversionCounts& counts = handle_.counts;
  switch (problem.kind) {
    case LX_PROBLEM_SUBSTITUTED:
      ++counts.substituted;
      break;
    case LX_PROBLEM_MALFORMED:
      ++counts.malformed;
      break;
    case LX_PROBLEM_SHIFT:
      ++counts.shifts;
      break;
    default:
      ++counts.cut;
  }
  if (handle_.callback != nullptr) handle_.callback(handle_.context, &problem);
}

}  // namespace lx

using namespace lx;

extern "C" {

LXConversion* LXOpenConversion(LXLocale* target_locale, LXLocale* source_locale, uint32_t /*reserved*/) noexcept {
  return locale_call(trace_unit, __func__, target_locale, 0, 0, static_cast<LXConversion*>(nullptr),
                     [&](LocaleCall& call) -> LXConversion* {
                       LXLocale* source = locale_or_default(source_locale);
                       if (source == nullptr) return call.fail(LX_E_ARGUMENT, static_cast<LXConversion*>(nullptr));
                       LXConversion* handle = make_handle(call.locale, *source);
                       if (handle == nullptr) call.status = LX_E_MEMORY;
                       return handle;
                     });
}

uint32_t LXCloseConversion(LXConversion* handle) noexcept {
  return exported(trace_unit, __func__,
                  [&]() -> uint32_t { return handle == nullptr || release(handle) ? LX_OK : LX_E_FREE; });
}

uint32_t LXConvertBuffer(LXConversion* handle, char** out, int32_t* out_room, const char** in, int32_t* in_left,
                         uint32_t /*reserved*/) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (handle == nullptr || out == nullptr || out_room == nullptr || in == nullptr || in_left == nullptr) {
      return LX_E_ARGUMENT;
    }
    Input input = {bytes_of(*in), *in != nullptr && *in_left > 0 ? static_cast<size_t>(*in_left) : 0};
    Output output = {bytes_of(*out), *out != nullptr && *out_room > 0 ? static_cast<size_t>(*out_room) : 0};
    uint32_t status = convert(*handle, input, output);
    *in_left -= static_cast<int32_t>(input.at - bytes_of(*in));
    *out_room -= static_cast<int32_t>(output.at - bytes_of(*out));
    *in = reinterpret_cast<const char*>(input.at);
    *out = reinterpret_cast<char*>(output.at);
    return status;
  });
}

int32_t LXConversionRatio(LXLocale* target_locale, LXLocale* source_locale, uint32_t /*reserved*/) noexcept {
  return locale_call(trace_unit, __func__, target_locale, 0, 0, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    LXLocale* source = locale_or_default(source_locale);
    if (source == nullptr) return call.fail(LX_E_ARGUMENT, -1);
    if (call.locale.code_page->id == source->code_page->id) return 1;
    const CodePage& page = page_of(call.locale);
    return page.max_length + (page.shift_sensitive ? 1 : 0);
  });
}

uint32_t LXSetConversionOptions(LXConversion* handle, uint32_t options, LXProblemFn callback, void* context) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (handle == nullptr || (options & ~kOptions) != 0 || in_use(*handle)) return LX_E_ARGUMENT;
    handle->options = options;
    handle->callback = callback;
    handle->context = context;
    return LX_OK;
  });
}

uint32_t LXFinishConversion(LXConversion* handle, char** out, int32_t* out_room) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (handle == nullptr || out == nullptr || out_room == nullptr) return LX_E_ARGUMENT;
    Output output = {bytes_of(*out), *out != nullptr && *out_room > 0 ? static_cast<size_t>(*out_room) : 0};
    deliver_pending(*handle, output);
    if (handle->pending_count == 0) {
      finish_text(*handle);
      deliver_pending(*handle, output);
    }
    *out_room -= static_cast<int32_t>(output.at - bytes_of(*out));
    *out = reinterpret_cast<char*>(output.at);
    return handle->pending_count != 0 ? LX_E_FULL : LX_OK;
  });
}

uint32_t LXGetConversionCounts(const LXConversion* handle, LXConversionCounts* counts) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (handle == nullptr || counts == nullptr) return LX_E_ARGUMENT;
    *counts = handle->counts;
    return LX_OK;
  });
}

}  // extern "C"
