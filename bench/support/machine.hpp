// SPDX-License-Identifier: Apache-2.0
// What belongs beside every figure: where, when and from which compiler it comes.
#pragma once

#include <string>

namespace lx::bench {

// A Markdown list with the processor, the system, the compiler, the peers' versions and the date.
std::string machine_description(const std::string& peers);

}  // namespace lx::bench
