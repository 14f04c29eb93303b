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
  for (const std::string& directory : program_share_directories()) candidates.push_back(directory + "/locale");
  char standard[256];
  if (LXGetDataLocation(standard, sizeof standard, 1) > 0) candidates.emplace_back(standard);
  return candidates;
}

}  // namespace

std::vector<std::string> program_share_directories() {
  std::error_code error;
  const fs::path program = fs::read_symlink("/proc/self/exe", error);
  if (error) return {};
  const fs::path prefix = program.parent_path().parent_path();  // PREFIX/bin/lexaro
  const fs::path build = prefix.parent_path();
  return {(prefix / "share/lexaro").string(), (build / "share/lexaro").string()};
}

std::string usual_data_directory() {
  for (const std::string& candidate : candidate_directories()) {
    if (holds_control_file(candidate)) return candidate;
  }
  return "";
}

std::string find_data_directory(const std::optional<std::string>& wanted) {
  if (wanted) {
    if (wanted->empty()) throw usage_failure(message("--locale-dir needs a directory"));
    if (holds_control_file(*wanted)) return *wanted;
    throw Failure(ExitStatus::kCodePage,
                  message("{0}: no locale data there (control.nls is missing)", display_name(*wanted)));
  }
  if (const std::string usual = usual_data_directory(); !usual.empty()) return usual;
  Message text = message("no locale data found; tried");
  for (const std::string& candidate : candidate_directories()) text += "\n  " + display_name(candidate);
  throw Failure(ExitStatus::kCodePage, text + "\n" + message("Name the directory with --locale-dir or LX_LOCALEDIR."));
}

}  // namespace lx::tool
