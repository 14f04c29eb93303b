# SPDX-License-Identifier: Apache-2.0
# What the two programs have in common.
find_package(CLI11 CONFIG REQUIRED)

# compile_quickly(FILE...): sources that take in the parser of command lines, which is all headers, and run once.
function(compile_quickly)
  set_source_files_properties(${ARGN} PROPERTIES COMPILE_OPTIONS
    "$<$<CONFIG:Release>:-O1>;$<$<CONFIG:RelWithDebInfo>:-O0;-g1>")
endfunction()

add_library(tools_shared OBJECT
  tools/lexaro/code_page_names.cpp
  tools/lexaro/data_directory.cpp
  tools/lexaro/environment_locale.cpp
  tools/lexaro/failure.cpp
  tools/lexaro/help.cpp
  tools/lexaro/library_session.cpp
  tools/lexaro/locale_items.cpp
  tools/lexaro/native_locale.cpp
  tools/lexaro/native_names.cpp
  tools/lexaro/near_names.cpp
  tools/lexaro/object_names.cpp
  tools/lexaro/output_file.cpp
  tools/lexaro/temporary_file.cpp
  tools/lexaro/terminal_text.cpp
  tools/lexaroc/catalog_file.cpp
  tools/lexaroc/object_file.cpp
  tools/lexaroc/pack_pool.cpp
  tools/lexaroc/report.cpp
  tools/messages/message.cpp
  tools/messages/translations.cpp)
compile_quickly(tools/lexaro/help.cpp)
target_link_libraries(tools_shared PRIVATE lexaro lexaro_options CLI11::CLI11)
