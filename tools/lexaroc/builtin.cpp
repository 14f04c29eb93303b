// SPDX-License-Identifier: Apache-2.0
#include "builtin.hpp"

#include "code_page_source.hpp"
#include "language.hpp"
#include "pack_code_page.hpp"
#include "territory.hpp"

namespace lx::compiler {

namespace {

constexpr const char* kLanguage = "builtin/language.txt";
constexpr const char* kTerritory = "builtin/territory.txt";
constexpr const char* kCodePage = "codepage/cp_00367.txt";

struct Image {
  const char* constant;
  const char* exported;
  std::string bytes;
};

std::string array_text(const std::string& declaration, const std::string& bytes) {
  constexpr size_t kPerLine = 20;
  std::string out = declaration + "[" + std::to_string(bytes.size()) + "] = {";
  for (size_t i = 0; i < bytes.size(); ++i) {
    out += i % kPerLine == 0 ? "\n    " : " ";
    out += std::to_string(static_cast<uint8_t>(bytes[i])) + (i + 1 == bytes.size() ? "" : ",");
  }
  return out + "};\n";
}

}  // namespace

BuiltinSources make_builtin_sources(const fs::path& sources, Report& report) {
  auto read = [&](const char* name, auto reader) {
    return reader(SourceFile((sources / name).string(), read_file(sources / name), report), report);
  };
  auto language = read(kLanguage, read_language);
  auto territory = read(kTerritory, read_territory);
  auto code_page = read(kCodePage, read_code_page);
  UnicodeTables unicode = UnicodeTables::read(sources / "unicode", report);
  if (!report.clean()) return {};
  Sections ascii = pack_code_page(*code_page, unicode, Layout::current);
  const Image images[] = {{"kBuiltInLanguageImage", "LXDefaultLanguage", pack_language(*language)},
                          {"kBuiltInTerritoryImage", "LXDefaultTerritory", pack_territory(*territory)},
                          {"kBuiltInCodePageImage", "LXDefaultCodePage", ascii[0]},
                          {"kBuiltInCodePageValuesImage", "LXDefCP3", ascii[2]}};
  std::string first_lines =
      "// SPDX-License-Identifier: Apache-2.0\n"
      "// Made by \"lexaroc builtin data objects\" from data/" +
      std::string(kLanguage) + ", data/" + kTerritory + ",\n// data/" + kCodePage + " and data/unicode.\n" +
      "// clang-format off\n";
  BuiltinSources result;
  result.images = first_lines + "#pragma once\n\n#include <cstdint>\n\nnamespace lx {\n\n";
  result.objects = first_lines + "#include \"lexaro/lexaro.h\"\n\nextern \"C\" {\n\n";
  for (const Image& image : images) {
    result.images += array_text(std::string("inline constexpr uint8_t ") + image.constant, image.bytes) + "\n";
    result.objects += array_text(std::string("const uint8_t ") + image.exported, image.bytes) + "\n";
  }
  result.images += "}  // namespace lx\n";
  result.objects += "}  // extern \"C\"\n";
  return result;
}

}  // namespace lx::compiler
