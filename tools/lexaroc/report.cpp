// SPDX-License-Identifier: Apache-2.0
#include "report.hpp"

#include <ostream>

namespace lx::compiler {

void Report::error(const std::string& file, Spot spot, const std::string& message) {
  messages_.push_back(file + ":" + std::to_string(spot.line) + ":" + std::to_string(spot.column) + ": " + message);
}

void Report::error(const std::string& file, const std::string& message) { messages_.push_back(file + ": " + message); }

void Report::print(std::ostream& out) const {
  for (const std::string& message : messages_) out << message << '\n';
}

}  // namespace lx::compiler
