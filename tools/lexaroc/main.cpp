// SPDX-License-Identifier: Apache-2.0
// lexaroc: compiles, prints and checks locale data and message catalogs.
#include <CLI/CLI.hpp>
#include <iostream>
#include <optional>
#include <set>
#include <system_error>

#include "builtin.hpp"
#include "catalog_command.hpp"
#include "catalog_file.hpp"
#include "check.hpp"
#include "compile.hpp"
#include "dump.hpp"
#include "lexaro/lexaro.h"
#include "object_file.hpp"
#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/help.hpp"

namespace {

using namespace lx::compiler;

enum ExitCode { kDone = 0, kBadData = 1, kBadUsage = 2, kIoFailure = 3 };

int run_data(const fs::path& sources, const fs::path& output, Layout layout, const std::set<uint16_t>& only) {
  Report report;
  SourceTree tree = read_source_tree(sources, only, report);
  if (report.clean()) {
    std::vector<CompiledFile> files = compile(tree, layout, report);
    if (report.clean()) {
      make_directory(output);
      for (const CompiledFile& file : files) write_file(output / file.name, file.bytes);
    }
  }
  report.print(std::cerr);
  return report.clean() ? kDone : kBadData;
}

int run_catalog(const CatalogRun& run) {
  Report report;
  compile_catalog(run, report);
  report.print(std::cerr);
  return report.clean() ? kDone : kBadData;
}

std::string source_of(const fs::path& file, const std::optional<std::string>& locale_directory) {
  std::string bytes = read_file(file);
  return is_catalog(bytes) ? dump_catalog(file, bytes, locale_directory) : dump_file(file);
}

int run_dump(const fs::path& file, const fs::path& output, const std::optional<std::string>& locale_directory) {
  try {
    std::string source = source_of(file, locale_directory);
    if (output.empty()) {
      std::cout << source << std::flush;
      return std::cout ? kDone : kIoFailure;
    }
    write_file(output, source);
    return kDone;
  } catch (const StructureError& error) {
    std::cerr << file.string() << ": " << error.text.shown << '\n';
    return kBadData;
  }
}

int run_check(const std::vector<fs::path>& paths) {
  Report report;
  for (const fs::path& path : paths) check_path(path, report);
  report.print(std::cerr);
  return report.clean() ? kDone : kBadData;
}

int run_builtin(const fs::path& sources, const fs::path& output) {
  Report report;
  std::string objects = make_builtin_source(sources, report);
  std::string tables = report.clean() ? make_unicode_source(sources, report) : std::string();
  report.print(std::cerr);
  if (!report.clean()) return kBadData;
  write_file(output / "objects/builtin_objects.cpp", objects);
  write_file(output / "codepage/unicode_tables.cpp", tables);
  return kDone;
}

int answer_parse_error(const CLI::App& app, const CLI::ParseError& error) {
  if (error.get_exit_code() == 0) {
    std::cout << lx::tool::requested_text(app, error) << std::flush;
    return kDone;
  }
  std::cerr << lx::tool::parse_error_text(app, error).shown << '\n'
            << lx::tool::message("Run with {0} for more information.", "--help").shown << '\n';
  return kBadUsage;
}

int run(int argc, char** argv) {
  CLI::App app("Compiler of locale data and message catalogs");
  app.set_version_flag("--version", std::string("lexaroc ") + LXVersion());
  app.require_subcommand(1);
  int result = kDone;
  fs::path sources, output;

  CLI::App* data = app.add_subcommand("data", "Compile a directory of sources into a data directory");
  unsigned layout = 2;
  std::set<uint16_t> only;
  data->add_option("SOURCE_DIR", sources, "Directory of the sources")->required();
  data->add_option("OUTPUT_DIR", output, "Data directory, created when it is not there")->required();
  data->add_option("--layout", layout, "Layout version of the code pages: 2, or 1 for tests")->check(CLI::Range(1, 2));
  data->add_option("--only", only, "Compile only these code pages")->delimiter(',');
  data->callback([&] { result = run_data(sources, output, layout == 1 ? Layout::version1 : Layout::current, only); });

  CLI::App* dump = app.add_subcommand("dump", "Print a compiled file as its readable source");
  fs::path compiled;
  dump->add_option("FILE", compiled, "control.nls, an object file or a message catalog")->required();
  dump->add_option("-o,--output", output, "Write to this file instead of standard output");
  std::optional<std::string> locale_directory;
  const char* locale_help = "Where the locale data is that catalogs need";
  dump->add_option("--locale-dir", locale_directory, locale_help);
  dump->callback([&] { result = run_dump(compiled, output, locale_directory); });

  CLI::App* catalog = app.add_subcommand("catalog", "Compile a message catalog");
  CatalogRun catalog_run;
  catalog->footer(kCatalogHelp);
  catalog->add_option("SOURCE", catalog_run.source, "Source of the messages")->required();
  catalog->add_option("-o,--output", catalog_run.output, "The catalog")->required();
  catalog->add_option("--locale", catalog_run.locale, "Locale whose code page the messages get")->required();
  catalog->add_option("--byte-order", catalog_run.byte_order, "Machine that reads it; without it, this one")
      ->check(CLI::IsMember({"little", "big"}));
  catalog->add_option("--encoding", catalog_run.encoding, "Code page of the source")->capture_default_str();
  catalog->add_option("--header", catalog_run.header, "Write the names of sets and messages as a C header");
  catalog->add_option("--merge", catalog_run.merged, "Begin with the messages of this catalog; may be repeated");
  catalog->add_option("--locale-dir", catalog_run.locale_directory, locale_help);
  catalog->callback([&] { result = run_catalog(catalog_run); });

  CLI::App* check = app.add_subcommand("check", "Check sources or compiled files");
  std::vector<fs::path> paths;
  check->add_option("PATH", paths, "Directories or files")->required();
  check->callback([&] { result = run_check(paths); });

  CLI::App* builtin = app.add_subcommand("builtin", "Make the C++ sources of the built-in objects and tables");
  builtin->add_option("SOURCE_DIR", sources, "Directory of the sources")->required();
  builtin->add_option("OUTPUT_DIR", output, "Root of the project: its objects/ and codepage/ are written to")
      ->required();
  builtin->callback([&] { result = run_builtin(sources, output); });

  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    return answer_parse_error(app, error);
  }
  return result;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    return run(argc, argv);
  } catch (const IoError& error) {
    std::cerr << "lexaroc: " << error.text.shown << '\n';
    return kIoFailure;
  } catch (const std::system_error& error) {
    std::cerr << "lexaroc: " << lx::tool::system_failure(error).text().shown << '\n';
    return kIoFailure;
  } catch (const Fault& error) {
    std::cerr << "lexaroc: " << error.text.shown << '\n';
    return kBadData;
  } catch (const lx::tool::Failure& error) {
    std::cerr << "lexaroc: " << error.text().shown << '\n';
    return kBadData;
  } catch (const std::exception& error) {
    std::cerr << "lexaroc: " << lx::tool::message(error.what()).shown << '\n';
    return kBadData;
  }
}
