// SPDX-License-Identifier: Apache-2.0
// The code pages beside those of the C library, both ways, all byte sequences and all of UCS-2. Where the two differ
// on purpose, iconv_differences.txt says so and why; anything else is a failure, and so is a difference that is gone.
#include <errno.h>
#include <iconv.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <map>
#include <optional>
#include <set>

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

std::string unicode_text(uint32_t value) {
  return hex(std::string{static_cast<char>(value >> 8), static_cast<char>(value)});
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

// What the two make of one key, as text; "-" for no character.
struct Difference {
  uint32_t key;
  std::string ours;
  std::string theirs;
};

// Neighbouring keys whose values run on in step are one line.
class Lines {
 public:
  Lines(uint16_t page, const std::string& way)
      : head_(std::to_string(page) + " " + way + " "), from_unicode_(way == "from") {}

  void add(const Difference& next) {
    bool in_step = !run_.empty() && next.key == run_.back().key + 1 && follows(run_.back().ours, next.ours) &&
                   follows(run_.back().theirs, next.theirs);
    if (!in_step) end_run();
    run_.push_back(next);
  }
  // More lines than anybody would read are merely counted.
  std::set<std::string> take() {
    static constexpr struct {
      const char* what;
      size_t most_lines;
    } kSides[] = {{"both: ", 10}, {"only ours: ", 3}, {"only theirs: ", 3}};
    end_run();
    std::set<std::string> all;
    for (size_t i = 0; i < 3; ++i) {
      if (lines_[i].size() > kSides[i].most_lines) lines_[i] = {head_ + kSides[i].what + std::to_string(counts_[i])};
      all.merge(lines_[i]);
    }
    return all;
  }

 private:
  static bool follows(const std::string& last, const std::string& next) {
    if (last == "-" || next == "-" || last == next) return last == next;
    return std::stoul(next, nullptr, 16) == std::stoul(last, nullptr, 16) + 1;
  }
  static std::string range(const std::string& first, const std::string& last) {
    return first == last ? first : first + ".." + last;
  }
  std::string key_text(uint32_t key) const { return from_unicode_ ? unicode_text(key) : hex(unpacked(key)); }

  void end_run() {
    if (run_.empty()) return;
    const Difference& first = run_.front();
    const Difference& last = run_.back();
    std::string line = head_ + range(key_text(first.key), key_text(last.key)) + " " + range(first.ours, last.ours) +
                       " " + range(first.theirs, last.theirs);
    const size_t side = first.ours == "-" ? 2 : first.theirs == "-" ? 1 : 0;
    lines_[side].insert(line);
    counts_[side] += run_.size();
    run_.clear();
  }

  std::string head_;
  bool from_unicode_;
  std::vector<Difference> run_;
  std::set<std::string> lines_[3];  // in both; only ours; only theirs
  size_t counts_[3] = {};
};

std::set<std::string> known_differences() {
  std::ifstream in(LEXARO_TEST_FOLDER "/iconv_differences.txt");
  EXPECT_TRUE(in.good());
  std::set<std::string> lines;
  for (std::string line; std::getline(in, line);) {
    if (!line.empty() && line[0] != '#') lines.insert(line);
  }
  return lines;
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
  bool has_peer() const { return decode_.ok() && encode_.ok(); }

  std::set<std::string> differences() {
    std::vector<Difference> from;
    std::map<std::string, std::string> only_ours;
    for (uint32_t unicode = 0; unicode < 65536; ++unicode) {
      const Difference pair = {unicode, our_bytes(unicode), their_bytes(unicode)};
      if (pair.ours != pair.theirs) from.push_back(pair);
      if (pair.theirs == "-" && pair.ours != "-") only_ours[unicode_text(unicode)] = pair.ours;
    }
    Lines both_ways(page_.id, "round"), to_unicode(page_.id, "to"), from_unicode(page_.id, "from");
    std::set<std::string> told;
    for (const std::string& bytes : sequences()) {
      const Difference pair = {packed(bytes), our_unicode(bytes), their_unicode(bytes)};
      if (pair.ours == pair.theirs) continue;
      const bool both = pair.theirs == "-" && only_ours[pair.ours] == hex(bytes);
      if (both) told.insert(pair.ours);
      (both ? both_ways : to_unicode).add(pair);
    }
    for (const Difference& pair : from) {
      if (!told.contains(unicode_text(pair.key))) from_unicode.add(pair);
    }
    std::set<std::string> all = both_ways.take();
    all.merge(to_unicode.take());
    all.merge(from_unicode.take());
    return all;
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
    return unicode == kNoCharacter ? "-" : unicode_text(static_cast<uint32_t>(unicode));
  }
  std::string their_unicode(const std::string& bytes) {
    bool shift = page_.mixed() && bytes.size() == 2;
    auto result =
        decode_.convert(shift ? static_cast<char>(page_.enter) + bytes + static_cast<char>(page_.leave) : bytes);
    if (!result || result->size() != 2) return "-";
    return unicode_text(static_cast<uint8_t>((*result)[1]) * 256u + static_cast<uint8_t>((*result)[0]));
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
  std::set<std::string> found;
  for (const std::string& file : PageSource::all_files()) {
    BesideIconv pair(file);
    if (!pair.has_peer()) continue;
    found.merge(pair.differences());
  }
  std::set<std::string> known = known_differences();
  std::vector<std::string> fresh, gone;
  std::set_difference(found.begin(), found.end(), known.begin(), known.end(), std::back_inserter(fresh));
  std::set_difference(known.begin(), known.end(), found.begin(), found.end(), std::back_inserter(gone));
  for (const std::string& line : fresh) ADD_FAILURE() << "new: " << line;
  for (const std::string& line : gone) ADD_FAILURE() << "gone: " << line;
}

}  // namespace
}  // namespace lx::test
