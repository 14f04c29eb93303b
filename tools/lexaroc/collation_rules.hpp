// SPDX-License-Identifier: Apache-2.0
// The rules by which a language changes the root collation.
#pragma once

#include "collation.hpp"

namespace lx::compiler {

// Begins with the root and applies one rule after the other. What a rule cannot do is thrown as SourceError.
class Tailoring {
 public:
  // `root` must stay.
  explicit Tailoring(const Collation& root);

  // "upper-first" or "backward-secondary"
  void option(Cursor& cursor);
  // Behind "&": a place in the order, and what comes after it.
  void rule(Cursor& cursor);
  // Behind "follow": a letter that has been moved, and characters that move to it with their own accents and case.
  void follow(Cursor& cursor);

  const Collation& result() const { return collation_; }

 private:
  enum class Level { primary, secondary, tertiary, equal };
  struct Step {
    Level level;
    std::u16string characters;
    std::u16string extension;
    Spot spot;
  };

  Step read_step(Cursor& cursor) const;
  WeightSets sets_of(const std::u16string& characters, Spot spot) const;
  void apply(const Step& step, WeightSets& current);
  WeightSet after(const WeightSet& current, const Step& step);
  Primary insert_primary(Primary current, Spot spot);
  Tertiary first_tertiary(const std::u16string& characters) const;
  void assign(const std::u16string& characters, const Element& element);
  LetterCase case_of(const std::u16string& characters) const;

  const Collation& root_;
  Collation collation_;
  bool before_ = false;  // the next new primary weight stands before the current one
};

}  // namespace lx::compiler
