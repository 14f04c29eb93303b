// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "tools/lexaro/command.hpp"
#include "tools/lexaro/json_output.hpp"
#include "tools/lexaro/locale_items.hpp"
#include "tools/lexaro/native_names.hpp"
#include "tools/lexaro/open_locale.hpp"
#include "tools/lexaro/terminal_text.hpp"

namespace lx::tool {
namespace {

constexpr char kNotes[] = R"(NAME is Language_Territory.CodePage@Sort, parts of it optional, or a system's name such
as de_CH.UTF-8 or ja_JP.PCK. Without it: the user's locale, from LX_LANG or else from the system. What is taken instead
of the exact locale is told on standard error. Text appears in the encoding of the terminal, JSON in UTF-8.

Examples:
  lexaro locale
  lexaro locale German_Austria --json
  lexaro locale fr_CH --item decimal --item 80
  lexaro locale Japanese.MS932 --native
)";

struct LocaleOptions {
  std::optional<std::string> name;
  std::vector<std::string> items;
  bool territory = false;
  bool native = false;
  bool json = false;
};

Json json_of(const ItemValue& value, const LocaleItem& item) {
  if (value.status != LX_OK) return nullptr;
  return item.is_number ? Json(value.number) : Json(value.text);
}

std::string plain(const ItemValue& value, const LocaleItem& item) {
  return item.is_number ? std::to_string(value.number) : value.text;
}

// Quotes show where a text begins and ends, when its ends cannot be seen.
std::string visible(const ItemValue& value, const LocaleItem& item) {
  if (value.status != LX_OK) return "(" + describe_status(value.status).utf8 + ")";
  const std::string text = plain(value, item);
  for (const char* blank : {" ", "\u00A0", "\u2009", "\u202F", "\u3000"}) {
    if (text.starts_with(blank) || text.ends_with(blank)) return "\"" + text + "\"";
  }
  return text.empty() ? "\"\"" : text;
}

std::string line(LXLocale* locale, const LocaleItem& item, ValueSource source) {
  constexpr std::size_t kNumberWidth = 4;
  constexpr std::size_t kNameWidth = 26;
  std::string number = std::to_string(item.number);
  number.insert(0, kNumberWidth - std::min(number.size(), kNumberWidth), ' ');
  std::string name = item.name;
  name.resize(std::max(name.size() + 1, kNameWidth), ' ');
  return number + "  " + name + visible(read_item(locale, item, source), item) + "\n";
}

void print_all(LXLocale* locale, const LocaleOptions& options, ValueSource source) {
  Json json = Json::object();
  std::string text;
  for (const ItemGroup& group : item_groups()) {
    if (!options.json) text += (text.empty() ? "" : "\n") + message(group.title).utf8 + "\n";
    for (const LocaleItem& item : group.items) {
      if (options.json) {
        json[item.name] = json_of(read_item(locale, item, source), item);
      } else {
        text += line(locale, item, source);
      }
    }
  }
  options.json ? print_json(json) : print_text(text);
}

std::vector<const LocaleItem*> wanted_items(const LocaleOptions& options) {
  std::vector<const LocaleItem*> items;
  for (const std::string& wanted : options.items) {
    const LocaleItem* item = find_item(wanted);
    if (!item) {
      throw usage_failure(
          message("unknown item \"{0}\"; \"lexaro locale\" shows numbers and names", display_name(wanted)));
    }
    items.push_back(item);
  }
  return items;
}

void print_items(LXLocale* locale, const std::vector<const LocaleItem*>& items, bool as_json, ValueSource source) {
  Json json = Json::object();
  std::string text;
  for (const LocaleItem* item : items) {
    const ItemValue value = read_item(locale, *item, source);
    if (value.status != LX_OK) {
      throw Failure(ExitStatus::kCodePage, message("item {0}: {1}", item->name, describe_status(value.status)));
    }
    json[item->name] = json_of(value, *item);
    text += plain(value, *item) + "\n";
  }
  as_json ? print_json(json) : print_text(text);
}

void print_native_names(LXLocale* locale, bool as_json) {
  const NativeNames names = native_names_of(locale);
  const std::string own = read_text(locale, LX_ITEM_LOCALE_NAME);
  const std::string meaning = mapped_native_name(names.nearest);
  if (as_json) {
    const auto or_null = [](const std::string& name) { return name.empty() ? Json() : Json(name); };
    print_json({{"locale", own},
                {"exact", or_null(names.exact)},
                {"nearest", or_null(names.nearest)},
                {"nearest_locale", or_null(meaning)}});
    return;
  }
  const auto or_none = [](const std::string& name) { return name.empty() ? message("(none)") : Message(name); };
  print_text(message("locale             {0}\n"
                     "its system name    {1}\n"
                     "nearest name       {2}\n"
                     "which is read as   {3}\n",
                     own, or_none(names.exact), or_none(names.nearest), or_none(meaning))
                 .utf8);
}

ExitStatus run_locale(const LocaleOptions& options, const CommonOptions& common) {
  const std::vector<const LocaleItem*> items = wanted_items(options);
  const LibrarySession session(common.locale_directory, WithoutData::kBuiltIn);
  const LocalePtr locale = options.name ? open_locale(*options.name) : open_user_locale();
  const ValueSource source = options.territory ? ValueSource::kTerritory : ValueSource::kLocale;
  if (options.native) {
    print_native_names(locale.get(), options.json);
  } else if (!items.empty()) {
    print_items(locale.get(), items, options.json, source);
  } else {
    print_all(locale.get(), options, source);
  }
  return ExitStatus::kExact;
}

}  // namespace

Command add_locale_command(CLI::App& program) {
  CLI::App* app = program.add_subcommand("locale", "Show what a locale knows");
  auto options = std::make_shared<LocaleOptions>();
  app->add_option("NAME", options->name, "A locale; without it, the user's")->type_name("");
  auto* item = app->add_option("--item", options->items, "Print only the value of this item; can be repeated")
                   ->option_text("NUMBER|NAME")
                   ->allow_extra_args(false);
  auto* territory =
      app->add_flag("--territory", options->territory, "Show the territory's own values")->option_text(" ");
  app->add_flag("--native", options->native, "Show the system's names of the locale instead")
      ->option_text(" ")
      ->excludes(item)
      ->excludes(territory);
  app->add_flag("--json", options->json, "Write JSON");
  app->footer(kNotes);
  return {app, [options](const CommonOptions& common) { return run_locale(*options, common); }};
}

}  // namespace lx::tool
