# SPDX-License-Identifier: Apache-2.0
# A test for each fuzz target, built without the fuzzer: all seeds go through it.
include(${CMAKE_CURRENT_LIST_DIR}/targets.cmake)

add_library(fuzz_replay_main OBJECT ${LEXARO_FUZZ_FOLDER}/replay_main.cpp)
target_link_libraries(fuzz_replay_main PRIVATE lexaro_options)
foreach(target ${LEXARO_FUZZ_TARGETS})
  set(name ${target}_replay)
  add_executable(${name} ${LEXARO_FUZZ_FOLDER}/${target}.cpp)
  target_link_libraries(${name} PRIVATE fuzz_support fuzz_replay_main)
  add_test(NAME ${name} COMMAND ${name} ${LEXARO_FUZZ_FOLDER}/../tests/faults/seeds/${target})
  set_tests_properties(${name} PROPERTIES TIMEOUT 300)
endforeach()
