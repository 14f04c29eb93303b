# SPDX-License-Identifier: Apache-2.0
# Debian asks for compressed manual pages. CPack runs this on what it is about to pack.
file(GLOB_RECURSE pages ${CPACK_TEMPORARY_DIRECTORY}/*/usr/share/man/*.[1-8]
  ${CPACK_TEMPORARY_DIRECTORY}/usr/share/man/*.[1-8])
if(pages)
  execute_process(COMMAND gzip -9nf ${pages} COMMAND_ERROR_IS_FATAL ANY)
endif()
