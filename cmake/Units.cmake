# Compiles several files of targets in one unit: most of the time goes to the headers and templates of
# test and JSON libraries. The clang preset still compiles file by file.
set(unite OFF)
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  set(unite ON)
endif()
option(VANTEL_UNITE "Compile several files of targets in one unit" ${unite})

# Units of 16 files in the order of the target's sources.
function(vantel_unite)
  if(VANTEL_UNITE)
    set_target_properties(${ARGN} PROPERTIES UNITY_BUILD ON UNITY_BUILD_BATCH_SIZE 16)
  endif()
endfunction()

# One unit of each of these lists of files, for what shares large headers. The rest stays alone.
function(vantel_unite_groups target)
  if(NOT VANTEL_UNITE)
    return()
  endif()
  set_target_properties(${target} PROPERTIES UNITY_BUILD ON UNITY_BUILD_MODE GROUP)
  foreach(group IN LISTS ARGN)
    set_source_files_properties(${${group}} PROPERTIES UNITY_GROUP ${group})
  endforeach()
endfunction()
