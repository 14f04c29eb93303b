// SPDX-License-Identifier: Apache-2.0
#include "wordlists/word_list.hpp"

#include <unicode/ucnv.h>

#include <algorithm>
#include <fstream>
#include <string_view>

namespace lx::test {
namespace {

// The conversion of whole texts only; a text that ICU refuses is no word.
std::string to_utf8(const std::string& text, const char* encoding) {
  std::string utf8(text.size() * 4 + 1, '\0');
  UErrorCode error = U_ZERO_ERROR;
  const int32_t length = ucnv_convert("UTF-8", encoding, utf8.data(), static_cast<int32_t>(utf8.size()), text.data(),
                                      static_cast<int32_t>(text.size()), &error);
  utf8.resize(U_SUCCESS(error) ? static_cast<size_t>(length) : 0);
  return utf8;
}

// Dictionaries have a count first, and behind each word what is known about it.
std::string word_of(const std::string& line, bool dictionary) {
  if (!dictionary) return line;
  if (line.find_first_not_of("0123456789\r") == std::string::npos) return "";
  return line.substr(0, line.find_first_of("/ \t\r"));
}

void thin_out(std::vector<std::string>& words, size_t most) {
  if (words.size() <= most) return;
  for (size_t i = 0; i < most; ++i) words[i].swap(words[i * words.size() / most]);
  words.resize(most);
}

}  // namespace

std::vector<std::string> read_words(const WordListFile& file, size_t most) {
  std::vector<std::string> words;
  std::ifstream in(file.path, std::ios::binary);
  const bool dictionary = std::string_view(file.path).ends_with(".dic");
  const bool is_utf8 = std::string_view(file.encoding) == "UTF-8";
  for (std::string line; std::getline(in, line);) {
    std::string word = word_of(line, dictionary);
    if (!is_utf8) word = to_utf8(word, file.encoding);
    if (!word.empty()) words.push_back(std::move(word));
  }
  thin_out(words, most);
  std::sort(words.begin(), words.end());
  words.erase(std::unique(words.begin(), words.end()), words.end());
  return words;
}

}  // namespace lx::test
