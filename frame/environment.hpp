// SPDX-License-Identifier: Apache-2.0
// What the functions that build and look up names share.
#pragma once

#include <cstddef>
#include <cstdint>

namespace lx {

// What an object's file name adds to its directory: separator, prefix, separator, five digits, extension, terminator.
inline constexpr int32_t kObjectNameRoom = 14;

// Whether the text and `more` bytes (terminator included) fit.
bool room_for(const char* text, int32_t more, int32_t buffer_size);

// Tells a developer on standard error that a name buffer is too small: the status alone says nothing about sizes.
void complain_about_room(int32_t provided, size_t needed);

// ASCII letters count as equal in either case; zero bytes are bytes like any other.
int compare_ignoring_case(const void* a, const void* b, size_t count);

}  // namespace lx
