// SPDX-License-Identifier: Apache-2.0
#include "nls1/translation_model.hpp"

#include <algorithm>
#include <cstring>
#include <vector>

namespace lx::test {
namespace {

uint8_t byte_at(const std::string& text, size_t at) { return static_cast<uint8_t>(text[at]); }

uint16_t unit_at(const std::string& text, size_t at) {
  uint16_t unit = 0;
  std::memcpy(&unit, text.data() + at, sizeof unit);
  return unit;
}

std::string unit_bytes(uint16_t unit) { return {reinterpret_cast<const char*>(&unit), sizeof unit}; }

bool is_shift(const PageSource& page, uint8_t byte) { return byte == page.enter || byte == page.leave; }

// The input, from its beginning in the single-byte state.
struct Input {
  const PageSource* page;
  const std::string& text;
  size_t at = 0;
  bool inside = false;  // a double-byte run
  size_t resume = 0;    // before the shift bytes that were skipped last: where a further call goes on

  void skip_shifts() {
    resume = at;
    while (page != nullptr && page->mixed() && at < text.size() && is_shift(*page, byte_at(text, at))) {
      inside = byte_at(text, at++) == page->enter;
    }
  }
  bool done() const { return at == text.size(); }
  size_t length() const {
    if (page == nullptr) return 2;
    if (page->mixed()) return inside ? page->max_length : 1u;
    return page->length_of(byte_at(text, at));
  }
  bool cut() const { return length() > text.size() - at; }
  uint16_t character() const { return page != nullptr ? page->decode(text.substr(at, length())) : unit_at(text, at); }
  bool only_blanks() const {
    if (inside) return false;
    if (page != nullptr) {
      return std::all_of(text.begin() + static_cast<ptrdiff_t>(at), text.end(),
                         [blank = page->encode(0x20)[0]](char byte) { return byte == blank; });
    }
    for (size_t unit = at; unit + 2 <= text.size(); unit += 2) {
      if (unit_at(text, unit) != 0x20) return false;
    }
    return true;
  }
};

struct Output {
  const PageSource* page;
  std::string bytes;
  bool inside = false;

  std::string piece(uint16_t character) const {
    if (page == nullptr) return unit_bytes(character);
    std::string code = page->encode(character);
    if (page->mixed() && inside != (code.size() > 1)) {
      code.insert(code.begin(), static_cast<char>(inside ? page->leave : page->enter));
    }
    return code;
  }
  void add(const std::string& piece) {
    if (page != nullptr && page->mixed() && is_shift(*page, byte_at(piece, 0))) inside = !inside;
    bytes += piece;
  }
  void add_unit(uint16_t value) {
    bytes += page != nullptr ? std::string(1, static_cast<char>(value)) : unit_bytes(value);
  }
};

class Model {
 public:
  explicit Model(const FieldCall& call)
      : call_(call),
        by_characters_(call.has(LX_OPT_CHARS)),
        unit_(call.to == nullptr && !by_characters_ ? 2 : 1),
        limit_(call.size / unit_ - (call.has(LX_OPT_TERMINATE) ? 1 : 0)),
        in_{call.from, call.text},
        out_{call.to, {}} {}

  FieldResult result() {
    if (call_.to == nullptr && call_.from == nullptr) {
      copy();
    } else if (call_.from == nullptr && call_.to->kind == PageSource::Kind::single) {
      fill_half();
    } else {
      carry();
      close();
    }
    return finish();
  }

 private:
  size_t used() const { return by_characters_ ? characters_ : out_.bytes.size() / unit_; }

  void refuse() {
    refused_ = true;
    if (!call_.has(NLS1_XLT_BLANKS) || !in_.only_blanks()) error_ = LX_E_BUFFER;
  }

  // The room plays no part.
  void copy() {
    characters_ = call_.text.size() / 2;
    consumed_ = characters_ * 2;
    out_.bytes = call_.text.substr(0, consumed_);
  }

  void fill_half() {
    characters_ = std::min(call_.text.size(), limit_) / 2;
    for (size_t i = 0; i < characters_; ++i) out_.add(out_.piece(unit_at(call_.text, i * 2)));
    consumed_ = in_.at = characters_ * 2;
    if (call_.text.size() > limit_) refuse();
  }

  void carry() {
    for (;;) {
      in_.skip_shifts();
      consumed_ = in_.at;
      if (in_.done() || in_.cut()) {
        cut_ = !in_.done();
        return;
      }
      const std::string piece = out_.piece(in_.character());
      if (by_characters_ ? characters_ == limit_ : (out_.bytes.size() + piece.size()) / unit_ > limit_) {
        consumed_ = in_.resume;
        return refuse();
      }
      before_last_ = {out_, in_.resume};
      out_.add(piece);
      in_.at += in_.length();
      ++characters_;
    }
  }

  // A text ends in the single-byte state, if need be without its last character.
  void close() {
    if (!out_.inside) return;
    if (!by_characters_ && out_.bytes.size() == limit_) {
      out_ = before_last_.out;
      consumed_ = before_last_.consumed;
      refused_ = true;
      error_ = LX_E_BUFFER;
    }
    if (out_.inside) out_.add_unit(out_.page->leave);
  }

  FieldResult finish() {
    size_t count = used();
    if (call_.has(NLS1_XLT_PAD)) {
      for (; count < limit_; ++count) out_.add_unit(call_.to != nullptr ? byte_at(call_.to->encode(0x20), 0) : 0x20);
    }
    const bool all = !refused_ && !cut_;
    if (call_.has(LX_OPT_TERMINATE) ? count <= limit_ : call_.measured && all && count < limit_) {
      out_.add_unit(0);
      ++count;
    }
    return {static_cast<int32_t>(count * unit_), out_.bytes,
            static_cast<int32_t>(by_characters_ ? characters_ : consumed_), error_};
  }

  const FieldCall& call_;
  const bool by_characters_;
  const size_t unit_;   // bytes that count as `unit_` in sizes and results
  const size_t limit_;  // units or characters, without the terminator
  Input in_;
  Output out_;
  struct {
    Output out;
    size_t consumed;
  } before_last_ = {{nullptr, {}}, 0};
  size_t characters_ = 0;
  size_t consumed_ = 0;
  bool refused_ = false;
  bool cut_ = false;
  uint32_t error_ = LX_OK;
};

FieldResult nothing(const FieldCall& call) {
  if (!call.has(LX_OPT_TERMINATE) || call.size == 0) return {};
  const bool unit = call.to == nullptr && (call.has(LX_OPT_CHARS) || call.size >= 2);
  return {1, std::string(unit ? 2 : 1, '\0'), 0, LX_OK};
}

}  // namespace

FieldResult translate_model(const FieldCall& call) {
  if (call.text.empty() || call.size == 0) return nothing(call);
  if (call.to == nullptr && !call.has(LX_OPT_CHARS) && call.size < 2) return {-1, "", 0, LX_E_BUFFER};
  return Model(call).result();
}

Counted count_characters(const PageSource* page, const std::string& text) {
  Counted result = {0, 0};
  for (Input in = {page, text};; in.at = result.bytes) {
    in.skip_shifts();
    if (in.done() || in.cut()) return result;
    ++result.characters;
    result.bytes = in.at + in.length();
  }
}

const PageSource* page_of(uint16_t id) { return id == LX_CP_UCS2 ? nullptr : &PageSource::of(id); }

std::string spelled(const PageSource* page, std::u16string_view text) {
  Output out = {page, {}};
  for (char16_t character : text) out.add(out.piece(character));
  if (out.inside) out.add_unit(page->leave);
  return out.bytes;
}

std::string ucs2_bytes(std::u16string_view text) { return spelled(nullptr, text); }

}  // namespace lx::test
