// SPDX-License-Identifier: Apache-2.0
// A host that keeps the library's messages. Linking trace_capture.cpp replaces the trace services.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace lx::test {

// Messages while the object lives, in their order; events read "LXInit entry", "LXInit exit 0".
class TraceCapture {
 public:
  TraceCapture();
  ~TraceCapture();
  TraceCapture(const TraceCapture&) = delete;
  TraceCapture& operator=(const TraceCapture&) = delete;

  const std::vector<std::string>& messages() const;
  bool has(std::string_view message) const;  // word for word
  std::string all() const;
};

}  // namespace lx::test
