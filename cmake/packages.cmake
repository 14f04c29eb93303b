# SPDX-License-Identifier: Apache-2.0
# Debian packages of a tree that was configured with the preset "package": cpack --preset package.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME lexaro)
set(CPACK_PACKAGE_VENDOR "The Lexaro Authors")
set(CPACK_PACKAGE_CONTACT "The Lexaro Authors <lexaro@localhost.localdomain>")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_PRE_BUILD_SCRIPTS ${PROJECT_SOURCE_DIR}/cmake/compress-manual.cmake)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_GROUPING ONE_PER_GROUP)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
# The tools find the library here while it is in no package yet.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR})
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_COMPONENTS_ALL library dev tools data doc)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")  # it would come before the first line of each package's own

# lexaro_package(COMPONENT NAME SECTION DEPENDS SUMMARY DESCRIPTION)
function(lexaro_package component name section depends summary description)
  string(TOUPPER ${component} key)
  set(CPACK_DEBIAN_${key}_PACKAGE_NAME ${name} PARENT_SCOPE)
  set(CPACK_DEBIAN_${key}_PACKAGE_SECTION ${section} PARENT_SCOPE)
  set(CPACK_DEBIAN_${key}_PACKAGE_DEPENDS "${depends}" PARENT_SCOPE)
  set(CPACK_DEBIAN_${key}_DESCRIPTION "${summary}\n${description}" PARENT_SCOPE)
  if(component MATCHES "data|doc")
    set(CPACK_DEBIAN_${key}_PACKAGE_ARCHITECTURE all PARENT_SCOPE)
  endif()
  # What Debian asks of every package, in its own folder: the terms and the list of changes.
  set(documents ${PROJECT_BINARY_DIR}/package/${name})
  configure_file(${PROJECT_SOURCE_DIR}/cmake/debian/copyright ${documents}/copyright COPYONLY)
  configure_file(${PROJECT_SOURCE_DIR}/cmake/debian/changelog ${documents}/changelog.Debian COPYONLY)
  execute_process(COMMAND gzip -9nf ${documents}/changelog.Debian COMMAND_ERROR_IS_FATAL ANY)
  install(FILES ${documents}/copyright ${documents}/changelog.Debian.gz
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${name} COMPONENT ${component})
endfunction()

set(version "(= ${PROJECT_VERSION}-1)")
lexaro_package(library liblexaro${PROJECT_VERSION_MAJOR} libs "lexaro-data (>= ${PROJECT_VERSION})"
  "globalization library for POSIX systems"
  "Converts, compares, sorts and formats text in some hundred code pages, host
(EBCDIC) ones among them, by the rules of many languages and territories.
This package has the shared library.")
lexaro_package(dev liblexaro-dev libdevel "liblexaro${PROJECT_VERSION_MAJOR} ${version}"
  "globalization library for POSIX systems - development files"
  "Converts, compares, sorts and formats text in some hundred code pages, host
(EBCDIC) ones among them, by the rules of many languages and territories.
This package has the headers, the static library, the function manual and
what CMake and pkg-config need.")
lexaro_package(tools lexaro text "liblexaro${PROJECT_VERSION_MAJOR} ${version}"
  "conversion of host data, and other tools of the Lexaro library"
  "Converts files and fixed-length records between code pages, sorts and formats
text by language, and compiles locale data and message catalogs.")
lexaro_package(data lexaro-data misc ""
  "locale data of the Lexaro library"
  "Code pages, languages, territories and orders of text, compiled for the Lexaro
library of any byte order.")
lexaro_package(doc lexaro-doc doc ""
  "documentation of the Lexaro library"
  "The terms, the list of what the sources hold (SPDX), guides and examples of the
Lexaro globalization library.")

# What the sources hold and under which terms, as SPDX.
find_program(LEXARO_REUSE reuse REQUIRED)
set(bill ${PROJECT_BINARY_DIR}/package/lexaro.spdx)
install(CODE "execute_process(COMMAND ${LEXARO_REUSE} --root ${PROJECT_SOURCE_DIR} spdx -o ${bill}
    COMMAND_ERROR_IS_FATAL ANY)
  execute_process(COMMAND sed -i -e \"s/^DocumentName: .*/DocumentName: Lexaro-${PROJECT_VERSION}/\"
    -e \"/^Creator: .*Anonymous/d\" ${bill} COMMAND_ERROR_IS_FATAL ANY)" COMPONENT doc)
install(FILES ${bill} DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/lexaro COMPONENT doc)

file(WRITE ${PROJECT_BINARY_DIR}/package/triggers "activate-noawait ldconfig\n")
set(CPACK_DEBIAN_LIBRARY_PACKAGE_CONTROL_EXTRA ${PROJECT_BINARY_DIR}/package/triggers)
include(CPack)
