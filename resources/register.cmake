# Writes the registration of the bundle in the directory BUNDLE, whose other files are all there, from
# TEMPLATE, for VERSION of the interface.
if(NOT IS_ABSOLUTE "${BUNDLE}")
  message(FATAL_ERROR "\"${BUNDLE}\" has to be the full path of the bundle.")
endif()
file(GLOB_RECURSE files RELATIVE ${BUNDLE} ${BUNDLE}/*)
list(REMOVE_ITEM files registration.json)
foreach(file ${files})
  file(SHA256 ${BUNDLE}/${file} digest)
  list(APPEND digests "    \"${file}\": \"${digest}\"")
endforeach()
list(JOIN digests ",\n" QUORL_DIGESTS)
set(QUORL_INTERFACE_VERSION ${VERSION})
configure_file(${TEMPLATE} ${BUNDLE}/registration.json @ONLY)
