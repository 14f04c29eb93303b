// SPDX-License-Identifier: Apache-2.0
// Streams against a slow model of text, on a routine that moves what its script says.
#include <map>

#include "support/counting_allocator.hpp"
#include "support/edge_buffer.hpp"
#include "support/stored_unit.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

// After `fail_at` calls it gives `failure`, once or always. Others move up to `most` bytes, or a random number.
struct Script {
  std::string wire;
  bool writes = false;
  size_t most = 1000, fail_at = SIZE_MAX;
  int32_t failure = -1;
  bool fail_on = false, failed = false;
  size_t at = 0, random = 1;

  static int32_t move(void* context, void* buffer, int32_t count) {
    auto& self = *static_cast<Script*>(context);
    auto n = static_cast<size_t>(count);
    if (self.fail_at-- == 0) {
      self.failed = true;
      if (self.fail_on) self.fail_at = 0;
      if (!self.writes) std::memset(buffer, 0xEE, n);
      return self.failure != INT32_MAX ? self.failure : count + 1;
    }
    n = std::min(n, self.most != 0 ? self.most : 1 + (self.random = self.random * 75 % 65537) % n);
    if (self.writes) self.wire.append(static_cast<char*>(buffer), n);
    if (!self.writes) self.at += n = self.wire.copy(static_cast<char*>(buffer), n, self.at);
    return n == 0 ? -1 : static_cast<int32_t>(n);
  }
};

constexpr size_t kMost[] = {1, 2, 1000, 0};
constexpr int32_t kFailures[] = {-1, 0xFFFF, 0, -3, INT32_MAX};

class Streams : public testing::Test {
 protected:
  CountingAllocator memory_;
  std::map<const PageSource*, Locale> locales_;
  std::vector<Form> forms_;
  Form form_, wire_;  // of the text in memory, and in the stream
  bool ucs2_, bare_;  // plain calls know no double-byte characters of mixed pages
  std::string bytes_;
  std::vector<Character> list_;  // what the bytes are
  LXLocale* l_ = nullptr;
  Script script_;
  LXStream* stream_ = nullptr;

  Streams() {
    memory_.init(LEXARO_DATA);
    for (uint16_t id : {uint16_t{57352}, uint16_t{932}, uint16_t{930}}) {
      const PageSource* page = &PageSource::of(id);
      locales_[page] = locale_of(page->name);
      for (auto kind : {Form::plain, Form::shifted, Form::wide}) forms_.push_back({kind, page});
    }
    forms_.push_back({Form::ucs2, forms_.back().page});
  }
  ~Streams() override {
    locales_.clear();
    LXTerm();
  }
  // A text in which digits stand for the characters of line ends.
  void use(const Form& form, std::u16string_view text) {
    form_ = form;
    ucs2_ = form.kind == Form::ucs2;
    wire_ = {ucs2_ ? Form::ucs2 : Form::shifted, form.page};
    bare_ = form.kind == Form::plain && form.page->mixed();
    l_ = locales_[form.page].get();
    Writer out{wire_};
    for (char16_t c : text) {
      bool line = c >= u'1' && c <= u'4';
      out.add(line ? piece(out, {0, 1, 1, line_character(c - size_t{u'1'}), 0}) : out.piece(c));
    }
    bytes_ = raw(wire_, out.units);
    list_ = characters_of(wire_, out.units).list;
  }
  void open(const Script& script) {
    script_ = script;
    stream_ = LXOpenStream(l_, Script::move, &script_, script.writes ? LX_STREAM_WRITE : LX_STREAM_READ);
  }
  void expect(int64_t result, int64_t expected, uint32_t status) {
    EXPECT_EQ(std::pair(result, LXGetError(l_)), std::pair(expected, status)) << form_.name();
  }
  void close() { expect(LXCloseStream(stream_, l_, 0), 1, LX_OK); }
  uint32_t line_character(size_t i) const { return ucs2_ ? U"\n\r\u2028\u2029"[i] : form_.page->line_ends[i]; }
  Units piece(const Writer& out, const Character& c) const {
    return ucs2_ ? Units{c.code} : out.piece_of_bytes(bytes_of_code(c.code, c.size));
  }
  bool read(Character& c) {
    if (ucs2_) return (c.code = LXReadCharU(stream_, l_, 0)) != 0xFFFF;
    auto* bare = form_.kind == Form::plain ? LXReadChar : LXReadCharW;
    c.code = form_.kind == Form::shifted ? LXReadCharEx(stream_, l_, &c.state, 0) : bare(stream_, l_, 0);
    return c.code != 0xFFFFFFFF;
  }
  int32_t put(LXStream* stream, const Character& c, bool back) {
    auto unit = static_cast<LXUChar>(c.code);
    const std::string text = bytes_of_code(c.code, c.size);
    const std::vector<char> copy(text.begin(), text.end());  // behind it a memory checker is on guard
    const char* s = c.size != 0 ? copy.data() : nullptr;
    if (ucs2_) return back ? LXUngetCharU(stream, l_, unit, 0) : LXWriteCharU(stream, l_, unit);
    if (form_.kind == Form::wide) return back ? LXUngetCharW(stream, l_, c.code, 0) : LXWriteCharW(stream, l_, c.code);
    if (form_.kind == Form::plain) return back ? LXUngetChar(stream, l_, s, 0) : LXWriteChar(stream, l_, s);
    return back ? LXUngetCharEx(stream, l_, s, c.state, 0) : LXWriteCharEx(stream, l_, s, c.state);
  }
  int32_t line(char* out, int32_t size, uint32_t flags) {
    if (ucs2_) return LXReadStringU(stream_, l_, reinterpret_cast<LXUChar*>(out), size, flags);
    if (form_.kind == Form::wide) return LXReadStringW(stream_, l_, reinterpret_cast<LXWChar*>(out), size, flags);
    return (form_.kind == Form::plain ? LXReadString : LXReadStringEx)(stream_, l_, out, size, flags);
  }
};

// Every character comes once; the failure has the status that fits what the stream keeps then.
TEST_F(Streams, ReadWhereverTheRoutineFails) {
  for (size_t choice = 0; choice < forms_.size() * 20; ++choice) {
    use(forms_[choice / 20], u"aあいbｱ亜11あ\u3000");
    if (wire_.follows_shifts()) list_ = characters_of(wire_, units_of(bytes_ += "\x0F\x0E\x0F\x40\x0F")).list;
    const int32_t failure = kFailures[choice / 4 % 5];
    const uint32_t within = failure == -1 ? LX_E_TRANSFER : failure > 0 ? LX_E_COUNT : LX_E_HALF;
    bool failed = true;
    for (size_t n = 0, next = 0; failed; ++n, next = 0) {
      open({bytes_, false, kMost[choice % 4], n, failure});
      auto inside = [&] { return ucs2_ ? script_.at % 2 != 0 : next < list_.size() && script_.at > list_[next].at; };
      failed = false;
      for (bool ended = false; !ended;) {
        bool was_inside = inside();
        Character c = {};
        if (read(c)) {
          EXPECT_TRUE(form_.kind != Form::shifted || c.state == list_.at(next).state);
          expect(c.code, list_.at(next++).code, LX_OK);
        } else if (script_.failed && !failed) {
          failed = true;
          expect(0, 0, inside() ? within : failure == -1 ? LX_OK : LX_E_COUNT);
        } else {
          ended = was_inside || !inside();
          expect(0, 0, ended ? LX_OK : LX_E_HALF);
        }
      }
      EXPECT_TRUE(next == list_.size() && script_.at == bytes_.size()) << form_.name() << ", " << choice << ", " << n;
      expect(line(nullptr, static_cast<int32_t>(n % 2) - 1, 0), 0, LX_OK);  // without room, also at the end
      close();
    }
  }
}

TEST_F(Streams, PutBackLastComesFirst) {
  for (size_t choice = 0; choice < forms_.size() * 3; ++choice) {
    use(forms_[choice / 3], u"bあaあああcｱ");
    open({bytes_, false, kMost[choice % 3], 3});  // fails inside a character, or between two
    size_t next = 0, back = 0;
    Character c = {};
    while (read(c) || !script_.failed) next += !ucs2_ || c.code != 0xFFFF;
    while (!bare_ && put(stream_, list_[back % 8], true) == 1) ++back;
    expect(0, 0, bare_ ? LX_E_TRANSFER : LX_E_BUFFER);
    EXPECT_TRUE(!ucs2_ || back == (script_.at % 2 != 0 ? 39u : 40u));
    script_.most = 1000;
    for (; back > 0; --back) expect(read(c) ? c.code : 0, list_[(back - 1) % 8].code, LX_OK);
    for (; next < 8; ++next) expect(read(c) ? c.code : 0, list_[next].code, LX_OK);
    close();
  }
}

// Refused output waits, up to 80 bytes, in whole characters with their shift bytes.
TEST_F(Streams, WrittenBytesArriveInOrderWhereverTheyAreRefused) {
  for (size_t choice = 0; choice < forms_.size() * 80 * 25; ++choice) {
    use(forms_[choice / 80 / 25], u"aああいb亜1aああいb亜1aああいb亜1aああいb亜1aああいb亜1aああいb亜1aああいb亜1");
    if (bare_) continue;
    const int32_t failure = kFailures[choice % 5];
    const size_t how = choice / 5 % 4;  // refused once; from there on; then flushed in vain; or closed in vain
    const bool fatal = failure == -1 || failure == 0xFFFF;
    open({{}, true, kMost[choice / 20 % 4], choice / 80 % 25 * 4, failure, how > 0});
    Writer out{wire_};
    std::string expected;
    auto inside = [&] { return !ucs2_ && characters_of(wire_, units_of(script_.wire)).state != 0; };
    auto add = [&](const Character& c) {
      const Units units = piece(out, c);
      script_.failed = false;
      int32_t result = put(stream_, c, false);
      bool full = script_.failed && expected.size() + raw(wire_, units).size() > script_.wire.size() + 80;
      expect(result, !script_.failed, full ? LX_E_BUFFER : script_.failed ? LX_E_REFUSED : LX_OK);
      if (!full) out.add(units);
      if (!full) expected += raw(wire_, units);
    };
    for (const Character& c : list_) add(c);
    if (how == 2 && script_.wire != expected) {
      expect(LXFlushStream(stream_, l_, 0), 0, fatal ? LX_E_FLUSH : LX_E_COUNT);
      if (fatal) expected = script_.wire;  // what follows stands in the state of what was taken
      if (fatal) out.inside = inside();
    }
    script_.fail_on = false;
    if (how == 3 && script_.wire != expected) {
      expected = script_.wire + (inside() ? std::string(1, static_cast<char>(form_.page->leave)) : "");
      script_.fail_at = 0;
      expect(LXCloseStream(stream_, l_, 0), 0, fatal ? LX_E_FLUSH : LX_E_COUNT);
      ASSERT_EQ(hex(script_.wire), hex(expected)) << form_.name() << choice;
      continue;
    }
    script_.fail_at = SIZE_MAX;
    expect(LXFlushStream(stream_, l_, 0), 1, LX_OK);
    add(list_[1]);
    if (out.inside) expected += static_cast<char>(form_.page->leave);
    close();
    ASSERT_EQ(hex(script_.wire), hex(expected)) << form_.name() << choice;
  }
}

TEST_F(Streams, LinesOfEveryKindInEveryRoom) {
  EdgeBuffer buffer(1000);
  for (uint32_t choice = 0; choice < forms_.size() * 128 * 18; ++choice) {
    use(forms_[choice / 128 / 18], u"aあい21b2 1121あ34c亜2112あ2");
    const uint32_t flags = choice % 16 << 8 | (choice & 16) << 11 | (choice & 32) << 9 | (choice & 64) >> 3;
    const uint32_t ends = choice % 16 != 0 ? flags : LX_EOL_1;
    const bool counted = flags & LX_OPT_CHARS;
    const int32_t size = static_cast<int32_t>(choice / 128 % 18) - 1;
    const size_t ended = flags & LX_OPT_TERMINATE && size > 0, room = size > 0 ? static_cast<size_t>(size) - ended : 0;
    open({bytes_, false, 2});
    auto is = [&](size_t at, size_t i, uint32_t flag) {
      return (ends & flag) != 0 && list_[at].size == 1 && list_[at].code == line_character(i);
    };
    auto stored = [&](size_t count) {  // the first characters in memory
      Writer out{form_};
      for (size_t i = 0; i < count; ++i) out.add(piece(out, list_[i]));
      if (out.inside) out.units.push_back(form_.page->leave);
      return out.units;
    };
    for (size_t taken = 1; taken != 0;) {  // up to the line end, as far as there is room, without tearing a pair
      size_t line_end = taken = 0;
      for (size_t at = 0; at < list_.size() && line_end == 0; at = taken) {
        ++taken;
        line_end = is(at, 0, LX_EOL_1) || is(at, 2, LX_EOL_3) || is(at, 3, LX_EOL_4);
        if (at > 0 && is(at - 1, 1, LX_EOL_21) && is(at, 0, LX_EOL_21)) line_end = 2;
      }
      const size_t wanted = taken;
      while (taken > 0 && (counted ? taken : stored(taken).size()) > room) --taken;
      char* out = buffer.room(((counted ? stored(taken).size() : room) + ended) * form_.unit_size());
      if (line_end == 2 && taken > 1 && taken == wanted - 1) --taken;
      if (taken < wanted) line_end = 0;
      const size_t length = taken - (flags & LX_EOL_KEEP ? 0 : line_end);
      Units expected = stored(length);
      expected.resize(expected.size() + (list_.empty() ? 0 : ended));
      const size_t result = list_.empty() ? SIZE_MAX : counted ? length + ended : expected.size();
      expect(line(out, size, flags), static_cast<int32_t>(result), LX_OK);
      ASSERT_EQ(hex({out, expected.size() * form_.unit_size()}), hex(raw(form_, expected))) << flags << " " << size;
      list_.erase(list_.begin(), list_.begin() + static_cast<ptrdiff_t>(taken));
    }
    close();
  }
}

TEST_F(Streams, WrongUse) {
  for (size_t choice = 0; choice < forms_.size() * 2; ++choice) {
    use(forms_[choice / 2], {});
    const bool writes = choice % 2;
    open({"\x0E\x42\x0F\x40", writes});
    Character c = {0, 1, 1, 'a', 0};
    expect(put(nullptr, c, writes), 0, LX_E_ARGUMENT);
    expect(put(stream_, c, writes), 0, LX_E_DIRECTION);
    if (!ucs2_ && form_.kind != Form::wide) {
      c.size = 0;  // no text at all
      expect(put(stream_, c, !writes), 0, LX_E_ARGUMENT);
    }
    expect(writes ? read(c) : LXFlushStream(stream_, l_, 0), 0, LX_E_DIRECTION);
    expect(line(nullptr, 0, writes ? 0 : 0x1100), -2, writes ? LX_E_DIRECTION : LX_E_ARGUMENT);
    if (!writes && wire_.follows_shifts()) {  // a run that lost a byte: told once, then read as it is
      expect(read(c), 0, LX_E_COUNT);
      expect(read(c) ? c.code : 0, 0x420F, LX_OK);
    }
    close();
    stream_ = LXOpenStream(l_, writes ? Script::move : nullptr, &script_, LX_STREAM_READ - writes);
    expect(stream_ != nullptr, 0, LX_E_ARGUMENT);
  }
}

TEST_F(Streams, MemoryRunsOut) {
  use(forms_.back(), {});
  memory_.arm(0, false);
  std::string bytes;
  for (char16_t unit : {u'a', u'b', u'c', u'\n'}) bytes += stored_unit(unit, 2);
  open({bytes});
  expect(stream_ != nullptr, 0, LX_E_MEMORY);
  open(Script(script_));
  for (auto [at, result] : {std::pair(0, -2), {2, 2}, {-1, 1}}) {  // at the first unit, the third, none
    memory_.arm(at, false);
    LXUChar text[5] = {};
    expect(line(reinterpret_cast<char*>(text), 5, LX_EOL_1), result, at < 0 ? LX_OK : LX_E_MEMORY);
    EXPECT_EQ(text[0], at == 0 ? 0 : at < 0 ? 'c' : 'a');
  }
  memory_.free_fails = true;
  expect(LXCloseStream(stream_, l_, 0), 0, LX_E_FREE);
}

}  // namespace
}  // namespace lx::test
