// SPDX-License-Identifier: Apache-2.0
// The frame of every compiled file: a header and up to four sections.
#pragma once

#include <array>
#include <stdexcept>
#include <string>
#include <string_view>

#include "objects/file_format.hpp"
#include "tools/lexaroc/report.hpp"

namespace lx::compiler {

using Sections = std::array<std::string, kMaxSections>;

// The bytes of a record that lies in a file as it is.
template <class T>
std::string_view bytes_of(const T& record) {
  return {reinterpret_cast<const char*>(&record), sizeof record};
}

// Throws PackError when a section is too large.
std::string make_object_file(const Sections& sections, uint32_t format);

// A compiled file breaks its format.
class StructureError : public Fault {
  using Fault::Fault;
};

struct ObjectFile {
  unsigned layout_version = 0;
  Sections sections;
};

// Throws StructureError.
ObjectFile split_object_file(std::string_view bytes);

// A record inside a section; throws StructureError when it is not wholly inside.
template <class T>
T record_at(std::string_view section, size_t offset) {
  if (offset > section.size() || section.size() - offset < sizeof(T)) {
    throw StructureError(tool::message("a record at offset {0} is not inside its section", offset));
  }
  T record;
  section.copy(reinterpret_cast<char*>(&record), sizeof record, offset);
  return record;
}

}  // namespace lx::compiler
