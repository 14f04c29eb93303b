# SPDX-License-Identifier: Apache-2.0
# The message catalogs of the tools, beside the locale data. The English one tells which message has which number.
set(LEXARO_MESSAGES_DIR ${PROJECT_BINARY_DIR}/share/lexaro/messages)
set(LEXARO_MESSAGE_LOCALES en=English_UnitedStates.UTF-8 de=German_Germany.UTF-8 ja=Japanese_Japan.UTF-8)
set(LEXARO_CATALOGS)
foreach(entry ${LEXARO_MESSAGE_LOCALES})
  string(REPLACE "=" ";" entry ${entry})
  list(GET entry 0 language)
  list(GET entry 1 locale)
  set(source ${PROJECT_SOURCE_DIR}/tools/messages/lexaro.${language}.msg)
  set(catalog ${LEXARO_MESSAGES_DIR}/lexaro.${language}.cat)
  add_custom_command(
    OUTPUT ${catalog}
    COMMAND ${CMAKE_COMMAND} -E make_directory ${LEXARO_MESSAGES_DIR}
    COMMAND lexaroc catalog ${source} -o ${catalog} --locale ${locale} --locale-dir ${LEXARO_DATA_DIR}
    DEPENDS lexaroc ${source} ${LEXARO_DATA_DIR}/control.nls
    COMMENT "Compiling the messages in ${language}"
    VERBATIM)
  list(APPEND LEXARO_CATALOGS ${catalog})
endforeach()
add_custom_target(lexaro_messages ALL DEPENDS ${LEXARO_CATALOGS})
add_dependencies(lexaro_messages lexaro_data)
