# SPDX-License-Identifier: Apache-2.0
# Flags of everything that is built here, as one interface target. The code of tests, which is half of all, has the
# property LEXARO_TEST_CODE: it tells lines, and addresses that are wrong, and takes a third less time to compile.
add_library(lexaro_options INTERFACE)
target_include_directories(lexaro_options INTERFACE ${PROJECT_SOURCE_DIR} ${PROJECT_SOURCE_DIR}/include)
target_compile_options(lexaro_options INTERFACE
  -Wall -Wextra -Wconversion -Wshadow -Werror
  $<$<COMPILE_LANG_AND_ID:CXX,Clang>:-Wno-missing-field-initializers>)
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  target_compile_options(lexaro_options INTERFACE -Wno-restrict)  # wrong about joined strings (GCC bug 105651)
endif()
set(test_code $<BOOL:$<TARGET_PROPERTY:LEXARO_TEST_CODE>>)
target_compile_options(lexaro_options INTERFACE $<$<AND:${test_code},$<CONFIG:RelWithDebInfo>>:-g1>)
if(LEXARO_SANITIZE)
  target_compile_options(lexaro_options INTERFACE -fsanitize=${LEXARO_SANITIZE} -fno-sanitize-recover=all
    -fno-omit-frame-pointer $<${test_code}:-fno-sanitize=undefined>)
  target_link_options(lexaro_options INTERFACE -fsanitize=${LEXARO_SANITIZE})
endif()
