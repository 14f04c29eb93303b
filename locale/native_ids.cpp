// SPDX-License-Identifier: Apache-2.0
// What the operating system calls a locale of these objects.
#include <algorithm>
#include <cstring>
#include <span>

#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "native_ids", 0};

constexpr unsigned kIds = 4;

struct NativeIds {
  uint16_t ids[kIds];  // language, territory, code page, sort
  const char* native;
};

// Rows that agree in their first ids stand together, and where nothing fits exactly the first of them is the nearest:
// the order counts. Names that the other way round mean something else are kept for the programs that know them.
constexpr NativeIds kRows[] = {
    {{1, 840, 367, 0}, "C"},           {{1, 840, 819, 1}, "en_US"},  {{1, 840, 57352, 1}, "en_US.UTF-8"},
    {{1, 36, 819, 1}, "en_AU"},        {{1, 124, 819, 1}, "en_CA"},  {{1, 826, 819, 1}, "en_UK"},
    {{2, 40, 819, 1}, "de_AT"},        {{2, 276, 819, 1}, "de"},     {{2, 756, 819, 1}, "de_CH"},
    {{3, 57, 819, 1}, "fr_BE"},        {{3, 250, 819, 1}, "fr"},     {{3, 757, 819, 1}, "fr_CH"},
    {{4, 724, 819, 2}, "es"},          {{4, 32, 819, 2}, "es_AR"},   {{4, 152, 819, 2}, "es_CL"},
    {{4, 484, 819, 2}, "es_MX"},       {{5, 380, 819, 1}, "it"},     {{6, 76, 819, 1}, "pt_BR"},
    {{6, 620, 819, 1}, "pt"},          {{7, 578, 819, 4}, "no"},     {{8, 752, 819, 5}, "sv"},
    {{9, 208, 819, 4}, "da"},          {{10, 246, 819, 6}, "su"},    {{11, 392, 954, 0}, "ja"},
    {{11, 392, 932, 0}, "ja_JP.PCK"},  {{12, 125, 819, 1}, "fr_CA"}, {{13, 158, 964, 0}, "zh_TW"},
    {{13, 158, 949, 0}, "zh_TW.BIG5"}, {{14, 156, 936, 0}, "zh"},    {{21, 203, 912, 8}, "cz"},
    {{22, 56, 819, 1}, "nl_BE"},       {{22, 528, 819, 1}, "nl"},    {{23, 233, 819, 9}, "et"},
    {{25, 300, 813, 1}, "el"},         {{27, 348, 912, 10}, "hu"},   {{28, 410, 57352, 0}, "ko.UTF-8"},
    {{28, 410, 949, 0}, "ko"},         {{29, 428, 57346, 11}, "lv"}, {{30, 442, 57346, 12}, "lt"},
    {{33, 643, 915, 1}, "ru"},         {{39, 792, 920, 17}, "tr"},
};

// The row with these ids. Null: there is none, and the nearest row is not wanted.
const NativeIds* row_of(const uint16_t (&ids)[kIds], bool nearest) {
  std::span<const NativeIds> rows = kRows;
  for (unsigned i = 0; i < kIds; ++i) {
    auto fits = [&](const NativeIds& row) { return row.ids[i] == ids[i]; };
    auto first = std::find_if(rows.begin(), rows.end(), fits);
    if (first == rows.end()) return nearest ? rows.data() : nullptr;
    rows = {first, std::find_if_not(first, rows.end(), fits)};
  }
  return rows.data();
}

uint16_t id_of(const LXObjEntry* entry) { return entry != nullptr ? entry->id : uint16_t{0}; }

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" int32_t LXConvertLocale(LXLocale* locale, char* buffer, uint32_t options) noexcept {
  return locale_call(trace_unit, __func__, locale, options, LX_NATIVE_INFO | LX_GET_SUBSTITUTE, int32_t{0},
                     [&](LocaleCall& call) -> int32_t {
                       if (buffer == nullptr) return call.fail(LX_E_ARGUMENT, 0);
                       const LXLocale& of = call.locale;
                       const NativeIds* row =
                           row_of({id_of(of.language), id_of(of.territory), id_of(of.code_page), id_of(of.sort)},
                                  (options & LX_GET_SUBSTITUTE) != 0);
                       if (row == nullptr) return call.fail(LX_E_NATIVE, 0);
                       std::strcpy(buffer, row->native);
                       return 1;
                     });
}
