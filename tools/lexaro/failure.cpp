// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/failure.hpp"

#include <cstdio>
#include <filesystem>

namespace lx::tool {

Failure usage_failure(const Message& text) { return {ExitStatus::kUsage, text}; }

Failure system_failure(const Message& subject, int error_number) {
  return {ExitStatus::kInputOutput, subject + ": " + system_error_text(error_number)};
}

Failure system_failure(const std::system_error& error) {
  const auto* of_file = dynamic_cast<const std::filesystem::filesystem_error*>(&error);
  const int number = error.code().value();
  if (of_file != nullptr) return system_failure(display_name(of_file->path1().string()), number);
  return {ExitStatus::kInputOutput, system_error_text(number)};
}

void complain(const Message& text) {
  const std::string line = "lexaro: " + text.shown + "\n";
  std::fwrite(line.data(), 1, line.size(), stderr);
}

Message display_name(const std::string& path) {
  return path == "-" ? message("standard input") : Message(plain_name(path));
}

std::string plain_name(const std::string& path) {
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
