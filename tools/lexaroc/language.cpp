// SPDX-License-Identifier: Apache-2.0
#include "language.hpp"

#include "field_file.hpp"
#include "text_pool.hpp"

namespace lx::compiler {

namespace {

constexpr const char* kDays[] = {"sun", "mon", "tue", "wed", "thu", "fri", "sat"};
constexpr unsigned kMonths = 13;

std::array<std::string, kLanguageTexts> make_text_keys() {
  std::array<std::string, kLanguageTexts> keys;
  auto key = keys.begin();
  for (const char* name : {"abbreviation", "own-name"}) *key++ = name;
  for (const char* prefix : {"day.", "abday."}) {
    for (const char* day : kDays) *key++ = std::string(prefix) + day;
  }
  for (const char* prefix : {"month.", "abmonth."}) {
    for (unsigned month = 1; month <= kMonths; ++month) *key++ = prefix + std::to_string(month);
  }
  for (const char* name : {"am", "pm"}) *key++ = name;
  return keys;
}

// Most calendars have no thirteenth month.
bool is_optional(const std::string& key) { return key == "month.13" || key == "abmonth.13"; }

// "00DF = 0053 0053": one or two characters on either side.
SpecialRow read_special(Cursor& cursor) {
  SpecialRow row;
  auto character = [&cursor] {
    Spot spot = cursor.spot();
    uint16_t c = cursor.unicode_escape();
    if (c == 0) throw SourceError(spot, "expected a character");
    return c;
  };
  row.key[0] = character();
  cursor.expect(U' ');
  if (cursor.peek() != U'=') {
    row.key[1] = character();
    cursor.expect(U' ');
  }
  cursor.expect(U'=');
  cursor.expect(U' ');
  row.value[0] = character();
  if (!cursor.done()) {
    cursor.expect(U' ');
    row.value[1] = character();
  }
  cursor.end();
  return row;
}

std::string write_special(const char* key, const SpecialRow& row) {
  auto side = [](const uint16_t(&c)[2]) { return hex_text(c[0], 4) + (c[1] == 0 ? "" : " " + hex_text(c[1], 4)); };
  return std::string(key) + " = " + side(row.key) + " = " + side(row.value) + "\n";
}

std::string special_bytes(const std::vector<SpecialRow>& rows) {
  std::string bytes;
  for (const SpecialRow& row : rows) bytes += bytes_of(SpecialPair{row.key[0], row.key[1], row.value[0], row.value[1]});
  return bytes;
}

std::vector<SpecialRow> unpack_special(std::string_view section, unsigned slot, unsigned count) {
  std::vector<SpecialRow> rows;
  if (count == 0) return rows;
  size_t offset = record_at<BeU16>(section, offsetof(LanguageHeader, text_offsets) + slot * sizeof(BeU16));
  for (unsigned i = 0; i < count; ++i, offset += sizeof(SpecialPair)) {
    auto pair = record_at<SpecialPair>(section, offset);
    rows.push_back({{pair.key1, pair.key2}, {pair.value1, pair.value2}});
  }
  return rows;
}

}  // namespace

const std::array<std::string, kLanguageTexts>& language_text_keys() {
  static const std::array<std::string, kLanguageTexts> keys = make_text_keys();
  return keys;
}

std::optional<Language> read_language(const SourceFile& source, Report& report) {
  size_t errors = report.count();
  FieldFile fields(source, {"special.upper", "special.lower"}, report);
  Language language;
  language.file = source.name();
  language.spots = fields.spots();
  language.id = fields.number("id");
  language.name = fields.name("name");
  language.default_territory = fields.number("default-territory");
  language.default_code_page = fields.number("default-codepage");
  language.default_sort = fields.number("default-sort");
  for (unsigned slot = 0; slot < kLanguageTexts; ++slot) {
    const std::string& key = language_text_keys()[slot];
    language.texts[slot] = fields.text(key, is_optional(key));
  }
  fields.read("special.upper", [&](Cursor& cursor) { language.upper_special.push_back(read_special(cursor)); });
  fields.read("special.lower", [&](Cursor& cursor) { language.lower_special.push_back(read_special(cursor)); });
  fields.end();
  if (report.count() != errors) return std::nullopt;
  return language;
}

std::string write_language(const Language& language) {
  std::string out = "id = " + std::to_string(language.id) + "\nname = " + language.name +
                    "\ndefault-territory = " + std::to_string(language.default_territory) +
                    "\ndefault-codepage = " + std::to_string(language.default_code_page) +
                    "\ndefault-sort = " + std::to_string(language.default_sort) + "\n";
  for (unsigned slot = 0; slot < kLanguageTexts; ++slot) {
    const std::string& key = language_text_keys()[slot];
    if (is_optional(key) && language.texts[slot].empty()) continue;
    out += key + " = " + write_text(language.texts[slot]) + "\n";
  }
  for (const SpecialRow& row : language.upper_special) out += write_special("special.upper", row);
  for (const SpecialRow& row : language.lower_special) out += write_special("special.lower", row);
  return out;
}

std::string pack_language(const Language& language) {
  LanguageHeader header{};
  header.default_territory = language.default_territory;
  header.default_code_page = language.default_code_page;
  header.default_sort = language.default_sort;
  header.upper_special_count = static_cast<uint16_t>(language.upper_special.size());
  header.lower_special_count = static_cast<uint16_t>(language.lower_special.size());
  // The slots of the special lists follow those of the texts, only as far as they are used.
  unsigned slots = !language.lower_special.empty() ? 2 : !language.upper_special.empty() ? 1 : 0;
  std::string upper = special_bytes(language.upper_special);
  std::string lower = special_bytes(language.lower_special);
  size_t start = sizeof header + slots * sizeof(BeU16);
  TextPool texts(start + upper.size() + lower.size());
  for (unsigned slot = 0; slot < kLanguageTexts; ++slot) header.text_offsets[slot] = texts.place(language.texts[slot]);
  std::string section(bytes_of(header));
  if (slots > 0) section += bytes_of(BeU16(static_cast<uint16_t>(upper.empty() ? 0 : start)));
  if (slots > 1) section += bytes_of(BeU16(static_cast<uint16_t>(start + upper.size())));
  return section + upper + lower + texts.bytes();
}

Language unpack_language(std::string_view section) {
  auto header = record_at<LanguageHeader>(section, 0);
  Language language;
  language.default_territory = header.default_territory;
  language.default_code_page = header.default_code_page;
  language.default_sort = header.default_sort;
  for (unsigned slot = 0; slot < kLanguageTexts; ++slot) {
    language.texts[slot] = text_at(section, header.text_offsets[slot]);
  }
  language.upper_special = unpack_special(section, kUpperSpecialSlot, header.upper_special_count);
  language.lower_special = unpack_special(section, kLowerSpecialSlot, header.lower_special_count);
  return language;
}

}  // namespace lx::compiler
