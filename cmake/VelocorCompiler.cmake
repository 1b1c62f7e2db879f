# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# velocor_build: the flags of this project's own targets, never passed on to targets that link them.

add_library(velocor_build INTERFACE)

if(CMAKE_CXX_COMPILER_ID MATCHES "GNU|Clang")
    target_compile_options(velocor_build INTERFACE
        -Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor -Woverloaded-virtual)
    if(CMAKE_CXX_COMPILER_ID MATCHES "Clang")
        # Qt's test macros cause this warning when called with a single string.
        target_compile_options(velocor_build INTERFACE -Wno-gnu-zero-variadic-macro-arguments)
    endif()
    if(CMAKE_UNITY_BUILD)
        # A parameter may have the name of a constant in another source.
        target_compile_options(velocor_build INTERFACE -Wno-shadow)
    endif()
    if(VELOCOR_WERROR)
        target_compile_options(velocor_build INTERFACE -Werror)
    endif()
endif()

# Only API of Qt 5.9 is used, so no warnings about what later versions deprecate.
target_compile_definitions(velocor_build INTERFACE
    QT_DEPRECATED_WARNINGS_SINCE=0x050900
    QT_NO_CAST_TO_ASCII
    QT_NO_FOREACH)

# velocor_product: additional rules for the sources of app/ and common/. No implicit conversion
# guesses the encoding of a string, "signals" and "emit" stay free for the applications that include
# the headers, and a chain of + allocates once. Messages name no source file, line or function, in
# debug builds either: what an installed handler or QT_MESSAGE_PATTERN shows would be the folder
# that the library was built in.
add_library(velocor_product INTERFACE)
target_link_libraries(velocor_product INTERFACE velocor_build)
target_compile_definitions(velocor_product INTERFACE
    QT_NO_CAST_FROM_ASCII
    QT_NO_KEYWORDS
    QT_NO_MESSAGELOGCONTEXT
    QT_NO_URL_CAST_FROM_STRING
    QT_USE_QSTRINGBUILDER)

# Sanitizers affect every object file of a program, so they are the only setting not per target.
if(VELOCOR_SANITIZE)
    add_compile_options(-fsanitize=${VELOCOR_SANITIZE} -fno-omit-frame-pointer)
    add_link_options(-fsanitize=${VELOCOR_SANITIZE})
    if(VELOCOR_SANITIZE MATCHES "undefined")
        add_compile_options(-fno-sanitize-recover=undefined)
    endif()
endif()

# The product throws nothing, and only one source catches exceptions, those of its XML parser
# (app/CMakeLists.txt). For coverage everything else is built without exceptions, whose clean-up branches after almost
# every call are unreachable. Processes that end at the same time add to the same counters, hence the
# atomic updates. The tests themselves are not counted.
if(VELOCOR_COVERAGE)
    add_link_options(--coverage)
endif()
function(velocor_measure_coverage target)
    if(VELOCOR_COVERAGE)
        target_compile_options(${target} PRIVATE
            --coverage -fprofile-update=atomic -fno-exceptions)
    endif()
endfunction()

# For builds from scratch: faster, but hides a missing #include, and tools that read the compile
# commands cannot read GCC's precompiled headers.
# velocor_precompile(target [headers ...]); the default is the headers of all Qt modules.
function(velocor_precompile target)
    set(headers ${ARGN})
    if(NOT headers)
        set(headers <QtWidgets> <QtXml>)
    endif()
    if(VELOCOR_PRECOMPILE)
        target_precompile_headers(${target} PRIVATE ${headers})
    endif()
endfunction()
