# Within this tree, find_package(Quorl) finds the tree: what is in examples/ is built here as its authors would build
# it elsewhere, where cmake/QuorlConfig.cmake.in is found.
include(FindPackageHandleStandardArgs)
find_package_handle_standard_args(Quorl REQUIRED_VARS Quorl_VERSION VERSION_VAR Quorl_VERSION)
