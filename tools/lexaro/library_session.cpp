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
    complain(failure.text() + "\n" + message("The built-in English, UnitedStates and US-ASCII serve."));
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
  throw Failure(ExitStatus::kCodePage,
                message("{0}: the locale data cannot be used ({1})",
                        directory ? display_name(*directory) : message("built-in objects"), describe_status(status)));
}

Message describe_status(uint32_t status) {
  switch (status) {
    case LX_E_OPEN:
      return message("a file cannot be opened");
    case LX_E_DEFAULTS:
    case LX_E_MANAGER:
      return message("control.nls is damaged or its path is too long");
    case LX_E_MEMORY:
      return message("out of memory");
    case LX_E_CODEPAGE:
      return message("code page not found");
    case LX_E_LANGUAGE:
      return message("language not found");
    case LX_E_TERRITORY:
      return message("territory not found");
    case LX_E_SORT:
      return message("sort not found");
    case LX_E_NOTFOUND:
      return message("object not found");
    case LX_E_NOFILE:
      return message("its file is missing");
    case LX_E_ACCESS:
      return message("no permission to read its file");
    case LX_E_FILE:
      return message("its file cannot be read");
    case LX_E_HEADER:
      return message("its file is damaged");
    default:
      return message("status {0}", status);
  }
}

}  // namespace lx::tool
