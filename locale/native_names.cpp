// SPDX-License-Identifier: Apache-2.0
// The names that the operating system gives its locales, and what the library calls them.
#include <cstdio>
#include <string_view>

#include "frame/text_view.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "native_names", 0};

struct NativeName {
  std::string_view native;
  const char* language;
  const char* territory;
  const char* code_page;
  const char* sort;
};

// The first row that fits is taken, so the order counts. "Columbia" is the name of that object.
constexpr NativeName kNativeNames[] = {
    {"C", "English", "UnitedStates", "US-ASCII", "Binary"},
    {"cz", "Czech", "CzechRepublic", "ISO-8859-2", "Czech"},
    {"da", "Danish", "Denmark", "Latin1", "Danish"},
    {"de", "German", "Germany", "Latin1", "Default"},
    {"de_AT", "German", "Austria", "Latin1", "Default"},
    {"de_CH", "German", "German-Switzerland", "Latin1", "Default"},
    {"el", "Greek", "Greece", "ISO-8859-7", "Default"},
    {"en_AU", "English", "Australia", "Latin1", "Default"},
    {"en_CA", "English", "Canada", "Latin1", "Default"},
    {"en_IE", "English", "Ireland", "Latin1", "Default"},
    {"en_NZ", "English", "NewZealand", "Latin1", "Default"},
    {"en_UK", "English", "UnitedKingdom", "Latin1", "Default"},
    {"en_US", "English", "UnitedStates", "Latin1", "Default"},
    {"en_US.utf-8", "English", "UnitedStates", "UTF-8", "Default"},
    {"es", "Spanish", "Spain", "Latin1", "Spanish"},
    {"es_AR", "Spanish", "Argentina", "Latin1", "Spanish"},
    {"es_BO", "Spanish", "Bolivia", "Latin1", "Spanish"},
    {"es_CL", "Spanish", "Chile", "Latin1", "Spanish"},
    {"es_CO", "Spanish", "Columbia", "Latin1", "Spanish"},
    {"es_CR", "Spanish", "CostaRica", "Latin1", "Spanish"},
    {"es_EC", "Spanish", "Ecuador", "Latin1", "Spanish"},
    {"es_GT", "Spanish", "Guatemala", "Latin1", "Spanish"},
    {"es_MX", "Spanish", "Mexico", "Latin1", "Spanish"},
    {"es_NI", "Spanish", "Nicaragua", "Latin1", "Spanish"},
    {"es_PA", "Spanish", "Panama", "Latin1", "Spanish"},
    {"es_PE", "Spanish", "Peru", "Latin1", "Spanish"},
    {"es_PY", "Spanish", "Paraguay", "Latin1", "Spanish"},
    {"es_SV", "Spanish", "ElSalvador", "Latin1", "Spanish"},
    {"es_UY", "Spanish", "Uruguay", "Latin1", "Spanish"},
    {"es_VE", "Spanish", "Venezuela", "Latin1", "Spanish"},
    {"et", "Estonian", "Estonia", "ISO-8859-2", "Czech"},
    {"fr", "French", "France", "Latin1", "Default"},
    {"fr_BE", "French", "French-Belgium", "Latin1", "Default"},
    {"fr_CA", "CanadianFrench", "French-Canada", "Latin1", "Default"},
    {"fr_CH", "French", "French-Switzerland", "Latin1", "Default"},
    {"hu", "Hungarian", "Hungary", "ISO-8859-2", "Default"},
    {"iso_8859_1", "English", "UnitedStates", "Latin1", "Binary"},
    {"it", "Italian", "Italy", "Latin1", "Default"},
    {"ja", "Japanese", "Japan", "JapanEUC", "Binary"},
    {"japanese", "Japanese", "Japan", "JapanEUC", "Binary"},
    {"ja_JP.PCK", "Japanese", "Japan", "MS932", "Binary"},
    {"ko", "Korean", "Korea", "MS949", "Binary"},
    {"ko.UTF-8", "Korean", "Korea", "UTF-8", "Binary"},
    {"lt", "Lithuanian", "Lithuania", "ISO-8859-4", "Lithuanian"},
    {"lv", "Latvian", "Latvia", "ISO-8859-4", "Latvian"},
    {"nl", "Dutch", "Netherlands", "Latin1", "Default"},
    {"nl_BE", "Dutch", "Dutch-Belgium", "Latin1", "Default"},
    {"no", "Norwegian", "Norway", "Latin1", "Danish"},
    {"pl", "Polish", "Poland", "ISO-8859-2", "Default"},
    {"POSIX", "English", "UnitedStates", "US-ASCII", "Binary"},
    {"pt", "Portuguese", "Portugal", "Latin1", "Default"},
    {"pt_BR", "Portuguese", "Brazil", "Latin1", "Default"},
    {"ru", "Russian", "Russia", "ISO-8859-5", "Default"},
    {"su", "Finnish", "Finland", "Latin1", "Finnish"},
    {"sv", "Swedish", "Sweden", "Latin1", "Swedish"},
    {"tr", "Turkish", "Turkey", "ISO-8859-9", "Default"},
    {"tw", "TraditionalChinese", "Taiwan", "EUC-TW", "Binary"},
    {"zh", "SimplifiedChinese", "China", "MS936", "Binary"},
    {"zh_TW", "TraditionalChinese", "Taiwan", "EUC-TW", "Binary"},
    {"zh_TW.BIG5", "TraditionalChinese", "Taiwan", "MS950", "Binary"},
};

constexpr NativeName kUnknown = {"", "Unknown", "Unknown", "Unknown", "Unknown"};

const NativeName& row_of(std::string_view native) {
  for (const NativeName& row : kNativeNames) {
    if (row.native == native) return row;
  }
  return kUnknown;
}

void write_name(char* buffer, int32_t size, const NativeName& language, const NativeName& territory,
                const NativeName& code_page, const NativeName& sort) {
  std::snprintf(buffer, static_cast<size_t>(size), "%s_%s.%s@%s", language.language, territory.territory,
                code_page.code_page, sort.sort);
}

// A name for each category: the first is the code page's, then come territory, language and sort.
void map_composite(std::string_view names, char* buffer, int32_t size) {
  const NativeName* rows[4];
  for (const NativeName*& row : rows) {
    names = tail(names, 1);
    std::string_view name = head(names, names.find('/'));
    names = tail(names, name.size());
    row = &row_of(name);
  }
  write_name(buffer, size, *rows[2], *rows[1], *rows[0], *rows[3]);
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" char* LXMapNativeLocale(const char* native_name, char* buffer, int32_t size) noexcept {
  return exported(trace_unit, __func__, [&] {
    if (native_name == nullptr || buffer == nullptr || size < 1) return buffer;
    std::string_view name = native_name;
    if (*native_name == '/') {
      map_composite(name, buffer, size);
      return buffer;
    }
    LX_TRACE(TRC1_LEVEL_DETAIL, "Searching for %s", native_name);
    const NativeName& row = row_of(name);
    if (&row == &kUnknown) {
      std::snprintf(buffer, static_cast<size_t>(size), "%s", kUnknown.language);
    } else {
      write_name(buffer, size, row, row, row, row);
    }
    return buffer;
  });
}

extern "C" int32_t LXEnumNativeNames(LXEnumNativeFn callback, void* context) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (callback == nullptr) return 0;
    for (const NativeName& row : kNativeNames) {
      char name[kLocaleNameRoom];
      write_name(name, kLocaleNameRoom, row, row, row, row);
      if (callback(context, row.native.data(), name) == 0) break;
    }
    return 0;
  });
}
