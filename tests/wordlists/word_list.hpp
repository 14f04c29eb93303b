// SPDX-License-Identifier: Apache-2.0
// Word lists of the system: plain ones of a word a line, and dictionaries of spelling checkers.
#pragma once

#include <string>
#include <vector>

namespace lx::test {

struct WordListFile {
  const char* package;  // that brings it
  const char* path;
  const char* encoding;
};

// Its different words in UTF-8, some evenly chosen ones of a very long list; empty where the list is not installed.
std::vector<std::string> read_words(const WordListFile& file, size_t most);

}  // namespace lx::test
