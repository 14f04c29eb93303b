// SPDX-License-Identifier: Apache-2.0
// Messages that people look for when the library does not find its data.
#include "support/trace_capture.hpp"

#include <gtest/gtest.h>

#include <functional>

#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

struct Case {
  std::function<void()> use;
  std::vector<std::string> messages;  // word for word, among others
};

void expect_messages(const std::vector<Case>& cases) {
  for (const auto& [use, messages] : cases) {
    TraceCapture trace;
    use();
    std::string missing;
    for (const std::string& message : messages) {
      if (!trace.has(message)) missing += message + "\n";
    }
    EXPECT_EQ(missing, "") << "all messages:\n" << trace.all();
  }
}

class Trace : public testing::Test {
 protected:
  Trace() { write_small_directory(directory_); }
  static std::function<void()> start(std::string directory) {
    return [=] { Session session(directory.c_str()); };
  }

  Variable location_{"LX_LOCALEDIR", "/does/not/exist"};
  DataDirectory directory_;
  const std::string path_ = directory_.path();
};

TEST_F(Trace, WhereDataIsLookedFor) {
  DataDirectory corrupted;
  Bytes control = control_file(small_directory_records());
  control[0] ^= 1;
  corrupted.write("control.nls", control);
  const std::string too_long(250, 'd');
  expect_messages({
      {start(path_),
       {"LXInit entry", "Creating global area", "Lexaro init count = 0", "directory = " + path_ + ".", "options = 0",
        "Opening file " + path_ + "/control.nls", "LXObjDisk size = 38",
        "Entry = 0, Object Type = 0, Object Id = 1, Object Name = English",
        "Entry = 8, Object Type = 2, Object Id = 903, Object Name = OldSingle", "LXInit exit 0", "LXTerm entry",
        "LXTerm exit 0"}},
      {start("/does/not/exist"),
       {"Unable to open /does/not/exist/control.nls, err = 1000", "Unable to open control file", "LXInit exit 10"}},
      {[] { Session session(nullptr); },
       {"No directory specified", "Unable to open /does/not/exist/control.nls, err = 1000",
        "Unable to open /Vantrel/locale/control.nls, err = 1000"}},
      {start(too_long), {"Unable to construct control file name in directory " + too_long, "control size = 255"}},
      {start(corrupted.path()), {"Control file header is corrupted", "LXInit exit 10"}},
  });
}

TEST_F(Trace, Aliases) {
  directory_.write("alias.txt", "Small one\n" + std::string(33, 'n') + " x\n");
  expect_messages({{start(path_),
                    {"Processing codepage 'Small'", "Processing alias 'one'", "Saved alias ONE, length = 3",
                     "codepage name length (33) for " + std::string(33, 'n') + " exceeds maximum of 32",
                     "Alias list build failed. No aliases supported"}}});
}

TEST_F(Trace, LookupsAndFiles) {
  directory_.write("x.nls", "old");
  Session session(directory_.path());
  LXObjMgr* manager = LXGetObjManager();
  auto get = [](const char* name) { return [=] { EXPECT_EQ(LXGetLocale(name, 0, nullptr), nullptr); }; };
  Variable lang("LX_LANG", nullptr);
  Variable all("LC_ALL", "C");
  expect_messages({
      {[] { Locale(LXGetLocale(nullptr, LX_GET_USER, nullptr)).reset(); },
       {"Searching for C", "Restored locale: [1/1024] C", "User locale: English_UnitedStates.US-ASCII@Binary"}},
      {[=] { LXGetObjFromName(manager, LX_CODEPAGE, "Nowhere", -1, 0, nullptr); },
       {"Searching for type 2, name Nowhere"}},
      {[=] { LXGetObjFromID(manager, LX_SORT, 77, 0, nullptr); }, {"Searching for type 3, id 77"}},
      {[=] { LXGetCodepageFromAlias(manager, "Tiny"); }, {"Searching for Tiny.", "TINY -> Small"}},
      {get("Nobody"), {"Unable to locate language, rc = 37"}},
      {get("English_Nowhere"), {"Unable to locate territory, rc = 37"}},
      {get("English.Nothing"), {"Unable to locate code page, rc = 37"}},
      {get("English@None"), {"Unable to locate sort, rc = 37"}},
      {[this] { LXCloseFile(LXOpenFile(1, directory_.file("x.nls").c_str(), 1, 0, nullptr), 0); },
       {"Opening file " + path_ + "/x.nls",
        "Original path: " + path_ + "/x.nls\n drive: \n directory: " + path_ + "/\n file: x\n extent: .nls",
        "Using temp file " + path_ + "/xtmp", "Renaming " + path_ + "/xtmp to " + path_ + "/x.nls"}},
  });
}

}  // namespace
}  // namespace lx::test
