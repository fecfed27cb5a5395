# What makes a plug-in of sources, and a test of a story. The Music pane is made by this, and so are the panes of
# others, who get it with find_package(Quorl).

include(GNUInstallDirs)

# Makes the plug-in NAME, a bundle in the folder panes of the build folder, and installs it into the folder of panes
# of an app with the same prefix.
#
#   quorl_add_pane(NAME
#     [MAIN]                         the pane that the app itself is about: into the folders plugins in place of panes
#     IDENTIFIER org.example.name    a name of its own, beginning with a domain in reverse
#     ROOT_CLASS NamePane            the class of the first pane, which a source exports
#     SOURCES NamePane.cpp ...
#     STRINGS locale/en.po ...)      the table of texts for each language; may be left out
function(quorl_add_pane name)
  cmake_parse_arguments(PARSE_ARGV 1 pane "MAIN" "IDENTIFIER;ROOT_CLASS" "SOURCES;STRINGS")
  foreach(wanted IDENTIFIER ROOT_CLASS SOURCES)
    if(NOT pane_${wanted})
      message(FATAL_ERROR "quorl_add_pane(${name}): say the ${wanted}.")
    endif()
  endforeach()
  if(pane_UNPARSED_ARGUMENTS)
    message(FATAL_ERROR "quorl_add_pane(${name}): nobody knows what to do with ${pane_UNPARSED_ARGUMENTS}.")
  endif()
  set(folder panes)
  if(pane_MAIN)
    set(folder plugins)
  endif()
  set(outputs ${CMAKE_LIBRARY_OUTPUT_DIRECTORY})
  if(NOT outputs)
    set(outputs ${CMAKE_CURRENT_BINARY_DIR})
  endif()
  set(bundle ${outputs}/${folder}/${name}.bundle)
  set(register ${CMAKE_CURRENT_FUNCTION_LIST_DIR}/register.cmake)

  quorl_compile_strings(${bundle} ${pane_STRINGS}) # sets `tables`
  add_library(${name} SHARED ${pane_SOURCES} ${tables})
  target_link_libraries(${name} PUBLIC Quorl::platform PRIVATE Quorl::runtime)
  set_target_properties(${name} PROPERTIES
    LIBRARY_OUTPUT_DIRECTORY ${bundle}
    CXX_VISIBILITY_PRESET hidden # nothing of one plug-in is taken for something of another
    VISIBILITY_INLINES_HIDDEN ON
    BUILD_WITH_INSTALL_RPATH ON
    INSTALL_RPATH "$ORIGIN/../..")

  # The registration holds the digests of the other files, and is made when they are all there.
  string(REPLACE "." ";" version ${Quorl_VERSION})
  list(GET version 0 major)
  list(GET version 1 minor)
  set(registration ${CMAKE_CURRENT_BINARY_DIR}/${name}.registration.json)
  configure_file(${CMAKE_CURRENT_FUNCTION_LIST_DIR}/registration.json.in ${registration} @ONLY)
  set_property(TARGET ${name} APPEND PROPERTY LINK_DEPENDS ${tables} ${register} ${registration})
  add_custom_command(TARGET ${name} POST_BUILD
    COMMAND ${CMAKE_COMMAND} -D BUNDLE=${bundle} -D REGISTRATION=${registration} -P ${register}
    COMMENT "Registering ${name}"
    VERBATIM)

  set(place ${CMAKE_INSTALL_LIBDIR}/quorl/${folder}/${name}.bundle)
  install(TARGETS ${name} LIBRARY DESTINATION ${place})
  if(tables)
    install(DIRECTORY ${bundle}/locale DESTINATION ${place})
  endif()
  install(FILES ${bundle}/registration.json DESTINATION ${place})
  # Installing may change the shared object. Who changes it after that, by stripping it for example, installs this
  # component once more.
  install(CODE "
    set(bundle \"${place}\")
    cmake_path(ABSOLUTE_PATH bundle BASE_DIRECTORY \"\${CMAKE_INSTALL_PREFIX}\")
    execute_process(
      COMMAND \"${CMAKE_COMMAND}\" -D \"BUNDLE=\$ENV{DESTDIR}\${bundle}\" -P \"${register}\"
      COMMAND_ERROR_IS_FATAL ANY)"
    COMPONENT Registration)
endfunction()

# Compiles tables of texts into a bundle; sets `tables` to what becomes of them.
function(quorl_compile_strings bundle)
  if(ARGN)
    find_program(MSGFMT msgfmt REQUIRED)
  endif()
  set(tables)
  foreach(source IN LISTS ARGN)
    cmake_path(ABSOLUTE_PATH source)
    cmake_path(GET source STEM language)
    set(table ${bundle}/locale/${language}/LC_MESSAGES/default.mo)
    cmake_path(GET table PARENT_PATH folder)
    file(MAKE_DIRECTORY ${folder})
    add_custom_command(
      OUTPUT ${table}
      COMMAND ${MSGFMT} --check-format --check-domain -o ${table} ${source}
      DEPENDS ${source}
      VERBATIM)
    list(APPEND tables ${table})
  endforeach()
  set(tables ${tables} PARENT_SCOPE)
endfunction()

# Adds the test that quorl-script plays the story NAME.jsonl against a pane and gives the replies in NAME.expected,
# beside it.
function(quorl_add_story pane story)
  if(NOT TARGET Quorl::script)
    message(FATAL_ERROR "quorl_add_story(${pane}): install quorl-script, which plays ${story}.")
  endif()
  cmake_path(ABSOLUTE_PATH story)
  cmake_path(GET story STEM name)
  add_test(NAME ${pane}.${name}
    COMMAND ${CMAKE_COMMAND} -D PLAYER=$<TARGET_FILE:Quorl::script> -D BUNDLE=$<TARGET_FILE_DIR:${pane}>
            -D STORY=${story} -D REPLIES=${CMAKE_CURRENT_BINARY_DIR}/${name}.replies
            -P ${CMAKE_CURRENT_FUNCTION_LIST_DIR}/play.cmake)
endfunction()
