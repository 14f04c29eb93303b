// SPDX-License-Identifier: Apache-2.0
// The alias file: a line begins with the name of a code page, further names follow, also on lines that begin with
// white space.
#include "objects/aliases.hpp"

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <span>

#include "frame/call.hpp"
#include "frame/data_file.hpp"
#include "frame/environment.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "aliases", 0};

constexpr char kAliasFile[] = "alias.txt";
constexpr int32_t kAliasFileRoom = sizeof kAliasFile + 1;  // with its separator
constexpr size_t kMaxLine = 32767;
constexpr size_t kShortName = 8;  // names are longer on the average, so that one block takes all
constexpr int kRecordSize = 104;  // what the message about a failed allocation has always said

// By character: every start goes through all of the text.
constexpr auto kWhite = [] {
  std::array<bool, 256> white{};
  for (char character : {' ', '\t', '\r', '\n'}) white[static_cast<uint8_t>(character)] = true;
  return white;
}();

bool is_white(char character) { return kWhite[static_cast<uint8_t>(character)]; }

const char* text_at(const LXObjMgr& manager, uint32_t offset) { return manager.alias_text + offset; }

// The form in which an alias is shown.
class UpperCase {
 public:
  UpperCase(const LXObjMgr& manager, const Alias& alias) {
    std::transform(text_at(manager, alias.alias), text_at(manager, alias.alias) + alias.alias_length, text_,
                   [](char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - ('a' - 'A')) : c; });
  }
  const char* text() const { return text_; }

 private:
  char text_[kMaxAlias + 1] = {};
};

// Reads the manager's text in place: names are terminated where they stand.
class AliasReader {
 public:
  explicit AliasReader(LXObjMgr& manager) : manager_(manager) {}

  // There is room for one character more than `length`.
  bool read(size_t length) {
    char* text = manager_.alias_text;
    char* end = text + length;
    *end = '\n';
    expected_ = length / kShortName + 1;
    while (text < end) {
      auto* line_end = static_cast<char*>(std::memchr(text, '\n', static_cast<size_t>(end - text) + 1));
      auto line_length = static_cast<size_t>(line_end - text);
      if (line_length > kMaxLine || std::memchr(text, '\0', line_length) != nullptr) return false;
      if (!read_line(text, line_end)) return false;
      text = line_end + 1;
    }
    return true;
  }

 private:
  struct Token {
    char* text;
    size_t length;
  };

  bool read_line(char* at, char* end) {
    if (at == end || *at == '#') return true;
    bool continues = *at == ' ' || *at == '\t';
    Token token = next_token(at, end);
    if (token.length == 0) return true;
    if (!continues) code_page_ = nullptr;
    if (code_page_ == nullptr) {
      if (!begin_code_page(token, continues)) return false;
      token = next_token(at, end);
    }
    for (; token.length != 0; token = next_token(at, end)) {
      if (!add(token)) return false;
    }
    return true;
  }

  // There is white space at the end of every line. What is behind a token becomes its terminator.
  static Token next_token(char*& at, char* end) {
    while (at < end && is_white(*at)) ++at;
    char* begin = at;
    if (at == end) return {begin, 0};
    while (!is_white(*at)) ++at;
    auto length = static_cast<size_t>(at - begin);
    *at = '\0';
    if (at < end) ++at;
    return {begin, length};
  }

  bool begin_code_page(const Token& name, bool continues) {
    if (continues) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Codepage name %s does not start in column 1", name.text);
      return false;
    }
    if (name.length > kMaxCodePageName) {
      LX_TRACE(TRC1_LEVEL_ERROR, "codepage name length (%d) for %s exceeds maximum of %d",
               static_cast<int>(name.length), name.text, kMaxCodePageName);
      return false;
    }
    code_page_ = name.text;
    LX_TRACE(TRC1_LEVEL_DETAIL, "Processing codepage '%s'", code_page_);
    return true;
  }

  bool add(const Token& alias) {
    if (alias.length > kMaxAlias) {
      // The message names the limit of code page names; tools that read it know it so.
      LX_TRACE(TRC1_LEVEL_ERROR, "Alias name length (%d) for %s exceeds maximum of %d", static_cast<int>(alias.length),
               alias.text, kMaxCodePageName);
      return false;
    }
    if (manager_.alias_count == room_ && !make_room(alias)) return false;
    LX_TRACE(TRC1_LEVEL_DETAIL, "Processing alias '%s'", alias.text);
    Alias& record = manager_.aliases[manager_.alias_count++];
    record = {offset_of(code_page_), offset_of(alias.text), static_cast<uint8_t>(alias.length)};
    LX_TRACE(TRC1_LEVEL_DETAIL, "Saved alias %s, length = %d", UpperCase(manager_, record).text(),
             static_cast<int>(alias.length));
    return true;
  }

  bool make_room(const Token& alias) {
    const size_t room = room_ == 0 ? expected_ : room_ * 2;
    auto* more = static_cast<Alias*>(allocate(room * sizeof(Alias)));
    if (more == nullptr) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Unable to allocate %d bytes for codepage %s, alias %s", kRecordSize, code_page_,
               alias.text);
      return false;
    }
    std::copy_n(manager_.aliases, room_, more);
    Owned<Alias>(std::exchange(manager_.aliases, more));
    room_ = room;
    return true;
  }

  uint32_t offset_of(const char* name) const { return static_cast<uint32_t>(name - manager_.alias_text); }

  LXObjMgr& manager_;
  size_t expected_ = 0;  // records
  size_t room_ = 0;
  const char* code_page_ = nullptr;
};

std::span<const Alias> aliases_of(const LXObjMgr& manager) { return {manager.aliases, manager.alias_count}; }

// The text of the file, with room for one character more; null when it cannot be read whole.
Owned<char> load_text(const char* name, size_t& length) {
  uint32_t rc = LX_OK;
  DataFile file(name, rc);
  if (!file) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Open of %s failed, err = %d", name, static_cast<int>(rc));
    return {};
  }
  int32_t size = LXFileSize(file.get());
  if (size < 0) return {};
  length = static_cast<size_t>(size);
  auto text = Owned<char>::array(length + 1);
  if (!text || LXReadFile(file.get(), text.get(), static_cast<uint32_t>(size), &rc) != length || rc != LX_OK) return {};
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
    LXDestroyAliasList(manager);
    size_t length = 0;
    Owned<char> text = load_text(name, length);
    if (!text) return 1;
    manager->alias_text = text.give_up();
    return AliasReader(*manager).read(length) ? 0 : 1;
  });
}

const char* LXGetCodepageFromAlias(LXObjMgr* manager, const char* name) noexcept {
  return exported(trace_unit, __func__, [&]() -> const char* {
    if (manager == nullptr || name == nullptr) return nullptr;
    LX_TRACE(TRC1_LEVEL_PARAMETER, "Searching for %s.", name);
    size_t length = std::strlen(name);
    for (const Alias& alias : aliases_of(*manager)) {
      if (alias.alias_length != length) continue;
      if (compare_ignoring_case(text_at(*manager, alias.alias), name, length) != 0) continue;
      const char* code_page = text_at(*manager, alias.code_page);
      LX_TRACE(TRC1_LEVEL_PARAMETER, "%s -> %s", UpperCase(*manager, alias).text(), code_page);
      return code_page;
    }
    return nullptr;
  });
}

uint32_t LXDestroyAliasList(LXObjMgr* manager) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (manager == nullptr) return 0;
    Owned<Alias>(std::exchange(manager->aliases, nullptr));
    manager->alias_count = 0;
    Owned<char>(std::exchange(manager->alias_text, nullptr));
    return 0;
  });
}

int32_t LXEnumAliases(LXObjMgr* manager, LXEnumAliasFn callback, void* context) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (manager == nullptr || callback == nullptr) return 0;
    for (const Alias& alias : aliases_of(*manager)) {
      if (callback(context, UpperCase(*manager, alias).text(), text_at(*manager, alias.code_page)) == 0) break;
    }
    return 0;
  });
}

}  // extern "C"
