// SPDX-License-Identifier: Apache-2.0
// The system's locale names and what they mean, in their order.
#pragma once

#include <string>

namespace lx::test {

struct NativeRow {
  const char* native;
  const char* language;
  const char* territory;
  const char* code_page;
  const char* sort;

  std::string locale_name() const { return std::string(language) + "_" + territory + "." + code_page + "@" + sort; }
};

inline constexpr NativeRow kNativeRows[] = {
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

}  // namespace lx::test
