// SPDX-License-Identifier: Apache-2.0
// Messages that people look for when the library does not find its data.
#include "support/trace_capture.hpp"

#include <gtest/gtest.h>

#include "support/counting_allocator.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

void expect_messages(const TraceCapture& trace, const std::vector<std::string>& wanted) {
  std::string missing;
  for (const std::string& message : wanted) {
    if (!trace.has(message)) missing += message + "\n";
  }
  EXPECT_EQ(missing, "") << "all messages:\n" << trace.all();
}

TEST(Trace, StartAndEnd) {
  DataDirectory directory;
  write_small_directory(directory);
  std::string path = directory.path();
  TraceCapture trace;
  { Session session(directory.path()); }
  expect_messages(trace, {"LXInit entry", "Creating global area", "Lexaro init count = 0", "directory = " + path + ".",
                          "options = 0", "Opening file " + path + "/control.nls", "LXObjDisk size = 38",
                          "Entry = 0, Object Type = 0, Object Id = 1, Object Name = English",
                          "Entry = 8, Object Type = 2, Object Id = 903, Object Name = OldSingle", "LXInit exit 0",
                          "LXTerm entry", "LXTerm exit 0"});
  EXPECT_EQ(trace.messages().front(), "LXInit entry");
  EXPECT_EQ(trace.messages().back(), "LXTerm exit 0");
}

TEST(Trace, EveryEntryHasItsExit) {
  TraceCapture trace;
  {
    Session session;
    Locale locale = locale_of("UTF-8");
  }
  long depth = 0;
  for (const std::string& message : trace.messages()) {
    if (message.ends_with(" entry")) ++depth;
    if (message.find(" exit") != message.npos && message.starts_with("LX")) --depth;
    EXPECT_GE(depth, 0) << message;
  }
  EXPECT_EQ(depth, 0);
}

TEST(Trace, DataThatIsNotFound) {
  Variable location("LX_LOCALEDIR", nullptr);
  TraceCapture trace;
  { Session session("/does/not/exist"); }
  expect_messages(trace, {"Unable to open /does/not/exist/control.nls, err = 1000", "Unable to open control file",
                          "LXInit exit 10"});
}

TEST(Trace, NameThatIsTooLong) {
  TraceCapture trace;
  std::string directory(250, 'd');
  { Session session(directory.c_str()); }
  expect_messages(trace, {"Unable to construct control file name in directory " + directory, "control size = 255"});
}

TEST(Trace, NoDirectory) {
  Variable location("LX_LOCALEDIR", "/does/not/exist");
  TraceCapture trace;
  { Session session(nullptr); }
  expect_messages(trace, {"No directory specified", "Unable to open /does/not/exist/control.nls, err = 1000",
                          "Unable to open /Vantrel/locale/control.nls, err = 1000"});
}

TEST(Trace, CorruptedControlFile) {
  DataDirectory directory;
  Bytes control = control_file(small_directory_records());
  control[0] ^= 1;
  directory.write("control.nls", control);
  TraceCapture trace;
  { Session session(directory.path()); }
  expect_messages(trace, {"Control file header is corrupted", "LXInit exit 10"});
}

TEST(Trace, FirstBadFieldIsNamed) {
  DataDirectory directory;
  write_small_directory(directory);
  Bytes page = multibyte_page_file();
  page[76 + 5] = 9;
  directory.write_object(LX_CODEPAGE, 900, page);
  Session session(directory.path());
  TraceCapture trace;
  uint32_t rc = 0;
  EXPECT_NE(LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, "Small", -1, 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_HEADER);
  EXPECT_NE(trace.all().find("maximum character length"), std::string::npos) << trace.all();
}

TEST(Trace, Lookups) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  TraceCapture trace;
  uint32_t rc = 0;
  LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, "Nowhere", -1, 0, &rc);
  LXGetObjFromID(LXGetObjManager(), LX_SORT, 77, 0, &rc);
  LXGetCodepageFromAlias(LXGetObjManager(), "Tiny");
  expect_messages(trace, {"Searching for type 2, name Nowhere", "Searching for type 3, id 77", "Searching for Tiny.",
                          "TINY -> Small"});
}

TEST(Trace, Aliases) {
  DataDirectory directory;
  write_small_directory(directory);
  const std::string long_alias(65, 'a');
  const std::string long_name(33, 'n');
  struct Case {
    std::string text, message;
  };
  const Case cases[] = {
      {"Small one\n", "Processing codepage 'Small'"},
      {"Small one\n", "Processing alias 'one'"},
      {"Small one\n", "Saved alias ONE, length = 3"},
      {" one two\n", "Codepage name one does not start in column 1"},
      {long_name + " x\n", "codepage name length (33) for " + long_name + " exceeds maximum of 32"},
      {"Small " + long_alias, "Alias name length (65) for " + long_alias + " exceeds maximum of 32"},
      {" one two\n", "Alias list build failed. No aliases supported"},
  };
  for (const Case& one : cases) {
    directory.write("alias.txt", one.text);
    TraceCapture trace;
    { Session session(directory.path()); }
    expect_messages(trace, {one.message});
  }
  directory.remove("alias.txt");
  TraceCapture trace;
  { Session session(directory.path()); }
  expect_messages(trace, {"Open of " + directory.file("alias.txt") + " failed, err = 1000",
                          "Alias list build failed. No aliases supported"});
}

TEST(Trace, MemoryThatIsNotThere) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.write("alias.txt", "Small one\n");
  std::string all;
  bool failed = true;
  for (int n = 0; failed; ++n) {
    CountingAllocator allocator;
    allocator.arm(n, false);
    TraceCapture trace;
    allocator.init(directory.path());
    failed = allocator.has_failed();
    all += trace.all();
    allocator.disarm();
    if (LXGetObjManager() == nullptr) allocator.init(directory.path());
    LXTerm();
  }
  for (const char* message :
       {"Unable to allocate 342 bytes for control data\n", " bytes for globals\n", " bytes for object manager\n",
        "Unable to allocate 104 bytes for codepage Small, alias one\n"}) {
    EXPECT_NE(all.find(message), std::string::npos) << message;
  }
}

TEST(Trace, PartsOfALocaleName) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  struct Case {
    const char* name;
    const char* message;
  };
  const Case cases[] = {
      {"Nobody", "Unable to locate language, rc = 37"},
      {"English_Nowhere", "Unable to locate territory, rc = 37"},
      {"English.Nothing", "Unable to locate code page, rc = 37"},
      {"English@None", "Unable to locate sort, rc = 37"},
  };
  for (const Case& one : cases) {
    TraceCapture trace;
    EXPECT_EQ(LXGetLocale(one.name, 0, nullptr), nullptr);
    expect_messages(trace, {one.message});
  }
}

TEST(Trace, SplitAndReplace) {
  DataDirectory directory;
  directory.write("x.nls", "old");
  TraceCapture trace;
  uint32_t rc = 0;
  LXFile* file = LXOpenFile(1, directory.file("x.nls").c_str(), 1, 0, &rc);
  EXPECT_EQ(LXCloseFile(file, 0), 0u);
  std::string path = directory.path();
  expect_messages(trace,
                  {"Opening file " + path + "/x.nls",
                   "Original path: " + path + "/x.nls\n drive: \n directory: " + path + "/\n file: x\n extent: .nls",
                   "Using temp file " + path + "/xtmp", "Renaming " + path + "/xtmp to " + path + "/x.nls"});
}

TEST(Trace, UserLocale) {
  Session session;
  Variable lang("LX_LANG", nullptr);
  Variable all("LC_ALL", "C");
  TraceCapture trace;
  char name[132];
  EXPECT_EQ(LXGetUserLocale(name, sizeof name), 2);
  expect_messages(
      trace, {"Searching for C", "Restored locale: [1/1024] C", "User locale: English_UnitedStates.US-ASCII@Binary"});
}

// Inner loops of callers stay silent.
TEST(Trace, PrimitivesSayNothing) {
  Session session;
  uint32_t rc = 0;
  LXObjEntry* page = LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, LX_CP_UTF8, 0, &rc);
  ASSERT_NE(page, nullptr);
  TraceCapture trace;
  char out[4];
  LXCpUnicodeToChar(page, 0x3042, out);
  LXCpUnicodeToCharW(page, 0x3042);
  LXCpMbToUnicode(page, out);
  LXCpMbToUnicodeW(page, 0xE38182);
  LXMbToW(page, out);
  LXMbToWS(page, out, 1);
  LXWToMb(out, 0xE38182);
  LXGetMbCtype(page, out);
  LXGetMbCtypeW(page, 0xE38182);
  LXCpMbHalfToFullW(page, 1);
  LXCpFullToHalfW(page, 1);
  LXCpMbCaseConvW(page, 0xE38182, 4);
  EXPECT_EQ(trace.all(), "");
}

}  // namespace
}  // namespace lx::test
