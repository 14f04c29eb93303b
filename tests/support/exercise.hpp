// SPDX-License-Identifier: Apache-2.0
// Uses an object of which nothing is known but that the library has loaded it. Whatever its tables say, no call may
// leave its buffers: those are as large as the interface promises to need, so that a memory checker sees more. Each
// returns null, or which promise was broken.
#pragma once

#include <lexaro/lexaro.h>

namespace lx::test {

const char* exercise_language(const LXObjEntry* language);
const char* exercise_page(const LXObjEntry* page);                    // the primitives, on all bytes
const char* exercise_conversions(LXLocale* locale, LXLocale* other);  // in both directions, at once and in pieces

}  // namespace lx::test
