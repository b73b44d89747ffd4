# Sanitizers and coverage, chosen by preset.
set(VANTEL_SANITIZE "" CACHE STRING "Sanitizers to build with, comma separated")
option(VANTEL_COVERAGE "Build for gcov" OFF)

if(VANTEL_SANITIZE)
  add_compile_options(-fsanitize=${VANTEL_SANITIZE} -fno-omit-frame-pointer
                      -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${VANTEL_SANITIZE})
endif()
if(VANTEL_COVERAGE)
  # Two threads may reach one place at once, and no count may get lost.
  add_compile_options(--coverage -fprofile-update=atomic)
  add_link_options(--coverage)
endif()
