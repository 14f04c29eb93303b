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
#include <vector>

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

// One line of a source is replaced.
struct BrokenSource {
  const char* file;
  const char* line;  // the line that begins so
  std::string replacement;
  unsigned line_offset;  // the fault is reported so many lines further on,
  unsigned column;       // and in this column
  const char* message;   // or its beginning
};
inline constexpr unsigned kEnd = ~0u;        // the line after the last
inline constexpr unsigned kElsewhere = ~1u;  // a line that the case does not care about

// What the compiler has to say: a line with both.
struct Complaint {
  std::string place, message;

  void expect_in(const Outcome& outcome) const {
    EXPECT_EQ(outcome.exit_code, 1);
    size_t at = outcome.output.find(place);
    while (at != std::string::npos &&
           outcome.output.substr(at, outcome.output.find('\n', at) - at).find(message) == std::string::npos) {
      at = outcome.output.find(place, at + 1);
    }
    EXPECT_NE(at, std::string::npos) << "expected " << place << " " << message << "\ngot " << outcome.output;
  }
};

// Breaks a source of the tree.
inline Complaint spoil(const fs::path& tree, const BrokenSource& broken) {
  const fs::path path = tree / broken.file;
  std::string text = "\n" + content(path);
  const size_t at = text.find(std::string("\n") + broken.line);
  text.erase(0, 1);
  EXPECT_NE(at, std::string::npos) << path << " has no line " << broken.line;
  if (at == std::string::npos) return {};
  text.replace(at, text.find('\n', at) - at, broken.replacement);
  fs::remove(path);  // it may be shared with other trees
  write(path, text);
  if (broken.line_offset == kElsewhere) return {tree.string() + "/", broken.message};
  const auto lines = std::count(text.begin(), text.begin() + static_cast<long>(at), '\n') + broken.line_offset;
  const auto line = broken.line_offset == kEnd ? std::count(text.begin(), text.end(), '\n') : lines;
  const std::string place = ":" + std::to_string(line + 1) + ":" + std::to_string(broken.column) + ": ";
  return {path.string() + place + broken.message, ""};
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

  void dump(const fs::path& compiled, const fs::path& source) {
    Outcome outcome = lexaroc("dump " + quoted(compiled) + " -o " + quoted(source));
    ASSERT_EQ(outcome.exit_code, 0) << outcome.output;
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
      dump(entry.path(), sources / folder_of(stem) / (stem + ".txt"));
    }
  }

  // A few sources of each type, to be broken.
  fs::path small_tree() {
    fs::path tree = work("small");
    for (const char* folder : {"language", "territory", "codepage"}) fs::create_directories(tree / folder);
    fs::copy(data_ / "unicode", tree / "unicode");
    for (const char* name : {"language/la_00002.txt", "territory/te_00276.txt", "codepage/cp_00930.txt",
                             "codepage/cp_00367.txt", "codepage/cp_00954.txt"}) {
      fs::copy(data_ / name, tree / name);
    }
    write(tree / "alias.txt", "US-ASCII ascii\n    us\n");
    return tree;
  }

  // Each fault alone in a copy of the tree, all checked in one run.
  void expect_checked(const fs::path& tree, const std::vector<BrokenSource>& cases) {
    std::string command = "check";
    std::vector<Complaint> complaints;
    for (const BrokenSource& broken : cases) {
      fs::path copy = work("case" + std::to_string(complaints.size()));
      fs::copy(tree, copy, fs::copy_options::recursive | fs::copy_options::create_hard_links);
      complaints.push_back(spoil(copy, broken));
      command += " " + quoted(copy / broken.file);
    }
    Outcome outcome = lexaroc(command);
    for (const Complaint& complaint : complaints) complaint.expect_in(outcome);
  }

  // Whatever stands in a compiled file, check and dump accept it or end with a message. Dump reads what check accepts;
  // of the others some will do.
  void expect_harmless(const std::string& name, const std::vector<std::string>& contents) {
    std::string command = "check";
    auto damaged = [&](size_t i) { return work("damaged" + std::to_string(i)) / name; };
    for (size_t i = 0; i < contents.size(); ++i) {
      fs::create_directories(damaged(i).parent_path());
      write(damaged(i), contents[i]);
      command += " " + quoted(damaged(i));
    }
    Outcome checked = lexaroc(command);
    EXPECT_EQ(checked.exit_code, 1) << name;
    for (size_t i = 0; i < contents.size(); ++i) {
      const bool refused = checked.output.find(damaged(i).string() + ": ") != std::string::npos;
      if (refused && i % 16 != 0) continue;
      Outcome dumped = lexaroc("dump --locale-dir " LEXARO_DATA " " + quoted(damaged(i)));
      const bool has_locale = name.ends_with(".cat");  // which dump needs
      EXPECT_TRUE(dumped.exit_code == int{refused} || (has_locale && dumped.exit_code == 1)) << name << " " << i;
    }
  }

  const fs::path data_ = LEXARO_SOURCE_DATA;

 private:
  fs::path work_;
};
