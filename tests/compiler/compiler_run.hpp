// SPDX-License-Identifier: Apache-2.0
// The data compiler, as its users run it: the program LEXAROC_PATH on the sources in LEXARO_SOURCE_DATA.
#pragma once

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <string>

namespace fs = std::filesystem;

struct Outcome {
  int exit_code;
  std::string output;  // both streams
};

inline Outcome lexaroc(const std::string& arguments) {
  FILE* pipe = popen((std::string("'") + LEXAROC_PATH + "' " + arguments + " 2>&1").c_str(), "r");
  if (pipe == nullptr) return {-1, "cannot run the compiler"};
  std::string output;
  char block[4096];
  for (size_t count; (count = fread(block, 1, sizeof block, pipe)) != 0;) output.append(block, count);
  int status = pclose(pipe);
  return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, output};
}

inline std::string quoted(const fs::path& path) { return "'" + path.string() + "'"; }

inline std::string content(const fs::path& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

inline void write(const fs::path& path, const std::string& bytes) {
  std::ofstream(path, std::ios::binary | std::ios::trunc) << bytes;
}

inline std::map<std::string, std::string> files_in(const fs::path& directory) {
  std::map<std::string, std::string> files;
  for (const auto& entry : fs::directory_iterator(directory)) {
    files[entry.path().filename().string()] = content(entry.path());
  }
  return files;
}

inline std::string without_comments(const std::string& text) {
  std::string rest;
  for (size_t at = 0; at < text.size();) {
    size_t end = text.find('\n', at);
    end = end == std::string::npos ? text.size() : end + 1;
    if (text[at] != '#') rest += text.substr(at, end - at);
    at = end;
  }
  return rest;
}

// The folder of an object's source, by the prefix of its file name.
inline std::string folder_of(const std::string& stem) {
  return stem[0] == 'l' ? "language" : stem[0] == 't' ? "territory" : stem[0] == 's' ? "collation" : "codepage";
}

class CompilerTest : public testing::Test {
 protected:
  CompilerTest() {
    std::string name = (fs::temp_directory_path() / "lexaroc.XXXXXX").string();
    if (mkdtemp(name.data()) != nullptr) work_ = name;
  }
  ~CompilerTest() override {
    if (!work_.empty()) fs::remove_all(work_);
  }
  void SetUp() override { ASSERT_FALSE(work_.empty()); }

  fs::path work(const std::string& name) const { return work_ / name; }

  void compile(const fs::path& sources, const fs::path& output, const std::string& options = "") {
    Outcome outcome = lexaroc("data " + options + " " + quoted(sources) + " " + quoted(output));
    ASSERT_EQ(outcome.exit_code, 0) << outcome.output;
    EXPECT_EQ(outcome.output, "");
  }

  // A source tree of what dump prints for each object of a data directory.
  void dump_all(const fs::path& compiled, const fs::path& sources) {
    fs::create_directories(sources);
    fs::copy(data_ / "unicode", sources / "unicode");
    fs::copy(compiled / "alias.txt", sources);
    for (const char* folder : {"language", "territory", "codepage", "collation"})
      fs::create_directory(sources / folder);
    for (const auto& entry : fs::directory_iterator(compiled)) {
      std::string stem = entry.path().stem().string();
      if (entry.path().extension() != ".nls" || stem == "control") continue;
      fs::path source = sources / folder_of(stem) / (stem + ".txt");
      Outcome outcome = lexaroc("dump " + quoted(entry.path()) + " -o " + quoted(source));
      ASSERT_EQ(outcome.exit_code, 0) << outcome.output;
    }
  }

  // A few sources of each type, to be broken.
  fs::path small_tree() {
    fs::path tree = work("small");
    fs::remove_all(tree);
    for (const char* folder : {"language", "territory", "codepage"}) fs::create_directories(tree / folder);
    fs::copy(data_ / "unicode", tree / "unicode");
    for (const char* name : {"language/la_00002.txt", "territory/te_00276.txt", "codepage/cp_00930.txt",
                             "codepage/cp_00367.txt", "codepage/cp_00954.txt"}) {
      fs::copy(data_ / name, tree / name);
    }
    write(tree / "alias.txt", "US-ASCII ascii\n    us\n");
    return tree;
  }

  const fs::path data_ = LEXARO_SOURCE_DATA;

 private:
  fs::path work_;
};

// One line of a source is replaced.
struct BrokenSource {
  const char* file;
  const char* line;  // the line that begins so
  const char* replacement;
  unsigned line_offset;  // the fault is reported so many lines further on,
  unsigned column;       // and in this column
  const char* message;   // or its beginning
};
inline constexpr unsigned kEnd = ~0u;        // the line after the last
inline constexpr unsigned kElsewhere = ~1u;  // a line that the case does not care about

// Breaks a source for as long as it lives.
class Fault {
 public:
  Fault(const fs::path& tree, const BrokenSource& broken)
      : broken_(broken), path_(tree / broken.file), sound_(content(path_)) {
    std::string text = "\n" + sound_;
    size_t at = text.find(std::string("\n") + broken.line);
    if (at == std::string::npos) {
      ADD_FAILURE() << broken.file << " has no line " << broken.line;
      return;
    }
    text.erase(0, 1);
    text.replace(at, text.find('\n', at) - at, broken.replacement);
    auto end = text.begin() + (broken.line_offset == kEnd ? static_cast<long>(text.size()) : static_cast<long>(at));
    line_ = std::count(text.begin(), end, '\n') + 1 + (broken.line_offset == kEnd ? 0 : broken.line_offset);
    write(path_, text);
  }
  Fault(const Fault&) = delete;
  Fault& operator=(const Fault&) = delete;
  ~Fault() { write(path_, sound_); }

  void expect_in(const Outcome& outcome) const {
    std::string expected = path_.string() + ":" + std::to_string(line_) + ":" + std::to_string(broken_.column) + ": ";
    if (broken_.line_offset == kElsewhere) expected.clear();
    expected += broken_.message;
    EXPECT_EQ(outcome.exit_code, 1) << broken_.replacement;
    EXPECT_NE(outcome.output.find(expected), std::string::npos)
        << "expected " << expected << "\ngot " << outcome.output;
  }

 private:
  const BrokenSource& broken_;
  fs::path path_;
  std::string sound_;
  long line_ = 0;
};
