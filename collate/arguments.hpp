// SPDX-License-Identifier: Apache-2.0
// How the functions of strings read their arguments and give their results, for all kinds of text.
#pragma once

#include "codepage/text/algorithms.hpp"
#include "codepage/text/kinds.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {

// Whether a measured length takes the terminator in.
enum class Terminator : bool { excluded, included };

// Whether a text is read, or its units are copied.
enum class Purpose : bool { reading, copying };

// A text as a call gives it: a negative length is measured, with LX_OPT_CHARS a positive one counts characters.
template <class Kind, class Unit = typename Kind::Unit>
Text<Unit> given_text(const CodePage& page, const Unit* at, uint32_t state, int32_t length, uint32_t options,
                      Terminator terminator, Purpose purpose = Purpose::reading) {
  Text<Unit> text = {at, 0, state};
  if (at == nullptr || length == 0) return text;
  if (length < 0) {
    text.length = measured_length(at) + (terminator == Terminator::included ? 1 : 0);
  } else {
    text.length = static_cast<size_t>(length);
    if ((options & LX_OPT_CHARS) == 0) return text;
    text.length = purpose == Purpose::copying ? length_to_copy<Kind>(page, text, text.length)
                                              : Kind::length_of_characters(page, text, text.length);
  }
  return text;
}

// Units as the call counts them.
template <class Kind, class Unit = typename Kind::Unit>
int32_t counted(const CodePage& page, const Text<Unit>& text, uint32_t options) {
  size_t count = text.length;
  if ((options & LX_OPT_CHARS) != 0) {
    count = Kind::with_walker(page, text, [](auto walker) { return count_characters(walker); });
  }
  return static_cast<int32_t>(count);
}

// Puts a second walker beside a first one of the same type. The page decides on both, so there are no others.
template <class Walker, class Use>
struct BesideWalker {
  const Walker& first;
  Use& use;

  template <class Other>
  auto operator()(Other second) const {
    if constexpr (std::same_as<Walker, Other>) {
      return use(first, second);
    } else {
      return decltype(use(first, first))();
    }
  }
};

template <class Kind, class Unit, class Use>
struct WithSecondWalker {
  const CodePage& page;
  const Text<Unit>& text;
  Use& use;

  template <class Walker>
  auto operator()(Walker first) const {
    return Kind::with_walker(page, text, BesideWalker<Walker, Use>{first, use});
  }
};

// use(walker of a, walker of b), both of the same type.
template <class Kind, class Unit, class Use>
auto with_walkers(const CodePage& page, const Text<Unit>& a, const Text<Unit>& b, Use use) {
  return Kind::with_walker(page, a, WithSecondWalker<Kind, Unit, Use>{page, b, use});
}

}  // namespace lx
