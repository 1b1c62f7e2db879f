# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Builds a program directly with the flags that pkg-config gives for PACKAGE in PREFIX, and runs it.

set(ENV{PKG_CONFIG_PATH} "${PREFIX}/lib/pkgconfig:$ENV{PKG_CONFIG_PATH}")

function(ask what variable)
    execute_process(COMMAND "${PKG_CONFIG}" ${what} ${PACKAGE}
        OUTPUT_VARIABLE output RESULT_VARIABLE result OUTPUT_STRIP_TRAILING_WHITESPACE)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "pkg-config ${what} ${PACKAGE}: ${result}")
    endif()
    separate_arguments(output UNIX_COMMAND "${output}")
    set(${variable} ${output} PARENT_SCOPE)
endfunction()

ask(--modversion version)
if(NOT version STREQUAL VERSION)
    message(FATAL_ERROR "pkg-config tells version ${version} instead of ${VERSION}")
endif()

ask(--cflags cflags)
ask(--libs libs)
set(sanitize)
if(SANITIZE)
    set(sanitize "-fsanitize=${SANITIZE}")
endif()
set(program "${PREFIX}/../uses_${PACKAGE}_by_pkg_config")
execute_process(COMMAND "${COMPILER}" -std=c++17 -DQT_DEPRECATED_WARNINGS_SINCE=0x050900 ${sanitize}
    ${cflags} "${SOURCE}" -o "${program}" ${libs}
    RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "not built")
endif()
execute_process(COMMAND "${program}" RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "the program returned ${result}")
endif()
