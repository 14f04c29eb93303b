// SPDX-License-Identifier: Apache-2.0
// Grouping strings, read size by size.
#include "format/grouping.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "grouping", 0};

template <class Unit>
int32_t next_size(const Spelling& spelling, const Unit* grouping, int32_t* remaining, const Unit** next) {
  if (remaining == nullptr || next == nullptr) return -1;
  int32_t size = next_group_size(spelling, grouping, *remaining);
  if (size >= 0) *next = grouping;
  return size;
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t size_call(const char* function, LXLocale* locale, const Unit* grouping, int32_t* remaining, const Unit** next) {
  return locale_call(trace_unit, function, locale, 0, 0, int32_t{-1}, [&](LocaleCall& call) {
    return next_size(spelling_of<Kind>(page_of(call.locale)), grouping, remaining, next);
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrGroupingSize(LXLocale* locale, const char* grouping, int32_t* remaining, const char** next) noexcept {
  return size_call<PlainKind>(__func__, locale, grouping, remaining, next);
}

int32_t LXStrGroupingSizeW(LXLocale* locale, const LXWChar* grouping, int32_t* remaining,
                           const LXWChar** next) noexcept {
  return size_call<WideKind>(__func__, locale, grouping, remaining, next);
}

// No locale has to do with it.
int32_t LXStrGroupingSizeU(LXLocale*, const LXUChar* grouping, int32_t* remaining, const LXUChar** next) noexcept {
  return exported(trace_unit, __func__, [&] { return next_size(kAsciiSpelling, grouping, remaining, next); });
}

}  // extern "C"
