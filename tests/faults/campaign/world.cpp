// SPDX-License-Identifier: Apache-2.0
#include "faults/campaign/world.hpp"

#include <unistd.h>

#include <algorithm>
#include <bit>
#include <cstring>
#include <sstream>

#include "faults/campaign/entry.hpp"
#include "support/object_builder.hpp"

namespace lx::test {
namespace {

// A set with one message, as the files have it.
std::string catalog_image() {
  const std::string locale = "English_UnitedStates.UTF-8@BINARY";
  const uint32_t head[] = {0x4C78F463, 0x10000000, static_cast<uint32_t>(LXMcGetByteOrder()), 1, 152};
  const uint32_t set[] = {1, 197, 1, 180, 192, 5, 0, 1, 5, 0};  // with its index
  std::string image(reinterpret_cast<const char*>(head), sizeof head);
  image += locale + std::string(132 - locale.size(), '\0');
  return image.append(reinterpret_cast<const char*>(set), sizeof set) + "Hello";
}

// Where files are made, also those with names that nobody would choose.
const DataDirectory& directory() {
  static const DataDirectory made;
  static const bool filled = [] {
    made.write("file", "some bytes to read, more than sixteen");
    made.write("catalog", catalog_image());
    return chdir(made.path()) == 0;
  }();
  return filled ? made : made;
}

}  // namespace

std::string raw_number(int64_t value, size_t size) {
  std::string bytes(reinterpret_cast<const char*>(&value), sizeof value);
  return std::endian::native == std::endian::little ? bytes.substr(0, size) : bytes.substr(sizeof value - size);
}

std::vector<Role> roles_of(const char* description) {
  std::vector<Role> roles;
  std::istringstream words(description);
  for (std::string word; words >> word && word[0] != '>';) {
    const size_t flags_end = std::min(word.find(':'), word.size());
    const std::string flags = word.substr(1, flags_end - 1);
    roles.push_back({word[0], flags.find('?') != flags.npos, flags.find('-') != flags.npos,
                     word.substr(std::min(flags_end + 1, word.size()))});
  }
  return roles;
}

char result_in(const char* description, char other) {
  const char* at = std::strchr(description, '>');
  return at != nullptr ? at[1] : other;
}

std::string name_in(const char* signature) {
  std::string_view text = signature;
  text.remove_prefix(text.find("kFunction = ") + 12);
  text.remove_prefix(text[0] == '&');
  return std::string(text.substr(0, text.find_first_of(";,]")));
}

Table joined(std::initializer_list<Table> tables) {
  Table all;
  for (const Table& table : tables) all.insert(all.end(), table.begin(), table.end());
  return all;
}

bool Entry::has(char letter) const {
  return std::any_of(roles.begin(), roles.end(), [&](const Role& role) { return role.letter == letter; });
}

CountingAllocator& memory() {
  static CountingAllocator allocator;
  return allocator;
}

Wire& Wire::get() {
  static Wire wire;
  return wire;
}

int32_t Wire::move(void* context, void* buffer, int32_t count) {
  auto& self = *static_cast<Wire*>(context);
  if (self.fail_at >= 0 && self.fail_at-- == 0) {
    self.failed = true;
    return self.failure == INT32_MAX ? count + 1 : self.failure;
  }
  if (self.bytes.empty()) return count;  // written
  size_t moved = self.bytes.copy(static_cast<char*>(buffer), static_cast<size_t>(count), self.at);
  self.at += moved;
  return moved != 0 ? static_cast<int32_t>(moved) : -1;
}

World::World(const char* name) : page_name(name) {
  directory();
  memory().init(LEXARO_DATA);
  manager = LXGetObjManager();
  locale = LXGetLocale(("German_Germany." + page_name + "@Default").c_str(), 0, nullptr);
  other = LXGetLocale("French_France.UTF-8@BINARY", 0, nullptr);
  page = LXGetLocaleObject(locale, LX_CODEPAGE);
  language = LXGetLocaleObject(locale, LX_LANGUAGE);
  sort = LXGetLocaleObject(locale, LX_SORT);
  other_page = LXGetObjFromName(manager, LX_CODEPAGE, "IBM930", -1, 0, nullptr);
}

World::~World() {
  LXReleaseLocale(locale, 0);
  LXReleaseLocale(other, 0);
  LXTerm();
}

LXLocale* World::own_locale() const {
  LXLocale* made = LXGetLocale(("German_Germany." + page_name + "@Default").c_str(), 0, nullptr);
  for (uint32_t item : {LX_ITEM_GROUPING, LX_ITEM_CURRENCY}) LXSetLocaleTextInfo(made, item, "x", 1, 0);
  LXSetLocaleNumInfo(made, LX_ITEM_FRACTION_DIGITS, 4);
  return made;
}

std::string World::encoded(size_t unit, const std::u16string& characters) const {
  const auto* in = reinterpret_cast<const LXUChar*>(characters.data());
  auto length = static_cast<int32_t>(characters.size());
  std::string out(characters.size() * 8, '\0');
  auto room = static_cast<int32_t>(out.size() / unit);
  int32_t units = length;
  if (unit == 1) units = LXUnicodeToStringEx(locale, out.data(), 0, room, in, length, 0);
  if (unit == 2) std::memcpy(out.data(), in, characters.size() * 2);
  if (unit == 4) units = LXUnicodeToStringW(locale, reinterpret_cast<LXWChar*>(out.data()), room, in, length, 0);
  out.resize(static_cast<size_t>(std::max(units, 0)) * unit);
  return out;
}

const std::string& World::text(size_t unit, const std::string& value) {
  auto [at, added] = texts_.try_emplace({unit, value});
  if (!added) return at->second;
  const bool ascii = value[0] == '=';
  std::string plain = value.substr(ascii);
  if (plain[0] == '$') {
    plain = plain == "$data" ? LEXARO_DATA : directory().file(plain.substr(1));
  } else {
    std::replace(plain.begin(), plain.end(), '_', ascii ? '_' : ' ');
  }
  std::u16string characters(plain.begin(), plain.end());
  if (value.empty()) characters = u"Ab,c 12\u00E9\u3042\u4E00\u03B1 Zz ";
  if (!ascii) return at->second = encoded(unit, characters);
  for (char byte : plain) at->second += raw_number(byte, unit);
  return at->second;
}

const std::string& World::hostile(size_t unit) const {
  static const std::string kBytes = "\x81\x0E\x41\x40\xFF\x8F\xE3\x82\x0F\x0E\xC3%\x6C\x8E\x0E\xE3";
  static const std::u16string kUnits = u"\xD800\xFFFF\u00DF\u030C\xFFFE\u3042\u0130\x7F%";
  static const std::u32string kWide = U"\x0E\xFFFFFFFF\x41004100\x8FA1A1\x81%\x6C\x110000";
  static const std::string kRaw[] = {{reinterpret_cast<const char*>(kUnits.data()), kUnits.size() * 2},
                                     {reinterpret_cast<const char*>(kWide.data()), kWide.size() * 4}};
  return unit == 1 ? kBytes : kRaw[unit / 4];
}

}  // namespace lx::test
