// SPDX-License-Identifier: Apache-2.0
#include "bench/support/machine.hpp"

#include <sys/utsname.h>
#include <unistd.h>

#include <ctime>
#include <fstream>

namespace lx::bench {
namespace {

std::string processor() {
  std::ifstream info("/proc/cpuinfo");
  for (std::string line; std::getline(info, line);) {
    if (line.rfind("model name", 0) == 0) return line.substr(line.find(':') + 2);
  }
  return "unknown";
}

std::string system_name() {
  utsname name = {};
  uname(&name);
  return std::string(name.sysname) + " " + name.release + " " + name.machine;
}

std::string today() {
  std::time_t now = std::time(nullptr);
  char text[16];
  std::strftime(text, sizeof text, "%Y-%m-%d", std::gmtime(&now));
  return text;
}

std::string compiler() {
#ifdef __clang__
  return "Clang " __clang_version__;
#else
  return "GCC " __VERSION__;
#endif
}

}  // namespace

std::string machine_description(const std::string& peers) {
  return "- Processor: " + processor() + ", " + std::to_string(sysconf(_SC_NPROCESSORS_ONLN)) +
         " online\n- System: " + system_name() + "\n- Compiler: " + compiler() + "\n- Peers: " + peers +
         "\n- Date: " + today() + "\n";
}

}  // namespace lx::bench
