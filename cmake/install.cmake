# SPDX-License-Identifier: Apache-2.0
# What is installed, and how others find it: a CMake package and a pkg-config file. The tree can be moved as a whole.
include(CMakePackageConfigHelpers)

set(LEXARO_PACKAGE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/Lexaro)
set(LEXARO_PKGCONFIG_DIR ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
set(LEXARO_LOCALE_DIR ${CMAKE_INSTALL_DATADIR}/lexaro/locale)

install(TARGETS lexaro lexaro_static EXPORT LexaroTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR})
install(TARGETS lexaroc RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/lexaro DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}
  FILES_MATCHING PATTERN "*.h")
install(DIRECTORY ${LEXARO_DATA_DIR}/ DESTINATION ${LEXARO_LOCALE_DIR}
  FILES_MATCHING PATTERN "*.nls" PATTERN "alias.txt")
install(FILES ${PROJECT_SOURCE_DIR}/LICENSE ${PROJECT_SOURCE_DIR}/NOTICE DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro)
install(FILES ${PROJECT_SOURCE_DIR}/data/LICENSE-UNICODE DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro)
install(FILES ${PROJECT_SOURCE_DIR}/data/NOTICE DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro RENAME NOTICE.data)

install(EXPORT LexaroTargets NAMESPACE Lexaro:: DESTINATION ${LEXARO_PACKAGE_DIR})
configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/LexaroConfig.cmake.in
  ${PROJECT_BINARY_DIR}/package/LexaroConfig.cmake
  INSTALL_DESTINATION ${LEXARO_PACKAGE_DIR}
  PATH_VARS LEXARO_LOCALE_DIR)
write_basic_package_version_file(${PROJECT_BINARY_DIR}/package/LexaroConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/package/LexaroConfig.cmake ${PROJECT_BINARY_DIR}/package/LexaroConfigVersion.cmake
  DESTINATION ${LEXARO_PACKAGE_DIR})

file(RELATIVE_PATH LEXARO_PC_TO_PREFIX /prefix/${LEXARO_PKGCONFIG_DIR} /prefix)
string(REGEX REPLACE "/$" "" LEXARO_PC_TO_PREFIX "${LEXARO_PC_TO_PREFIX}")
configure_file(${PROJECT_SOURCE_DIR}/cmake/lexaro.pc.in ${PROJECT_BINARY_DIR}/package/lexaro.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/package/lexaro.pc DESTINATION ${LEXARO_PKGCONFIG_DIR})
