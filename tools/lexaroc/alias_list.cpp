// SPDX-License-Identifier: Apache-2.0
#include "alias_list.hpp"

#include <algorithm>
#include <set>

namespace lx::compiler {

std::string folded(const std::string& name) {
  std::string result = name;
  for (char& c : result) {
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
  }
  return result;
}

std::vector<Alias> read_aliases(const SourceFile& source, Report& report) {
  constexpr size_t kLongestName = 32;
  constexpr size_t kLongestAlias = 64;
  constexpr size_t kLongestLine = 32767;
  std::vector<Alias> aliases;
  std::set<std::string> seen;
  std::string code_page;
  source.for_each_line(report, [&](Cursor& cursor) {
    if (cursor.line().text.size() > kLongestLine) cursor.fail("the line is too long");
    if (cursor.peek() != U' ' && cursor.peek() != U'\t') {
      code_page = cursor.word("a code page name");
      if (code_page.size() > kLongestName) cursor.fail("the code page name is longer than 32 characters");
    } else if (code_page.empty()) {
      cursor.fail("aliases without a code page");
    }
    for (cursor.skip_blanks(); !cursor.done(); cursor.skip_blanks()) {
      Alias alias{code_page, "", cursor.spot()};
      alias.alias = cursor.word("an alias");
      if (alias.alias.size() > kLongestAlias) throw SourceError(alias.spot, "the alias is longer than 64 characters");
      if (!seen.insert(folded(alias.alias)).second)
        throw SourceError(alias.spot, tool::message("\"{0}\" is given twice", alias.alias));
      aliases.push_back(std::move(alias));
    }
  });
  return aliases;
}

}  // namespace lx::compiler
