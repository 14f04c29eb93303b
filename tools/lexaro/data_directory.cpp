// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/data_directory.hpp"

#include <cstdlib>
#include <filesystem>
#include <system_error>
#include <vector>

#include "lexaro/lexaro.h"
#include "tools/lexaro/failure.hpp"

namespace lx::tool {
namespace {

namespace fs = std::filesystem;

bool holds_control_file(const std::string& directory) {
  std::error_code error;
  return fs::exists(directory + "/control.nls", error);
}

std::vector<std::string> candidate_directories() {
  std::vector<std::string> candidates;
  if (const char* value = std::getenv("LX_LOCALEDIR"); value && *value) candidates.emplace_back(value);

  std::error_code error;
  const fs::path program = fs::read_symlink("/proc/self/exe", error);
  if (!error) {
    const fs::path home = program.parent_path();
    candidates.push_back((home.parent_path() / "share/lexaro/locale").string());                // PREFIX/bin/lexaro
    candidates.push_back((home.parent_path().parent_path() / "share/lexaro/locale").string());  // a build tree
  }
  char standard[256];
  if (LXGetDataLocation(standard, sizeof standard, 1) > 0) candidates.emplace_back(standard);
  return candidates;
}

}  // namespace

std::string find_data_directory(const std::optional<std::string>& wanted) {
  if (wanted) {
    if (wanted->empty()) throw usage_failure("--locale-dir needs a directory");
    if (holds_control_file(*wanted)) return *wanted;
    throw Failure(ExitStatus::kCodePage, display_name(*wanted) + ": no locale data there (control.nls is missing)");
  }
  std::string message = "no locale data found; tried";
  for (const std::string& candidate : candidate_directories()) {
    if (holds_control_file(candidate)) return candidate;
    message += "\n  " + display_name(candidate);
  }
  throw Failure(ExitStatus::kCodePage, message + "\nName the directory with --locale-dir or LX_LOCALEDIR.");
}

}  // namespace lx::tool
