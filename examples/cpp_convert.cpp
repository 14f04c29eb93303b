// SPDX-License-Identifier: Apache-2.0
// Converts a file of any size from one code page to another.
//   cpp_convert FROM TO INPUT OUTPUT [DIRECTORY]
// FROM and TO are names, aliases or numbers of code pages; DIRECTORY holds the locale data, else LX_LOCALEDIR does.
#include <fstream>
#include <iostream>
#include <lexaro/lexaro.hpp>
#include <stdexcept>
#include <string>

namespace {

void convert(lexaro::Conversion& conversion, std::istream& input, std::ostream& output) {
  std::string block(1 << 16, '\0');
  std::string converted;
  while (input.read(block.data(), static_cast<std::streamsize>(block.size())), input.gcount() > 0) {
    converted.clear();
    // What is left of a character at the end of the block waits in the conversion.
    conversion.append(std::string_view(block).substr(0, static_cast<std::size_t>(input.gcount())), converted);
    output << converted;
  }
  converted.clear();
  conversion.finish(converted);
  output << converted;
}

void run(int argc, char** argv) {
  if (argc < 5) throw std::runtime_error("usage: cpp_convert FROM TO INPUT OUTPUT [DIRECTORY]");
  const lexaro::Library library(argc > 5 ? argv[5] : nullptr);
  // The code page is all that matters of these locales, so any language does.
  lexaro::Locale from(std::string("English.") + argv[1]);
  lexaro::Locale to(std::string("English.") + argv[2]);
  lexaro::Conversion conversion(from, to);

  std::ifstream input(argv[3], std::ios::binary);
  if (!input) throw std::runtime_error(std::string("cannot read ") + argv[3]);
  std::ofstream output(argv[4], std::ios::binary);
  convert(conversion, input, output);
  output.close();
  if (input.bad() || !output) throw std::runtime_error(std::string("cannot convert ") + argv[3] + " to " + argv[4]);

  const LXConversionCounts counts = conversion.counts();
  std::cout << counts.bytes_in << " bytes in, " << counts.bytes_out << " bytes out, " << counts.substituted
            << " characters substituted\n";
}

}  // namespace

int main(int argc, char** argv) {
  try {
    run(argc, argv);
    return 0;
  } catch (const std::exception& error) {  // lexaro::Error is one; it says which call failed with which status
    std::cerr << error.what() << '\n';
    return 1;
  }
}
