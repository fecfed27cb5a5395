# Builds for another kind of machine: with Debian's cross compiler, and with the headers and libraries that
# tools/sysroot and tools/libdispatch keep for this user. Included with these set:
#
# QUORL_TARGET                what Debian calls the machine
# QUORL_TRIPLE                what its compiler is called
# CMAKE_LIBRARY_ARCHITECTURE  the folder of its libraries
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_C_COMPILER ${QUORL_TRIPLE}-gcc-12)
set(CMAKE_CXX_COMPILER ${QUORL_TRIPLE}-g++-12)

set(tools ${CMAKE_CURRENT_LIST_DIR}/../../tools)
execute_process(
  COMMAND ${tools}/sysroot ${QUORL_TARGET} --prefix
  OUTPUT_VARIABLE CMAKE_SYSROOT OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
execute_process(
  COMMAND ${tools}/libdispatch --target ${QUORL_TARGET} --prefix
  OUTPUT_VARIABLE dispatch OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)

# Where the kernel does not start what is built, scripts do; see tools/emulate.
if(DEFINED ENV{QUORL_EMULATOR})
  set(CMAKE_CXX_LINKER_LAUNCHER ${tools}/link-emulated $ENV{QUORL_EMULATOR} ${CMAKE_SYSROOT})
  set(CMAKE_C_LINKER_LAUNCHER ${CMAKE_CXX_LINKER_LAUNCHER})
endif()

# Programs are this machine's.
set(CMAKE_FIND_ROOT_PATH ${CMAKE_SYSROOT} ${dispatch})
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
set(QT_HOST_PATH /usr)

set(libraries ${CMAKE_SYSROOT}/usr/lib/${CMAKE_LIBRARY_ARCHITECTURE})
set(ENV{PKG_CONFIG_SYSROOT_DIR} ${CMAKE_SYSROOT})
set(ENV{PKG_CONFIG_LIBDIR} ${libraries}/pkgconfig:${CMAKE_SYSROOT}/usr/share/pkgconfig)
# Libraries that were built for the root of the file system name each other so.
set(CMAKE_EXE_LINKER_FLAGS_INIT "-Wl,-rpath-link,${libraries}")
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-Wl,-rpath-link,${libraries}")
