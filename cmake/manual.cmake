# SPDX-License-Identifier: Apache-2.0
# The manual pages, the reference of the headers, and what shells complete.
set(LEXARO_MANUAL_DATE 2026-11-22)  # on the pages: that of their last change
set(LEXARO_MANUAL_DIR ${PROJECT_BINARY_DIR}/man)

find_program(LEXARO_PANDOC pandoc)
if(LEXARO_PANDOC)
  file(GLOB LEXARO_MANUAL_SOURCES CONFIGURE_DEPENDS
    ${PROJECT_SOURCE_DIR}/docs/man/* ${PROJECT_SOURCE_DIR}/include/lexaro/*.h)
  add_custom_command(
    OUTPUT ${PROJECT_BINARY_DIR}/manual.stamp
    COMMAND ${PROJECT_SOURCE_DIR}/docs/man/make-manual
            ${PROJECT_SOURCE_DIR} ${LEXARO_MANUAL_DIR} ${PROJECT_VERSION} ${LEXARO_MANUAL_DATE}
    COMMAND ${CMAKE_COMMAND} -E touch ${PROJECT_BINARY_DIR}/manual.stamp
    DEPENDS ${LEXARO_MANUAL_SOURCES}
    COMMENT "Making the manual pages"
    VERBATIM)
  add_custom_target(manual ALL DEPENDS ${PROJECT_BINARY_DIR}/manual.stamp)
  install(DIRECTORY ${LEXARO_MANUAL_DIR}/man1 ${LEXARO_MANUAL_DIR}/man5 DESTINATION ${CMAKE_INSTALL_MANDIR}
    COMPONENT tools)
  install(DIRECTORY ${LEXARO_MANUAL_DIR}/man3 ${LEXARO_MANUAL_DIR}/man7 DESTINATION ${CMAKE_INSTALL_MANDIR}
    COMPONENT dev)
endif()

find_package(Doxygen QUIET)
if(DOXYGEN_FOUND)
  configure_file(${PROJECT_SOURCE_DIR}/docs/Doxyfile.in ${PROJECT_BINARY_DIR}/Doxyfile @ONLY)
  add_custom_target(doc
    COMMAND ${DOXYGEN_EXECUTABLE} ${PROJECT_BINARY_DIR}/Doxyfile
    COMMENT "Making the reference of the headers in ${PROJECT_BINARY_DIR}/doc/html"
    VERBATIM)
endif()

foreach(program lexaro lexaroc)
  install(FILES ${PROJECT_SOURCE_DIR}/tools/completion/lexaro.bash
    DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions RENAME ${program} COMPONENT tools)
endforeach()
install(FILES ${PROJECT_SOURCE_DIR}/tools/completion/_lexaro DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/site-functions
  COMPONENT tools)
