// SPDX-License-Identifier: Apache-2.0
#include "collate/sort_model.hpp"

#include <algorithm>
#include <filesystem>

namespace lx::test {
namespace {

constexpr unsigned kAll = mask_flags(15);
constexpr unsigned kHeaderSize = 1036;

void put_entry(Image& image, const SortSpec::Entry& entry) {
  image.u16(image.size(), entry.weight);
  image.u8(image.size(), entry.secondary);
  image.u8(image.size(), entry.tertiary);
  image.u16(image.size(), entry.flags);
}

}  // namespace

Bytes SortSpec::section() const {
  Image image(kHeaderSize);
  image.u8(0, default_secondary);
  image.u8(1, default_tertiary);
  image.u16(2, static_cast<unsigned>(expansions.size()));
  image.u16(4, static_cast<unsigned>(combinations.size()));
  unsigned tabulated = 0;
  image.u16(1030, kHeaderSize);
  for (unsigned high = 0; high < 256; ++high) {
    const Page& page = pages[high];
    image.u8(6 + 4 * high, page.flags);
    image.u8(7 + 4 * high, page.mask);
    bool has_table = (page.flags & (kEmptyPage | kPrimaryPage | kSpecialPage)) == 0;
    image.u16(8 + 4 * high, has_table ? 256 * tabulated++ : page.base);
    for (unsigned low = 0; has_table && low < 256; ++low) {
      auto found = entries.find(static_cast<char16_t>(high << 8 | low));
      put_entry(image, found != entries.end() ? found->second : Entry{});
    }
  }
  image.u16(1032, static_cast<unsigned>(image.size()));
  for (const Expansion& row : expansions) {
    image.u16(image.size(), row.character);
    for (const Entry& set : {row.first, row.second}) {
      image.u16(image.size(), set.weight);
      image.u8(image.size(), set.secondary);
      image.u8(image.size(), set.tertiary);
    }
    image.u32(image.size(), 0xEEEEEEEE);  // not for comparison
  }
  image.u16(1034, static_cast<unsigned>(image.size()));
  for (const Combination& row : combinations) {
    image.u16(image.size(), row.first);
    image.u16(image.size(), row.second);
    put_entry(image, row.entry);
  }
  return image.bytes();
}

SortSpec test_sort(const std::string& name) {
  SortSpec sort;
  sort.pages[0x00] = sort.pages[0x01] = sort.pages[0x03] = {0, 0, 0};
  sort.pages[0x30] = {kPrimaryPage, 15, 0x3000};
  sort.pages[0x31] = {kSpecialPage, 15, 0x0500};
  sort.pages[0x4E] = {kPrimaryPage | kSpecialPage, 0xF7, 0xFFFC};  // its weights pass the highest number
  sort.pages[0x50] = {kSpecialPage, 0x0E, 0x0600};
  sort.pages[0x51] = {kEmptyPage | kPrimaryPage, 15, 0x0700};
  constexpr unsigned k7 = mask_flags(7), k9 = mask_flags(9), k10 = mask_flags(10), k11 = mask_flags(11);
  constexpr unsigned kSpecial = kIsSpecial | kAll, kSpecial14 = kIsSpecial | mask_flags(14);
  constexpr unsigned kExpandsAll = kExpands | kAll, kExpandsSpecial = kExpandsAll | kIsSpecial,
                     kExpands7 = kExpands | k7;
  using Entries = std::map<char16_t, SortSpec::Entry>;
  const Entries in_order = {
      {u' ', {0x100, 0x20, 2, kAll}}, {u'a', {0x110, 0x20, 2, kAll}},  {u'A', {0x110, 0x20, 4, kAll}},
      {u'b', {0x112, 0x20, 2, kAll}}, {u'B', {0x112, 0x21, 2, kAll}},  {u'c', {0x114, 0x20, 2, kAll}},
      {u'S', {0x130, 0x20, 4, kAll}}, {u's', {0x130, 0x20, 2, kAll}},  {u'I', {0x120, 0x20, 4, kAll}},
      {u'i', {0x120, 0x20, 2, kAll}}, {0x130, {0x121, 0x20, 4, kAll}}, {0xDF, {0x135, 0x20, 2, kAll}}};
  const Entries backwards = {{u'e', {0x116, 0x24, 3, k11}},
                             {u'f', {0x116, 0x25, 4, k9}},
                             {u'p', {0x117, 0x20, 2, k7}},
                             {u'q', {0x118, 0x22, 3, k7}},
                             {u'Q', {0x117, 0x22, 4, 0}}};
  const Entries without_some = {
      {u'-', {0x11, 9, 9, kSpecial}}, {u'+', {0x12, 0, 0, kSpecial}}, {u'*', {0x13, 0, 0, kSpecial14}},
      {u'm', {0, 0x30, 3, kAll}},     {0x307, {0, 0x34, 3, kAll}},    {u'n', {0, 0x31, 2, k11}},
      {u'd', {0, 0x20, 0, kAll}},     {u't', {0, 0, 7, kAll}},        {u'0', {0, 0, 0, kAll}}};
  const Entries expanding = {{u'x', {0x7777, 7, 7, kExpandsSpecial}},
                             {u'y', {0, 0, 0, kExpands7}},
                             {u'w', {0, 0, 0, kExpandsAll}},
                             {u'z', {0x119, 0x20, 2, kExpands | k10}}};  // has no row
  for (const Entries& entries : {in_order, backwards, without_some, expanding}) {
    sort.entries.insert(entries.begin(), entries.end());
  }
  sort.expansions = {{u'y', {0x0110, 0x20, 2}, {0x0112, 0x21, 2}},
                     {u'x', {0x0110, 0x20, 2}, {0x0112, 0x21, 2}},
                     {u'x', {0x0999, 0x20, 2}, {0x0999, 0x21, 2}},
                     {u'w', {0, 0x33, 0}, {0x0112, 0, 2}}};
  sort.combinations = {{u'c', u'b', {0x0115, 0x20, 2, kAll}},
                       {u'c', u'B', {0x0111, 0x20, 2, kAll}},  // before both of its letters
                       {u'c', u'c', {0x0113, 0x26, 5, mask_flags(0xB)}},
                       {u'c', u'-', {0x0040, 1, 1, kIsSpecial | kExpands | kAll}},
                       {u'c', u'b', {0x0999, 0x20, 2, kAll}},
                       {u'a', 0x3041, {0x0111, 0x26, 5, mask_flags(0x1)}},
                       {u'c', 0xFFFF, {0x0111, 0x20, 2, kAll}}};
  if (name == "Plain") sort.combinations.clear();
  if (name == "Forward") {
    for (auto& [character, entry] : sort.entries) entry.flags |= kAll;
    for (SortSpec::Combination& pair : sort.combinations) pair.entry.flags |= kAll;
  }
  return sort;
}

void write_collation_directory(const DataDirectory& directory) {
  std::vector<ObjectRecord> records = {
      {LX_LANGUAGE, 1, "English"},     {LX_LANGUAGE, 2, "German"},       {LX_LANGUAGE, 39, "Turkish"},
      {LX_LANGUAGE, 30, "Lithuanian"}, {LX_TERRITORY, 442, "Lithuania"}, {LX_TERRITORY, 840, "UnitedStates"},
      {LX_TERRITORY, 276, "Germany"},  {LX_TERRITORY, 792, "Turkey"},    {LX_CODEPAGE, 819, "Latin1"},
      {LX_CODEPAGE, 930, "IBM930"},    {LX_CODEPAGE, 954, "JapanEUC"},   {LX_CODEPAGE, 964, "EUC-TW"},
      {LX_CODEPAGE, 57352, "UTF-8"}};
  for (const ObjectRecord& record : records) {
    std::string name = directory.object_name(record.type, record.id);
    std::filesystem::copy_file(std::string(LEXARO_DATA) + "/" + name, directory.file(name));
  }
  for (const auto& [id, name] : {std::pair(uint16_t{77}, "Plain"), {78, "Combining"}, {79, "Forward"}}) {
    records.push_back({LX_SORT, id, name});
    directory.write_object(LX_SORT, id, test_sort(name).file());
  }
  directory.write_control(records);
}

// ---- Weights ----

namespace {

ModelWeights entry_weights(const SortSpec::Entry& entry) {
  const int mask = static_cast<int>(entry.flags >> 10 & 15);
  if ((entry.flags & kIsSpecial) != 0) return {{{0, 0, 0, entry.weight}}, mask};
  return {{{entry.weight, entry.secondary, entry.tertiary, 0}}, mask};
}

}  // namespace

ModelWeights model_weights(const SortSpec& sort, char16_t character) {
  const SortSpec::Page& page = sort.pages[character >> 8];
  if ((page.flags & kEmptyPage) != 0) return {};
  unsigned by_rule = (page.base + (character & 0xFFu)) & 0xFFFF;
  int page_mask = static_cast<int>(page.mask & 15);
  if ((page.flags & kPrimaryPage) != 0) return {{{by_rule, 0, 0, 0}}, page_mask};
  if ((page.flags & kSpecialPage) != 0) return {{{0, 0, 0, by_rule}}, page_mask};
  auto found = sort.entries.find(character);
  ModelWeights weights = entry_weights(found != sort.entries.end() ? found->second : SortSpec::Entry{});
  if (found == sort.entries.end() || (found->second.flags & kExpands) == 0) return weights;
  weights.sets.clear();
  for (const SortSpec::Expansion& row : sort.expansions) {
    if (row.character != character) continue;
    for (const SortSpec::Entry& set : {row.first, row.second}) {
      weights.sets.push_back({set.weight, set.secondary, set.tertiary, 0});
    }
    break;
  }
  return weights;
}

bool model_combination(const SortSpec& sort, char16_t first, char16_t second, ModelWeights& weights) {
  for (const SortSpec::Combination& row : sort.combinations) {
    if (row.first != first || row.second != second) continue;
    weights = entry_weights(row.entry);
    return true;
  }
  return false;
}

ModelReader::ModelReader(const SortSpec& sort, const Form& form, const Units& text)
    : sort_(&sort), form_(form), text_(characters_of(form, text)) {
  now.remaining = static_cast<int32_t>(text.size());
  now.state = form.state;
}

bool ModelReader::read(char16_t& character) {
  bool found = at_ < text_.list.size();
  auto offset = static_cast<int32_t>(found ? text_.list[at_].own_end() : text_.whole);
  now.state = found ? text_.list[at_].state : text_.state;
  now.remaining -= offset - now.offset;
  now.offset = offset;
  if (found) character = unicode_of(form_, text_.list[at_++]);
  return found;
}

ModelWeights ModelReader::next() {
  char16_t current = now.pending;
  if (now.pending != 0xFFFF) {
    now.pending = 0xFFFF;
    --now.remaining;
  } else {
    if (!read(current)) {
      now.remaining = 0;
      return {};
    }
    ++now.position;
  }
  const Reading before = now;
  char16_t second = 0;
  if (!sort_->combinations.empty() && now.remaining > 0 && read(second)) {
    ModelWeights weights;
    if (model_combination(*sort_, current, second, weights)) {
      ++now.position;
      return weights;
    }
    if (second == 0xFFFF) {  // it could not be told from none, and stays in the text until it is its turn
      now = before;
      --at_;
    } else {
      now.pending = second;
      ++now.remaining;
    }
  }
  return model_weights(*sort_, current);
}

void ModelLevels::file(const ModelSet& set, uint16_t position, int mask) {
  if (set.primary != 0) primary.file(set.primary, (mask & 8) != 0);
  if (set.secondary != 0) secondary.file(set.secondary, (mask & 4) != 0);
  if (set.tertiary != 0) tertiary.file(set.tertiary, (mask & 2) != 0);
  if (set.special != 0) special.file({position, set.special}, (mask & 1) != 0);
}

std::string model_key(const SortSpec& sort, std::u16string_view text) {
  ModelLevels levels;
  for (size_t i = 0; i < text.size(); ++i) {
    auto position = static_cast<uint16_t>(i + 1);
    ModelWeights weights = model_weights(sort, text[i]);
    if (i + 1 < text.size() && model_combination(sort, text[i], text[i + 1], weights)) ++i;
    for (const ModelSet& set : weights.sets) levels.file(set, position, weights.mask);
  }
  auto& secondary = levels.secondary.list;
  auto& tertiary = levels.tertiary.list;
  while (!secondary.empty() && secondary.back() == sort.default_secondary) secondary.pop_back();
  while (!tertiary.empty() && tertiary.back() == sort.default_tertiary) tertiary.pop_back();
  std::string key;
  auto two_bytes = [&](unsigned value) { key += bytes_of_code(value, 2); };
  for (unsigned weight : levels.primary.list) two_bytes(weight);
  for (const auto& list : {secondary, tertiary, std::vector<unsigned>()}) {
    key += '\0';
    for (unsigned weight : list) key += static_cast<char>(weight);
  }
  bool alone = key.size() == 3;
  for (auto [position, weight] : levels.special.list) {
    if (!alone) two_bytes(position);
    two_bytes(weight);
  }
  return key;
}

namespace {

struct ModelSide {
  ModelReader reader;
  ModelLevels levels = {};
  std::vector<ModelSet> waiting = {};
  int mask = 0;

  // The next primary weight, everything before it filed; 0: the text has ended.
  unsigned next_primary() {
    while (!waiting.empty() || reader.more()) {
      if (waiting.empty()) {
        ModelWeights weights = reader.next();
        waiting = weights.sets;
        mask = weights.mask;
        continue;
      }
      ModelSet set = waiting.front();
      waiting.erase(waiting.begin());
      levels.file(set, reader.now.position, mask);
      if (set.primary != 0) return set.primary;
    }
    return 0;
  }
};

// Not by the operators of the lists, which the C++ library of GCC 12 gets wrong on big-endian machines.
template <class List>
int order(const List& a, const List& b) {
  auto less = [](const List& x, const List& y) {
    return std::lexicographical_compare(x.begin(), x.end(), y.begin(), y.end());
  };
  return less(b, a) - less(a, b);
}

}  // namespace

int model_compare(ModelReader first, ModelReader second) {
  ModelSide a{first}, b{second};
  bool in_order = true;
  for (;;) {
    unsigned x = a.next_primary(), y = b.next_primary();
    if ((x != 0 && (a.mask & 8) == 0) || (y != 0 && (b.mask & 8) == 0)) in_order = false;
    if (x == 0 && y == 0) break;
    if (!in_order) continue;
    if (x == 0 || y == 0) return x != 0 ? 1 : -1;
    if (x != y) return static_cast<int>(x) - static_cast<int>(y);
  }
  auto &p = a.levels.primary.list, &q = b.levels.primary.list;
  const size_t common = std::min(p.size(), q.size());
  p.resize(common), q.resize(common);  // where the shorter one ends, the other levels decide
  int result = order(p, q);
  if (result == 0) result = order(a.levels.secondary.list, b.levels.secondary.list);
  if (result == 0) result = order(a.levels.tertiary.list, b.levels.tertiary.list);
  return result != 0 ? result : order(a.levels.special.list, b.levels.special.list);
}

// ---- The library ----

Collation::Collation(Form::Kind kind, uint16_t page, const std::string& sort_name, LanguageIndex index)
    : form{kind, &PageSource::of(page)},
      sort(test_sort(sort_name)),
      language(test_languages()[index]),
      name(language.name + form.name() + "@" + sort_name) {
  uint32_t rc = 99;
  locale_.reset(LXGetLocale((language.name + form.page->name + "@" + sort_name).c_str(), 0, &rc));
  EXPECT_EQ(rc, LX_OK) << name;
}

std::u16string Collation::mapped(const Form& in, std::u16string_view text, uint32_t flags) const {
  TextCall call = {Function::map, in, spelled(in, text)};
  call.length = static_cast<int32_t>(call.text.size());
  call.size = 8 * call.length;
  call.options = flags;
  call.language = &language;
  Outcome outcome = map_model(call);
  outcome.memory.resize(static_cast<size_t>(outcome.result));
  std::u16string unicode;
  for (const Character& c : characters_of(in, outcome.memory).list) unicode += unicode_of(in, c);
  return unicode;
}

int32_t Collation::compare(const Units& a, const Units& b, uint32_t options) const {
  static EdgeBuffer edge_a(1 << 16), edge_b(1 << 16);
  const auto length_a = static_cast<int32_t>(a.size()), length_b = static_cast<int32_t>(b.size());
  return with_calls(form, [&](auto calls) {
    using U = typename decltype(calls)::Unit;
    return calls(kStrcoll, locale(), place<U>(edge_a, a, 0), length_a, State{0}, place<U>(edge_b, b, 0), length_b,
                 State{0}, options);
  });
}

int32_t Collation::transform(void* key, int32_t size, const Units& text, int32_t length, uint32_t options) const {
  static EdgeBuffer edge(1 << 16);
  return with_calls(form, [&](auto calls) {
    using U = typename decltype(calls)::Unit;
    return calls(kStrxfrm, locale(), key, size, place<U>(edge, text, length), length, State{0}, options);
  });
}

std::string Collation::key(const Units& text, uint32_t options) const {
  std::string key(text.size() * 32 + 16, '\x5A');
  int32_t length =
      transform(key.data(), static_cast<int32_t>(key.size()), text, static_cast<int32_t>(text.size()), options);
  EXPECT_GE(length, 0) << name;
  return key.substr(0, static_cast<size_t>(std::max(length, 0)));
}

ModelWeights Collation::next_weight(const Units& text, Reading& reading) const {
  static EdgeBuffer edge(4096);
  uint16_t primary[2] = {9, 9}, special[2] = {9, 9};
  uint8_t secondary[2] = {9, 9}, tertiary[2] = {9, 9}, mask = 0xEE;
  int32_t count = with_calls(form, [&](auto calls) {
    using U = typename decltype(calls)::Unit;
    const U* begin = place<U>(edge, text, 0);
    const U* at = begin + reading.offset;
    int32_t result = calls(kGetNextWeight, locale(), &at, &reading.remaining, StateAt{&reading.state},
                           &reading.position, primary, secondary, tertiary, special, primary + 1, secondary + 1,
                           tertiary + 1, special + 1, &mask, &reading.pending);
    reading.offset = static_cast<int32_t>(at - begin);
    return result;
  });
  ModelWeights weights = {{}, mask == 0xEE ? -1 : mask};
  for (int i = 0; i < 2; ++i) {
    const ModelSet set = {primary[i], secondary[i], tertiary[i], special[i]};
    if (i < count) {
      weights.sets.push_back(set);
    } else {
      EXPECT_EQ(set, ModelSet({9, 9, 9, 9})) << "a set that is none was written";
    }
  }
  return weights;
}

std::vector<Collation> own_forms(const std::string& sort, LanguageIndex language) {
  std::vector<Collation> forms;
  forms.reserve(5);
  forms.emplace_back(Form::plain, 954, sort, language);
  forms.emplace_back(Form::shifted, 930, sort, language);
  forms.emplace_back(Form::shifted, 57352, sort, language);
  forms.emplace_back(Form::wide, 954, sort, language);
  forms.emplace_back(Form::ucs2, 819, sort, language);
  return forms;
}

std::vector<std::u16string> all_texts(std::u16string_view letters, size_t length) {
  std::vector<std::u16string> texts = {u""};
  for (size_t i = 0; i < texts.size(); ++i) {
    if (texts[i].size() == length) continue;
    for (char16_t letter : letters) texts.push_back(texts[i] + letter);
  }
  return texts;
}

}  // namespace lx::test
