# Finds libdispatch: one that the system has, else the one that tools/libdispatch keeps for this user.
# Another place can be given with -DDispatch_ROOT=DIR (with include/ and lib/ inside). What Quorl has installed is
# looked for in Dispatch_INCLUDE_PLACE and Dispatch_LIBRARY_PLACE first.
#
# Dispatch::dispatch           the target to link; brings all that its headers want of the compiler
# Dispatch_PRIVATE_LIBRARIES   libraries to install beside ours; empty where the system has them

if(NOT Dispatch_LIBRARY_PLACE)
  execute_process(
    COMMAND ${CMAKE_CURRENT_LIST_DIR}/../tools/libdispatch --prefix
    OUTPUT_VARIABLE Dispatch_USER_PREFIX OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
endif()

set(Dispatch_LIBRARY_PLACES HINTS ${Dispatch_LIBRARY_PLACE} PATHS ${Dispatch_USER_PREFIX}/lib)
find_path(Dispatch_INCLUDE_DIR dispatch/dispatch.h
  HINTS ${Dispatch_INCLUDE_PLACE} PATHS ${Dispatch_USER_PREFIX}/include)
find_library(Dispatch_LIBRARY dispatch ${Dispatch_LIBRARY_PLACES})
find_library(Dispatch_BLOCKS_LIBRARY BlocksRuntime ${Dispatch_LIBRARY_PLACES})
mark_as_advanced(Dispatch_INCLUDE_DIR Dispatch_LIBRARY Dispatch_BLOCKS_LIBRARY)

include(FindPackageHandleStandardArgs)
find_package_handle_standard_args(Dispatch
  REQUIRED_VARS Dispatch_LIBRARY Dispatch_INCLUDE_DIR
  REASON_FAILURE_MESSAGE "In a copy of Quorl's sources, run tools/libdispatch once, which fetches and builds it, then try again.")

if(NOT Dispatch_FOUND OR TARGET Dispatch::dispatch)
  return()
endif()

find_package(Threads REQUIRED)
add_library(Dispatch::dispatch SHARED IMPORTED)
set_target_properties(Dispatch::dispatch PROPERTIES
  IMPORTED_LOCATION ${Dispatch_LIBRARY}
  INTERFACE_INCLUDE_DIRECTORIES ${Dispatch_INCLUDE_DIR}
  INTERFACE_LINK_LIBRARIES Threads::Threads)
if(Dispatch_BLOCKS_LIBRARY)
  set_target_properties(Dispatch::dispatch PROPERTIES
    IMPORTED_LINK_DEPENDENT_LIBRARIES ${Dispatch_BLOCKS_LIBRARY})
endif()
# The headers ask clang's questions, which g++ 12 cannot parse: there the answer is no.
target_compile_options(Dispatch::dispatch INTERFACE
  $<$<OR:$<COMPILE_LANG_AND_ID:CXX,GNU>,$<COMPILE_LANG_AND_ID:C,GNU>>:-D__has_feature\(x\)=0>
  $<$<OR:$<COMPILE_LANG_AND_ID:CXX,GNU>,$<COMPILE_LANG_AND_ID:C,GNU>>:-D__has_extension\(x\)=0>)

cmake_path(GET Dispatch_LIBRARY PARENT_PATH Dispatch_LIBRARY_DIR)
set(Dispatch_PRIVATE_LIBRARIES "")
if(NOT Dispatch_LIBRARY_DIR IN_LIST CMAKE_CXX_IMPLICIT_LINK_DIRECTORIES)
  set(Dispatch_PRIVATE_LIBRARIES ${Dispatch_LIBRARY} ${Dispatch_BLOCKS_LIBRARY})
endif()
