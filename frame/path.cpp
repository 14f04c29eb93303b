// SPDX-License-Identifier: Apache-2.0
// Cuts a path into drive, directory, file and extension, and joins the parts again.
#include <cstring>
#include <string_view>

#include "frame/call.hpp"
#include "frame/text_view.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "path", 0};

constexpr size_t kMaxDrive = 3;
constexpr size_t kMaxDirectory = 255;
constexpr size_t kMaxFile = 14;
constexpr size_t kMaxExtension = 4;

// Parts that are absent or too long are empty.
int32_t deliver(std::string_view part, size_t limit, char* out) {
  if (part.size() > limit) part = {};
  if (!part.empty()) std::memcpy(out, part.data(), part.size());
  out[part.size()] = '\0';
  return static_cast<int32_t>(part.size());
}

std::string_view after_drive(const char* path) {
  std::string_view text = path;
  size_t colon = text.find(':');
  return colon == text.npos ? text : tail(text, colon + 1);
}

bool is_dots(std::string_view name) { return name == "." || name == ".."; }

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t SplitDrive(const char* path, char* drive) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    std::string_view text = path;
    size_t colon = text.find(':');
    return deliver(colon == text.npos ? std::string_view() : head(text, colon + 1), kMaxDrive, drive);
  });
}

int32_t SplitDir(const char* path, char* directory) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    std::string_view text = after_drive(path);
    size_t slash = text.rfind('/');
    if (slash == text.npos) return deliver({}, kMaxDirectory, directory);
    if (!is_dots(tail(text, slash + 1))) text = head(text, slash + 1);
    return deliver(text, kMaxDirectory, directory);
  });
}

int32_t SplitFile(const char* path, char* file) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    std::string_view text = after_drive(path);
    size_t slash = text.rfind('/');
    if (slash != text.npos) text = tail(text, slash + 1);
    if (is_dots(text)) return deliver({}, kMaxFile, file);
    return deliver(head(text, text.rfind('.')), kMaxFile, file);
  });
}

int32_t SplitExtent(const char* path, char* extension) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    std::string_view text = path;
    size_t dot = text.rfind('.');
    return deliver(dot == text.npos ? std::string_view() : tail(text, dot), kMaxExtension, extension);
  });
}

void SplitPath(const char* path, char* drive, char* directory, char* file, char* extension) noexcept {
  exported(trace_unit, __func__, [&] {
    SplitDrive(path, drive);
    SplitDir(path, directory);
    SplitFile(path, file);
    SplitExtent(path, extension);
    LX_TRACE(TRC1_LEVEL_DETAIL, "Original path: %s\n drive: %s\n directory: %s\n file: %s\n extent: %s", path, drive,
             directory, file, extension);
  });
}

void MakePath(char* result, const char* drive, const char* directory, const char* file,
              const char* extension) noexcept {
  exported(trace_unit, __func__, [&] {
    for (const char* part : {drive, directory, file, extension}) {
      size_t length = std::strlen(part);
      std::memcpy(result, part, length);
      result += length;
    }
    *result = '\0';
  });
}

}  // extern "C"
