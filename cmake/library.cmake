# SPDX-License-Identifier: Apache-2.0
# One set of objects, two libraries.
file(GLOB LEXARO_SOURCES CONFIGURE_DEPENDS
  host/*.cpp frame/*.cpp objects/*.cpp codepage/*.cpp codepage/text/*.cpp locale/*.cpp collate/*.cpp format/*.cpp
  stream/*.cpp msgcat/*.cpp nls1/*.cpp)

add_library(lexaro_core OBJECT ${LEXARO_SOURCES})
target_link_libraries(lexaro_core PRIVATE lexaro_options)
# Joining two pointers that were just stored into one wide load makes short conversions wait for the stores, hence no
# vectorizing of straight-line code; loops are not concerned.
target_compile_options(lexaro_core PRIVATE -fno-exceptions -fno-rtti -fno-threadsafe-statics -fno-tree-slp-vectorize)

# Decimal numbers are read by rounding every step: with fused ones, machines that have them would read others.
set_source_files_properties(format/parse_number.cpp PROPERTIES COMPILE_OPTIONS -ffp-contract=off)

# The static library also serves the tests that look behind the interface.
add_library(lexaro_static STATIC)
target_link_libraries(lexaro_static
  PRIVATE $<BUILD_INTERFACE:lexaro_core>
  PUBLIC $<BUILD_INTERFACE:lexaro_options>)
set_target_properties(lexaro_static PROPERTIES OUTPUT_NAME lexaro)

if(LEXARO_SHARED)
  add_library(lexaro SHARED)
  target_link_libraries(lexaro PRIVATE lexaro_core lexaro_options)
  set_target_properties(lexaro PROPERTIES
    VERSION ${PROJECT_VERSION}
    SOVERSION ${PROJECT_VERSION_MAJOR}
    LINK_DEPENDS ${PROJECT_SOURCE_DIR}/cmake/exports.map)
  # It stays mapped once loaded: threads that end after a dlclose still give their storage back through it.
  target_link_options(lexaro PRIVATE -Wl,--version-script=${PROJECT_SOURCE_DIR}/cmake/exports.map -Wl,--as-needed
    -Wl,-z,nodelete)
  if(NOT LEXARO_SANITIZE)
    target_link_options(lexaro PRIVATE -Wl,-z,defs)
  endif()
else()
  add_library(lexaro ALIAS lexaro_static)
endif()

find_package(Threads REQUIRED)
set(LEXARO_LIBRARIES lexaro_static)
if(LEXARO_SHARED)
  list(PREPEND LEXARO_LIBRARIES lexaro)
endif()
foreach(target ${LEXARO_LIBRARIES})
  target_include_directories(${target} PUBLIC
    $<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}/include>
    $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)
  target_link_libraries(${target} PUBLIC Threads::Threads)
endforeach()
