// SPDX-License-Identifier: Apache-2.0
// Text cut into host records of a fixed length: every record stands by itself, and none of the text is lost.
#include <gtest/gtest.h>

#include "nls1/translation_model.hpp"
#include "support/edge_buffer.hpp"

namespace lx::test {
namespace {

// The characters of a record; fails when it does not begin and end in the single-byte state, or has half a character.
std::u16string read_record(const PageSource& page, std::string_view record) {
  std::u16string text;
  bool inside = false;
  for (size_t at = 0; at < record.size();) {
    const auto byte = static_cast<uint8_t>(record[at]);
    if (byte == page.enter || byte == page.leave) {
      EXPECT_NE(inside, byte == page.enter) << hex(record);
      inside = byte == page.enter;
      ++at;
      continue;
    }
    const size_t length = inside ? 2 : 1;
    EXPECT_LE(at + length, record.size()) << hex(record);
    text += static_cast<char16_t>(page.decode(record.substr(at, length)));
    at += length;
  }
  EXPECT_FALSE(inside) << hex(record);
  return text;
}

std::u16string long_text() {
  static constexpr std::u16string_view kRuns[] = {
      u"山田太郎様",           u"AB", u"東京都", u"X",    u"一", u"あいうえおかきくけこ",
      u"12345678901234567890", u"日", u"C",      u"本語", u"-"};
  std::u16string text;
  for (int i = 0; i < 4; ++i) {
    for (std::u16string_view run : kRuns) text += run.substr(0, run.size() - static_cast<size_t>(i) % run.size());
  }
  return text;
}

void cut_into_records(uint16_t to, uint16_t from, size_t length) {
  SCOPED_TRACE(std::to_string(from) + " to " + std::to_string(to) + ", records of " + std::to_string(length));
  const PageSource& page = PageSource::of(to);
  const std::u16string text = long_text();
  const std::string in = spelled(page_of(from), text);
  EdgeBuffer out(64), rest(in.size());
  std::u16string found;
  size_t done = 0;
  while (done < in.size()) {
    char* record = out.room(length);
    int32_t consumed = 99;
    uint32_t error = 99;
    const int32_t count =
        NLS1_TranslateString(to, record, static_cast<int32_t>(length), from, rest.text(in.substr(done)),
                             static_cast<int32_t>(in.size() - done), &consumed, NLS1_XLT_PAD, &error);
    ASSERT_EQ(count, static_cast<int32_t>(length));
    std::u16string part = read_record(page, {record, length});
    part.erase(part.find_last_not_of(u' ') + 1);
    found += part;
    if (consumed == 0) break;
    done += static_cast<size_t>(consumed);
    ASSERT_EQ(error, done < in.size() ? LX_E_BUFFER : LX_OK);
  }
  if (length >= 4) {
    EXPECT_EQ(found, text);
  } else {
    EXPECT_EQ(found, u"") << "the text begins with a character that has no room";
  }
}

TEST(Records, AreBalancedAtEveryLength) {
  for (size_t length = 0; length <= 40; ++length) {
    for (uint16_t to : std::initializer_list<uint16_t>{930, 1399}) {
      for (uint16_t from : std::initializer_list<uint16_t>{LX_CP_UTF8, LX_CP_UCS2, 932})
        cut_into_records(to, from, length);
    }
  }
}

// From one host page into another. Where a call ends inside a run, the next one is told so by an enter byte.
TEST(Records, GoOnInsideARun) {
  const std::u16string text = long_text();
  for (auto [to, from] : {std::pair<uint16_t, uint16_t>{1399, 930}, {930, 1399}, {57352, 930}, {932, 1399}}) {
    const PageSource& source = PageSource::of(from);
    const std::string whole = spelled(&source, text);
    for (size_t length = 4; length <= 40; ++length) {
      std::string in = whole, all;
      while (!in.empty()) {
        EdgeBuffer rest(in.size()), out(length);
        char* record = out.room(length);
        int32_t consumed = 0;
        const int32_t count = NLS1_TranslateString(to, record, static_cast<int32_t>(length), from, rest.text(in),
                                                   static_cast<int32_t>(in.size()), &consumed, 0, nullptr);
        ASSERT_GT(consumed, 0) << hex(in) << " into " << length;
        if (PageSource::of(to).mixed()) {
          all += ucs2_bytes(read_record(PageSource::of(to), {record, static_cast<size_t>(count)}));
        } else {
          all.append(record, static_cast<size_t>(count));
        }
        bool inside = false;
        for (size_t at = 0; at < static_cast<size_t>(consumed);) {
          const auto byte = static_cast<uint8_t>(in[at]);
          const bool shift = byte == source.enter || byte == source.leave;
          if (shift) inside = byte == source.enter;
          at += shift || !inside ? 1 : 2;
        }
        in.erase(0, static_cast<size_t>(consumed));
        if (inside) in.insert(in.begin(), static_cast<char>(source.enter));
      }
      const std::string expected = PageSource::of(to).mixed() ? ucs2_bytes(text) : spelled(page_of(to), text);
      EXPECT_EQ(hex(all), hex(expected)) << from << " to " << to << ", " << length;
    }
  }
}

}  // namespace
}  // namespace lx::test
