// SPDX-License-Identifier: Apache-2.0
#include "support/locale_model.hpp"

#include <algorithm>
#include <cstring>
#include <sstream>

#include "support/edge_buffer.hpp"

namespace lx::test {
namespace {

constexpr size_t kRoom = 4096;

bool is_name(uint32_t item) { return item == 2 || item == 6 || item == 10 || (item >= 12 && item <= 15); }

// One that a locale has a copy of.
bool is_own_text(uint32_t item) {
  return is_separator(item) || item == 62 || item == 64 || item == 68 || item == 71 || item == 72 ||
         (item >= 79 && item <= 81);
}

std::u16string ascii(std::string_view text) { return std::u16string(text.begin(), text.end()); }

// The largest number of characters that leave room for the terminator.
size_t that_fit(const std::vector<Units>& prefixes, size_t room, bool characters) {
  size_t count = prefixes.size() - 1;
  while ((characters ? count : prefixes[count].size()) >= room) --count;
  return count;
}

// One call, into a room that ends at an unmapped page. Counted in characters, it is just what they need. `prefixes`
// spell the first characters, from none on.
std::string delivery_difference(LXLocale* locale, uint32_t item, const TextForm& form,
                                const std::vector<Units>& prefixes, int32_t size, uint32_t options) {
  static EdgeBuffer buffer(kRoom * 4);
  const bool characters = (options & LX_OPT_CHARS) != 0;
  Units written;
  int32_t count = 0;
  if (size > 0) {
    const size_t fit = that_fit(prefixes, static_cast<size_t>(size), characters);
    written = prefixes[fit];
    written.push_back(0);
    count = static_cast<int32_t>(characters ? fit + 1 : written.size());
  }
  const std::string bytes = form.raw(written);
  const size_t room = characters ? bytes.size() : static_cast<size_t>(size) * form.unit_size();
  char* at = buffer.room(room);
  int32_t got = form.get(locale, item, at, size, options);
  if (got == count && std::memcmp(at, bytes.data(), bytes.size()) == 0 && LXGetError(locale) == LX_OK) return "";
  std::ostringstream text;
  text << "text " << item << " options " << options << " size " << size << ": " << got << " "
       << hex(std::string_view(at, room)).substr(0, 120) << ", error " << LXGetError(locale) << ", not " << count << " "
       << hex(bytes).substr(0, 120);
  return text.str();
}

}  // namespace

// ---- Forms of text --------------------------------------------------------------------------------------------------

int32_t TextForm::get(LXLocale* l, uint32_t item, void* buffer, int32_t size, uint32_t options) const {
  if (kind == Form::wide) return LXGetLocaleTextInfoW(l, item, static_cast<LXWChar*>(buffer), size, options);
  if (kind == Form::ucs2) return LXGetLocaleTextInfoU(l, item, static_cast<LXUChar*>(buffer), size, options);
  if (kind == Form::plain) return LXGetLocaleTextInfo(l, item, static_cast<char*>(buffer), size, options);
  return LXGetLocaleTextInfoEx(l, item, static_cast<char*>(buffer), size, record, options);
}

int32_t TextForm::set(LXLocale* l, uint32_t item, const void* text, int32_t length, uint32_t options) const {
  if (kind == Form::wide) return LXSetLocaleTextInfoW(l, item, static_cast<const LXWChar*>(text), length, options);
  if (kind == Form::ucs2) return LXSetLocaleTextInfoU(l, item, static_cast<const LXUChar*>(text), length, options);
  if (kind == Form::plain) return LXSetLocaleTextInfo(l, item, static_cast<const char*>(text), length, options);
  return LXSetLocaleTextInfoEx(l, item, static_cast<const char*>(text), length, record, options);
}

Units TextForm::spell(const PageSource& own, std::u16string_view text) const {
  return spelled({kind, page != nullptr ? page : &own}, text);
}

std::vector<TextForm> text_forms(bool pages) {
  std::vector<TextForm> forms = {{"plain", Form::plain, nullptr, nullptr},
                                 {"W", Form::wide, nullptr, nullptr},
                                 {"U", Form::ucs2, nullptr, nullptr},
                                 {"Ex", Form::shifted, nullptr, nullptr}};
  for (uint16_t id : {uint16_t{LX_CP_UTF8}, uint16_t{37}, uint16_t{930}}) {
    const LXObjEntry* record = pages ? LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, id, 0, nullptr) : nullptr;
    if (record != nullptr) {
      forms.push_back({"Ex " + std::to_string(id), Form::shifted, &PageSource::of(id), record});
    }
  }
  return forms;
}

bool is_separator(uint32_t item) { return item >= 59 && item <= 67 && (item <= 61 || item >= 66); }

// ---- What a locale must report --------------------------------------------------------------------------------------

LocaleModel::LocaleModel(std::string_view language_name, std::string_view territory_name, std::string_view page_name)
    : language(&LocaleSource::of(LX_LANGUAGE, language_name)),
      territory(&LocaleSource::of(LX_TERRITORY, territory_name)),
      ids_{} {
  set_page(page_name);
}

LocaleModel LocaleModel::built_in() {
  LocaleModel model("English", "UnitedStates", "US-ASCII");
  std::fill(model.ids_, model.ids_ + 3, uint16_t{1});
  return model;
}

std::string LocaleModel::name() const { return language->name + "_" + territory->name + "." + page->name + "@Binary"; }

std::optional<std::u16string> LocaleModel::text(uint32_t item, bool own) const {
  if (own && texts.contains(item)) return texts.at(item);
  if (is_name(item) || item == kLastItem) {
    auto standard = [&](uint8_t type) { return LocaleSource::name_of(type, language->default_id(type)); };
    const bool built_in = ids_[0] != 0;
    const std::map<uint32_t, std::string> names = {
        {2, language->name},
        {6, territory->name},
        {10, page->name},
        {12, "Binary"},
        {13, standard(LX_TERRITORY)},
        {14, built_in ? "US-ASCII" : standard(LX_CODEPAGE)},
        {15, built_in || language->default_id(LX_SORT) == 0 ? "Binary" : standard(LX_SORT)},
        {kLastItem, name()}};
    return ascii(names.at(item));
  }
  const std::optional<std::u16string> text = language->text(item);
  return text ? text : territory->text(item);
}

std::optional<int32_t> LocaleModel::number(uint32_t item, bool own) const {
  if (own && numbers.contains(item)) return numbers.at(item);
  const std::map<uint32_t, int32_t> others = {{1, ids_[0] != 0 ? ids_[0] : language->id},
                                              {5, ids_[1] != 0 ? ids_[1] : territory->id},
                                              {9, ids_[2] != 0 ? ids_[2] : page->id},
                                              {11, 0},
                                              {85, page->max_length},
                                              {86, page->ascii_family},
                                              {87, page->mixed()}};
  return others.contains(item) ? others.at(item) : territory->number(item);
}

std::u16string LocaleModel::through_page(std::u16string_view text) const {
  std::u16string result;
  for (char16_t character : text) result += static_cast<char16_t>(page->decode(page->encode(character)));
  return result;
}

// ---- Comparison -----------------------------------------------------------------------------------------------------

std::string LocaleModel::difference(LXLocale* locale, bool every_size) const {
  for (uint32_t item = 0; item <= kLastItem + 1; ++item) {
    for (uint32_t source : {0u, 1u}) {
      std::optional<int32_t> wanted = number(item, source == 0);
      int32_t got = LXGetLocaleNumInfo(locale, item, source);
      uint32_t error = LXGetError(locale);
      if (got != wanted.value_or(-1) || error != (wanted ? LX_OK : LX_E_ITEM)) {
        return "number " + std::to_string(item) + " source " + std::to_string(source) + ": " + std::to_string(got) +
               " (error " + std::to_string(error) + "), not " + std::to_string(wanted.value_or(-1));
      }
    }
    std::string wrong = text_difference(locale, item, every_size);
    if (wrong.empty()) wrong = found_text_difference(locale, item);
    if (!wrong.empty()) return wrong;
  }
  char buffer[136];
  int32_t length = LXLocaleGetLocaleString(locale, buffer);
  if (length == static_cast<int32_t>(name().size()) && name() == buffer) return "";
  return "locale string " + std::to_string(length) + " " + buffer;
}

// The locale keeps one byte of a separator, which is what plain readers get.
Units LocaleModel::spelled(const TextForm& form, uint32_t item, bool own, std::u16string_view text) const {
  if (own && form.kind == Form::plain && is_separator(item) && !text.empty() && page->encode(text[0]).size() > 1) {
    return {page->substitution};
  }
  return form.spell(*page, text);
}

std::string LocaleModel::text_difference(LXLocale* locale, uint32_t item, bool every_size) const {
  const std::vector<TextForm> forms = text_forms();
  for (uint32_t object : {0u, LX_OPT_OBJECT}) {
    const std::optional<std::u16string> wanted = text(item, object == 0);
    const bool sizes = every_size && object == 0;  // the territory's texts are cut as all others are
    for (const TextForm& form : forms) {
      if (!wanted) {
        char untouched = 'u';
        if (form.get(locale, item, &untouched, 1, object) == -1 && LXGetError(locale) == LX_E_ITEM) continue;
        return name() + " has a text " + std::to_string(item);
      }
      // With room for all, nobody looks at the shorter ones.
      std::vector<Units> prefixes(wanted->size() + 1);
      for (size_t i = sizes ? 0 : wanted->size(); i <= wanted->size(); ++i) {
        prefixes[i] = spelled(form, item, object == 0, std::u16string_view(*wanted).substr(0, i));
      }
      const auto full = static_cast<int32_t>(prefixes.back().size() + 1);
      for (int32_t size = sizes ? 0 : full; size <= full + (sizes ? 1 : 0); ++size) {
        for (uint32_t characters : {0u, LX_OPT_CHARS}) {
          std::string wrong = delivery_difference(locale, item, form, prefixes, size, object | characters);
          if (!wrong.empty()) return name() + " " + form.name + " " + wrong;
        }
      }
    }
  }
  return "";
}

std::string LocaleModel::found_text_difference(LXLocale* locale, uint32_t item) const {
  static const std::vector<TextForm> forms = text_forms(false);
  for (int32_t own : {0, 1}) {
    std::optional<std::u16string> wanted = text(item, own != 0);
    if (item == kLastItem) wanted.reset();
    uint32_t wanted_form = !wanted                    ? 0
                           : is_name(item)            ? LX_FORM_NAME
                           : own && is_own_text(item) ? LX_FORM_CODEPAGE
                                                      : LX_FORM_UCS2;
    uint32_t form = 99;
    const void* got = LXLocaleGetTextItem(locale, item, own, &form);
    bool right = form == wanted_form && (got != nullptr) == (form != 0);
    if (right && got != nullptr) {
      const TextForm& kind = forms[form == LX_FORM_UCS2 ? 2 : 0];
      Units units = form == LX_FORM_NAME ? Units(wanted->begin(), wanted->end()) : spelled(kind, item, own, *wanted);
      units.push_back(0);
      const std::string bytes = kind.raw(units);
      right = std::memcmp(got, bytes.data(), is_separator(item) && own ? 1 : bytes.size()) == 0;
    }
    const LXUChar* got_u = LXLocaleGetTextItemU(locale, item, own, &form);
    bool right_u = form == (wanted ? LX_FORM_UCS2 : 0) && (got_u != nullptr) == wanted.has_value();
    if (right_u && got_u != nullptr) right_u = std::u16string(got_u, got_u + wanted->size() + 1) == *wanted + u'\0';
    if (!right || !right_u) {
      return name() + " found text " + std::to_string(item) + (right ? "U" : "") + " own " + std::to_string(own);
    }
  }
  return "";
}

}  // namespace lx::test
