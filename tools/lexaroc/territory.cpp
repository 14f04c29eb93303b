// SPDX-License-Identifier: Apache-2.0
#include "territory.hpp"

#include "field_file.hpp"
#include "text_pool.hpp"

namespace lx::compiler {

namespace {

// "precedes 1 space 0 sign 3"
AmountForm read_amount_form(Cursor& cursor) {
  AmountForm form;
  auto field = [&cursor](const char* name, unsigned largest) {
    std::string prefix = std::string(name) + " ";
    if (!cursor.accept(prefix)) cursor.fail(tool::message("expected \"{0}\"", prefix + "N"));
    return cursor.decimal(largest);
  };
  form.symbol_precedes = field("precedes", 1) != 0;
  cursor.expect(U' ');
  form.symbol_spaced = field("space", 1) != 0;
  cursor.expect(U' ');
  form.sign_position = static_cast<uint8_t>(field("sign", 4));
  cursor.end();
  return form;
}

std::string write_amount_form(const AmountForm& form) {
  return "precedes " + std::to_string(form.symbol_precedes) + " space " + std::to_string(form.symbol_spaced) +
         " sign " + std::to_string(form.sign_position);
}

bool is_sign(TerritoryText text) {
  return text == TerritoryText::positive_sign || text == TerritoryText::negative_sign;
}

uint16_t flag(bool set, uint16_t bit) { return set ? bit : 0; }

}  // namespace

std::optional<Territory> read_territory(const SourceFile& source, Report& report) {
  size_t errors = report.count();
  FieldFile fields(source, {}, report);
  Territory territory;
  territory.file = source.name();
  territory.spots = fields.spots();
  territory.id = fields.number("id");
  territory.name = fields.name("name");
  for (unsigned i = 0; i < kSeparators; ++i) {
    fields.read(kSeparatorKeys[i], [&](Cursor& cursor) {
      Spot spot = cursor.spot();
      std::u16string text = read_text(cursor);
      if (text.size() > 1) throw SourceError(spot, "a separator is one character, or \"\" for none");
      territory.separators[i] = text.empty() ? u'\0' : text[0];
    });
  }
  for (unsigned i = 0; i < kTerritoryTexts; ++i) territory.texts[i] = fields.text(kTerritoryTextKeys[i]);
  territory.fraction_digits = fields.number("fraction-digits");
  territory.currency_digits = fields.number("mon-digits");
  territory.currency_intl_digits = fields.number("mon-digits-intl");
  fields.read("positive", [&](Cursor& cursor) { territory.positive = read_amount_form(cursor); });
  fields.read("negative", [&](Cursor& cursor) { territory.negative = read_amount_form(cursor); });
  territory.item58 = fields.number("item58", 1) != 0;
  territory.item82 = fields.number("item82", 1) != 0;
  territory.item83 = fields.number("item83", 1) != 0;
  territory.item84 = fields.number("item84");
  fields.end();
  if (report.count() != errors) return std::nullopt;
  return territory;
}

std::string write_territory(const Territory& territory) {
  std::string out;
  auto line = [&out](const char* key, const std::string& value) { out += std::string(key) + " = " + value + "\n"; };
  auto number = [&line](const char* key, unsigned value) { line(key, std::to_string(value)); };
  auto text = [&](TerritoryText which) {
    line(kTerritoryTextKeys[static_cast<unsigned>(which)], write_text(territory.text(which), is_sign(which)));
  };
  auto separator = [&](unsigned index) {
    char16_t c = territory.separators[index];
    line(kSeparatorKeys[index], write_text(std::u16string(c == 0 ? 0 : 1, c), true));
  };
  number("id", territory.id);
  line("name", territory.name);
  text(TerritoryText::abbreviation);
  text(TerritoryText::own_name);
  for (unsigned i : {0u, 1u, 2u}) separator(i);
  text(TerritoryText::grouping);
  number("fraction-digits", territory.fraction_digits);
  text(TerritoryText::currency);
  text(TerritoryText::currency_intl);
  for (unsigned i : {3u, 4u}) separator(i);
  text(TerritoryText::monetary_grouping);
  number("mon-digits", territory.currency_digits);
  number("mon-digits-intl", territory.currency_intl_digits);
  text(TerritoryText::positive_sign);
  text(TerritoryText::negative_sign);
  line("positive", write_amount_form(territory.positive));
  line("negative", write_amount_form(territory.negative));
  text(TerritoryText::time_format);
  text(TerritoryText::short_date);
  text(TerritoryText::long_date);
  number("item58", territory.item58);
  number("item82", territory.item82);
  number("item83", territory.item83);
  number("item84", territory.item84);
  return out;
}

std::string pack_territory(const Territory& territory) {
  TerritoryHeader header{};
  for (unsigned i = 0; i < kSeparators; ++i) header.separators[i] = territory.separators[i];
  header.fraction_digits = territory.fraction_digits;
  header.currency_digits = territory.currency_digits;
  header.currency_intl_digits = territory.currency_intl_digits;
  header.positive_sign_position = territory.positive.sign_position;
  header.negative_sign_position = territory.negative.sign_position;
  header.value84 = territory.item84;
  header.flags = static_cast<uint16_t>(flag(territory.item58, kTerritoryYesNo) |
                                       flag(territory.positive.symbol_precedes, kPositiveSymbolPrecedes) |
                                       flag(territory.positive.symbol_spaced, kPositiveSymbolSpaced) |
                                       flag(territory.negative.symbol_precedes, kNegativeSymbolPrecedes) |
                                       flag(territory.negative.symbol_spaced, kNegativeSymbolSpaced) |
                                       flag(territory.item82, kYesNo82) | flag(territory.item83, kYesNo83));
  TextPool texts(sizeof header);
  for (unsigned i = 0; i < kTerritoryTexts; ++i) header.text_offsets[i] = texts.place(territory.texts[i]);
  return std::string(bytes_of(header)) + texts.bytes();
}

Territory unpack_territory(std::string_view section) {
  auto header = record_at<TerritoryHeader>(section, 0);
  Territory territory;
  for (unsigned i = 0; i < kSeparators; ++i) territory.separators[i] = header.separators[i];
  territory.fraction_digits = header.fraction_digits;
  territory.currency_digits = header.currency_digits;
  territory.currency_intl_digits = header.currency_intl_digits;
  unsigned flags = header.flags;
  auto set = [flags](uint16_t bit) { return (flags & bit) != 0; };
  territory.positive = {set(kPositiveSymbolPrecedes), set(kPositiveSymbolSpaced), header.positive_sign_position};
  territory.negative = {set(kNegativeSymbolPrecedes), set(kNegativeSymbolSpaced), header.negative_sign_position};
  territory.item58 = set(kTerritoryYesNo);
  territory.item82 = set(kYesNo82);
  territory.item83 = set(kYesNo83);
  territory.item84 = header.value84;
  for (unsigned i = 0; i < kTerritoryTexts; ++i) territory.texts[i] = text_at(section, header.text_offsets[i]);
  return territory;
}

}  // namespace lx::compiler
