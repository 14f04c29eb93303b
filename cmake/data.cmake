# SPDX-License-Identifier: Apache-2.0
# The compiled data directory, where the tools of the build tree look for it.
set(LEXARO_DATA_DIR ${PROJECT_BINARY_DIR}/share/lexaro/locale)
file(GLOB_RECURSE LEXARO_DATA_SOURCES CONFIGURE_DEPENDS ${PROJECT_SOURCE_DIR}/data/*.txt)
add_custom_command(
  OUTPUT ${LEXARO_DATA_DIR}/control.nls
  COMMAND lexaroc data ${PROJECT_SOURCE_DIR}/data ${LEXARO_DATA_DIR}
  DEPENDS lexaroc ${LEXARO_DATA_SOURCES}
  COMMENT "Compiling the locale data"
  VERBATIM)
add_custom_target(lexaro_data ALL DEPENDS ${LEXARO_DATA_DIR}/control.nls)
