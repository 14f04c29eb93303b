// SPDX-License-Identifier: Apache-2.0
// A text of any length on its way from one code page into another.
#pragma once

#include <cstdint>
#include <exception>
#include <functional>
#include <string_view>
#include <vector>

#include "tools/lexaro/code_page_names.hpp"

namespace lx::tool {

inline constexpr std::size_t kBufferSize = 256 * 1024;

class Conversion {
 public:
  using Sink = std::function<void(std::string_view)>;                         // takes the converted bytes
  using ProblemFn = std::function<void(const LXConversionProblem& problem)>;  // hears of each problem as it is met

  Conversion(const CodePage& from, const CodePage& to, uint32_t options, Sink sink, ProblemFn on_problem = {});
  Conversion(const Conversion&) = delete;
  Conversion& operator=(const Conversion&) = delete;

  // Converts the next piece of the text; pieces may be cut anywhere.
  void convert(std::string_view piece);
  // Ends the text.
  void finish();

  LXConversionCounts counts() const;

 private:
  static void hear_problem(void* context, const LXConversionProblem* problem);
  // One call of the library with an empty buffer; whether it asks to be called again.
  template <class Call>
  bool step(Call call);

  ConversionPtr handle_;
  Sink sink_;
  ProblemFn on_problem_;
  std::exception_ptr problem_failure_;
  std::vector<char> buffer_;
};

}  // namespace lx::tool
