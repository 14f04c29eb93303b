// SPDX-License-Identifier: Apache-2.0
// The form of a sort object that states each weight.
#pragma once

#include "sort_object.hpp"
#include "source_text.hpp"

namespace lx::compiler {

class SortWeightsReader {
 public:
  void line(Cursor& cursor);
  // Fails when a page is missing.
  SortObject take(Spot end);

 private:
  void pages(Cursor& cursor);
  void character(Cursor& cursor);
  void expansion(Cursor& cursor);
  void pair(Cursor& cursor);

  SortObject sort_;
  bool stated_[256] = {};    // pages
  bool seen_[0x10000] = {};  // characters of tables
  unsigned seen_count_ = 0;
};

// Lines that the reader takes.
std::string write_sort_weights(const SortObject& sort);

}  // namespace lx::compiler
