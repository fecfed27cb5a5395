# The schemas of the settings declare each preference once. What our programs know of the preferences is
# made of them when the build is configured.

set(GENERATED_DIRECTORY ${PROJECT_BINARY_DIR}/generated)

# All schemas, by the end of their ids.
set(PREFERENCES_SCHEMAS AssetSync Places Notices)

# Sets `file` to the file of a schema.
function(name_schema_file schema)
  set(file ${PROJECT_SOURCE_DIR}/resources/preferences/org.quorl.Velora.${schema}.gschema.xml PARENT_SCOPE)
endfunction()

# A trial has values of its own under schemas that differ in their ids and paths alone; PREFERENCES_FILES are
# the files of all.
set(PREFERENCES_FILES)
foreach(schema IN LISTS PREFERENCES_SCHEMAS)
  name_schema_file(${schema})
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${file})
  file(READ ${file} text)
  string(REPLACE "org.quorl.Velora." "org.quorl.Velora.Trial." text "${text}")
  string(REPLACE "/org/quorl/velora/" "/org/quorl/velora/trial/" text "${text}")
  set(trial ${GENERATED_DIRECTORY}/schemas/org.quorl.Velora.Trial.${schema}.gschema.xml)
  file(CONFIGURE OUTPUT ${trial} CONTENT "${text}" @ONLY)
  list(APPEND PREFERENCES_FILES ${file} ${trial})
endforeach()

string(CONCAT PREFERENCE_PATTERN "<key name=\"([^\"]*)\" type=\"([^\"]*)\">[^<]*"
  "<default>([^<]*)</default>[^<]*<summary>([^<]*)</summary>[^<]*"
  "<description>([^<]*)</description>[^<]*</key>")

set(PREFERENCE_TYPE_b bool)
set(PREFERENCE_TYPE_t std::uint64_t)
set(PREFERENCE_TYPE_mt std::optional<std::uint64_t>)
set(PREFERENCE_TYPE_s std::string)

# Sets `preferences` to the declarations of all preferences of a schema.
function(read_preferences schema)
  name_schema_file(${schema})
  file(READ ${file} text)
  string(REGEX MATCHALL "<key " keys "${text}")
  string(REGEX MATCHALL "${PREFERENCE_PATTERN}" preferences "${text}")
  list(LENGTH keys declared)
  list(LENGTH preferences understood)
  if(NOT understood EQUAL declared OR text MATCHES "[;&\\\\]")
    message(FATAL_ERROR "${file}: give each key a name, type, default, summary and "
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

# Sets `result` to `block` with a preference's values in place of @schema@, @name@, @Name@, @key@, @kind@
# (as in the schema), @type@ and @default@ (both as in C++), @summary@ and @description@.
function(fill_in_preference schema preference block)
  string(REGEX MATCH "${PREFERENCE_PATTERN}" preference "${preference}")
  set(key ${CMAKE_MATCH_1})
  set(kind ${CMAKE_MATCH_2})
  set(default ${CMAKE_MATCH_3})
  set(summary ${CMAKE_MATCH_4})
  set(description ${CMAKE_MATCH_5})
  if(NOT DEFINED PREFERENCE_TYPE_${kind})
    message(FATAL_ERROR "${schema}: ${key} has another type than b, t, mt and s.")
  endif()
  set(type ${PREFERENCE_TYPE_${kind}})
  string(REGEX REPLACE "^just " "" default ${default})
  string(REGEX REPLACE "^nothing$" "std::nullopt" default ${default})
  string(REGEX REPLACE "^'(.*)'$" "\"\\1\"" default ${default})
  name_preference(${key})
  string(CONFIGURE "${block}" result @ONLY)
  set(result "${result}" PARENT_SCOPE)
endfunction()

# Makes a header of the template that has its name and the ending .in; `header` is its path in the
# project, and in GENERATED_DIRECTORY. What stands between the lines @each@ and @end@ of the template
# comes once for each preference of the schemas; @schemas@ is their list as in C++, @count@ how many they are.
function(make_preferences_header header schema)
  set(schemas ${schema} ${ARGN})
  set(template ${PROJECT_SOURCE_DIR}/${header}.in)
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${template})
  file(READ ${template} text)
  string(REPLACE ";" "@semicolon@" text "${text}")
  string(REGEX REPLACE "@(each|end)@\n" ";" parts "${text}")
  set(semicolon ";")
  set(content "")
  set(isEach FALSE)
  foreach(part IN LISTS parts)
    if(isEach)
      set(isEach FALSE)
      foreach(schema IN LISTS schemas)
        read_preferences(${schema})
        foreach(preference IN LISTS preferences)
          fill_in_preference(${schema} "${preference}" "${part}")
          string(APPEND content "${result}")
        endforeach()
      endforeach()
    else()
      set(isEach TRUE)
      string(APPEND content "${part}")
    endif()
  endforeach()
  list(LENGTH schemas count)
  list(JOIN schemas "\", \"" schemas)
  set(schemas "\"${schemas}\"")
  file(CONFIGURE OUTPUT ${GENERATED_DIRECTORY}/${header} CONTENT "${content}" @ONLY)
endfunction()
