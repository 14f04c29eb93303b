// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <map>
#include <string>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/json_output.hpp"
#include "tools/lexaro/library_session.hpp"
#include "tools/lexaro/object_names.hpp"
#include "tools/lexaro/terminal_text.hpp"

namespace lx::tool {
namespace {

struct Page {
  std::string name;
  uint16_t id = 0;
  Message trouble;  // why it could not be loaded
  LXCodePageInfo info{};
  std::vector<std::string> aliases;

  const char* kind() const {
    if (info.shift_sensitive) return "mixed";
    return info.max_length > 1 ? "multibyte" : "single-byte";
  }
  const char* family() const { return info.ascii_family ? "ASCII" : "EBCDIC"; }
};

using AliasMap = std::map<std::string, std::vector<std::string>>;

int32_t collect_alias(void* context, const char* alias, const char* page) {
  (*static_cast<AliasMap*>(context))[page].emplace_back(alias);
  return 1;
}

Page load_page(const std::string& name) {
  Page page;
  page.name = name;
  uint32_t rc = 0;
  LXObjEntry* entry = LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, name.c_str(), -1, 1, &rc);
  if (entry) {
    page.id = LXGetObjId(entry);
    entry = LXLoadObj(LXGetObjManager(), entry, &rc);
  }
  if (entry && rc == LX_OK) rc = LXGetCodePageInfo(entry, &page.info);
  if (!entry || rc != LX_OK) page.trouble = describe_status(rc);
  return page;
}

std::vector<Page> load_pages(bool aliases) {
  AliasMap by_page;
  if (aliases) LXEnumAliases(LXGetObjManager(), collect_alias, &by_page);
  std::vector<Page> pages;
  for (const std::string& name : object_names(LX_CODEPAGE)) {
    pages.push_back(load_page(name));
    pages.back().aliases = by_page[name];
  }
  return pages;
}

Json page_json(const Page& page, bool aliases) {
  Json json;
  json["id"] = page.id;
  json["name"] = page.name;
  if (!page.trouble.empty()) {
    json["error"] = page.trouble.english;
    return json;
  }
  json["kind"] = page.kind();
  json["family"] = page.family();
  json["max_length"] = page.info.max_length;
  json["substitution"] = page.info.substitution;
  if (aliases) json["aliases"] = page.aliases;
  return json;
}

// Words in lines of a fixed width, indented.
std::string wrapped(const std::vector<std::string>& words, std::size_t indent) {
  constexpr std::size_t kWidth = 100;
  std::string text;
  std::size_t column = kWidth;
  for (const std::string& word : words) {
    if (column + 1 + word.size() > kWidth) {
      text += (text.empty() ? "" : "\n") + std::string(indent, ' ');
      column = indent;
    } else {
      text += ' ';
      ++column;
    }
    text += word;
    column += word.size();
  }
  return text.empty() ? text : text + "\n";
}

std::string page_table(const std::vector<Page>& pages) {
  std::size_t width = 4;
  for (const Page& page : pages) width = std::max(width, page.name.size());
  const auto blanks = [](const std::string& cell, std::size_t columns) {
    const std::size_t taken = display_width(cell);
    return std::string(taken < columns ? columns - taken : 0, ' ');
  };
  const auto row = [&](const std::string& id, const std::string& name, const std::string& kind,
                       const std::string& family) {
    const std::string end = family.empty() ? "" : blanks(kind, 12) + " " + family;
    return blanks(id, 5) + id + "  " + name + blanks(name, width) + "  " + kind + end + "\n";
  };
  std::string text = row(message("ID").utf8, message("NAME").utf8, message("KIND").utf8, message("FAMILY").utf8);
  for (const Page& page : pages) {
    const std::string id = std::to_string(page.id);
    text += page.trouble.empty() ? row(id, page.name, message(page.kind()).utf8, page.family())
                                 : row(id, page.name, message("unusable: {0}", page.trouble).utf8, "");
    text += wrapped(page.aliases, 9);
  }
  return text;
}

}  // namespace

ExitStatus list_code_pages(const CommonOptions& common, bool aliases, bool json) {
  const LibrarySession session(common.locale_directory);
  const std::vector<Page> pages = load_pages(aliases);
  if (json) {
    Json list = Json::array();
    for (const Page& page : pages) list.push_back(page_json(page, aliases));
    print_json(list);
  } else {
    print_text(page_table(pages));
  }
  ExitStatus status = ExitStatus::kExact;
  for (const Page& page : pages) {
    if (page.trouble.empty()) continue;
    complain(message("code page {0}: {1}", page.name, page.trouble));
    status = ExitStatus::kCodePage;
  }
  return status;
}

}  // namespace lx::tool
