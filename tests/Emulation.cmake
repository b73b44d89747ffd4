# Programs of another architecture run in an emulator here, and so must those that tests start.

# Sets result to the file that tests start for the program of a target: itself, or a script that runs
# it in the emulator, with the same process id, arguments and environment.
function(vantel_get_started_file result target)
  set(emulator ${CMAKE_CROSSCOMPILING_EMULATOR})
  if(NOT emulator)
    set(${result} $<TARGET_FILE:${target}> PARENT_SCOPE)
    return()
  endif()
  set(script ${CMAKE_BINARY_DIR}/emulated/${target})
  set(${result} ${script} PARENT_SCOPE)
  get_property(is_written GLOBAL PROPERTY vantel_started_file_of_${target})
  if(is_written)
    return()
  endif()
  set_property(GLOBAL PROPERTY vantel_started_file_of_${target} ${script})
  # The environment may be empty, so without a path; the shell would add PWD.
  find_program(emulator_file NAMES ${emulator} REQUIRED)
  file(
    GENERATE
    OUTPUT ${script}
    CONTENT
      "#!/bin/sh\nunset PWD\nexec '${emulator_file}' -0 \"$0\" '$<TARGET_FILE:${target}>' \"$@\"\n"
    FILE_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ
                     WORLD_EXECUTE)
endfunction()
