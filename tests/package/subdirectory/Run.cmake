# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Runs the built program; the project that was added must not add tests or install rules.

execute_process(COMMAND ./uses_framework RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "the program returned ${result}")
endif()

execute_process(COMMAND "${CMAKE_CTEST_COMMAND}" --show-only OUTPUT_VARIABLE tests)
if(NOT tests MATCHES "Total Tests: 0")
    message(FATAL_ERROR "tests: ${tests}")
endif()

file(REMOVE_RECURSE prefix)
execute_process(COMMAND "${CMAKE_COMMAND}" --install . --prefix prefix RESULT_VARIABLE result)
file(GLOB_RECURSE installed RELATIVE "${CMAKE_CURRENT_BINARY_DIR}/prefix" prefix/*)
if(NOT result EQUAL 0 OR NOT installed STREQUAL "bin/uses_framework")
    message(FATAL_ERROR "installed: ${installed}")
endif()
