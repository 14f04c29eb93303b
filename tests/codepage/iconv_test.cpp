// SPDX-License-Identifier: Apache-2.0
// The code pages beside those of the C library, both ways, all byte sequences and all of UCS-2. How often the two
// differ on purpose, iconv_differences.txt says and why; more is a failure, and so is a difference that is gone.
#include <errno.h>
#include <iconv.h>

#include <fstream>
#include <map>
#include <optional>

#include "support/page_source.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

// Most pages have the same name there.
std::string name_in_iconv(const PageSource& page) {
  if (page.id == 954) return "EUC-JP";
  if (page.id == 737) return "CP737";
  return page.name.substr(0, 2) == "MS" ? "CP" + page.name.substr(2) : page.name;
}

// One conversion of the C library, a character at a time.
class Iconv {
 public:
  Iconv(const std::string& to, const std::string& from) : handle_(iconv_open(to.c_str(), from.c_str())) {}
  ~Iconv() {
    if (ok()) iconv_close(handle_);
  }
  bool ok() const { return handle_ != reinterpret_cast<iconv_t>(-1); }
  // Nothing when the text is not converted whole.
  std::optional<std::string> convert(std::string text) {
    iconv(handle_, nullptr, nullptr, nullptr, nullptr);
    char out[32];
    char* in_at = text.data();
    char* out_at = out;
    size_t left = text.size();
    size_t room = sizeof out;
    if (iconv(handle_, &in_at, &left, &out_at, &room) != 0 || left != 0) return std::nullopt;
    if (iconv(handle_, nullptr, nullptr, &out_at, &room) != 0) return std::nullopt;
    return std::string(out, out_at);
  }

 private:
  iconv_t handle_;
};

// How often the two differ in one direction, and where first.
struct Tally {
  size_t both = 0, only_ours = 0, only_theirs = 0;
  std::string first = {};

  void add(uint32_t of, const std::string& ours, const std::string& theirs) {
    if (ours == theirs) return;
    ++(ours == "-" ? only_theirs : theirs == "-" ? only_ours : both);
    if (first.size() < 200) first += "\n  " + hex(unpacked(of)) + ": " + ours + ", not " + theirs;
  }
  std::string numbers() const {
    return std::to_string(both) + " " + std::to_string(only_ours) + " " + std::to_string(only_theirs);
  }
};

// Numbers by page and direction.
std::map<std::string, std::string> known_differences() {
  std::ifstream in(LEXARO_TEST_FOLDER "/iconv_differences.txt");
  EXPECT_TRUE(in.good());
  std::map<std::string, std::string> known;
  for (std::string line; std::getline(in, line);) {
    const size_t direction = line.find(' '), numbers = line.find(' ', direction + 1);
    if (!line.empty() && line[0] != '#') known[line.substr(0, numbers)] = line.substr(numbers + 1);
  }
  return known;
}

class BesideIconv {
 public:
  explicit BesideIconv(const std::string& file)
      : page_(file),
        locale_(locale_of(page_.name)),
        record_(LXGetLocaleObject(locale_.get(), LX_CODEPAGE)),
        decode_("UTF-16LE", name_in_iconv(page_)),
        encode_(name_in_iconv(page_), "UTF-16LE") {
    EXPECT_EQ(decode_.ok() && encode_.ok(), page_.id != 838) << page_.name;  // which it does not have
  }
  std::string number() const { return std::to_string(page_.id); }
  bool has_peer() const { return decode_.ok() && encode_.ok(); }

  Tally to_unicode() {
    Tally tally;
    for (const std::string& bytes : sequences()) tally.add(packed(bytes), our_unicode(bytes), their_unicode(bytes));
    return tally;
  }
  Tally from_unicode() {
    Tally tally;
    for (uint32_t unicode = 0; unicode < 65536; ++unicode) {
      tally.add(unicode, our_bytes(unicode), their_bytes(unicode));
    }
    return tally;
  }

 private:
  // All that could begin a character, but for four-byte sequences outside the plane that we have.
  std::vector<std::string> sequences() const {
    std::vector<std::string> all;
    for (uint32_t first = 0; first < 256; ++first) {
      auto byte = static_cast<uint8_t>(first);
      bool shift = page_.mixed() && (byte == page_.enter || byte == page_.leave);
      if (!shift && page_.length_of(byte) == 1) all.emplace_back(1, static_cast<char>(first));
    }
    for (uint32_t code = 0x100; code < 0x10000; ++code) {
      bool lead = page_.mixed() ? (code >> 8) >= 0x40 : page_.lengths[code >> 8] == 2;
      if (lead) all.push_back(unpacked(code));
    }
    for (uint32_t code = 0x10000; code < 0x1000000; ++code) {
      if (page_.lengths[code >> 16] == 3) all.push_back(unpacked(code));
    }
    if (page_.kind == PageSource::Kind::utf8) {  // the rule takes ill-formed sequences for characters too
      std::erase_if(all, [&](const std::string& bytes) { return page_.encode(page_.decode(bytes)) != bytes; });
    }
    for (uint32_t code = 0x8EA20000; code < 0x8EA30000; ++code) {
      if (page_.lengths[0x8E] == 4) all.push_back(unpacked(code));
    }
    return all;
  }

  std::string our_unicode(const std::string& bytes) const {
    int32_t unicode = 0;
    if (bytes.size() == 1) {
      LXUChar out = 0;
      LXCpStrToUnicode(record_, &out, 1, bytes.data(), 1, 0);
      unicode = out;
    } else {
      unicode = LXCpMbToUnicode(record_, bytes.data());
    }
    return unicode == kNoCharacter ? "-" : hex(unpacked(static_cast<uint32_t>(unicode)));
  }
  std::string their_unicode(const std::string& bytes) {
    bool shift = page_.mixed() && bytes.size() == 2;
    auto result =
        decode_.convert(shift ? static_cast<char>(page_.enter) + bytes + static_cast<char>(page_.leave) : bytes);
    if (!result || result->size() != 2) return "-";
    return hex(unpacked(static_cast<uint8_t>((*result)[1]) * 256u + static_cast<uint8_t>((*result)[0])));
  }
  std::string our_bytes(uint32_t unicode) const {
    char out[4];
    auto count = static_cast<size_t>(LXCpUnicodeToChar(record_, static_cast<LXUChar>(unicode), out));
    std::string bytes(out, count);
    bool stands_in = count == 1 && static_cast<uint8_t>(out[0]) == page_.substitution && page_.decode(bytes) != unicode;
    return stands_in ? "-" : hex(bytes);
  }
  std::string their_bytes(uint32_t unicode) {
    auto result = encode_.convert({static_cast<char>(unicode), static_cast<char>(unicode >> 8)});
    if (!result || result->empty()) return "-";
    if (page_.mixed() && result->size() == 4) return hex(result->substr(1, 2));
    return hex(*result);
  }

  PageSource page_;
  Locale locale_;
  const LXObjEntry* record_;
  Iconv decode_;
  Iconv encode_;
};

TEST(BesideIconv, DiffersOnlyWhereMeantTo) {
  Session session;
  std::map<std::string, std::string> known = known_differences();
  for (const std::string& file : PageSource::all_files()) {
    BesideIconv pair(file);
    if (!pair.has_peer()) continue;
    for (const auto& [direction, tally] : {std::pair(" to", pair.to_unicode()), {" from", pair.from_unicode()}}) {
      const auto found = known.extract(pair.number() + direction);
      EXPECT_EQ(tally.numbers(), found ? found.mapped() : "0 0 0") << pair.number() << direction << tally.first;
    }
  }
  for (const auto& [direction, numbers] : known) ADD_FAILURE() << "no such page or none to compare: " << direction;
}

}  // namespace
}  // namespace lx::test
