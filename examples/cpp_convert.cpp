// SPDX-License-Identifier: Apache-2.0
// Converts a file of any size from one code page to another.
//   cpp_convert FROM TO INPUT OUTPUT [DIRECTORY]
// FROM and TO are names, aliases or numbers of code pages; DIRECTORY holds the locale data.
#include <lexaro/lexaro.h>

#include <fstream>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

// The library, for as long as this object lives.
class Lexaro {
 public:
  explicit Lexaro(const char* directory) {
    const uint32_t status = LXInit(directory, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS);
    if (status != LX_OK) throw std::runtime_error("cannot start Lexaro: status " + std::to_string(status));
  }
  ~Lexaro() { LXTerm(); }
  Lexaro(const Lexaro&) = delete;
  Lexaro& operator=(const Lexaro&) = delete;
};

struct Releaser {
  void operator()(LXLocale* locale) const { LXReleaseLocale(locale, 0); }
  void operator()(LXConversion* conversion) const { LXCloseConversion(conversion); }
};
using Locale = std::unique_ptr<LXLocale, Releaser>;
using Conversion = std::unique_ptr<LXConversion, Releaser>;

Locale locale_of(const std::string& code_page) {
  uint32_t status = LX_OK;
  Locale locale(LXGetLocale(("English." + code_page).c_str(), 0, &status));
  if (!locale) throw std::runtime_error("cannot use code page " + code_page + ": status " + std::to_string(status));
  return locale;
}

// Calls `step(out, room)` with an empty buffer, and writes what it puts there, until it no longer needs more room.
template <typename Step>
void drain(std::ostream& output, Step step) {
  char buffer[8192];
  uint32_t status = LX_E_FULL;
  while (status == LX_E_FULL) {
    char* end = buffer;
    auto room = static_cast<int32_t>(sizeof buffer);
    status = step(&end, &room);
    output.write(buffer, end - buffer);
  }
}

void convert(LXConversion* conversion, std::istream& input, std::ostream& output) {
  std::vector<char> block(1 << 16);
  while (input.read(block.data(), static_cast<std::streamsize>(block.size())), input.gcount() > 0) {
    const char* in = block.data();
    auto left = static_cast<int32_t>(input.gcount());
    // What is left of a character at the end of the block waits in the handle.
    drain(output, [&](char** out, int32_t* room) { return LXConvertBuffer(conversion, out, room, &in, &left, 0); });
  }
  drain(output, [&](char** out, int32_t* room) { return LXFinishConversion(conversion, out, room); });
}

void report(const LXConversion* conversion) {
  LXConversionCounts counts{};
  LXGetConversionCounts(conversion, &counts);
  std::cerr << counts.bytes_in << " bytes in, " << counts.bytes_out << " bytes out, " << counts.substituted
            << " characters substituted\n";
}

void run(int argc, char** argv) {
  if (argc < 5) throw std::runtime_error("usage: cpp_convert FROM TO INPUT OUTPUT [DIRECTORY]");
  const Lexaro library(argc > 5 ? argv[5] : nullptr);
  const Locale from = locale_of(argv[1]);
  const Locale to = locale_of(argv[2]);
  const Conversion conversion(LXOpenConversion(to.get(), from.get(), 0));
  if (!conversion) throw std::runtime_error("out of memory");
  std::ifstream input(argv[3], std::ios::binary);
  if (!input) throw std::runtime_error(std::string("cannot read ") + argv[3]);
  std::ofstream output(argv[4], std::ios::binary);
  convert(conversion.get(), input, output);
  output.close();
  if (!output) throw std::runtime_error(std::string("cannot write ") + argv[4]);
  report(conversion.get());
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
