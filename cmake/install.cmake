# SPDX-License-Identifier: Apache-2.0
# What is installed, and how others find it: a CMake package and a pkg-config file. The tree can be moved as a whole.
# The components are the packages that cmake/packages.cmake makes: library, development, tools, data and documents.
include(CMakePackageConfigHelpers)

set(LEXARO_PACKAGE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/Lexaro)
set(LEXARO_PKGCONFIG_DIR ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
set(LEXARO_LOCALE_DIR ${CMAKE_INSTALL_DATADIR}/lexaro/locale)

install(TARGETS ${LEXARO_LIBRARIES} EXPORT LexaroTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT library NAMELINK_COMPONENT dev
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT dev)
install(TARGETS lexaroc RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT tools)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/lexaro DESTINATION ${CMAKE_INSTALL_INCLUDEDIR} COMPONENT dev
  FILES_MATCHING PATTERN "*.h" PATTERN "*.hpp")
install(DIRECTORY ${LEXARO_DATA_DIR}/ DESTINATION ${LEXARO_LOCALE_DIR} COMPONENT data
  FILES_MATCHING PATTERN "*.nls" PATTERN "alias.txt")
install(FILES ${LEXARO_CATALOGS} DESTINATION ${CMAKE_INSTALL_DATADIR}/lexaro/messages COMPONENT tools)
install(FILES ${PROJECT_SOURCE_DIR}/LICENSES/Apache-2.0.txt ${PROJECT_SOURCE_DIR}/LICENSES/LicenseRef-Unicode-3.0.txt
  ${PROJECT_SOURCE_DIR}/NOTICE DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro COMPONENT doc)
install(FILES ${PROJECT_SOURCE_DIR}/data/NOTICE DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro COMPONENT doc
  RENAME NOTICE.data)
install(FILES ${PROJECT_SOURCE_DIR}/docs/collation.md ${PROJECT_SOURCE_DIR}/docs/performance.md
  ${PROJECT_SOURCE_DIR}/docs/scaling.md DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro COMPONENT doc)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/examples DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro COMPONENT doc
  USE_SOURCE_PERMISSIONS PATTERN ".git*" EXCLUDE)

install(EXPORT LexaroTargets NAMESPACE Lexaro:: DESTINATION ${LEXARO_PACKAGE_DIR} COMPONENT dev)
configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/LexaroConfig.cmake.in
  ${PROJECT_BINARY_DIR}/package/LexaroConfig.cmake
  INSTALL_DESTINATION ${LEXARO_PACKAGE_DIR}
  PATH_VARS LEXARO_LOCALE_DIR)
write_basic_package_version_file(${PROJECT_BINARY_DIR}/package/LexaroConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/package/LexaroConfig.cmake ${PROJECT_BINARY_DIR}/package/LexaroConfigVersion.cmake
  DESTINATION ${LEXARO_PACKAGE_DIR} COMPONENT dev)

file(RELATIVE_PATH LEXARO_PC_TO_PREFIX /prefix/${LEXARO_PKGCONFIG_DIR} /prefix)
string(REGEX REPLACE "/$" "" LEXARO_PC_TO_PREFIX "${LEXARO_PC_TO_PREFIX}")
configure_file(${PROJECT_SOURCE_DIR}/cmake/lexaro.pc.in ${PROJECT_BINARY_DIR}/package/lexaro.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/package/lexaro.pc DESTINATION ${LEXARO_PKGCONFIG_DIR} COMPONENT dev)
