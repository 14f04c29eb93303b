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

TEST(HostOrder, IsThatOfTheBytes) {
  const Session session;
  for (const char* number : {"037", "273", "500", "930", "1047", "1140", "1141"}) {
    const PageSource& page = PageSource::of(static_cast<uint16_t>(std::stoul(number)));
    const Locale locale(LXGetLocale((std::string("English.UTF-8@IBM") + number).c_str(), 0, nullptr));
    ASSERT_NE(locale, nullptr) << number;
    const std::vector<uint32_t> characters = ordered_characters(page);
    std::mt19937 random{2407};
    for (int i = 0; i < 40000; ++i) {
      HostText a(random() % 13), b(random() % 13);
      for (HostText* text : {&a, &b}) {
        for (uint32_t& code : *text) code = characters[random() % characters.size()];
      }
      std::copy_n(a.begin(), std::min({a.size(), b.size(), size_t{random() % 12}}), b.begin());  // often alike
      const std::string x = utf8_of(page, a), y = utf8_of(page, b);
      const int host = (a > b) - (a < b);
      ASSERT_EQ(sign(key_of(locale.get(), x).compare(key_of(locale.get(), y))), host) << hex(x) << " " << hex(y);
      ASSERT_EQ(order_of(locale.get(), x, y), host) << hex(x) << " " << hex(y);
    }
  }
}

}  // namespace
}  // namespace lx::test
