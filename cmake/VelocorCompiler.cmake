# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# velocor_build: the flags of this project's own targets, never passed on to who links them.

add_library(velocor_build INTERFACE)

if(CMAKE_CXX_COMPILER_ID MATCHES "GNU|Clang")
    target_compile_options(velocor_build INTERFACE
        -Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor -Woverloaded-virtual)
    if(CMAKE_CXX_COMPILER_ID MATCHES "Clang")
        # What the toolkit's test macros lead to when they are given a text alone.
        target_compile_options(velocor_build INTERFACE -Wno-gnu-zero-variadic-macro-arguments)
    endif()
    if(VELOCOR_WERROR)
        target_compile_options(velocor_build INTERFACE -Werror)
    endif()
endif()

# Only what Qt 5.9 already offered is used, so what later versions deprecate stays quiet.
target_compile_definitions(velocor_build INTERFACE
    QT_DEPRECATED_WARNINGS_SINCE=0x050900
    QT_NO_CAST_TO_ASCII
    QT_NO_FOREACH)

# Sanitizers concern every object of a program, so they are the one setting that is not a target's.
if(VELOCOR_SANITIZE)
    add_compile_options(-fsanitize=${VELOCOR_SANITIZE} -fno-omit-frame-pointer)
    add_link_options(-fsanitize=${VELOCOR_SANITIZE})
    if(VELOCOR_SANITIZE MATCHES "undefined")
        add_compile_options(-fno-sanitize-recover=undefined)
    endif()
endif()

# Every object of a program has to agree on how its counts are kept, the tests' own included. Each
# process adds its counts to those before it, and several may end at the same time.
if(VELOCOR_COVERAGE)
    add_compile_options(--coverage -fprofile-update=atomic)
    add_link_options(--coverage)
endif()

# The product throws nothing, and what catches the XML parser's exceptions is named here. Where
# coverage is measured, everything else is built without the branches that would clean up after an
# exception behind almost every call: nothing can reach them.
function(velocor_count_without_exceptions target)
    if(VELOCOR_COVERAGE)
        target_compile_options(${target} PRIVATE -fno-exceptions)
        set_source_files_properties(LaunchOptionParser.cpp PROPERTIES COMPILE_OPTIONS -fexceptions)
    endif()
endfunction()
