// SPDX-License-Identifier: Apache-2.0
// What is wrong with the sources, and where.
#pragma once

#include <iosfwd>
#include <stdexcept>
#include <string>
#include <vector>

#include "tools/messages/message.hpp"

namespace lx::compiler {

// A place in a text. Lines and columns count from 1; a column is one character, not one byte.
struct Spot {
  unsigned line = 1;
  unsigned column = 1;
};

// What is wrong, for people. A text without parts may be given in English: it is translated here.
class Fault : public std::runtime_error {
 public:
  explicit Fault(const tool::Message& text);
  const tool::Message text;
};

// Ends the reading of one line or file; whoever knows the file name turns it into an entry of the report.
class SourceError : public Fault {
 public:
  SourceError(Spot where, const tool::Message& message) : Fault(message), spot(where) {}
  Spot spot;
};

class Report {
 public:
  void error(const std::string& file, Spot spot, const tool::Message& message);
  void error(const std::string& file, const SourceError& error) { this->error(file, error.spot, error.text); }
  // For compiled files, which have no lines.
  void error(const std::string& file, const tool::Message& message);

  bool clean() const { return messages_.empty(); }
  size_t count() const { return messages_.size(); }
  void print(std::ostream& out) const;

 private:
  std::vector<std::string> messages_;
};

}  // namespace lx::compiler
