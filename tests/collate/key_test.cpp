// SPDX-License-Identifier: Apache-2.0
// Sort keys in buffers of every size.
#include "collate/collation.hpp"

namespace lx::test {
namespace {

using Keys = CollationTest;

const std::u16string_view kTexts[] = {u"a",     u"abc",    u"aaabBB", u"efefa", u"-+*",       u"a-b*c-cbcc",
                                      u"xyzwx", u"mntd0m", u"Qpqaq",  u"z0",    u"\u51FFz00", u"\u3041\u4E03\u50FF-"};

const LXUChar* units_of(std::u16string_view text) { return reinterpret_cast<const LXUChar*>(text.data()); }

TEST_F(Keys, FillBuffersOfEverySize) {
  TextForm form(Kind::ucs2, "Single", "Combining");
  EdgeBuffer edge(1024);
  for (std::u16string_view text : kTexts) {
    const std::string wanted = model_key(form.sort(), text);
    size_t n = text.size();
    size_t work = (8 * n + 3 + 3) / 4 * 4 + 8 * n;
    for (size_t size = 0; size <= work + 8; ++size) {
      for (size_t behind = 0; behind < 4; ++behind) {
        char* key = edge.room(size + behind);
        size_t gap = (4 - reinterpret_cast<uintptr_t>(key) % 4) % 4;
        std::string expected(size + behind, '\x5A');
        if (wanted.size() <= size) {
          expected.replace(0, wanted.size(), wanted);
          if (size >= gap + work) expected.replace(wanted.size(), size - wanted.size(), size - wanted.size(), '\0');
        }
        auto length = static_cast<int32_t>(wanted.size());
        auto room = static_cast<int32_t>(size);
        ASSERT_EQ(LXStrGenSortKey(form.locale(), key, room, units_of(text), static_cast<int32_t>(n)), length);
        ASSERT_EQ(std::string_view(key, expected.size()), expected) << shown(text) << ' ' << size << ' ' << behind;
        key = edge.room(size + behind);
        ASSERT_EQ(LXStrxfrmU(form.locale(), key, room, units_of(text), static_cast<int32_t>(n), 0), length);
        ASSERT_EQ(std::string_view(key, expected.size()), expected) << shown(text) << ' ' << size << ' ' << behind;
      }
    }
    EXPECT_EQ(LXStrGenSortKey(form.locale(), nullptr, 0, units_of(text), static_cast<int32_t>(n)),
              static_cast<int32_t>(wanted.size()));
  }
}

TEST_F(Keys, OfAnEmptyText) {
  for (const char* sort : {"Plain", "BINARY"}) {
    TextForm form(Kind::plain, "Single", sort);
    for (int32_t size = 0; size < 6; ++size) {
      char key[6];
      std::memset(key, 9, sizeof key);
      EXPECT_EQ(LXStrxfrm(form.locale(), key, size, "", 0, 0), size == 0 ? 0 : 3);
      for (int32_t i = 0; i < 6; ++i) EXPECT_EQ(key[i], i < std::min(size, 3) ? 0 : 9) << size << ' ' << i;
      if (std::string_view(sort) == "BINARY") continue;
      std::memset(key, 9, sizeof key);
      EXPECT_EQ(LXStrGenSortKey(form.locale(), key, size, nullptr, 0), 3);
      for (int32_t i = 0; i < 6; ++i) EXPECT_EQ(key[i], size >= 3 && i < 3 ? 0 : 9) << size << ' ' << i;
    }
  }
}

TEST_F(Keys, AreTheSameFromEveryForm) {
  for (const char* sort : {"Plain", "Combining"}) {
    for (const TextForm& form : own_forms(sort)) {
      auto texts = all_texts(u"aAcefpQ-*mdxyz0\u3041", 2);
      for (const std::u16string& text : all_texts(u"acb-\u3041", 4)) texts.push_back(text);
      for (const std::u16string& text : texts) {
        if (text.empty()) continue;
        ASSERT_EQ(form.key(form.store(text)), model_key(form.sort(), text)) << form.name() << ' ' << shown(text);
      }
    }
  }
}

// Positions and lengths beyond sixteen bits wrap round.
TEST_F(Keys, OfLongTexts) {
  TextForm form(Kind::ucs2, "Single", "Plain");
  std::u16string text(70000, u'a');
  text[69999] = u'-';
  std::string key(text.size() * 16 + 16, '\x5A');
  int32_t length = LXStrGenSortKey(form.locale(), key.data(), static_cast<int32_t>(key.size()), units_of(text), 70000);
  ASSERT_EQ(length, 2 * 69999 + 3 + 4);
  EXPECT_EQ(key.substr(2 * 69999, 7), std::string("\0\0\0\x11\x70\0\x11", 7));
}

TEST_F(Keys, NeedGoodOptions) {
  for (const TextForm& form : own_forms("Plain")) {
    Stored text = form.store(u"ab");
    char key[64];
    for (uint32_t options : {1u, 0x40u, 0x80000000u, LX_CMP_TRIM, LX_CMP_NOCASE | 2, LX_CMP_NOWIDTH | LX_CMP_TRIM}) {
      EXPECT_EQ(form.transform(key, 64, text, options), -1) << form.name() << ' ' << options;
      EXPECT_EQ(LXGetError(form.locale()), uint32_t{LX_E_ARGUMENT});
    }
    EXPECT_EQ(form.transform(key, 64, text, LX_OPT_CHARS), 2 * 2 + 3) << form.name();
    EXPECT_EQ(LXGetError(form.locale()), uint32_t{LX_OK});
    // Measured; the terminator is no part of the text.
    text.raw += std::string(4, '\0');
    EXPECT_EQ(form.transform(key, 64, text, -1, 0), 7) << form.name();
  }
}

}  // namespace
}  // namespace lx::test
