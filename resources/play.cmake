# Plays the script STORY with PLAYER against the plug-in in the directory BUNDLE, and fails unless its replies, which
# are kept in the file REPLIES, are those in the file with the ending .expected beside the script.
cmake_path(GET BUNDLE PARENT_PATH plugins)
execute_process(
  COMMAND ${PLAYER} --plugins ${plugins} ${STORY}
  OUTPUT_FILE ${REPLIES} ERROR_VARIABLE complaints RESULT_VARIABLE ended)
cmake_path(REPLACE_EXTENSION STORY LAST_ONLY .expected OUTPUT_VARIABLE expected)
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${REPLIES} ${expected} RESULT_VARIABLE differ)
if(complaints OR NOT ended EQUAL 0)
  message(FATAL_ERROR "${STORY}: ended with ${ended}; a reply in ${REPLIES} may say why. ${complaints}")
elseif(differ)
  message(FATAL_ERROR "${STORY}: the replies in ${REPLIES} differ from those in ${expected}.")
endif()
