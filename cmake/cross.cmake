# Another architecture, named by VANTEL_ARCHITECTURE as Debian names it, with Debian's cross compiler; tests
# run under qemu's user-mode emulation.
set(CMAKE_TRY_COMPILE_PLATFORM_VARIABLES VANTEL_ARCHITECTURE)
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR ${VANTEL_ARCHITECTURE})
set(CMAKE_LIBRARY_ARCHITECTURE ${VANTEL_ARCHITECTURE}-linux-gnu)
if(VANTEL_ARCHITECTURE STREQUAL "armhf")
  set(CMAKE_SYSTEM_PROCESSOR arm)
  set(CMAKE_LIBRARY_ARCHITECTURE arm-linux-gnueabihf)
elseif(VANTEL_ARCHITECTURE STREQUAL "arm64")
  set(CMAKE_SYSTEM_PROCESSOR aarch64)
  set(CMAKE_LIBRARY_ARCHITECTURE aarch64-linux-gnu)
endif()
set(CMAKE_C_COMPILER ${CMAKE_LIBRARY_ARCHITECTURE}-gcc)
set(CMAKE_CXX_COMPILER ${CMAKE_LIBRARY_ARCHITECTURE}-g++)
set(CMAKE_CROSSCOMPILING_EMULATOR qemu-${CMAKE_SYSTEM_PROCESSOR}-static)
set(ENV{PKG_CONFIG_LIBDIR} /usr/lib/${CMAKE_LIBRARY_ARCHITECTURE}/pkgconfig:/usr/share/pkgconfig)
# Notes about a change of GCC 7 that no library here was built before.
set(CMAKE_CXX_FLAGS_INIT -Wno-psabi)
