# SPDX-License-Identifier: Apache-2.0
# Flags of everything that is built here, as one interface target.
add_library(lexaro_options INTERFACE)
target_include_directories(lexaro_options INTERFACE ${PROJECT_SOURCE_DIR} ${PROJECT_SOURCE_DIR}/include)
target_compile_options(lexaro_options INTERFACE
  -Wall -Wextra -Wconversion -Wshadow -Werror
  $<$<COMPILE_LANG_AND_ID:CXX,Clang>:-Wno-missing-field-initializers>)
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  target_compile_options(lexaro_options INTERFACE -Wno-restrict)  # wrong about joined strings (GCC bug 105651)
endif()
if(LEXARO_SANITIZE)
  target_compile_options(lexaro_options INTERFACE -fsanitize=${LEXARO_SANITIZE} -fno-sanitize-recover=all
    -fno-omit-frame-pointer)
  target_link_options(lexaro_options INTERFACE -fsanitize=${LEXARO_SANITIZE})
endif()
