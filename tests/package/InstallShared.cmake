# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Builds the framework of the project in SOURCE as a shared library and installs it into PREFIX. Only
# that, for the program would take long: BUILD/common is the framework's part of the build tree.

execute_process(COMMAND "${CMAKE_COMMAND}" -S "${SOURCE}" -B "${BUILD}" -G "${GENERATOR}"
    ${OPTIONS} -DBUILD_SHARED_LIBS=ON -DVELOCOR_BUILD_TESTS=OFF
    RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "not configured")
endif()
execute_process(COMMAND "${CMAKE_COMMAND}" --build "${BUILD}" --target tork_common
    RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "not built")
endif()

set(BUILD "${BUILD}/common")
include("${CMAKE_CURRENT_LIST_DIR}/Install.cmake")

file(GLOB archives "${PREFIX}/lib/*.a")
if(archives)
    message(FATAL_ERROR "no shared library: ${archives}")
endif()
