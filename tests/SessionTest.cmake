include(GoogleTest)

# add_session_test(target [argument of gtest_discover_tests]...)
#
# Adds the GoogleTest cases of the target to ctest. Each case runs in a login session of its own, with a
# private session bus and private directories; see session-run.
function(add_session_test target)
  set_property(TARGET ${target} PROPERTY CROSSCOMPILING_EMULATOR ${PROJECT_SOURCE_DIR}/tests/session-run)
  gtest_discover_tests(${target} ${ARGN})
endfunction()
