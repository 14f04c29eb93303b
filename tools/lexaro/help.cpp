// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/help.hpp"

#include <algorithm>
#include <cstdio>
#include <utility>
#include <vector>

#include "tools/lexaro/terminal_text.hpp"
#include "tools/messages/translations.hpp"

namespace lx::tool {
namespace {

class HelpFormatter : public CLI::Formatter {
 public:
  explicit HelpFormatter(bool translated) : translated_(translated) {
    for (const char* name : {"Usage", "Positionals", "Options", "Subcommands", "OPTIONS", "SUBCOMMAND", "SUBCOMMANDS",
                             "REQUIRED", "Excludes"}) {
      label(name, text(name));
    }
  }
  bool lacks_text() const { return lacks_text_; }

  std::string make_group(std::string group, bool positional, std::vector<const CLI::Option*> options) const override {
    return Formatter::make_group(get_label(group), positional, std::move(options));
  }
  std::string make_description(const CLI::App* app) const override { return text(app->get_description()) + "\n"; }
  std::string make_footer(const CLI::App* app) const override {
    return app->get_footer().empty() ? "" : text(app->get_footer()) + "\n";
  }
  std::string make_subcommands(const CLI::App* app, CLI::AppFormatMode) const override {
    std::string rows;
    for (const CLI::App* command : app->get_subcommands({})) rows += make_subcommand(command);
    return rows.empty() ? "" : "\n" + get_label("Subcommands") + ":\n" + rows;
  }
  std::string make_subcommand(const CLI::App* command) const override {
    const std::string name = command->get_name();
    return row(name, name.size(), command->get_description());
  }
  std::string make_option(const CLI::Option* option, bool positional) const override {
    const std::string name = make_option_name(option, positional) + make_option_opts(option);
    std::size_t width = name.size();
    // The only part of the name that is a word of the language.
    const Translation* required = translated_ ? find_translation("REQUIRED") : nullptr;
    if (required && name.ends_with(required->terminal)) {
      width = width - required->terminal.size() + display_width(required->utf8);
    }
    return row(name, width, option->get_description());
  }

 private:
  std::string text(const std::string& english) const {
    if (!translated_ || english.empty()) return english;
    const Translation* translation = find_translation(english);
    if (!translation) lacks_text_ = true;
    return translation ? translation->terminal : english;
  }

  // The parser would count bytes, not columns.
  std::string row(const std::string& name, std::size_t width, const std::string& description) const {
    const std::size_t column = get_column_width();
    width += 2;
    std::string line = "  " + name;
    if (width < column) line.append(column - width, ' ');
    if (width >= column && !description.empty()) line += "\n" + std::string(column, ' ');
    return line + text(description) + "\n";
  }

  const bool translated_;
  mutable bool lacks_text_ = false;
};

// The program and the commands that were given.
std::vector<const CLI::App*> given_commands(const CLI::App& program) {
  std::vector<const CLI::App*> all = {&program};
  while (!all.back()->get_subcommands().empty()) all.push_back(all.back()->get_subcommands().front());
  return all;
}

void add_option_errors(std::vector<Message>& all, const CLI::Option& option) {
  const std::string name = option.get_name();
  const std::string type = option.get_type_name();
  const int least = std::min(option.get_type_size_min(), option.get_items_expected_min());
  const int most = std::max(option.get_items_expected_max(), 1);
  const CLI::results_t& values = option.results();
  all.push_back(message("{0} is required", name));
  all.push_back(message("{0}: {1} required {2} missing", name, least, type));
  all.push_back(message("{0}: At Most {1} required but received {2}", name, most, values.size()));
  all.push_back(message("Could not convert: {0} = {1}", name, CLI::detail::join(values)));
  for (const CLI::Option* other : option.get_excludes()) {
    all.push_back(message("{0} excludes {1}", name, other->get_name()));
  }
  const std::string allowed = type.substr(type.find(':') + 1);
  int first = 0;
  int last = 0;
  const bool is_range = std::sscanf(allowed.c_str(), "INT in [%d - %d]", &first, &last) == 2;
  for (const std::string& value : values) {
    all.push_back(is_range ? message("{0}: Value {1} not in range {2} to {3}", name, value, first, last)
                           : message("{0}: {1} not in {2}", name, value, allowed));
  }
}

}  // namespace

std::string help_text(const CLI::App& command, const std::string& name) {
  for (const bool translated : {has_translations(), false}) {
    const HelpFormatter formatter(translated);
    std::string text = formatter.make_help(&command, name, CLI::AppFormatMode::Normal);
    if (!formatter.lacks_text()) return text;
  }
  return "";
}

std::string requested_text(const CLI::App& program, const CLI::ParseError& error) {
  if (dynamic_cast<const CLI::CallForVersion*>(&error)) return std::string(error.what()) + "\n";
  const std::vector<const CLI::App*> commands = given_commands(program);
  std::string name = program.get_name();
  for (std::size_t i = 1; i < commands.size(); ++i) name += " " + commands[i]->get_name();
  return help_text(*commands.back(), name);
}

// An error of the parser has no parts, only its text. So all that it could have said of this command line are made
// anew.
Message parse_error_text(const CLI::App& program, const CLI::ParseError& error) {
  std::vector<Message> all = {message("A subcommand is required")};
  for (const CLI::App* command : given_commands(program)) {
    const std::vector<std::string> rest = command->remaining();
    const std::string words = CLI::detail::rjoin(rest, " ");
    all.push_back(rest.size() == 1 ? message("The following argument was not expected: {0}", words)
                                   : message("The following arguments were not expected: {0}", words));
    for (const CLI::Option* option : command->get_options()) add_option_errors(all, *option);
  }
  const auto found =
      std::find_if(all.begin(), all.end(), [&](const Message& text) { return text.english == error.what(); });
  return found == all.end() ? Message(std::string(error.what())) : *found;
}

}  // namespace lx::tool
