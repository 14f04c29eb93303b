// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/failure.hpp"

#include <cstdio>
#include <system_error>

namespace lx::tool {

Failure usage_failure(const std::string& message) { return {ExitStatus::kUsage, message}; }

Failure system_failure(const std::string& subject, int error_number) {
  return {ExitStatus::kInputOutput, subject + ": " + std::generic_category().message(error_number)};
}

void complain(std::string_view text) {
  std::string line = "lexaro: ";
  line.append(text).push_back('\n');
  std::fwrite(line.data(), 1, line.size(), stderr);
}

std::string display_name(const std::string& path) {
  if (path == "-") return "standard input";
  if (path.empty()) return "\"\"";
  std::string shown = path;
  for (char& c : shown) {
    const auto byte = static_cast<unsigned char>(c);
    if (byte < 0x20 || byte == 0x7F) c = '?';
  }
  return shown;
}

}  // namespace lx::tool
