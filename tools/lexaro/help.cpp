// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/help.hpp"

#include "tools/messages/message.hpp"

namespace lx::tool {

void translate_help(CLI::App& app) {
  for (const char* label : {"Usage", "Positionals", "Options", "Subcommands", "OPTIONS", "SUBCOMMAND", "SUBCOMMANDS",
                            "REQUIRED", "Excludes"}) {
    app.get_formatter()->label(label, message(label).shown);
  }
  app.description(message(app.get_description()).shown);
  app.footer(message(app.get_footer()).shown);
  app.group(message(app.get_group()).shown);
  for (CLI::Option* option : app.get_options()) {
    option->description(message(option->get_description()).shown);
    option->group(message(option->get_group()).shown);
  }
  for (CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) translate_help(*command);
}

}  // namespace lx::tool
