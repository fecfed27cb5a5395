# The schema of the settings declares each preference once. What our programs know of the preferences is
# made of it when the build is configured.

set(PREFERENCES_SCHEMA
  ${PROJECT_SOURCE_DIR}/resources/preferences/org.quorl.Velora.AssetSync.gschema.xml)
set(GENERATED_DIRECTORY ${PROJECT_BINARY_DIR}/generated)

string(CONCAT PREFERENCE_PATTERN "<key name=\"([^\"]*)\" type=\"([^\"]*)\">[^<]*"
  "<default>([^<]*)</default>[^<]*<summary>([^<]*)</summary>[^<]*"
  "<description>([^<]*)</description>[^<]*</key>")

set(PREFERENCE_TYPE_b bool)
set(PREFERENCE_TYPE_t std::uint64_t)
set(PREFERENCE_TYPE_mt std::optional<std::uint64_t>)

# Sets `preferences` to the declarations of all preferences.
function(read_preferences)
  file(READ ${PREFERENCES_SCHEMA} schema)
  string(REGEX MATCHALL "<key " keys "${schema}")
  string(REGEX MATCHALL "${PREFERENCE_PATTERN}" preferences "${schema}")
  list(LENGTH keys declared)
  list(LENGTH preferences understood)
  if(NOT understood EQUAL declared OR schema MATCHES "[;&\\\\]")
    message(FATAL_ERROR "${PREFERENCES_SCHEMA}: give each key a name, type, default, summary and "
      "description in this order, and use none of ; & \\ in the file.")
  endif()
  set(preferences "${preferences}" PARENT_SCOPE)
endfunction()

# Sets `Name` and `name` to what programs call a key: asset-sync-id becomes AssetSyncID and assetSyncID.
function(name_preference key)
  string(REGEX REPLACE "-id$" "-ID" words ${key})
  string(REPLACE "-" ";" words ${words})
  foreach(word IN LISTS words)
    string(SUBSTRING ${word} 0 1 first)
    string(SUBSTRING ${word} 1 -1 rest)
    string(TOUPPER ${first} first)
    string(APPEND Name ${first}${rest})
  endforeach()
  string(SUBSTRING ${key} 0 1 first)
  string(SUBSTRING ${Name} 1 -1 rest)
  set(Name ${Name} PARENT_SCOPE)
  set(name ${first}${rest} PARENT_SCOPE)
endfunction()

# Sets `result` to `block` with a preference's values in place of @name@, @Name@, @key@, @kind@ (as in
# the schema), @type@ and @default@ (both as in C++), @summary@ and @description@.
function(fill_in_preference preference block)
  string(REGEX MATCH "${PREFERENCE_PATTERN}" preference "${preference}")
  set(key ${CMAKE_MATCH_1})
  set(kind ${CMAKE_MATCH_2})
  set(default ${CMAKE_MATCH_3})
  set(summary ${CMAKE_MATCH_4})
  set(description ${CMAKE_MATCH_5})
  if(NOT DEFINED PREFERENCE_TYPE_${kind})
    message(FATAL_ERROR "${PREFERENCES_SCHEMA}: ${key} has another type than b, t and mt.")
  endif()
  set(type ${PREFERENCE_TYPE_${kind}})
  string(REGEX REPLACE "^just " "" default ${default})
  string(REGEX REPLACE "^nothing$" "std::nullopt" default ${default})
  name_preference(${key})
  string(CONFIGURE "${block}" result @ONLY)
  set(result "${result}" PARENT_SCOPE)
endfunction()

# Makes a header of the template that has its name and the ending .in; `header` is its path in the
# project, and in GENERATED_DIRECTORY. What stands between the lines @each@ and @end@ of the template
# comes once for each preference.
function(make_preferences_header header)
  set(template ${PROJECT_SOURCE_DIR}/${header}.in)
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${template} ${PREFERENCES_SCHEMA})
  read_preferences()
  file(READ ${template} text)
  string(REPLACE ";" "@semicolon@" text "${text}")
  string(REGEX REPLACE "@(each|end)@\n" ";" parts "${text}")
  set(semicolon ";")
  set(content "")
  set(isEach FALSE)
  foreach(part IN LISTS parts)
    if(isEach)
      set(isEach FALSE)
      foreach(preference IN LISTS preferences)
        fill_in_preference("${preference}" "${part}")
        string(APPEND content "${result}")
      endforeach()
    else()
      set(isEach TRUE)
      string(APPEND content "${part}")
    endif()
  endforeach()
  file(CONFIGURE OUTPUT ${GENERATED_DIRECTORY}/${header} CONTENT "${content}" @ONLY)
endfunction()
