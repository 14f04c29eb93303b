// SPDX-License-Identifier: Apache-2.0
// Message catalogs as they lie in a file, of either byte order.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <string_view>

#include "msgcat/catalog_format.hpp"

namespace lx::compiler {

using CatalogMessages = std::map<uint32_t, std::string>;  // texts in the code page of the catalog's locale

struct Catalog {
  std::string locale;
  uint32_t byte_order = kNativeCatalog;
  std::map<uint32_t, CatalogMessages> sets;
};

inline constexpr size_t kLongestCatalogLocale = sizeof(CatalogHeader::locale) - 1;
inline constexpr const char* kCatalogExtension = ".cat";

bool is_catalog(std::string_view bytes);
// Throws PackError when the file would be too large.
std::string pack_catalog(const Catalog& catalog);
// Throws StructureError at the first fault.
Catalog unpack_catalog(std::string_view bytes);

}  // namespace lx::compiler
