// SPDX-License-Identifier: Apache-2.0
#include "collate/text_form.hpp"

namespace lx::test {
namespace {

template <class Unit>
const Unit* units(const void* at) {
  return static_cast<const Unit*>(at);
}

}  // namespace

TextForm::TextForm(Kind kind, std::string page, const std::string& sort, const std::string& language)
    : kind_(kind), page_(std::move(page)), sort_(test_sort(sort == "Combining")) {
  const char* const kinds[] = {"plain", "shifted", "wide", "ucs2"};
  name_ = std::string(kinds[static_cast<int>(kind)]) + " text, " + language + "." + page_ + "@" + sort;
  uint32_t rc = 99;
  locale_.reset(LXGetLocale((language + "_UnitedStates." + page_ + "@" + sort).c_str(), 0, &rc));
  EXPECT_EQ(rc, LX_OK) << name_;
}

std::string TextForm::character(char16_t value, bool wide) const {
  std::string bytes;
  auto add = [&](int byte) { bytes += static_cast<char>(byte); };
  if (value < 0x100) {
    add(value);
  } else if (page_ == "Mixed") {
    add(value < 0x3050 ? 0x41 : 0x42), add(0x40 + (value & 0x0F));
  } else if (value < 0x4E00) {
    add(0x81), add(0x40 + (value & 0x0F));
  } else if (value < 0x5000) {
    add(0x8E), add(value < 0x4E08 ? 0xA0 : 0xA1), add(0xA0 + (value & 7));
  } else {
    add(0x8F), add(0xA1), add(0xA1), add(0xA0 + (value & 7));
  }
  if (!wide) return bytes;
  uint32_t packed = 0;
  for (char byte : bytes) packed = packed << 8 | static_cast<uint8_t>(byte);
  return {reinterpret_cast<const char*>(&packed), sizeof packed};
}

Stored TextForm::store(std::u16string_view text) const {
  Stored stored;
  bool shifts = kind_ == Kind::shifted && page_ == "Mixed";
  bool inside = false;
  auto shift = [&](bool enter) {
    stored.raw += enter ? '\x0E' : '\x0F';
    stored.pieces.push_back({0, 1, true, enter});
    inside = enter;
  };
  for (char16_t value : text) {
    if (shifts && inside != (value > 0xFF)) shift(!inside);
    std::string bytes = kind_ == Kind::ucs2 ? std::string(reinterpret_cast<const char*>(&value), sizeof value)
                                            : character(value, kind_ == Kind::wide);
    stored.raw += bytes;
    stored.pieces.push_back({value, static_cast<int>(bytes.size()) / unit_size()});
  }
  if (inside) shift(false);
  stored.units = static_cast<int32_t>(stored.raw.size()) / unit_size();
  return stored;
}

int32_t TextForm::compare(const Stored& a, const Stored& b, uint32_t options) const {
  return compare(a, a.units, b, b.units, options);
}

int32_t TextForm::compare(const Stored& a, int32_t m, const Stored& b, int32_t n, uint32_t options) const {
  static EdgeBuffer edge_a(1 << 16);
  static EdgeBuffer edge_b(1 << 16);
  const void* x = edge_a.text(a.raw);
  const void* y = edge_b.text(b.raw);
  switch (kind_) {
    case Kind::plain:
      return LXStrcoll(locale(), units<char>(x), m, units<char>(y), n, options);
    case Kind::shifted:
      return LXStrcollEx(locale(), units<char>(x), m, 0, units<char>(y), n, 0, options);
    case Kind::wide:
      return LXWcscoll(locale(), units<LXWChar>(x), m, units<LXWChar>(y), n, options);
    default:
      return LXStrcollU(locale(), units<LXUChar>(x), m, units<LXUChar>(y), n, options);
  }
}

int32_t TextForm::transform(void* key, int32_t size, const Stored& text, uint32_t options) const {
  return transform(key, size, text, text.units, options);
}

int32_t TextForm::transform(void* key, int32_t size, const Stored& text, int32_t length, uint32_t options) const {
  static EdgeBuffer edge(1 << 16);
  const void* x = edge.text(text.raw);
  switch (kind_) {
    case Kind::plain:
      return LXStrxfrm(locale(), key, size, units<char>(x), length, options);
    case Kind::shifted:
      return LXStrxfrmEx(locale(), key, size, units<char>(x), length, 0, options);
    case Kind::wide:
      return LXWcsxfrm(locale(), key, size, units<LXWChar>(x), length, options);
    default:
      return LXStrxfrmU(locale(), key, size, units<LXUChar>(x), length, options);
  }
}

std::string TextForm::key(const Stored& text, uint32_t options) const {
  std::string key(static_cast<size_t>(text.units) * 32 + 16, '\x5A');
  int32_t length = transform(key.data(), static_cast<int32_t>(key.size()), text, options);
  EXPECT_GE(length, 0) << name_;
  key.resize(static_cast<size_t>(std::max(length, 0)));
  return key;
}

ModelWeights TextForm::next_weight(const void* text, Reading& reading) const {
  uint16_t primary[2] = {9, 9};
  uint8_t secondary[2] = {9, 9};
  uint8_t tertiary[2] = {9, 9};
  uint16_t special[2] = {9, 9};
  uint8_t mask = 0xEE;
  auto read = [&](auto function, auto*... state) {
    auto run = [&]<class Unit>(int32_t (*call)(LXLocale*, const Unit**, int32_t*, decltype(state)..., uint16_t*,
                                               uint16_t*, uint8_t*, uint8_t*, uint16_t*, uint16_t*, uint8_t*, uint8_t*,
                                               uint16_t*, uint8_t*, uint16_t*)) {
      const Unit* at = units<Unit>(text) + reading.offset;
      int32_t result =
          call(locale(), &at, &reading.remaining, state..., &reading.position, &primary[0], &secondary[0], &tertiary[0],
               &special[0], &primary[1], &secondary[1], &tertiary[1], &special[1], &mask, &reading.pending);
      reading.offset = static_cast<int32_t>(at - units<Unit>(text));
      return result;
    };
    return run(function);
  };
  int32_t count = kind_ == Kind::plain     ? read(&LXStrGetNextWeight)
                  : kind_ == Kind::shifted ? read(&LXStrGetNextWeightEx, &reading.state)
                  : kind_ == Kind::wide    ? read(&LXStrGetNextWeightW)
                                           : read(&LXStrGetNextWeightU);
  ModelWeights weights;
  weights.mask = mask == 0xEE ? -1 : mask;
  for (int i = 0; i < count; ++i) weights.sets.push_back({primary[i], secondary[i], tertiary[i], special[i]});
  for (int i = count; i < 2; ++i) {
    EXPECT_EQ(primary[i] + secondary[i] + tertiary[i] + special[i], 36) << "a set that is none was written";
  }
  return weights;
}

std::vector<TextForm> own_forms(const std::string& sort) {
  std::vector<TextForm> forms;
  for (auto [kind, page] : {std::pair(Kind::plain, "Small"),
                            {Kind::shifted, "Mixed"},
                            {Kind::shifted, "Small"},
                            {Kind::wide, "Small"},
                            {Kind::ucs2, "Single"}}) {
    forms.emplace_back(kind, page, sort);
  }
  return forms;
}

std::string shown(std::u16string_view text) {
  std::string result;
  char number[16];
  for (char16_t unit : text) {
    std::snprintf(number, sizeof number, unit < 0x7F && unit > 0x1F ? "%c" : "\\u%04X", unsigned{unit});
    result += number;
  }
  return '"' + result + '"';
}

std::vector<std::u16string> all_texts(std::u16string_view letters, size_t length) {
  std::vector<std::u16string> texts = {u""};
  for (size_t begin = 0; length != 0; --length) {
    size_t end = texts.size();
    for (; begin < end; ++begin) {
      for (char16_t letter : letters) texts.push_back(texts[begin] + letter);
    }
  }
  return texts;
}

}  // namespace lx::test
