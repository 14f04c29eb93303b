// SPDX-License-Identifier: Apache-2.0
#include <fcntl.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <memory>
#include <new>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

#include "lexaro/lexaro.h"
#include "tools/lexaro/command.hpp"
#include "tools/lexaro/help.hpp"
#include "tools/lexaro/output_file.hpp"
#include "tools/lexaro/temporary_file.hpp"
#include "tools/lexaro/values.hpp"

namespace lx::tool {
namespace {

constexpr char kProgramNotes[] = R"(Locale data are taken from --locale-dir, else from the directory that LX_LOCALEDIR
names, else from the installation that the program belongs to.

Examples:
  lexaro convert -f IBM-1047 -t UTF-8 report.dat > report.txt
  lexaro list codepages
  lexaro locale German_Austria.UTF-8
  lexaro help convert
)";

// A file that is opened must never become the standard output that the caller closed: the gap is filled with a
// descriptor on which the real use fails.
void fill_standard_descriptors() {
  for (int fd : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (::fcntl(fd, F_GETFD) != -1 || errno != EBADF) continue;
    if (::open("/dev/null", fd == STDIN_FILENO ? O_WRONLY : O_RDONLY) != fd) std::_Exit(3);
  }
}

Command add_help_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("help", "Show the help of the program or of a command");
  auto topic = std::make_shared<std::string>();
  app->add_option("COMMAND", *topic, "A command of the program")->type_name("");
  return {app, [&program, topic](const CommonOptions&) {
            if (topic->empty()) {
              print(help_text(program, "lexaro"));
              return ExitStatus::kExact;
            }
            const auto named = [&](const CLI::App* command) { return command->get_name() == *topic; };
            const std::vector<CLI::App*> found = program.get_subcommands(named);
            if (found.empty()) throw usage_failure(message("there is no command \"{0}\"", display_name(*topic)));
            print(help_text(*found.front(), "lexaro " + *topic));
            return ExitStatus::kExact;
          }};
}

ExitStatus report_parse_error(CLI::App& program, const CLI::ParseError& error) {
  if (error.get_exit_code() == 0) {
    print(requested_text(program, error));
    return ExitStatus::kExact;
  }
  std::string command = "lexaro";
  Message text = parse_error_text(program, error);
  if (const auto unknown = program.remaining(); program.get_subcommands().empty() && !unknown.empty()) {
    text = message("there is no command or option \"{0}\"", display_name(unknown.front()));
  }
  for (const CLI::App* app : std::as_const(program).get_subcommands()) command += " " + app->get_name();
  complain(text + "\n" + message("Try \"{0} --help\".", command));
  return ExitStatus::kUsage;
}

// The arguments in the reversed order that the parser takes them in. It would read [x] as a list of values and treat
// what follows "--" as options once a file was named: both are file names here, and "./" makes that plain; or values,
// which get a mark, as negative numbers do.
std::vector<std::string> parser_arguments(int argument_count, char** arguments) {
  std::vector<std::string> all;
  const auto is_value_command = [](std::string_view argument) { return argument == "format" || argument == "parse"; };
  const bool values = std::any_of(arguments + 1, arguments + argument_count, is_value_command);
  bool only_files = false;
  for (int i = 1; i < argument_count; ++i) {
    std::string argument = arguments[i];
    if (!only_files && argument == "--") {
      only_files = true;
      continue;
    }
    const bool like_option = only_files && argument.size() > 1 && argument.front() == '-';
    const bool like_list = argument.starts_with('[') && argument.ends_with(']');
    if (values) {
      if (like_option || like_list || is_negative_value(argument)) argument.insert(0, 1, kValueMark);
    } else if (like_option || like_list) {
      argument.insert(0, "./");
    }
    all.push_back(std::move(argument));
  }
  std::reverse(all.begin(), all.end());
  return all;
}

ExitStatus run(int argument_count, char** arguments) {
  CLI::App program("Converts text between code pages and shows what locales know.", "lexaro");
  CommonOptions common;
  program.add_option("--locale-dir", common.locale_directory, "Directory of the locale data")->type_name("DIR");
  program.set_version_flag("--version", std::string("lexaro ") + LXVersion());
  program.footer(kProgramNotes);

  const std::vector<Command> commands = {
      add_catalog_command(program), add_convert_command(program), add_format_command(program),
      add_list_command(program),    add_locale_command(program),  add_parse_command(program),
      add_records_command(program), add_sort_command(program),    add_help_command(program)};
  program.require_subcommand(1);
  program.fallthrough();
  for (const Command& command : commands) command.app->fallthrough();
  try {
    program.parse(parser_arguments(argument_count, arguments));
  } catch (const CLI::ParseError& error) {
    return report_parse_error(program, error);
  }
  for (const Command& command : commands) {
    if (command.app->parsed()) return command.run(common);
  }
  return ExitStatus::kUsage;
}

ExitStatus guarded_run(int argument_count, char** arguments) {
  try {
    return run(argument_count, arguments);
  } catch (const Failure& failure) {
    if (!failure.quiet()) complain(failure.text());
    return failure.status();
  } catch (const std::bad_alloc&) {
    complain(message("out of memory"));
  } catch (const std::system_error& error) {
    complain(system_failure(error).text());
  } catch (const std::exception& error) {
    complain(message(error.what()));
  }
  return ExitStatus::kInputOutput;
}

}  // namespace
}  // namespace lx::tool

int main(int argc, char** argv) {
  lx::tool::fill_standard_descriptors();
  lx::tool::install_signal_handling();
  return static_cast<int>(lx::tool::guarded_run(argc, argv));
}
