// SPDX-License-Identifier: Apache-2.0
// What someone may have meant who mistyped a name.
#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <vector>
#include "tools/messages/message.hpp"

namespace lx::tool {

// Letters and digits in lower case: "IBM_930", "ibm-930" and "Ibm 930" look alike to whoever mistypes them.
std::string plain_letters(const std::string& name);

// Collects the names that are close to a wanted one.
class NearNames {
 public:
  explicit NearNames(const std::string& wanted) : wanted_(plain_letters(wanted)), limit_(1 + wanted_.size() / 4) {}

  // `shown` is what to suggest when `name` is close: the page of an alias.
  void offer(const char* name, const char* shown);
  // "; did you mean A, B or C?", or nothing.
  Message question() const;

 private:
  std::vector<std::string> best() const;

  std::string wanted_;
  std::size_t limit_;
  std::map<std::string, std::size_t> distances_;
};

}  // namespace lx::tool
