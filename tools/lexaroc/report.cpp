// SPDX-License-Identifier: Apache-2.0
#include "report.hpp"

#include <ostream>

namespace lx::compiler {

namespace {

tool::Message translated(const tool::Message& text) {
  return text.shown == text.english ? tool::message(text.english) : text;
}

}  // namespace

Fault::Fault(const tool::Message& given) : std::runtime_error(given.english), text(translated(given)) {}

void Report::error(const std::string& file, Spot spot, const tool::Message& message) {
  error(file + ":" + std::to_string(spot.line) + ":" + std::to_string(spot.column), message);
}

void Report::error(const std::string& file, const tool::Message& message) {
  messages_.push_back(file + ": " + translated(message).shown);
}

void Report::print(std::ostream& out) const {
  for (const std::string& message : messages_) out << message << '\n';
}

}  // namespace lx::compiler
