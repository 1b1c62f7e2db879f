# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Runs the built program. The project that was added must not build its own program, nor add tests or
# files to the installation.

execute_process(COMMAND ./uses_framework RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "the program returned ${result}")
endif()

file(GLOB_RECURSE libraries RELATIVE "${CMAKE_CURRENT_BINARY_DIR}" libtork* libvelocor* velocor)
list(FILTER libraries EXCLUDE REGEX "^prefix/|/lib(tork|velocor_frame)(-qt6)?\\.a$")
if(libraries)
    message(FATAL_ERROR "built, though nothing links it: ${libraries}")
endif()

execute_process(COMMAND "${CMAKE_CTEST_COMMAND}" --show-only OUTPUT_VARIABLE tests)
if(NOT tests MATCHES "Total Tests: 0")
    message(FATAL_ERROR "tests: ${tests}")
endif()

file(REMOVE_RECURSE prefix)
execute_process(COMMAND "${CMAKE_COMMAND}" --install . --prefix prefix RESULT_VARIABLE result)
file(GLOB_RECURSE installed RELATIVE "${CMAKE_CURRENT_BINARY_DIR}/prefix" prefix/*)
list(FILTER installed EXCLUDE REGEX "^lib/cmake/Strangers/")
if(NOT result EQUAL 0 OR NOT installed STREQUAL "bin/uses_framework;lib/libstrangers.a")
    message(FATAL_ERROR "installed: ${installed}")
endif()
