// SPDX-License-Identifier: Apache-2.0
// Translation by code page ids.
#include <new>

#include "codepage/host_translation.hpp"
#include "codepage/lengths.hpp"
#include "codepage/text/text_kinds.hpp"
#include "frame/memory.hpp"
#include "nls1/state.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "nls1_translate", 0};

constexpr uint32_t kFlags = LX_OPT_TERMINATE | LX_OPT_CHARS | NLS1_XLT_PAD | NLS1_XLT_BLANKS;

// Two code pages, as they were found. Fields are short and pairs come back, so a manager keeps the pairs that it was
// asked for, each in the place that its ids give; a pair whose place is taken is looked up each time.
struct Pair {
  uint16_t target_id;
  uint16_t source_id;
  bool mapped;             // both are single-byte
  const CodePage* target;  // null: UCS-2
  const CodePage* source;
  ByteMap map;

  Pair(uint16_t target_number, uint16_t source_number, const CodePage* target_page, const CodePage* source_page)
      : target_id(target_number),
        source_id(source_number),
        mapped(target_page != nullptr && source_page != nullptr && target_page->max_length == 1 &&
               source_page->max_length == 1),
        target(target_page),
        source(source_page),
        map(mapped ? *source_page : built_in_code_page(), mapped ? *target_page : built_in_code_page()) {}
};

std::atomic<const void*>& place_of(LXObjMgr& manager, uint16_t target, uint16_t source) {
  return manager.pairs[(target * 7u ^ source) % kPairPlaces];
}

const Pair* kept_pair(LXObjMgr& manager, uint16_t target, uint16_t source) {
  const auto* pair = static_cast<const Pair*>(place_of(manager, target, source).load(std::memory_order_acquire));
  return pair != nullptr && pair->target_id == target && pair->source_id == source ? pair : nullptr;
}

void keep_pair(LXObjMgr& manager, uint16_t target_id, uint16_t source_id, const CodePage* target,
               const CodePage* source) {
  std::atomic<const void*>& place = place_of(manager, target_id, source_id);
  if (place.load(std::memory_order_relaxed) != nullptr) return;
  void* block = allocate(sizeof(Pair));
  if (block == nullptr) return;  // it is only not kept
  const void* nothing = nullptr;
  const Pair* pair = new (block) Pair(target_id, source_id, target, source);
  if (!place.compare_exchange_strong(nothing, pair, std::memory_order_acq_rel)) release(block);
}

// What was read is missing when the entry's data are those that stand in for it.
bool stands_in(const LXObjMgr& manager, const LXObjEntry& entry) {
  return (entry.flags & kEntryBuiltIn) != 0 && manager.directory[0] != '\0';
}

// LX_OK with a null page: UCS-2.
uint32_t find_page(LXObjMgr& manager, uint16_t id, const CodePage*& page) {
  page = nullptr;
  if (id == LX_CP_UCS2) return LX_OK;
  uint32_t rc = LX_OK;
  const LXObjEntry* entry = object_by_id(LX_CODEPAGE, id, true, rc);
  if (entry != nullptr && !stands_in(manager, *entry)) {
    page = &code_page_of(*entry);
    return LX_OK;
  }
  LX_TRACE(TRC1_LEVEL_ERROR, "Unable to locate codepage %d", id);
  return entry != nullptr || rc == LX_E_NOTFOUND || rc == LX_E_NOFILE ? LX_E_CODEPAGE : rc;
}

// Both sides of a translation.
struct Sides {
  const CodePage* target = nullptr;
  const CodePage* source = nullptr;
  const ByteMap* map = nullptr;

  uint32_t find(uint16_t target_id, uint16_t source_id) {
    LXObjMgr* manager = LXGetObjManager();
    if (manager == nullptr) return LX_E_MANAGER;
    if (const Pair* pair = kept_pair(*manager, target_id, source_id)) {
      target = pair->target;
      source = pair->source;
      if (pair->mapped) map = &pair->map;
      return LX_OK;
    }
    uint32_t rc = find_page(*manager, source_id, source);
    if (rc == LX_OK) rc = find_page(*manager, target_id, target);
    if (rc == LX_OK) keep_pair(*manager, target_id, source_id, target, source);
    return rc;
  }
};

// ---- Traces ----

void trace_kind(const char* side, uint16_t id, const CodePage* page) {
  if (page == nullptr) return;
  if (page->max_length == 1) {
    TRC1_Printf(&trace_unit, __LINE__, "%s codepage %d is single byte", side, id);
  } else if (page->shift_sensitive) {
    TRC1_Printf(&trace_unit, __LINE__, "%s codepage %d is shift sensitive, Shift-In=%02X, Shift-Out=%02x", side, id,
                page->enter_byte, page->leave_byte);
  } else {
    TRC1_Printf(&trace_unit, __LINE__, "%s codepage %d is not shift sensitive", side, id);
  }
}

void trace_mode(const Sides& sides) {
  if (sides.source == nullptr || sides.target == nullptr) return;
  bool from_single = sides.source->max_length == 1;
  if (sides.target->shift_sensitive) {
    TRC1_Printf(&trace_unit, __LINE__, "%s",
                from_single ? "Process SingleByte Input, Extended Multi-byte output "
                            : "Process multi-byte Input, Extended Multi-byte output ");
  } else if (!from_single) {
    TRC1_Printf(&trace_unit, __LINE__, "Process Multi-Byte Input, Multi-byte output ");
  } else if (sides.target->max_length > 1) {
    TRC1_Printf(&trace_unit, __LINE__, "Process SingleByte Input, Multi-byte output ");
  }
}

size_t source_length(const CodePage* source, const void* in, int32_t length, bool characters) {
  if (in == nullptr) return 0;
  if (source == nullptr) {
    size_t units = length < 0 ? measured_length(static_cast<const LXUChar*>(in)) : static_cast<size_t>(length);
    return length < 0 || characters ? units * sizeof(LXUChar) : units;
  }
  const auto* bytes = static_cast<const uint8_t*>(in);
  if (length < 0) return measured_length(bytes);
  return characters ? bytes_of_characters(*source, bytes, 0, static_cast<size_t>(length)) : static_cast<size_t>(length);
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" int32_t NLS1_TranslateString(uint16_t target_code_page, void* out, int32_t out_size,
                                        uint16_t source_code_page, const void* in, int32_t in_length, int32_t* consumed,
                                        uint32_t flags, uint32_t* error) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    auto fail = [&](uint32_t status) {
      set_status(error, status);
      if (consumed != nullptr) *consumed = 0;
      return -1;
    };
    NLS1_PrivateFunction_GetThreadLocale();
    if (!ready()) return fail(LX_E_MANAGER);
    if ((flags & ~kFlags) != 0) return fail(LX_E_ARGUMENT);
    Sides sides;
    if (uint32_t rc = sides.find(target_code_page, source_code_page)) return fail(rc);
    if (traces(trace_unit, TRC1_LEVEL_DETAIL)) [[unlikely]] {
      trace_kind("Source", source_code_page, sides.source);
      trace_kind("Target", target_code_page, sides.target);
      trace_mode(sides);
    }
    bool characters = (flags & LX_OPT_CHARS) != 0;
    size_t length = source_length(sides.source, in, in_length, characters);
    if (in_length < 0) LX_TRACE(TRC1_LEVEL_DETAIL, "Source length = %d", static_cast<int>(length));
    Translated result = translate({.target = sides.target,
                                   .source = sides.source,
                                   .map = sides.map,
                                   .out = out,
                                   .out_size = out != nullptr && out_size > 0 ? static_cast<size_t>(out_size) : 0,
                                   .in = in,
                                   .in_length = length,
                                   .measured = in_length < 0,
                                   .characters = characters,
                                   .terminate = (flags & LX_OPT_TERMINATE) != 0,
                                   .pad = (flags & NLS1_XLT_PAD) != 0,
                                   .drop_blanks = (flags & NLS1_XLT_BLANKS) != 0});
    set_status(error, result.status);
    if (consumed != nullptr) *consumed = result.consumed;
    return result.count;
  });
}
