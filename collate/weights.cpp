// SPDX-License-Identifier: Apache-2.0
// Weights one character at a time. These stand in inner loops of callers: nothing is traced.
#include "collate/weights.hpp"

#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

const SortTables* tables_of(const LXObjEntry* sort) {
  return sort != nullptr && sort->type == LX_SORT && sort->loaded() ? sort->sort : nullptr;
}

// Where a call wants the weights.
struct WeightsOut {
  uint16_t* primary;
  uint8_t* secondary;
  uint8_t* tertiary;
  uint16_t* special;
  uint16_t* primary2;
  uint8_t* secondary2;
  uint8_t* tertiary2;
  uint16_t* special2;
  uint8_t* mask;

  int32_t store(const Weights& weights) const {
    if (weights.mask_known) *mask = weights.mask;
    if (weights.count >= 1) put(weights.sets[0], primary, secondary, tertiary, special);
    if (weights.count == 2) put(weights.sets[1], primary2, secondary2, tertiary2, special2);
    return weights.count;
  }
  static void put(const WeightSet& set, uint16_t* primary, uint8_t* secondary, uint8_t* tertiary, uint16_t* special) {
    *primary = set.primary;
    *secondary = set.secondary;
    *tertiary = set.tertiary;
    *special = set.special;
  }
};

template <class Unit, class WithReader>
int32_t next_weight(LXLocale* locale, const Unit** text, int32_t* remaining, uint32_t* shift_state, uint16_t* position,
                    uint16_t* pending, const WeightsOut& out, WithReader with_reader_of) {
  locale = locale_or_default(locale);
  const SortTables* sort = locale != nullptr ? tables_of(locale->sort) : nullptr;
  if (sort == nullptr) {
    *remaining = 0;
    return 0;
  }
  // A pending character counts as one of the units that remain.
  bool waiting = *pending < 0xFFFF;
  int32_t left = *remaining - (waiting ? 1 : 0);
  if (left <= 0 && !waiting) {
    *remaining = 0;
    return 0;
  }
  const CodePage& page = code_page_of(*locale->code_page);
  return with_reader_of(page, *text, left > 0 ? static_cast<size_t>(left) : 0, [&](auto in) {
    WeightReader reader(*sort, in, *position, *pending);
    Weights weights = reader.next();
    const auto& behind = reader.reader();
    *text = reinterpret_cast<const Unit*>(behind.at);
    *position = reader.position();
    *pending = reader.pending();
    if constexpr (requires { behind.double_byte; }) *shift_state = behind.double_byte ? 1 : 0;
    size_t rest = static_cast<size_t>(behind.end - behind.at) + (*pending < 0xFFFF ? 1 : 0);
    *remaining = reader.truncated() ? 0 : static_cast<int32_t>(rest);
    return out.store(weights);
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXSortGetWeights(const LXObjEntry* sort, LXUChar ch, uint16_t* primary, uint8_t* secondary, uint8_t* tertiary,
                         uint16_t* special, uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2,
                         uint16_t* special2, uint8_t* mask) noexcept {
  const SortTables* tables = tables_of(sort);
  if (tables == nullptr) return 0;
  Weights weights = tables->weights_of(ch);
  return WeightsOut{primary, secondary, tertiary, special, primary2, secondary2, tertiary2, special2, mask}.store(
      weights);
}

int32_t LXSortGetCombination(const LXObjEntry* sort, LXUChar ch1, LXUChar ch2, uint16_t* primary, uint8_t* secondary,
                             uint8_t* tertiary, uint16_t* special, uint8_t* mask) noexcept {
  const SortTables* tables = tables_of(sort);
  Weights weights;
  if (tables == nullptr || !tables->combination_of(ch1, ch2, weights)) return 0;
  WeightsOut::put(weights.sets[0], primary, secondary, tertiary, special);
  *mask = weights.mask;
  return 1;
}

int32_t LXStrGetNextWeight(LXLocale* locale, const char** text, int32_t* remaining, uint16_t* position,
                           uint16_t* primary, uint8_t* secondary, uint8_t* tertiary, uint16_t* special,
                           uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2, uint16_t* special2,
                           uint8_t* mask, uint16_t* pending) noexcept {
  WeightsOut out = {primary, secondary, tertiary, special, primary2, secondary2, tertiary2, special2, mask};
  return next_weight(locale, text, remaining, nullptr, position, pending, out,
                     [](const CodePage& page, const char* at, size_t length, auto use) {
                       return with_reader(page, {}, bytes_of(at), length, use);
                     });
}

int32_t LXStrGetNextWeightEx(LXLocale* locale, const char** text, int32_t* remaining, uint32_t* shift_state,
                             uint16_t* position, uint16_t* primary, uint8_t* secondary, uint8_t* tertiary,
                             uint16_t* special, uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2,
                             uint16_t* special2, uint8_t* mask, uint16_t* pending) noexcept {
  locale = locale_or_default(locale);
  if (locale == nullptr || !code_page_of(*locale->code_page).shift_sensitive) {
    return LXStrGetNextWeight(locale, text, remaining, position, primary, secondary, tertiary, special, primary2,
                              secondary2, tertiary2, special2, mask, pending);
  }
  WeightsOut out = {primary, secondary, tertiary, special, primary2, secondary2, tertiary2, special2, mask};
  return next_weight(locale, text, remaining, shift_state, position, pending, out,
                     [&](const CodePage& page, const char* at, size_t length, auto use) {
                       ShiftedReader in(page, bytes_of(at), length, *shift_state);
                       in.all_shifts = true;
                       return use(in);
                     });
}

int32_t LXStrGetNextWeightW(LXLocale* locale, const LXWChar** text, int32_t* remaining, uint16_t* position,
                            uint16_t* primary, uint8_t* secondary, uint8_t* tertiary, uint16_t* special,
                            uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2, uint16_t* special2,
                            uint8_t* mask, uint16_t* pending) noexcept {
  WeightsOut out = {primary, secondary, tertiary, special, primary2, secondary2, tertiary2, special2, mask};
  return next_weight(locale, text, remaining, nullptr, position, pending, out,
                     [](const CodePage& page, const LXWChar* at, size_t length, auto use) {
                       return use(WideReader(page, at, length));
                     });
}

int32_t LXStrGetNextWeightU(LXLocale* locale, const LXUChar** text, int32_t* remaining, uint16_t* position,
                            uint16_t* primary, uint8_t* secondary, uint8_t* tertiary, uint16_t* special,
                            uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2, uint16_t* special2,
                            uint8_t* mask, uint16_t* pending) noexcept {
  WeightsOut out = {primary, secondary, tertiary, special, primary2, secondary2, tertiary2, special2, mask};
  return next_weight(
      locale, text, remaining, nullptr, position, pending, out,
      [](const CodePage&, const LXUChar* at, size_t length, auto use) { return use(Ucs2Reader(at, length)); });
}

}  // extern "C"
