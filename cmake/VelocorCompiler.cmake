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

# velocor_product: what the sources of app/ and common/ are held to besides. Nothing guesses the
# encoding of a text, "signals" and "emit" stay free for the applications that include the headers,
# and texts joined with + are made in one piece.
add_library(velocor_product INTERFACE)
target_link_libraries(velocor_product INTERFACE velocor_build)
target_compile_definitions(velocor_product INTERFACE
    QT_NO_CAST_FROM_ASCII
    QT_NO_KEYWORDS
    QT_NO_URL_CAST_FROM_STRING
    QT_USE_QSTRINGBUILDER)

# Sanitizers concern every object of a program, so they are the one setting that is not a target's.
if(VELOCOR_SANITIZE)
    add_compile_options(-fsanitize=${VELOCOR_SANITIZE} -fno-omit-frame-pointer)
    add_link_options(-fsanitize=${VELOCOR_SANITIZE})
    if(VELOCOR_SANITIZE MATCHES "undefined")
        add_compile_options(-fno-sanitize-recover=undefined)
    endif()
endif()

# The product throws nothing, and what catches the XML parser's exceptions is named here. Where
# coverage is measured, everything else is built without the branches that would clean up after an
# exception behind almost every call: nothing can reach them. Each process adds its counts to those
# before it, and several may end at the same time. The tests themselves are not counted.
if(VELOCOR_COVERAGE)
    add_link_options(--coverage)
endif()
function(velocor_measure_coverage target)
    if(VELOCOR_COVERAGE)
        target_compile_options(${target} PRIVATE
            --coverage -fprofile-update=atomic -fno-exceptions)
        set_source_files_properties(LaunchOptionParser.cpp PROPERTIES COMPILE_OPTIONS -fexceptions)
    endif()
endfunction()

# For builds that are made from nothing each time: faster, but a missing #include stays unseen, and
# tools that read the compiler's commands cannot read its precompiled headers.
# velocor_precompile(target [headers ...]), those of all modules if none are named.
function(velocor_precompile target)
    set(headers ${ARGN})
    if(NOT headers)
        set(headers <QtWidgets> <QtXml>)
    endif()
    if(VELOCOR_PRECOMPILE)
        target_precompile_headers(${target} PRIVATE ${headers})
    endif()
endfunction()
