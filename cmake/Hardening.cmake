# What turns a mistake with memory into an end of the process, in all that is optimised: without it the C
# library checks nothing, and with sanitizers these look for themselves.
include(CheckCXXCompilerFlag)

set(hardening -fstack-protector-strong)
# What not every compiler has for every architecture.
set(flags -fstack-clash-protection -fcf-protection)
if(CMAKE_SYSTEM_PROCESSOR STREQUAL "aarch64")
  set(flags -fstack-clash-protection -mbranch-protection=standard)
endif()
foreach(flag IN LISTS flags)
  string(MAKE_C_IDENTIFIER "VANTEL_HAVE_${flag}" has_flag)
  check_cxx_compiler_flag(${flag} ${has_flag})
  if(${has_flag})
    list(APPEND hardening ${flag})
  endif()
endforeach()
# Debian's own flags may set a lower level.
list(APPEND hardening "SHELL:-U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=3")

if(NOT VANTEL_SANITIZE AND NOT VANTEL_COVERAGE)
  add_compile_options("$<$<CONFIG:Release,RelWithDebInfo,MinSizeRel>:${hardening}>")
endif()
