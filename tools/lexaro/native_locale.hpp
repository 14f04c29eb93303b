// SPDX-License-Identifier: Apache-2.0
// System names of locales, as the library knows them and as systems of today spell them.
#pragma once

#include <optional>
#include <string>
#include <vector>
#include "tools/messages/message.hpp"

namespace lx::tool {

struct NativeLocale {
  std::string locale_name;      // of parts that the locale data have
  bool listed = true;           // the library's table has this very name
  std::vector<Message> missed;  // what of the name is not reflected: "sort Default", "territory LU"

  bool exact() const { return listed && missed.empty(); }
};

// "de_CH", "de_CH.UTF-8@euro", "/ja/C/de/C" (code page, territory, language and sort from one name each). A name that
// the library's table lacks is taken apart: language and territory by the table or by their ISO codes, the code set as
// a code page. Nothing when the locale data lack its language.
std::optional<NativeLocale> find_native_locale(const std::string& native_name);

}  // namespace lx::tool
