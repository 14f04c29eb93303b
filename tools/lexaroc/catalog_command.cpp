// SPDX-License-Identifier: Apache-2.0
#include "catalog_command.hpp"

#include "catalog_source.hpp"
#include "object_file.hpp"

namespace lx::compiler {

namespace {

// The messages of an older catalog come first, so that those of the source replace them.
void merge(const fs::path& path, const CatalogText& text, Catalog& catalog, Report& report) try {
  Catalog old = unpack_catalog(read_file(path));
  if (!CatalogText(old.locale).same_page(text)) {
    report.error(path.string(), tool::message("the catalog's locale {0} has another code page", old.locale));
    return;
  }
  for (auto& [set, messages] : old.sets) {
    for (auto& [number, bytes] : messages) catalog.sets[set][number] = bytes;
  }
} catch (const StructureError& error) {
  report.error(path.string(), error.text);
}

uint32_t byte_order_of(const std::string& name) {
  if (name.empty()) return kNativeCatalog;
  return name == "big" ? kBigEndianCatalog : kLittleEndianCatalog;
}

std::string source_in_utf8(const CatalogRun& run, Report& report) try {
  return CatalogText("English_UnitedStates." + run.encoding + "@BINARY").to_utf8(read_file(run.source));
} catch (const SourceError& error) {
  report.error(run.source.string(), error);
  return {};
}

}  // namespace

void compile_catalog(const CatalogRun& run, Report& report) {
  tool::LibrarySession session(run.locale_directory);
  CatalogText text(run.locale);
  Catalog catalog{text.locale_name(), byte_order_of(run.byte_order), {}};
  if (catalog.locale.size() > kLongestCatalogLocale) throw Fault("the locale name is too long");
  for (const fs::path& path : run.merged) merge(path, text, catalog, report);
  std::string source = source_in_utf8(run, report);
  if (!report.clean()) return;
  auto names = read_catalog_source(run.source.string(), source, text, catalog, report);
  if (!report.clean()) return;
  std::string header = run.header.empty() ? std::string() : write_catalog_header(names, run.source.string(), report);
  if (!report.clean()) return;
  write_file(run.output, pack_catalog(catalog));
  if (!run.header.empty()) write_file(run.header, header);
}

std::string dump_catalog(const fs::path& path, const std::string& bytes,
                         const std::optional<std::string>& locale_directory) {
  tool::LibrarySession session(locale_directory);
  Catalog catalog = unpack_catalog(bytes);
  return "$ printed from " + path.filename().string() + "\n" +
         write_catalog_source(catalog, CatalogText(catalog.locale));
}

}  // namespace lx::compiler
