// SPDX-License-Identifier: Apache-2.0
// The input is an alias file.
#include <lexaro/lexaro.h>

#include <cstring>

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

class Library {
 public:
  Library() : aliases_((test::write_small_directory(directory_), directory_), "alias.txt") {
    LXInit(directory_.path(), nullptr, nullptr, nullptr, 0);
  }
  ~Library() { LXTerm(); }
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;

  void run(const uint8_t* data, size_t size) {
    aliases_.write(data, size);
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
}  // namespace lx::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static lx::fuzz::Library library;
  library.run(data, size);
  return 0;
}
