// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/library_session.hpp"

#include "tools/lexaro/data_directory.hpp"
#include "tools/lexaro/failure.hpp"

namespace lx::tool {

namespace {

// The directory, or nothing when the built-in objects have to serve.
std::optional<std::string> data_directory(const std::optional<std::string>& wanted, WithoutData without_data) {
  try {
    return find_data_directory(wanted);
  } catch (const Failure& failure) {
    if (wanted || without_data == WithoutData::kFail) throw;
    complain(std::string(failure.what()) + "\nThe built-in English, UnitedStates and US-ASCII serve.");
    return std::nullopt;
  }
}

}  // namespace

LibrarySession::LibrarySession(const std::optional<std::string>& locale_directory, WithoutData without_data) {
  const auto directory = data_directory(locale_directory, without_data);
  const uint32_t status = directory ? LXInit(directory->c_str(), nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS)
                                    : LXInit(nullptr, nullptr, nullptr, nullptr, 0);
  if (status == LX_OK || (status == LX_E_DEFAULTS && !directory)) return;
  if (status == LX_E_DEFAULTS) LXTerm();
  throw Failure(ExitStatus::kCodePage, display_name(directory.value_or("built-in objects")) +
                                           ": the locale data cannot be used (" + describe_status(status) + ")");
}

std::string describe_status(uint32_t status) {
  switch (status) {
    case LX_E_OPEN:
      return "a file cannot be opened";
    case LX_E_DEFAULTS:
    case LX_E_MANAGER:
      return "control.nls is damaged or its path is too long";
    case LX_E_MEMORY:
      return "out of memory";
    case LX_E_CODEPAGE:
      return "code page not found";
    case LX_E_LANGUAGE:
      return "language not found";
    case LX_E_TERRITORY:
      return "territory not found";
    case LX_E_SORT:
      return "sort not found";
    case LX_E_NOTFOUND:
      return "object not found";
    case LX_E_NOFILE:
      return "its file is missing";
    case LX_E_ACCESS:
      return "no permission to read its file";
    case LX_E_FILE:
      return "its file cannot be read";
    case LX_E_HEADER:
      return "its file is damaged";
    default:
      return "status " + std::to_string(status);
  }
}

}  // namespace lx::tool
