# Read by cpack before it installs. Finds out what the programs depend on: cpack's own way would also add
# maintainer scripts that call ldconfig, where Debian wants a trigger.
if(NOT DEFINED ENV{SOURCE_DATE_EPOCH})
  set(ENV{SOURCE_DATE_EPOCH} ${CPACK_VANTEL_DATE})
endif()
# For programs of another architecture.
set(ENV{DEB_HOST_ARCH} ${CPACK_DEBIAN_PACKAGE_ARCHITECTURE})

function(vantel_find_dependencies result)
  list(GET CPACK_BUILD_SOURCE_DIRS 1 build)
  list(TRANSFORM ARGN PREPEND ${build}/)
  # dpkg-shlibdeps wants to stand beside a debian/control.
  set(folder ${CPACK_PACKAGE_DIRECTORY}/shlibdeps)
  file(WRITE ${folder}/debian/control "")
  execute_process(COMMAND dpkg-shlibdeps --warnings=0 -O ${ARGN} WORKING_DIRECTORY ${folder}
                  OUTPUT_VARIABLE output OUTPUT_STRIP_TRAILING_WHITESPACE
                  COMMAND_ERROR_IS_FATAL ANY)
  file(REMOVE_RECURSE ${folder})
  string(REPLACE "shlibs:Depends=" "" output "${output}")
  set(${result} ${output} PARENT_SCOPE)
endfunction()

vantel_find_dependencies(CPACK_DEBIAN_LIBRARY_PACKAGE_DEPENDS ${CPACK_VANTEL_LIBRARY_FILES})
vantel_find_dependencies(CPACK_DEBIAN_TOOLS_PACKAGE_DEPENDS ${CPACK_VANTEL_TOOLS_FILES})
string(APPEND CPACK_DEBIAN_TOOLS_PACKAGE_DEPENDS ", ${CPACK_VANTEL_TOOLS_DEPENDS}")
