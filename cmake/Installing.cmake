# Systemd and D-Bus want the full paths of the programs they start. Where those are is known only when the programs are
# installed, for `cmake --install --prefix` may name another place than the build did.

# Installs what the template (its name ends in .in) becomes with the folder of the programs in place of @programs@.
function(install_with_paths template destination)
  cmake_path(GET template STEM LAST_ONLY name)
  set(filled_in ${CMAKE_CURRENT_BINARY_DIR}/installed/${name})
  install(CODE "
    set(programs \"${CMAKE_INSTALL_BINDIR}\")
    cmake_path(ABSOLUTE_PATH programs BASE_DIRECTORY \"\${CMAKE_INSTALL_PREFIX}\" NORMALIZE)
    configure_file(\"${template}\" \"${filled_in}\" @ONLY)
    set(destination \"${destination}\")
    cmake_path(ABSOLUTE_PATH destination BASE_DIRECTORY \"\${CMAKE_INSTALL_PREFIX}\" NORMALIZE)
    file(INSTALL \"${filled_in}\" DESTINATION \"\${destination}\")")
endfunction()

# Installs what shells offer after the name of a program.
function(install_completions program)
  set(completions ${PROJECT_SOURCE_DIR}/resources/completions)
  install(FILES ${completions}/${program}.bash RENAME ${program}
          DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions)
  install(FILES ${completions}/_${program} DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/site-functions)
  install(FILES ${completions}/${program}.fish DESTINATION ${CMAKE_INSTALL_DATADIR}/fish/vendor_completions.d)
endfunction()
