// SPDX-License-Identifier: Apache-2.0
#include <memory>
#include <string>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/input_file.hpp"
#include "tools/lexaro/open_locale.hpp"
#include "tools/lexaro/output_file.hpp"
#include "tools/lexaro/terminal_text.hpp"
#include "tools/lexaroc/catalog_file.hpp"
#include "tools/lexaroc/object_file.hpp"

namespace lx::tool {
namespace {

constexpr char kNotes[] =
    R"(Without SET, all messages are listed: set, message and text, with line feeds and
backslashes written as \n and \\. SET and MESSAGE show that text as it is. Text
appears in the encoding of the terminal, whatever code page the catalog has.

Exit codes: 0 shown, 1 not a catalog of this kind of machine, or no such message,
2 usage, 3 input or output failed, 4 bad locale data.

Examples:
  lexaro catalog program.cat
  lexaro catalog program.cat 2 17
)";

struct CatalogOptions {
  std::string file;
  std::optional<uint32_t> set;
  std::optional<int32_t> message;
};

struct CatalogDeleter {
  void operator()(LXCatalog* catalog) const { LXCloseCatalog(catalog, 0); }
};
using CatalogPtr = std::unique_ptr<LXCatalog, CatalogDeleter>;

Failure bad_catalog(const std::string& file, const Message& why) {
  return {ExitStatus::kDataProblem, display_name(file) + ": " + why};
}

// What is in the file: the library finds messages, but lists none.
compiler::Catalog read_catalog(const std::string& path) {
  std::string bytes;
  InputFile input(path);
  std::vector<char> piece(64 * 1024);
  while (const std::size_t count = input.read(piece)) bytes.append(piece.data(), count);
  if (!compiler::is_catalog(bytes)) throw bad_catalog(path, message("this is no message catalog"));
  try {
    return compiler::unpack_catalog(bytes);
  } catch (const compiler::StructureError& error) {
    throw bad_catalog(path, message(error.what()));
  }
}

CatalogPtr open_catalog(LXLocale* locale, const std::string& path) {
  uint32_t rc = LX_OK;
  LXFile* file = LXOpenFile(0, path.c_str(), 0, 0, &rc);
  if (!file) throw Failure(ExitStatus::kInputOutput, display_name(path) + ": " + describe_status(rc));
  CatalogPtr catalog(LXMcLoadCat(locale, file, 1, &rc));
  if (catalog) return catalog;
  LXCloseFile(file, 1);
  throw bad_catalog(path, describe_status(rc));
}

std::string text_of(LXCatalog* catalog, uint32_t set, int32_t message, std::size_t bytes, uint32_t& status) {
  std::vector<LXUChar> text(bytes + 1);  // no character takes less than a byte
  status = LXGetMessageU(catalog, set, message, text.data(), static_cast<int32_t>(text.size()), nullptr, 0);
  std::size_t length = 0;
  while (text[length] != 0) ++length;
  text.resize(length);
  return utf8_of(text);
}

std::string on_one_line(const std::string& text) {
  std::string line;
  for (const char c : text) {
    if (c == '\n') {
      line += "\\n";
    } else {
      line.append(c == '\\' ? 2 : 1, c);
    }
  }
  return line;
}

ExitStatus run_catalog(const CatalogOptions& options, const CommonOptions& common) {
  const LibrarySession session(common.locale_directory);
  const compiler::Catalog content = read_catalog(options.file);
  const LocalePtr locale = open_locale("English");  // texts come as UCS-2, so any will do
  const CatalogPtr catalog = open_catalog(locale.get(), options.file);
  OutputFile output("-");
  bool found = false;
  for (const auto& [set, messages] : content.sets) {
    if (options.set && *options.set != set) continue;
    for (const auto& [message, stored] : messages) {
      if (options.message && *options.message != static_cast<int32_t>(message)) continue;
      uint32_t status = LX_OK;
      const std::string text = text_of(catalog.get(), set, static_cast<int32_t>(message), stored.size(), status);
      if (status != LX_OK) throw bad_catalog(options.file, describe_status(status));
      const std::string place = std::to_string(set) + " " + std::to_string(message) + " ";
      output.write(terminal_text(options.message ? text + "\n" : place + on_one_line(text) + "\n"));
      found = true;
    }
  }
  output.commit();
  if (!found && options.set)
    throw bad_catalog(options.file, options.message ? message("no such message") : message("no such set"));
  return ExitStatus::kExact;
}

}  // namespace

Command add_catalog_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("catalog", "Show the messages of a catalog");
  auto options = std::make_shared<CatalogOptions>();
  app->add_option("FILE", options->file, "A catalog, as lexaroc catalog writes it")->required()->type_name("");
  app->add_option("SET", options->set, "Only this set")->type_name("");
  app->add_option("MESSAGE", options->message, "Only the text of this message")->type_name("");
  app->footer(kNotes);
  return {app, [options](const CommonOptions& common) { return run_catalog(*options, common); }};
}

}  // namespace lx::tool
