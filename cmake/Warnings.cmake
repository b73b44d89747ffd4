# The project's warning set, for every target of its own. The presets make them errors.
add_library(vantel_warnings INTERFACE)
# What is local to a file is no longer alone in a unit of several.
set(united $<BOOL:$<TARGET_PROPERTY:UNITY_BUILD>>)
target_compile_options(
  vantel_warnings
  INTERFACE -Wall
            -Wextra
            -Wpedantic
            $<$<NOT:${united}>:-Wshadow>
            $<$<AND:${united},$<CXX_COMPILER_ID:GNU>>:-Wno-subobject-linkage>
            -Wconversion
            -Wsign-conversion
            -Wcast-align
            -Wcast-qual
            -Wformat=2
            -Wundef
            -Wmissing-declarations
            $<$<COMPILE_LANGUAGE:CXX>:-Wold-style-cast>
            $<$<COMPILE_LANGUAGE:CXX>:-Wnon-virtual-dtor>
            $<$<COMPILE_LANGUAGE:CXX>:-Woverloaded-virtual>
            $<$<CXX_COMPILER_ID:GNU>:-Wduplicated-cond>
            $<$<CXX_COMPILER_ID:GNU>:-Wlogical-op>)
