// SPDX-License-Identifier: Apache-2.0
// Finds where a text has to end so that it fits.
#pragma once

#include <string>
#include <string_view>

#include "tools/lexaro/conversion.hpp"
#include "tools/lexaro/record_page.hpp"

namespace lx::tool {

// Converts a second time, byte by byte where the room ends: that tells which source byte the cut falls behind. Only
// texts that are too long come here.
class CutFinder {
 public:
  struct Cut {
    std::string_view text;  // whole characters, in the single-byte state at the end; until the next call
    std::size_t used;       // bytes of the source in it
    bool only_blanks;       // nothing else was cut off
  };

  CutFinder(const RecordPage& from, const RecordPage& to, uint32_t options);

  Cut find(std::string_view source, std::size_t width);

 private:
  // Goes over what the last step added: whether it is nothing but blanks.
  bool pass_blanks(std::string_view added);

  const RecordPage& to_;
  std::string text_;
  bool double_byte_ = false;
  Conversion conversion_;
};

}  // namespace lx::tool
