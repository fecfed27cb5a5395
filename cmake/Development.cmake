# Installs what authors of panes need besides the headers, as the component Development: a package for find_package,
# which works wherever the whole was moved to, and the examples.
include(CMakePackageConfigHelpers)

set(package ${CMAKE_INSTALL_LIBDIR}/cmake/Quorl)
set(headers ${CMAKE_INSTALL_INCLUDEDIR}/quorl)
set(libraries ${QUORL_LIBRARY_DIR})
set(programs ${CMAKE_INSTALL_BINDIR})
get_target_property(soversion quorl-runtime SOVERSION)
set(runtime ${CMAKE_SHARED_LIBRARY_PREFIX}quorl-runtime${CMAKE_SHARED_LIBRARY_SUFFIX}.${soversion})
configure_package_config_file(cmake/QuorlConfig.cmake.in ${CMAKE_BINARY_DIR}/cmake/QuorlConfig.cmake
  INSTALL_DESTINATION ${package} PATH_VARS headers libraries programs)
write_basic_package_version_file(${CMAKE_BINARY_DIR}/cmake/QuorlConfigVersion.cmake
  VERSION ${Quorl_VERSION} COMPATIBILITY SameMajorVersion)

install(
  FILES ${CMAKE_BINARY_DIR}/cmake/QuorlConfig.cmake ${CMAKE_BINARY_DIR}/cmake/QuorlConfigVersion.cmake
        cmake/FindDispatch.cmake resources/QuorlPane.cmake resources/register.cmake resources/registration.json.in
        resources/play.cmake
  DESTINATION ${package} COMPONENT Development)
install(DIRECTORY examples/alarm DESTINATION ${CMAKE_INSTALL_DOCDIR}/examples COMPONENT Development)

# The headers of a libdispatch that is not the system's own.
if(Dispatch_PRIVATE_LIBRARIES)
  install(DIRECTORY ${Dispatch_INCLUDE_DIR}/dispatch ${Dispatch_INCLUDE_DIR}/os DESTINATION ${headers}
          COMPONENT Development)
endif()
