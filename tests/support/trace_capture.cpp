// SPDX-License-Identifier: Apache-2.0
#include "support/trace_capture.hpp"

#include <lexaro/host.h>

#include <algorithm>
#include <cstdarg>
#include <cstdio>

namespace {

std::vector<std::string>* g_messages;

void keep(std::string message) {
  if (g_messages != nullptr) g_messages->push_back(std::move(message));
}

}  // namespace

void TRC1_Sync(TRC1_Unit* unit) noexcept { unit->flags = g_messages != nullptr ? ~0u : 0u; }

void TRC1_Event(TRC1_Unit*, int32_t, uint32_t kind, const char* function, intptr_t result) noexcept {
  std::string text = std::string(function) + (kind == TRC1_ENTRY ? " entry" : " exit");
  keep(kind == TRC1_EXIT_RESULT ? text + " " + std::to_string(result) : text);
}

void TRC1_Printf(TRC1_Unit*, int32_t, const char* format, ...) noexcept {
  va_list arguments;
  va_start(arguments, format);
  char* text = nullptr;
  if (vasprintf(&text, format, arguments) >= 0) keep(text);
  std::free(text);
  va_end(arguments);
}

void TRC1_Dump(TRC1_Unit*, int32_t, const char* label, const void*, size_t length) noexcept {
  keep(std::string(label) + ": " + std::to_string(length) + " bytes");
}

namespace lx::test {

TraceCapture::TraceCapture() { g_messages = new std::vector<std::string>; }

TraceCapture::~TraceCapture() {
  delete g_messages;
  g_messages = nullptr;
}

const std::vector<std::string>& TraceCapture::messages() const { return *g_messages; }

bool TraceCapture::has(std::string_view message) const {
  return std::find(g_messages->begin(), g_messages->end(), message) != g_messages->end();
}

std::string TraceCapture::all() const {
  std::string text;
  for (const std::string& message : *g_messages) text += message + "\n";
  return text;
}

}  // namespace lx::test
