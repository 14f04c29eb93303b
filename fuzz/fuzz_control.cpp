// SPDX-License-Identifier: Apache-2.0
// The input is a control file: objects are looked up in what is made of it, and loaded.

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

class ControlFiles : public Target {
 public:
  ControlFiles() : control_((test::write_small_directory(directory_), directory_), "control.nls") {
    start("/does/not/exist");
  }

  void run(InputBytes input) override {
    control_.write(input.rest());
    uint32_t rc = 99;
    LXObjMgr* manager = LXInitObjManager(directory_.path(), LX_INIT_NO_DEFAULTS, &rc);
    demand(manager != nullptr, "LXInitObjManager");
    demand(rc == LX_OK || rc == LX_E_HEADER || rc == LX_E_FILE, "status of the control file");
    use(manager, rc == LX_OK ? 0 : 1);
    demand(LXTermObjManager(manager) == LX_OK, "LXTermObjManager");
  }

 private:
  static void use(LXObjMgr* manager, int expected_nothing) {
    for (uint8_t type = 0; type <= 4; ++type) {
      uint32_t rc = 99;
      for (uint32_t id = 0; id < 0x10000; id += id < 1000 ? 1 : 997) {
        LXObjEntry* entry = LXGetObjFromID(manager, type, static_cast<uint16_t>(id), 1, &rc);
        if (entry == nullptr) continue;
        demand(expected_nothing == 0 && rc == LX_OK, "an object of a directory that was refused");
        demand(LXGetObjType(entry) == type && LXGetObjId(entry) == id,
               "another object than the one that was asked for");
        demand(std::strlen(LXGetObjName(entry)) <= 33, "name of an object");
        LXGetObjFromName(manager, type, LXGetObjName(entry), -1, 0, &rc);
      }
      for (const char* name : {"English", "Germany", "US-ASCII", "Small", "BINARY", ""}) {
        LXObjEntry* entry = LXGetObjFromName(manager, type, name, -1, 0, &rc);
        demand(entry == nullptr || LXGetObjType(entry) == type, "type of an object");
      }
    }
  }

  test::DataDirectory directory_;
  InputFile control_;
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<ControlFiles>(); }

}  // namespace lx::fuzz
