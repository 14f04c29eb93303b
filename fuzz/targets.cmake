# SPDX-License-Identifier: Apache-2.0
set(LEXARO_FUZZ_TARGETS fuzz_alias fuzz_catalog fuzz_collate fuzz_control fuzz_convert fuzz_format fuzz_object fuzz_stream fuzz_text)
set(LEXARO_FUZZ_FOLDER ${CMAKE_CURRENT_LIST_DIR})

add_library(fuzz_support OBJECT ${LEXARO_FUZZ_FOLDER}/fuzz_support.cpp
  ${PROJECT_SOURCE_DIR}/tests/support/exercise.cpp ${PROJECT_SOURCE_DIR}/tests/support/object_builder.cpp)
target_link_libraries(fuzz_support PUBLIC lexaro_static lexaro_options GTest::gtest)
target_include_directories(fuzz_support PUBLIC ${PROJECT_SOURCE_DIR}/tests ${LEXARO_FUZZ_FOLDER})
target_compile_definitions(fuzz_support PUBLIC LEXARO_DATA="${LEXARO_DATA_DIR}")
add_dependencies(fuzz_support lexaro_data)
