// SPDX-License-Identifier: Apache-2.0
#include "nls1/translation_model.hpp"

#include <algorithm>
#include <cstring>

namespace lx::test {
namespace {

class Model {
 public:
  explicit Model(const FieldCall& call) : call_(call) {}

  FieldResult result() {
    const bool half = !call_.from.is_bytes() && call_.to.is_bytes() && call_.to.page->kind == PageSource::Kind::single;
    if (!call_.to.is_bytes() && !call_.from.is_bytes()) {  // the room plays no part
      out_.units = in_;
      characters_ = in_.size();
      consumed_ = characters_;
    } else if (half) {
      characters_ = std::min(in_.size() * 2, limit_) / 2;
      for (size_t i = 0; i < characters_; ++i) out_.add(out_.piece(static_cast<uint16_t>(in_[i])));
      consumed_ = characters_;
      if (in_.size() * 2 > limit_) refuse(characters_, false);
    } else {
      carry();
    }
    return finish();
  }

 private:
  size_t used() const { return by_characters_ ? characters_ : out_.units.size(); }
  uint32_t blank(const Form& form) const { return form.is_bytes() ? units_of(form.page->encode(0x20))[0] : 0x20; }

  // What is left has no room, which is no error when nobody will miss it.
  void refuse(size_t at, bool inside) {
    refused_ = true;
    bool blanks = !inside && std::all_of(in_.begin() + static_cast<ptrdiff_t>(at), in_.end(),
                                         [&](uint32_t unit) { return unit == blank(call_.from); });
    if (!call_.has(NLS1_XLT_BLANKS) || !blanks) error_ = LX_E_BUFFER;
  }

  // A further call goes on before the shift bytes that were skipped last.
  void carry() {
    const Characters found = characters_of(call_.from, in_);
    size_t resume = 0, before = 0;
    Writer shorter = out_;
    for (const Character& c : found.list) {
      const Units piece = out_.piece(unicode_of(call_.from, c));
      if (by_characters_ ? characters_ == limit_ : out_.units.size() + piece.size() > limit_) {
        consumed_ = resume;
        refuse(c.at, c.state != 0);
        break;
      }
      shorter = out_;
      before = resume;
      out_.add(piece);
      resume = c.own_end();
      ++characters_;
    }
    if (!refused_) consumed_ = found.whole;
    cut_ = !refused_ && (found.cut || in_.size() * call_.from.unit_size() < call_.text.size());
    // A text ends in the single-byte state, if need be without its last character.
    if (!out_.inside) return;
    if (!by_characters_ && out_.units.size() == limit_) {
      out_ = shorter;
      consumed_ = before;
      refused_ = true;
      error_ = LX_E_BUFFER;
    }
    if (out_.inside) out_.units.push_back(call_.to.page->leave);
  }

  FieldResult finish() {
    size_t count = used();
    for (; call_.has(NLS1_XLT_PAD) && count < limit_; ++count) out_.units.push_back(blank(call_.to));
    const bool all = !refused_ && !cut_;
    if (call_.has(LX_OPT_TERMINATE) ? count <= limit_ : call_.measured && all && count < limit_) {
      out_.units.push_back(0);
      ++count;
    }
    return {static_cast<int32_t>(count * unit_), raw(call_.to, out_.units),
            static_cast<int32_t>(by_characters_ ? characters_ : consumed_ * call_.from.unit_size()), error_};
  }

  const FieldCall& call_;
  const bool by_characters_ = call_.has(LX_OPT_CHARS);
  const size_t unit_ = by_characters_ ? 1 : call_.to.unit_size();  // bytes that count as one in sizes and results
  const size_t limit_ = call_.size / unit_ - (call_.has(LX_OPT_TERMINATE) ? 1 : 0);  // without the terminator
  const Units in_ = units_in(call_.from, call_.text);
  Writer out_{call_.to};
  size_t characters_ = 0;
  size_t consumed_ = 0;
  bool refused_ = false;
  bool cut_ = false;
  uint32_t error_ = LX_OK;
};

}  // namespace

FieldResult translate_model(const FieldCall& call) {
  if (call.text.empty() || call.size == 0) {
    if (!call.has(LX_OPT_TERMINATE) || call.size == 0) return {};
    const bool unit = !call.to.is_bytes() && (call.has(LX_OPT_CHARS) || call.size >= 2);
    return {1, std::string(unit ? 2 : 1, '\0'), 0, LX_OK};
  }
  if (!call.to.is_bytes() && !call.has(LX_OPT_CHARS) && call.size < 2) return {-1, "", 0, LX_E_BUFFER};
  return Model(call).result();
}

Form form_of(uint16_t page) {
  if (page == LX_CP_UCS2) return {Form::ucs2, nullptr};
  return {Form::shifted, &PageSource::of(page)};
}

Units units_in(const Form& form, std::string_view bytes) {
  if (form.is_bytes()) return units_of(bytes);
  Units units;
  for (size_t at = 0; at + 2 <= bytes.size(); at += 2) {
    uint16_t unit = 0;
    std::memcpy(&unit, bytes.data() + at, sizeof unit);
    units.push_back(unit);
  }
  return units;
}

}  // namespace lx::test
