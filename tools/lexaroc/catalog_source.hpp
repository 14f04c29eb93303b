// SPDX-License-Identifier: Apache-2.0
// The source of a message catalog, in the format that POSIX gives to gencat.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "catalog_file.hpp"
#include "catalog_text.hpp"

namespace lx::compiler {

// A name that the source gives to a set or a message.
struct CatalogName {
  std::string name;
  uint32_t number;
  Spot spot;
};

// Applies a source in UTF-8 to a catalog: new messages replace those of the same numbers. Returns the names in their
// order. Faults go to the report.
std::vector<CatalogName> read_catalog_source(const std::string& file, std::string_view source, const CatalogText& text,
                                             Catalog& catalog, Report& report);

// The source of a catalog, without its names.
std::string write_catalog_source(const Catalog& catalog, const CatalogText& text);

// A C header that defines the names. A name that is given twice goes to the report of that source.
std::string write_catalog_header(const std::vector<CatalogName>& names, const std::string& file, Report& report);

}  // namespace lx::compiler
