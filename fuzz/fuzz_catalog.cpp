// SPDX-License-Identifier: Apache-2.0
// A message catalog, loaded and on disk, and all that its readers look at. The first bytes choose the caller's page and
// the room of the messages; the rest is the file.

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

class Catalogs : public Target {
 public:
  Catalogs() {
    test::write_small_directory(directory_);
    start(directory_.path(), "English_UnitedStates.", {"US-ASCII", "Small", "Mixed", "OldSingle"}, "@BINARY");
  }

  void run(InputBytes input) override {
    LXLocale* locale = locales_[input.byte() % locales_.size()];
    int32_t room = input.byte() % 64 + 1;
    file_.write(input.rest());
    for (bool on_disk : {false, true}) read_all(locale, on_disk, room);
  }

 private:
  void read_all(LXLocale* locale, bool on_disk, int32_t room) {
    uint32_t rc = 99;
    LXFile* file = LXOpenFile(0, directory_.file("catalog").c_str(), 0, 0, &rc);
    demand(file != nullptr, "the input file cannot be opened");
    LXCatalog* catalog = LXMcLoadCat(locale, file, on_disk ? 0 : 1, &rc);
    if (catalog == nullptr) {
      demand(rc == LX_E_CATALOG, "status of a catalog that was refused");
      demand(LXCloseFile(file, 0) == 0, "the file of a refused catalog is the caller's");
      return;
    }
    for (uint32_t set = 0; set < 6; ++set) {
      for (int32_t message = -1; message < 12; ++message) read(catalog, on_disk, set, message, room);
    }
    demand(LXCloseCatalog(catalog, 0) == LX_OK, "LXCloseCatalog");
  }

  void read(LXCatalog* catalog, bool on_disk, uint32_t set, int32_t message, int32_t room) {
    auto units = static_cast<size_t>(room);
    auto bytes = std::make_unique<char[]>(units);
    auto wide = std::make_unique<LXWChar[]>(units);
    auto ucs2 = std::make_unique<LXUChar[]>(units);
    std::vector<char> long_enough(units * 5 + 3);  // a size that counts characters says nothing about bytes
    uint32_t results[] = {LXGetMessage(catalog, set, message, bytes.get(), room, "default", 0),
                          LXGetMessageW(catalog, set, message, wide.get(), room, nullptr, 0),
                          LXGetMessageU(catalog, set, message, ucs2.get(), room, nullptr, LX_OPT_CHARS),
                          LXGetMessage(catalog, set, message, long_enough.data(), room, nullptr, LX_OPT_CHARS)};
    for (uint32_t rc : results) demand(rc == LX_OK || rc == LX_E_CATALOG || rc == LX_E_MESSAGE, "status of a message");
    LXCatSet scratch;
    uint32_t length = 0;
    uint32_t rc = 99;
    const char* text = MCGetMsg(catalog, MCGetSet(catalog, set, &scratch, &rc), message, &length, &rc);
    volatile char last = text != nullptr && length != 0 ? text[length - 1] : '\0';
    static_cast<void>(last);
    if (on_disk) LXMcFree(const_cast<char*>(text));
  }

  test::DataDirectory directory_;
  InputFile file_{directory_, "catalog"};
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Catalogs>(); }

}  // namespace lx::fuzz
