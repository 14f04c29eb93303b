// SPDX-License-Identifier: Apache-2.0
// The alias file: a line begins with the name of a code page, further names follow, also on lines that begin with
// white space.
#include "objects/aliases.hpp"

#include <cstdio>
#include <cstring>
#include <string_view>

#include "frame/call.hpp"
#include "frame/data_file.hpp"
#include "frame/environment.hpp"
#include "frame/text_view.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "aliases", 0};

constexpr char kAliasFile[] = "alias.txt";
constexpr int32_t kAliasFileRoom = sizeof kAliasFile + 1;  // with its separator
constexpr size_t kMaxLine = 32767;
constexpr int kRecordSize = 104;  // what the message about a failed allocation has always said
constexpr std::string_view kWhiteSpace = " \t\r\n";

int printed(std::string_view text) { return static_cast<int>(text.size()); }

class AliasReader {
 public:
  explicit AliasReader(LXObjMgr& manager) : tail_(&manager.aliases) {
    while (*tail_ != nullptr) tail_ = &(*tail_)->next;
  }

  bool read(std::string_view text) {
    while (!text.empty()) {
      size_t end = text.find('\n');
      std::string_view line = head(text, end);
      if (line.size() > kMaxLine || line.find('\0') != line.npos || !read_line(line)) return false;
      text = end == text.npos ? std::string_view() : tail(text, end + 1);
    }
    return true;
  }

 private:
  bool read_line(std::string_view line) {
    if (line.empty() || line[0] == '#' || line.find_first_not_of(kWhiteSpace) == line.npos) return true;
    bool continues = line[0] == ' ' || line[0] == '\t';
    if (!continues) code_page_ = {};
    std::string_view token = next_token(line);
    if (code_page_.empty()) {
      if (!begin_code_page(token, continues)) return false;
      token = next_token(line);
    }
    for (; !token.empty(); token = next_token(line)) {
      if (!add(token)) return false;
    }
    return true;
  }

  static std::string_view next_token(std::string_view& line) {
    line = tail(line, line.find_first_not_of(kWhiteSpace));
    std::string_view token = head(line, line.find_first_of(kWhiteSpace));
    line = tail(line, token.size());
    return token;
  }

  bool begin_code_page(std::string_view name, bool continues) {
    if (continues) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Codepage name %.*s does not start in column 1", printed(name), name.data());
      return false;
    }
    if (name.size() > kMaxCodePageName) {
      LX_TRACE(TRC1_LEVEL_ERROR, "codepage name length (%d) for %.*s exceeds maximum of %d", printed(name),
               printed(name), name.data(), kMaxCodePageName);
      return false;
    }
    code_page_ = name;
    LX_TRACE(TRC1_LEVEL_DETAIL, "Processing codepage '%.*s'", printed(name), name.data());
    return true;
  }

  bool add(std::string_view alias) {
    if (alias.size() > kMaxAlias) {
      // The message names the limit of code page names; tools that read it know it so.
      LX_TRACE(TRC1_LEVEL_ERROR, "Alias name length (%d) for %.*s exceeds maximum of %d", printed(alias),
               printed(alias), alias.data(), kMaxCodePageName);
      return false;
    }
    auto record = Owned<Alias>::zeroed();
    if (!record) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Unable to allocate %d bytes for codepage %.*s, alias %.*s", kRecordSize,
               printed(code_page_), code_page_.data(), printed(alias), alias.data());
      return false;
    }
    LX_TRACE(TRC1_LEVEL_DETAIL, "Processing alias '%.*s'", printed(alias), alias.data());
    std::memcpy(record->code_page, code_page_.data(), code_page_.size());
    for (size_t i = 0; i < alias.size(); ++i) {
      record->alias[i] = alias[i] >= 'a' && alias[i] <= 'z' ? static_cast<char>(alias[i] - ('a' - 'A')) : alias[i];
    }
    record->alias_length = static_cast<uint8_t>(alias.size());
    LX_TRACE(TRC1_LEVEL_DETAIL, "Saved alias %s, length = %d", record->alias, printed(alias));
    *tail_ = record.give_up();
    tail_ = &(*tail_)->next;
    return true;
  }

  Alias** tail_;
  std::string_view code_page_;
};

// The whole text of the file; `failed` tells an empty file from one that cannot be read.
Owned<char> load_text(const char* name, size_t& length, bool& failed) {
  uint32_t rc = LX_OK;
  length = 0;
  failed = true;
  DataFile file(name, rc);
  if (!file) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Open of %s failed, err = %d", name, static_cast<int>(rc));
    return {};
  }
  int32_t size = LXFileSize(file.get());
  if (size < 0) return {};
  Owned<char> text(static_cast<char*>(LXLoadFile(file.get(), 0, static_cast<uint32_t>(size), &rc)));
  length = text ? static_cast<size_t>(size) : 0;
  failed = rc != LX_OK;
  return text;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

char* LXGetAliasFileName(const char* directory, char* buffer, int32_t buffer_size) noexcept {
  return exported(trace_unit, __func__, [&]() -> char* {
    if (directory == nullptr || buffer == nullptr) return nullptr;
    if (!room_for(directory, kAliasFileRoom, buffer_size)) {
      complain_about_room(buffer_size, std::strlen(directory) + kAliasFileRoom);
      return nullptr;
    }
    const LXGlobals* area = live_globals();
    std::snprintf(buffer, static_cast<size_t>(buffer_size), "%s%s%s", directory,
                  area != nullptr ? area->directory_separator : "/", kAliasFile);
    return buffer;
  });
}

uint32_t LXBuildAliasList(LXObjMgr* manager) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (manager == nullptr) return 1;
    char name[sizeof manager->directory + kAliasFileRoom];
    if (LXGetAliasFileName(manager->directory, name, sizeof name) == nullptr) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Unable to generate alias file name");
      return 1;
    }
    size_t length = 0;
    bool failed = false;
    Owned<char> text = load_text(name, length, failed);
    if (failed) return 1;
    return AliasReader(*manager).read({text.get(), length}) ? 0 : 1;
  });
}

const char* LXGetCodepageFromAlias(LXObjMgr* manager, const char* name) noexcept {
  return exported(trace_unit, __func__, [&]() -> const char* {
    if (manager == nullptr || name == nullptr) return nullptr;
    LX_TRACE(TRC1_LEVEL_PARAMETER, "Searching for %s.", name);
    size_t length = std::strlen(name);
    for (const Alias* alias = manager->aliases; alias != nullptr; alias = alias->next) {
      if (alias->alias_length != length || compare_ignoring_case(alias->alias, name, length) != 0) continue;
      LX_TRACE(TRC1_LEVEL_PARAMETER, "%s -> %s", alias->alias, alias->code_page);
      return alias->code_page;
    }
    return nullptr;
  });
}

uint32_t LXDestroyAliasList(LXObjMgr* manager) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (manager == nullptr) return 0;
    for (Alias* alias = std::exchange(manager->aliases, nullptr); alias != nullptr;) {
      release(std::exchange(alias, alias->next));
    }
    return 0;
  });
}

int32_t LXEnumAliases(LXObjMgr* manager, LXEnumAliasFn callback, void* context) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (manager == nullptr || callback == nullptr) return 0;
    for (const Alias* alias = manager->aliases; alias != nullptr; alias = alias->next) {
      if (callback(context, alias->alias, alias->code_page) == 0) break;
    }
    return 0;
  });
}

}  // extern "C"
