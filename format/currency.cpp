// SPDX-License-Identifier: Apache-2.0
// Amounts of money with their currency symbol and sign.
#include "format/fixed_point.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "currency", 0};

// ---- Layout ----

enum class Piece : uint8_t { symbol, sign, space, amount, open, close };

// The pieces of an amount in reading order.
class Layout {
 public:
  Layout(unsigned sign_position, bool symbol_first, bool spaced) {
    if (sign_position == 0) add(Piece::open);
    if (sign_position == 1) add(Piece::sign);
    if (symbol_first) add_symbol(sign_position);
    if (symbol_first && spaced) add(Piece::space);
    add(Piece::amount);
    if (!symbol_first && spaced) add(Piece::space);
    if (!symbol_first) add_symbol(sign_position);
    if (sign_position == 2) add(Piece::sign);
    if (sign_position == 0) add(Piece::close);
  }
  const Piece* begin() const { return pieces_; }
  const Piece* end() const { return pieces_ + count_; }

 private:
  void add(Piece piece) { pieces_[count_++] = piece; }
  void add_symbol(unsigned sign_position) {
    if (sign_position == 3) add(Piece::sign);
    add(Piece::symbol);
    if (sign_position > 3) add(Piece::sign);
  }

  Piece pieces_[5];
  size_t count_ = 0;
};

// Which items belong to an amount.
struct AmountItems {
  uint32_t sign;
  uint32_t sign_position;
  uint32_t symbol_first;
  uint32_t spaced;
};
constexpr AmountItems kPositive = {LX_ITEM_POSITIVE_SIGN, LX_ITEM_P_SIGN_POSN, LX_ITEM_P_CS_PRECEDES,
                                   LX_ITEM_P_SEP_BY_SPACE};
constexpr AmountItems kNegative = {LX_ITEM_NEGATIVE_SIGN, LX_ITEM_N_SIGN_POSN, LX_ITEM_N_CS_PRECEDES,
                                   LX_ITEM_N_SEP_BY_SPACE};

// ---- Writing ----

template <class Kind>
class Amount {
 public:
  using Unit = typename Kind::Unit;

  Amount(const LXLocale& locale, double amount, uint32_t flags)
      : locale_(locale),
        page_(page_of(locale)),
        spelling_(spelling_of<Kind>(page_)),
        flags_(flags),
        international_((flags & LX_NUM_INTLSYM) != 0),
        number_(amount),
        items_(number_.negative() ? kNegative : kPositive) {}

  void put(Output<Unit>& out) const {
    for (Piece piece :
         Layout(setting(items_.sign_position), setting(items_.symbol_first) != 0, setting(items_.spaced) != 0)) {
      put(out, piece);
      if (out.cut()) return;
    }
  }

 private:
  void put(Output<Unit>& out, Piece piece) const {
    switch (piece) {
      case Piece::symbol:
        return put_text(out, international_ ? LX_ITEM_CURRENCY_INTL : LX_ITEM_CURRENCY, SIZE_MAX);
      case Piece::sign:
        return put_text(out, items_.sign, number_.negative() ? kNegativeSignLimit : SIZE_MAX);
      case Piece::amount:
        return put_number(out);
      case Piece::space:
        return out.put(spelling_.space);
      case Piece::open:
        return out.put(spelling_.open);
      case Piece::close:
        return out.put(spelling_.close);
    }
  }
  void put_text(Output<Unit>& out, uint32_t item, size_t limit) const {
    const LocalText<Kind, 32> text(locale_, item, flags_);
    out.template put_text<Kind>(page_, {text.begin(), text.length()}, limit);
  }
  void put_number(Output<Unit>& out) const {
    const NumberItems items = {LX_ITEM_MON_DECIMAL, LX_ITEM_MON_THOUSANDS, LX_ITEM_MON_GROUPING,
                               international_ ? LX_ITEM_CURRENCY_INTL_DIGITS : LX_ITEM_CURRENCY_DIGITS};
    FixedPointText<Kind>(locale_, number_, items, flags_).put(out);
  }
  uint16_t setting(uint32_t item) const { return local_number(locale_, item, flags_); }

  static constexpr size_t kNegativeSignLimit = 3;

  const LXLocale& locale_;
  const CodePage& page_;
  const Spelling& spelling_;
  const uint32_t flags_;
  const bool international_;
  const FixedPoint number_;
  const AmountItems& items_;
};

// Where lengths count characters, these many bytes are the most that is written: of each, and of all.
constexpr size_t kCharacterRoom = 6;  // with shift bytes around it
constexpr size_t kCharactersRoom = 512;

template <class Kind, class Unit = typename Kind::Unit>
int32_t write_amount(LocaleCall& call, double value, const Destination<Unit>& to) {
  if (to.empty()) return call.fail(LX_E_BUFFER, 0);
  const Amount<Kind> amount(call.locale, value, to.flags);
  const bool in_characters = Kind::kBytes && to.in_characters();
  size_t room = to.room();
  if (in_characters) {
    const size_t bytes = std::min(static_cast<size_t>(to.length) * kCharacterRoom, kCharactersRoom);
    room = bytes - (to.terminated() ? 1 : 0);
  }
  Output<Unit> out(to.buffer, room, to.room());
  amount.put(out);
  if (to.terminated()) out.terminate();
  if (out.cut()) call.status = LX_E_BUFFER;
  return static_cast<int32_t>(in_characters ? static_cast<size_t>(to.length) - out.characters_left() : out.written());
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t currency_call(const char* function, LXLocale* locale, double value, const Destination<Unit>& to) {
  // Without room for any character the other flags are not looked at.
  constexpr uint32_t kFlags = LX_NUM_TEXTOPT | LX_NUM_TERMINATE | LX_NUM_INTLSYM | LX_NUM_CHARLEN;
  const uint32_t accepted = to.in_characters() && to.length <= 0 ? ~0u : kFlags;
  return locale_call(trace_unit, function, locale, to.flags, accepted, int32_t{-1},
                     [&](LocaleCall& call) { return write_amount<Kind>(call, value, to); });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXCurrencyToString(LXLocale* locale, double amount, char* buffer, int32_t length, uint32_t flags) noexcept {
  return currency_call<PlainKind>(__func__, locale, amount, {buffer, 0, length, flags});
}

int32_t LXCurrencyToStringEx(LXLocale* locale, double amount, char* buffer, uint32_t state, int32_t length,
                             uint32_t flags) noexcept {
  return currency_call<ShiftedKind>(__func__, locale, amount, {buffer, state, length, flags});
}

int32_t LXCurrencyToStringW(LXLocale* locale, double amount, LXWChar* buffer, int32_t length, uint32_t flags) noexcept {
  return currency_call<WideKind>(__func__, locale, amount, {buffer, 0, length, flags});
}

int32_t LXCurrencyToStringU(LXLocale* locale, double amount, LXUChar* buffer, int32_t length, uint32_t flags) noexcept {
  return currency_call<Ucs2Kind>(__func__, locale, amount, {buffer, 0, length, flags});
}

}  // extern "C"
