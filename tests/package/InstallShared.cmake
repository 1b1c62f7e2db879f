# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Builds the framework of the project in SOURCE as a shared library and the frame on top of it, and
# installs both into PREFIX. Not the program, which takes long to build: BUILD/common is the
# framework's part of the build tree, and of the program's part only the frame is installed.

execute_process(COMMAND "${CMAKE_COMMAND}" -S "${SOURCE}" -B "${BUILD}" -G "${GENERATOR}"
    ${OPTIONS} -DBUILD_SHARED_LIBS=ON -DVELOCOR_BUILD_TESTS=OFF
    RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "not configured")
endif()
execute_process(COMMAND "${CMAKE_COMMAND}" --build "${BUILD}" --target tork_common velocor_frame
    RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "not built")
endif()

set(BUILD "${BUILD}/common")
include("${CMAKE_CURRENT_LIST_DIR}/Install.cmake")

execute_process(COMMAND "${CMAKE_COMMAND}" --install "${BUILD}/../app" --prefix "${PREFIX}"
    --component frame RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "the frame is not installed: ${result}")
endif()

file(GLOB archives "${PREFIX}/lib/libtork*.a")
if(archives)
    message(FATAL_ERROR "no shared library: ${archives}")
endif()
