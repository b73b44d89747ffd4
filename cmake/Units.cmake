# Compiles several files of targets in one unit: most of the time goes to the headers and templates of
# test and JSON libraries. The clang preset still compiles, and tidies, file by file.
function(vantel_unite)
  if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    set_target_properties(${ARGN} PROPERTIES UNITY_BUILD ON UNITY_BUILD_BATCH_SIZE 8)
  endif()
endfunction()
