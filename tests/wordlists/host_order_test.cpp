// SPDX-License-Identifier: Apache-2.0
// Text from a host, converted to UTF-8, keeps the order that it had there when it is sorted by the host's sort object.
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <vector>

#include "support/page_source.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kPages[] = {37, 273, 500, 930, 1047, 1140, 1141};
constexpr int kPairs = 40000;
constexpr size_t kLongest = 12;

using HostText = std::vector<uint32_t>;  // codes without shift bytes: one byte stands before two

std::string utf8_of(const PageSource& page, const HostText& text) {
  std::string utf8;
  for (const uint32_t code : text) {
    const std::string bytes = code < 256 ? std::string(1, static_cast<char>(code)) : unpacked(code);
    utf8 += PageSource::of(LX_CP_UTF8).encode(page.decode(bytes));
  }
  return utf8;
}

// Ideographs of a mixed page stand in the order of their code points: there is no room for a table of them.
bool has_place(const PageSource& page, uint32_t code) {
  const std::string bytes = code < 256 ? std::string(1, static_cast<char>(code)) : unpacked(code);
  const uint16_t unicode = page.decode(bytes);
  const bool ideograph = unicode >= 0x4E00 && unicode < 0xA000;
  const bool compatible = unicode >= 0xF900 && unicode < 0xFB00;
  return unicode != kNoCharacter && page.encode(unicode) == bytes && !ideograph && !compatible;
}

std::vector<uint32_t> characters_of(const PageSource& page) {
  std::vector<uint32_t> codes;
  for (uint32_t byte = 0; byte < 256; ++byte) {
    if (page.mixed() && (byte == page.enter || byte == page.leave)) continue;
    if (has_place(page, byte)) codes.push_back(byte);
  }
  for (const std::string& code : page.long_codes()) {
    if (has_place(page, packed(code))) codes.push_back(packed(code));
  }
  return codes;
}

class Samples {
 public:
  explicit Samples(std::vector<uint32_t> characters) : characters_(std::move(characters)) {}

  HostText text() {
    HostText text(random_() % (kLongest + 1));
    for (uint32_t& code : text) code = character();
    return text;
  }
  // One that is often the same up to some place.
  HostText near(const HostText& other) {
    HostText near = text();
    const size_t common = std::min({near.size(), other.size(), size_t{random_() % kLongest}});
    std::copy_n(other.begin(), common, near.begin());
    return near;
  }

 private:
  uint32_t character() { return characters_[random_() % characters_.size()]; }

  std::vector<uint32_t> characters_;
  std::mt19937 random_{2407};
};

std::string key_of(LXLocale* locale, const std::string& text) {
  std::string key(text.size() * 8 + 3, '\0');
  const int32_t length = LXStrxfrm(locale, key.data(), static_cast<int32_t>(key.size()), text.data(),
                                   static_cast<int32_t>(text.size()), 0);
  key.resize(static_cast<size_t>(std::max(length, 0)));
  return key;
}

int sign(int value) { return (value > 0) - (value < 0); }
int order_of(const HostText& a, const HostText& b) { return (a > b) - (a < b); }

class HostOrder : public testing::TestWithParam<uint16_t> {};

TEST_P(HostOrder, IsThatOfTheBytes) {
  const Session session;
  const PageSource& page = PageSource::of(GetParam());
  char sort[16];
  std::snprintf(sort, sizeof sort, "IBM%03u", unsigned{GetParam()});
  uint32_t rc = LX_OK;
  const Locale locale(LXGetLocale((std::string("English.UTF-8@") + sort).c_str(), 0, &rc));
  ASSERT_NE(locale, nullptr) << sort << ": " << rc;

  Samples samples(characters_of(page));
  for (int i = 0; i < kPairs; ++i) {
    const HostText a = samples.text();
    const HostText b = samples.near(a);
    const std::string x = utf8_of(page, a);
    const std::string y = utf8_of(page, b);
    const int host = order_of(a, b);
    ASSERT_EQ(sign(key_of(locale.get(), x).compare(key_of(locale.get(), y))), host) << hex(x) << " " << hex(y);
    const int direct =
        LXStrcoll(locale.get(), x.data(), static_cast<int32_t>(x.size()), y.data(), static_cast<int32_t>(y.size()), 0);
    ASSERT_EQ(sign(direct), host) << hex(x) << " " << hex(y);
  }
}

INSTANTIATE_TEST_SUITE_P(Pages, HostOrder, testing::ValuesIn(kPages));

}  // namespace
}  // namespace lx::test
