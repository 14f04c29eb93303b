// SPDX-License-Identifier: Apache-2.0
// The code pages of the contest, under the name that each contender knows them by.
#pragma once

#include <bit>

namespace lx::bench {

enum class Script { latin, japanese, chinese, records };

struct Page {
  const char* name;
  const char* lexaro;  // null: UCS-2, which has no object
  const char* iconv;
  const char* icu;  // null: UCS-2, which is what ICU converts from and to
  Script script;
  bool shifted;  // text ends with a return to the single-byte state
};

inline constexpr bool kLittle = std::endian::native == std::endian::little;

inline constexpr Page kUtf8 = {"UTF-8", "UTF-8", "UTF-8", "UTF-8", Script::latin, false};
inline constexpr Page kUcs2 = {"UCS-2", nullptr, kLittle ? "UCS-2LE" : "UCS-2BE", nullptr, Script::latin, false};

inline constexpr Page kPages[] = {
    {"IBM-037", "IBM037", "IBM037", "ibm-37_P100-1995", Script::latin, false},
    {"IBM-273", "IBM273", "IBM273", "ibm-273_P100-1995", Script::latin, false},
    {"ISO-8859-1", "Latin1", "ISO-8859-1", "ISO-8859-1", Script::latin, false},
    {"MS932", "MS932", "CP932", "ibm-943_P15A-2003", Script::japanese, false},
    {"JapanEUC", "JapanEUC", "EUC-JP", "euc-jp-2007", Script::japanese, false},
    {"MS936", "MS936", "CP936", "windows-936-2000", Script::chinese, false},
    {"IBM-930", "IBM930", "IBM930", "ibm-930_P120-1999", Script::records, true},
};

inline bool is_ucs2(const Page& page) { return page.lexaro == nullptr; }

}  // namespace lx::bench
