// SPDX-License-Identifier: Apache-2.0
// The primitives where they do what one would not expect: in UTF-8, on a page with changed bytes, and on pages of the
// older layout.
#include "support/object_builder.hpp"
#include "support/page_source.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

TEST(Primitives, Utf8IsDecodedByRuleAlone) {
  const Session session;
  const Locale locale = locale_of("UTF-8");
  const LXObjEntry* utf8 = LXGetLocaleObject(locale.get(), LX_CODEPAGE);
  const std::pair<std::string_view, int32_t> cases[] = {
      {"\x41\x42", 0x42},                    // no one-byte case
      {std::string_view("\x00\x00", 2), 0},  // whatever the lead byte
      {"\xC0\xAF", 0x2F},                    // overlong
      {"\xF1\x80\x80", 0x1000},              // from E0 on three bytes
      {"\xFF\xBF\xBF", 0xFFFF},
  };
  for (const auto& [text, unicode] : cases) {
    Guarded bytes(text);
    EXPECT_EQ(LXCpMbToUnicode(utf8, bytes.data()), unicode) << hex(text);
  }
  EXPECT_EQ(LXCpMbToUnicodeW(utf8, 0x41), 0x40);  // 41 and the zero behind it
}

class BuiltPages : public testing::Test {
 protected:
  BuiltPages() { write_small_directory(directory_); }

  const LXObjEntry* page(uint16_t id) {
    if (!session_) session_ = std::make_unique<Session>(directory_.path());
    const LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, id, 0, nullptr);
    EXPECT_NE(entry, nullptr) << id;
    return entry;
  }

  DataDirectory directory_;

 private:
  std::unique_ptr<Session> session_;
};

// An unknown kind of page for U+30xx, a single pair of widths, and two bytes with one full-width form.
TEST_F(BuiltPages, ChangedTables) {
  constexpr size_t kSection = 76, kPages = kSection + 2316, kFullWidth = kSection + 4376;
  Bytes file = multibyte_page_file();
  file[kSection + 7] = 1;
  file[kPages + 8 * 0x30] = 5;
  file[kFullWidth + 4 * 'B' + 2] = 0x81;
  file[kFullWidth + 4 * 'B' + 3] = 0x41;
  directory_.write_object(LX_CODEPAGE, 900, file);
  const LXObjEntry* changed = page(900);
  Guarded out(1);
  EXPECT_EQ(LXCpUnicodeToChar(changed, 0x3042, out.data()), 1);
  EXPECT_EQ(out.data()[0], 0);
  EXPECT_EQ(LXCpUnicodeToCharW(changed, 0x3042), 0u);
  EXPECT_EQ(LXCpUnicodeToCharW(changed, 0x4E01), 0x8EA0A1u);  // other pages are as before
  EXPECT_EQ(LXCpMbHalfToFullW(changed, 0x8142), 0x8EA0A0u);   // one pair is compared too
  EXPECT_EQ(LXCpMbHalfToFullW(changed, 0x8143), 0u);
  EXPECT_EQ(LXCpFullToHalfW(changed, 0x8141), LXWChar{'A'});  // the first single byte wins
}

// Every second byte reaches a value, by its low bits.
TEST_F(BuiltPages, OlderLayoutHasNoBounds) {
  for (uint16_t id : {uint16_t{900}, uint16_t{902}}) {
    EXPECT_EQ(LXCpMbToUnicode(page(id), "\x81\x42"), 0x3042);
    EXPECT_EQ(LXCpMbToUnicode(page(id), "\x81\x62"), id == 900 ? 0xFFFD : 0x3042);
  }
}

// Sections of one's own, at the edge of memory: without a section 2 none is made.
TEST_F(BuiltPages, OlderLayoutWithoutASecondSection) {
  const Bytes file = multibyte_page_file(true);
  const auto size = static_cast<uint16_t>(file[10] << 8 | file[11]);
  Guarded section1(std::string_view(reinterpret_cast<const char*>(file.data()) + 76, size));
  uint8_t* section2 = section1.as<uint8_t>();
  uint8_t* made = LXCpV1toV2(section1.as<uint8_t>(), size, nullptr, 0, &section2);
  ASSERT_NE(made, nullptr);
  EXPECT_EQ(section2, nullptr);
  EXPECT_EQ(made[4374] << 8 | made[4375], 0) << "no table to Unicode";
  LXUnloadFile(made);
}

}  // namespace
}  // namespace lx::test
