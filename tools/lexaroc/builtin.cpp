// SPDX-License-Identifier: Apache-2.0
#include "builtin.hpp"

#include "code_page_source.hpp"
#include "language.hpp"
#include "pack_code_page.hpp"
#include "source_text.hpp"
#include "territory.hpp"

namespace lx::compiler {

namespace {

constexpr const char* kLanguage = "builtin/language.txt";
constexpr const char* kTerritory = "builtin/territory.txt";
constexpr const char* kCodePage = "codepage/cp_00367.txt";

// In two pieces, or licence checkers would take the literal for this file's own.
const std::string kLicence = std::string("// SPDX-License-") + "Identifier: Apache-2.0\n";

struct Image {
  const char* name;
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

// Each line ends with the character that it begins with.
std::string array_text(const char* type, unsigned digits, const UnicodeArray& array) {
  constexpr size_t kPerLine = 8;
  size_t count = array.values.size();
  std::string out = std::string("const ") + type + " " + array.name + "[" + std::to_string(count) + "] = {\n";
  for (size_t i = 0; i < count; ++i) {
    out += (i % kPerLine == 0 ? "    0x" : " 0x") + hex_text(array.values[i], digits) + ",";
    if (i % kPerLine == kPerLine - 1 || i == count - 1) {
      out += "  // " + unicode_name(static_cast<uint32_t>(array.first + i / kPerLine * kPerLine)) + "\n";
    }
  }
  return out + "};\n";
}

std::string digits_text(const std::vector<std::array<uint16_t, 2>>& digits) {
  std::string out = "const uint16_t LXDigits[" + std::to_string(digits.size()) + "][2] = {";
  for (size_t i = 0; i < digits.size(); ++i) {
    out += i % 5 == 0 ? "\n    " : " ";
    out += "{0x" + hex_text(digits[i][0], 4) + ", 0x" + hex_text(digits[i][1], 4) + "},";
  }
  return out + "\n};\n";
}

}  // namespace

std::string make_builtin_source(const fs::path& sources, Report& report) {
  auto read = [&](const char* name, auto reader) {
    return reader(SourceFile((sources / name).string(), read_file(sources / name), report), report);
  };
  auto language = read(kLanguage, read_language);
  auto territory = read(kTerritory, read_territory);
  auto code_page = read(kCodePage, read_code_page);
  UnicodeTables unicode = UnicodeTables::read(sources / "unicode", report);
  if (!report.clean()) return {};
  Sections ascii = pack_code_page(*code_page, unicode, Layout::current);
  const Image images[] = {{"LXDefaultLanguage", pack_language(*language)},
                          {"LXDefaultTerritory", pack_territory(*territory)},
                          {"LXDefaultCodePage", ascii[0]},
                          {"LXDefCP3", ascii[2]}};
  std::string text = kLicence + "// Made by \"lexaroc builtin data .\" from data/" + std::string(kLanguage) +
                     ", data/" + kTerritory + ",\n// data/" + kCodePage + " and data/unicode.\n" +
                     "// clang-format off\n#include \"lexaro/lexaro.h\"\n\nextern \"C\" {\n\n";
  for (const Image& image : images) text += array_text(std::string("const uint8_t ") + image.name, image.bytes) + "\n";
  return text + "}  // extern \"C\"\n";
}

std::string make_unicode_source(const fs::path& sources, Report& report) {
  UnicodeTables unicode = UnicodeTables::read(sources / "unicode", report);
  if (!report.clean()) return {};
  std::string text = kLicence +
                     "// Made by \"lexaroc builtin data .\" from data/unicode.\n"
                     "// clang-format off\n#include \"lexaro/lexaro.h\"\n\nextern \"C\" {\n\n";
  for (const UnicodeArray& array : unicode.type_arrays()) text += array_text("uint32_t", 8, array) + "\n";
  for (const UnicodeArray& array : unicode.map_arrays()) text += array_text("uint16_t", 4, array) + "\n";
  return text + digits_text(unicode.digits()) + "\n}  // extern \"C\"\n";
}

}  // namespace lx::compiler
