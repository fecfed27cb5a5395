# What every target of this project is compiled with.
set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bin)
# The build tree is laid out like an installation, so that what is built is what is installed: a search
# path that CMake changes at install ends in an empty entry before, which stands for the working directory.
set(QUORL_LIBRARY_DIR ${CMAKE_INSTALL_LIBDIR}/quorl)
set(QUORL_BUNDLE_DIR ${QUORL_LIBRARY_DIR}/plugins/VeloraMusic.bundle)
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/${QUORL_LIBRARY_DIR})
set(CMAKE_BUILD_WITH_INSTALL_RPATH ON)
# From a program to our libraries, and from one of these to another.
set(CMAKE_INSTALL_RPATH "$ORIGIN/../${QUORL_LIBRARY_DIR}" "$ORIGIN")
# The same for a test that is linked to the plug-in, which hosts load from its bundle.
set(QUORL_TEST_RPATH ${CMAKE_INSTALL_RPATH} "$ORIGIN/../${QUORL_BUNDLE_DIR}")

# Songs of more than 2 GiB and days after 2038, also on 32-bit machines. Everywhere, for headers that several
# targets share hold off_t, time_t and struct stat.
add_compile_definitions(_FILE_OFFSET_BITS=64 _TIME_BITS=64)

if(NOT CMAKE_BUILD_TYPE)
  set(CMAKE_BUILD_TYPE RelWithDebInfo CACHE STRING "" FORCE)
endif()

option(QUORL_WARNINGS_AS_ERRORS "A warning fails the build" ON)
set(QUORL_SANITIZE "" CACHE STRING "Sanitizers to build with, for example address,undefined")

# Link this to every target of the project, privately.
add_library(project_options INTERFACE)
target_include_directories(project_options INTERFACE ${PROJECT_SOURCE_DIR})
target_compile_options(project_options INTERFACE
  -ffile-prefix-map=${PROJECT_SOURCE_DIR}=.
  -fPIC -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Wnon-virtual-dtor -Woverloaded-virtual
  -Wold-style-cast -Wcast-align -Wformat=2
  # g++ 12 sees overlapping copies in its own std::string where none can be.
  $<$<CXX_COMPILER_ID:GNU>:-Wno-restrict>
  $<$<BOOL:${QUORL_WARNINGS_AS_ERRORS}>:-Werror>)
# Nobody puts another function in the place of one of a shared library of ours: within one, calls are direct.
target_compile_options(project_options INTERFACE
  $<$<STREQUAL:$<TARGET_PROPERTY:TYPE>,SHARED_LIBRARY>:-fno-semantic-interposition>)
if(CMAKE_SYSTEM_PROCESSOR MATCHES "^(i.86|x86_64|AMD64)$" AND CMAKE_SIZEOF_VOID_P EQUAL 4)
  # The x87 unit keeps more digits in its registers than in memory, so that what a comparison of two
  # figures finds would hang on which of them was stored. The others round each operation alike.
  target_compile_options(project_options INTERFACE -msse2 -mfpmath=sse)
endif()
if(QUORL_SANITIZE)
  target_compile_options(project_options INTERFACE
    -fsanitize=${QUORL_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(project_options INTERFACE -fsanitize=${QUORL_SANITIZE})
endif()
if(QUORL_SANITIZE STREQUAL thread)
  # g++ 12 loses track of std::optional in what this sanitizer adds.
  target_compile_options(project_options INTERFACE -Wno-maybe-uninitialized)
endif()

# What was compiled in one copy of this tree need not be compiled again in another one.
find_program(CCACHE ccache)
if(CCACHE)
  set(CMAKE_CXX_COMPILER_LAUNCHER
    ${CMAKE_COMMAND} -E env CCACHE_BASEDIR=${PROJECT_SOURCE_DIR} ${CCACHE})
endif()
