// SPDX-License-Identifier: Apache-2.0
// The texts of a language or territory as callers read them: in machine order, each with its terminator.
#pragma once

#include "frame/records.hpp"

namespace lx {

// Pointers to the texts, followed by the texts; one block of memory. Null: no memory.
const LXUChar* const* build_texts(uint8_t type, const uint8_t* checked_section);

// Those of the built-in objects, which need no memory.
const LXUChar* const* built_in_texts(uint8_t type);

}  // namespace lx
