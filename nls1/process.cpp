// SPDX-License-Identifier: Apache-2.0
// The blocks of the process and of its threads.
#include <utility>

#include "nls1/state.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "nls1_process", 0};

constexpr char kSource[] = "qlgnls1";
constexpr uint32_t kUserLocale = LX_GET_USER | LX_GET_SUBSTITUTE;

void set_state(int32_t state) { __atomic_store_n(&qlginflg, state, __ATOMIC_RELEASE); }

uint32_t init_process() {
  const char* directory = HSV1_GetEnv("NLS1_LOCALEDIR", 0);
  if (directory == nullptr) LX_TRACE(TRC1_LEVEL_INIT, "Unable to determine location of locale definitions\n");
  uint32_t rc = LXInit(directory, nullptr, nullptr, nullptr, 0);
  if (rc != LX_OK && rc != LX_E_DEFAULTS) {
    set_state(-1);
    LX_TRACE(TRC1_LEVEL_INIT, "Unable to initialize Lexaro, rc = %d", static_cast<int>(rc));
    return rc;
  }
  set_state(1);
  uint32_t locale_rc = LXSetLocale(nullptr, kUserLocale);
  if (locale_rc == LX_OK) return rc;
  LX_TRACE(TRC1_LEVEL_INIT, "Unable to set global locale, rc = %d", static_cast<int>(locale_rc));
  return locale_rc;
}

LXLocale* init_thread() {
  const auto* process = static_cast<const uint32_t*>(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, kSource));
  if (process == nullptr || *process != LX_OK) return nullptr;
  uint32_t rc = LX_OK;
  LXLocale* locale = LXGetLocale(nullptr, kUserLocale, &rc);
  if (locale == nullptr) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Unable to set thread locale, rc = %d", static_cast<int>(rc));
  }
  return locale;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t qlginflg = 0;
HSV1_Descriptor qlgnlprc_HSV1__P = {sizeof(uint32_t), InitProcess, TermProcess, nullptr};
HSV1_Descriptor qlgnlthr_HSV1__T = {sizeof(LXLocale*), InitThread, TermThread, nullptr};

void* InitProcess(void* block) noexcept {
  return exported(trace_unit, __func__, [&] {
    if (block != nullptr) *static_cast<uint32_t*>(block) = init_process();
    return block;
  });
}

void* TermProcess(void* block) noexcept {
  return exported(trace_unit, __func__, [&] {
    LXTerm();
    set_state(0);
    return block;
  });
}

void* InitThread(void* block) noexcept {
  return exported(trace_unit, __func__, [&] {
    if (block != nullptr) *static_cast<LXLocale**>(block) = init_thread();
    return block;
  });
}

void* TermThread(void* block) noexcept {
  return exported(trace_unit, __func__, [&] {
    if (block != nullptr) LXReleaseLocale(std::exchange(*static_cast<LXLocale**>(block), nullptr), 0);
    return block;
  });
}

uint32_t NLS1_PrivateFunction_GetProcessLocale(void) noexcept {
  return exported(trace_unit, __func__, [&] {
    HSV1_ResolveProcess(&qlgnlprc_HSV1__P, kSource);
    return uint32_t{0};
  });
}

LXLocale* NLS1_PrivateFunction_GetThreadLocale(void) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXLocale* {
    const void* block = HSV1_ResolveThread(&qlgnlthr_HSV1__T, kSource);
    return block != nullptr ? *static_cast<LXLocale* const*>(block) : nullptr;
  });
}

}  // extern "C"
