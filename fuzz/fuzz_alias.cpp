// SPDX-License-Identifier: Apache-2.0
// The input is an alias file.

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

class Aliases : public Target {
 public:
  Aliases() : aliases_((test::write_small_directory(directory_), directory_), "alias.txt") { start(directory_.path()); }

  void run(InputBytes input) override {
    aliases_.write(input.rest());
    LXObjMgr* manager = LXGetObjManager();
    LXDestroyAliasList(manager);
    demand(LXBuildAliasList(manager) <= 1, "LXBuildAliasList");
    int left = 200;  // looking up is linear
    LXEnumAliases(manager, look_up, &left);
    // A file that is read twice has the same aliases twice: the first still win.
    LXBuildAliasList(manager);
    left = 20;
    LXEnumAliases(manager, look_up, &left);
    LXReleaseLocale(LXGetLocale("English.tiny", 0, nullptr), 0);
  }

 private:
  static int32_t look_up(void* left, const char* alias, const char* code_page) {
    size_t length = std::strlen(alias);
    demand(length >= 1 && length <= 64, "length of an alias");
    demand(std::strlen(code_page) >= 1 && std::strlen(code_page) <= 32, "length of a code page name");
    demand(std::strpbrk(alias, " \t\r\nabcdefghijklmnopqrstuvwxyz") == nullptr, "characters of an alias");
    demand(LXGetCodepageFromAlias(LXGetObjManager(), alias) != nullptr, "an alias is not found");
    std::string name = "English." + std::string(alias);
    LXReleaseLocale(LXGetLocale(name.c_str(), 0, nullptr), 0);
    return --*static_cast<int*>(left);
  }

  test::DataDirectory directory_;
  InputFile aliases_;
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Aliases>(); }

}  // namespace lx::fuzz
