// SPDX-License-Identifier: Apache-2.0
// Room checks of the functions that build file names.
#pragma once

#include <cstddef>
#include <cstdint>

namespace lx {

// Whether the text and `more` bytes (terminator included) fit.
bool room_for(const char* text, int32_t more, int32_t buffer_size);

// Tells a developer on standard error that a name buffer is too small: the status alone says nothing about sizes.
void complain_about_room(int32_t provided, size_t needed);

}  // namespace lx
