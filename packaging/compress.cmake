# Runs when what is packed has been gathered: pages and changelogs of Debian packages are compressed.
file(GLOB_RECURSE texts "${CPACK_TEMPORARY_DIRECTORY}/*")
list(FILTER texts INCLUDE REGEX "/share/man/man[^/]+/[^/]+$|/changelog\\.Debian$")
foreach(text IN LISTS texts)
  if(NOT text MATCHES "\\.gz$")
    execute_process(COMMAND gzip -9n ${text} COMMAND_ERROR_IS_FATAL ANY)
  endif()
endforeach()
