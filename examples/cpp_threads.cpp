// SPDX-License-Identifier: Apache-2.0
// Many threads at once: each converts a host file, sorts its lines and writes numbers and a time, with locales of its
// own, and all come to what a single thread comes to.
//   cpp_threads THREADS INPUT
// INPUT is in IBM-930; the locale data are where LX_LOCALEDIR says.
#include <algorithm>
#include <array>
#include <fstream>
#include <iostream>
#include <iterator>
#include <lexaro/lexaro.hpp>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

namespace {

const std::array<const char*, 4> kLocales = {"English_UnitedStates.UTF-8", "German_Germany.UTF-8",
                                             "French_France.UTF-8", "Swedish_Sweden.UTF-8"};

std::vector<std::string> lines_of(const std::string& text) {
  const std::string next_line = "\xC2\x85";  // U+0085, with which host files end their lines
  std::vector<std::string> lines;
  for (std::size_t begin = 0, end; (end = text.find(next_line, begin)) != std::string::npos;) {
    lines.push_back(text.substr(begin, end - begin));
    begin = end + next_line.size();
  }
  return lines;
}

// By comparing the texts, and by comparing keys; throws when the orders differ.
std::vector<std::string> sorted(lexaro::Locale& locale, const std::vector<std::string>& lines) {
  std::vector<std::string> by_text = lines;
  std::stable_sort(by_text.begin(), by_text.end(),
                   [&](const auto& a, const auto& b) { return locale.compare(a, b) < 0; });
  std::vector<std::pair<std::string, std::string>> keys;
  for (const auto& line : lines) keys.emplace_back(locale.sort_key(line), line);
  std::stable_sort(keys.begin(), keys.end(), [](const auto& a, const auto& b) { return a.first < b.first; });
  for (std::size_t i = 0; i < keys.size(); ++i) {
    if (keys[i].second != by_text[i]) throw std::runtime_error("keys and texts order differently");
  }
  return by_text;
}

// All the work of one locale, as text. A locale belongs to one thread at a time, so it is made here.
std::string work(const std::string& name, const std::string& host_file) {
  lexaro::Locale host("Japanese.IBM-930");
  lexaro::Locale locale(name);
  LXTime time{};
  time.tm_year = 126;
  time.tm_mon = 10;
  time.tm_mday = 22;
  time.tm_wday = 0;
  std::string result = locale.name() + ": " + locale.format(1234567.891) + ", " + locale.format_currency(-1234.5) +
                       ", " + locale.format_time(time, locale.text(LX_ITEM_LONG_DATE)) + '\n';
  for (const auto& line : sorted(locale, lines_of(lexaro::convert(host, locale, host_file)))) {
    result += locale.upper(line) + '\n';
  }
  return result;
}

// One thread's share: every locale several times. Gives how many results differ from the right ones.
int repeat(const std::vector<std::string>& expected, const std::string& host_file) {
  constexpr int kRounds = 20;
  int wrong = 0;
  for (int round = 0; round < kRounds; ++round) {
    for (std::size_t i = 0; i < kLocales.size(); ++i) wrong += work(kLocales[i], host_file) != expected[i];
  }
  return wrong;
}

void run(int argc, char** argv) {
  if (argc != 3) throw std::runtime_error("usage: cpp_threads THREADS INPUT");
  const auto count = static_cast<std::size_t>(std::clamp(std::stoi(argv[1]), 1, 64));
  std::ifstream input(argv[2], std::ios::binary);
  if (!input) throw std::runtime_error(std::string("cannot read ") + argv[2]);
  const std::string host_file(std::istreambuf_iterator<char>(input), {});

  const lexaro::Library library;  // one for all threads, made before them
  std::vector<std::string> expected;
  for (const char* name : kLocales) {
    expected.push_back(work(name, host_file));
    std::cout << expected.back().substr(0, expected.back().find('\n') + 1);
  }

  std::vector<int> wrong(count, -1);  // -1: the thread failed
  std::vector<std::thread> threads;
  for (std::size_t i = 0; i < count; ++i) {
    threads.emplace_back([&, i] {
      try {
        wrong[i] = repeat(expected, host_file);
      } catch (const std::exception& error) {
        std::cerr << "thread " << i << ": " << error.what() << '\n';
      }
    });
  }
  for (auto& thread : threads) thread.join();
  for (const int result : wrong) {
    if (result != 0) throw std::runtime_error("a thread came to something else");
  }
  std::cout << count << " threads: all results equal those of one thread\n";
}

}  // namespace

int main(int argc, char** argv) {
  try {
    run(argc, argv);
    return 0;
  } catch (const std::exception& error) {
    std::cerr << error.what() << '\n';
    return 1;
  }
}
