# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Copies the starter with SCRIPT as the application Cellar in FOLDER, and checks what the script refuses.

file(REMOVE_RECURSE "${FOLDER}")

# refuses(name folder message)
function(refuses name folder message)
    execute_process(COMMAND "${SCRIPT}" "${name}" "${folder}"
        RESULT_VARIABLE result ERROR_VARIABLE errors OUTPUT_VARIABLE output)
    if(NOT result EQUAL 2 OR NOT errors STREQUAL "new-application: ${message}\n")
        message(FATAL_ERROR "\"${name}\" in ${folder}: ${result}, ${errors}${output}")
    endif()
endfunction()

foreach(name "" C cellar 9Cellars "My Cellar" "Cellar/x" "Cellar&" "Célar")
    refuses("${name}" "${FOLDER}" "not a capital letter followed by letters and digits: ${name}")
endforeach()
refuses(Test "${FOLDER}" "the name is taken: Test")
refuses(Preinstall "${FOLDER}" "the name is taken: Preinstall")
refuses(Cellar "" "no folder")
refuses(Cellar "${CMAKE_CURRENT_LIST_DIR}" "not an empty folder: ${CMAKE_CURRENT_LIST_DIR}")
refuses(Cellar "${CMAKE_CURRENT_LIST_FILE}" "not an empty folder: ${CMAKE_CURRENT_LIST_FILE}")
if(EXISTS "${FOLDER}")
    message(FATAL_ERROR "a refused name has left ${FOLDER}")
endif()

file(MAKE_DIRECTORY "${FOLDER}")
execute_process(COMMAND "${SCRIPT}" Cellar "${FOLDER}" RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "not copied: ${result}")
endif()

file(GLOB_RECURSE original RELATIVE "${STARTER}" "${STARTER}/*")
list(TRANSFORM original REPLACE Starter Cellar)
list(TRANSFORM original REPLACE starter cellar)
file(GLOB_RECURSE copied RELATIVE "${FOLDER}" "${FOLDER}/*")
list(SORT original)
list(SORT copied)
if(NOT copied STREQUAL original OR NOT copied)
    message(FATAL_ERROR "copied: ${copied}\ninstead of: ${original}")
endif()
foreach(name IN LISTS copied)
    file(STRINGS "${FOLDER}/${name}" rest REGEX "[Ss]tarter")
    if(rest)
        message(FATAL_ERROR "${name} still names the starter: ${rest}")
    endif()
endforeach()
