// SPDX-License-Identifier: Apache-2.0
// Text from a host, converted to UTF-8, keeps the order that it had there when it is sorted by the host's sort object.
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <vector>

#include "support/page_source.hpp"
#include "wordlists/keys.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kPages[] = {37, 273, 500, 930, 1047, 1140, 1141};
constexpr int kPairs = 40000;
constexpr size_t kLongest = 12;

using HostText = std::vector<uint32_t>;  // codes without shift bytes: one byte stands before two

std::string bytes_of(uint32_t code) { return code < 256 ? std::string(1, static_cast<char>(code)) : unpacked(code); }

std::string utf8_of(const PageSource& page, const HostText& text) {
  std::string utf8;
  for (const uint32_t code : text) utf8 += PageSource::of(LX_CP_UTF8).encode(page.decode(bytes_of(code)));
  return utf8;
}

// Ideographs of a mixed page stand in the order of their code points: there is no room for a table of them.
std::vector<uint32_t> ordered_characters(const PageSource& page) {
  std::vector<std::string> all = page.long_codes();
  for (uint32_t byte = 0; byte < 256; ++byte) {
    if (!page.mixed() || (byte != page.enter && byte != page.leave)) all.push_back(bytes_of(byte));
  }
  std::vector<uint32_t> codes;
  for (const std::string& code : all) {
    const uint16_t unicode = page.decode(code);
    const bool ideograph = (unicode >= 0x4E00 && unicode < 0xA000) || (unicode >= 0xF900 && unicode < 0xFB00);
    if (unicode != kNoCharacter && page.encode(unicode) == code && !ideograph) codes.push_back(packed(code));
  }
  return codes;
}

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

  const std::vector<uint32_t> characters = ordered_characters(page);
  std::mt19937 random{2407};
  for (int i = 0; i < kPairs; ++i) {
    HostText a(random() % (kLongest + 1)), b(random() % (kLongest + 1));
    for (HostText* text : {&a, &b}) {
      for (uint32_t& code : *text) code = characters[random() % characters.size()];
    }
    std::copy_n(a.begin(), std::min({a.size(), b.size(), size_t{random() % kLongest}}), b.begin());  // often alike
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
