// SPDX-License-Identifier: Apache-2.0
// Converts the output back while it is made and compares it with the input, in constant memory and on pipes too.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "tools/lexaro/conversion.hpp"
#include "tools/messages/message.hpp"

namespace lx::tool {

class Verifier {
 public:
  // A byte that does not come back; a side that has no byte there has ended.
  struct Difference {
    uint64_t offset;
    std::optional<uint8_t> source;
    std::optional<uint8_t> returned;
    Message describe() const;
  };

  Verifier(const CodePage& from, const CodePage& to);

  // The next bytes of the input, before any output made of them.
  void expect(std::string_view source);
  // The next bytes of the output.
  void check(std::string_view output);
  void finish();

  const std::optional<Difference>& difference() const { return difference_; }

 private:
  void compare(std::string_view returned);
  std::string_view waiting() const { return std::string_view(window_).substr(compared_); }

  Conversion back_;
  std::string window_;         // source bytes that have not come back yet, behind some that have
  std::size_t compared_ = 0;   // of the window
  uint64_t window_start_ = 0;  // offset of the window's first byte in the input
  std::optional<Difference> difference_;
};

}  // namespace lx::tool
