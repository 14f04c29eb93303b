// SPDX-License-Identifier: Apache-2.0
#include <memory>
#include <string>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/lists.hpp"
#include "tools/lexaro/output_file.hpp"

namespace lx::tool {
namespace {

constexpr char kExplanation[] = R"(What can be listed, each as a table or with --json:
  lexaro list codepages    the code pages: number, name, kind, family (--aliases: and their other names)
  lexaro list aliases      the other names of code pages, one a line
  lexaro list languages    the languages and their defaults
  lexaro list territories  the territories and their currencies
  lexaro list sorts        the sort orders
  lexaro list native       the system names that are known, and what they mean
)";

struct Listing {
  const char* name;
  const char* help;
  ExitStatus (*run)(const CommonOptions& common, bool json);
};
constexpr Listing kListings[] = {
    {"aliases", "List the other names of code pages", list_aliases},
    {"languages", "List the languages", list_languages},
    {"territories", "List the territories", list_territories},
    {"sorts", "List the sort orders", list_sorts},
    {"native", "List the system names of locales", list_native_names},
};

}  // namespace

Command add_list_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("list", "List what the locale data hold");
  app->footer(kExplanation);  // of the lists below it, too
  auto aliases = std::make_shared<bool>(false);
  auto json = std::make_shared<bool>(false);
  const auto add = [&](const char* name, const char* help) {
    CLI::App* list = app->add_subcommand(name, help);
    list->add_flag("--json", *json, "Write JSON");
    return list;
  };
  CLI::App* pages = add("codepages", "List the code pages in the order of the directory");
  pages->add_flag("--aliases", *aliases, "Show the other names that are understood");
  std::vector<CLI::App*> lists;
  for (const Listing& listing : kListings) lists.push_back(add(listing.name, listing.help));
  app->require_subcommand(0, 1);
  return {app, [pages, lists, aliases, json](const CommonOptions& common) {
            if (pages->parsed()) return list_code_pages(common, *aliases, *json);
            for (std::size_t i = 0; i < lists.size(); ++i) {
              if (lists[i]->parsed()) return kListings[i].run(common, *json);
            }
            print(message(kExplanation).shown);
            return ExitStatus::kExact;
          }};
}

}  // namespace lx::tool
