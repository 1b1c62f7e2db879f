# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# The names that the static libraries in PREFIX add to every program that links them: in namespace
# Velocor, with the framework's prefix, or declared by an installed header. Any other could clash
# with the program's own.
#
# If PREFIX has the shared library, that exports exactly the classes and functions that the headers
# mark with TORK_EXPORT, and nothing of the other names is visible.

file(GLOB_RECURSE headers "${PREFIX}/include/*.h")
set(declared "")
foreach(header IN LISTS headers)
    file(READ "${header}" text)
    string(APPEND declared "${text}")
endforeach()

file(GLOB libraries "${PREFIX}/lib/lib*.a")
if(NOT libraries OR NOT headers)
    message(FATAL_ERROR "nothing to check in ${PREFIX}")
endif()

# list_symbols(variable library flags...): the global symbols of a library.
function(list_symbols variable library)
    execute_process(COMMAND "${NM}" -C --defined-only ${ARGN} "${library}"
        OUTPUT_VARIABLE symbols RESULT_VARIABLE result)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "${NM} ${library}: ${result}")
    endif()
    # Uppercase means a global symbol. A is the name of the version of the others.
    string(REGEX MATCHALL "[0-9a-f]+ [B-Zu] [^\n]+" symbols "${symbols}")
    if(NOT symbols)
        message(FATAL_ERROR "no symbols in ${library}")
    endif()
    set(${variable} ${symbols} PARENT_SCOPE)
endfunction()

# name_of(symbol variable): the class or function that a symbol belongs to.
function(name_of symbol variable)
    string(REGEX REPLACE
        "^[0-9a-f]+ . (non-virtual thunk to |vtable for |typeinfo for |typeinfo name for )?" ""
        name "${symbol}")
    string(REGEX REPLACE "[^A-Za-z0-9_].*" "" name "${name}")
    set(${variable} "${name}" PARENT_SCOPE)
endfunction()

set(strays "")
foreach(library IN LISTS libraries)
    list_symbols(symbols "${library}" -g)
    # Templates and inline functions are exempt.
    list(FILTER symbols EXCLUDE REGEX "^[0-9a-f]+ [VWu] ")
    foreach(symbol IN LISTS symbols)
        name_of("${symbol}" name)
        if(name STREQUAL "Velocor" OR name MATCHES "^Tork[A-Z]")
            continue()
        endif()
        # On a line that is not a comment.
        if(NOT declared MATCHES "\n(class|struct) ${name}[ \n]" AND
           NOT declared MATCHES "\n[A-Za-z][^\n]* ${name}\\(")
            list(APPEND strays "${symbol}")
        endif()
    endforeach()
endforeach()
if(strays)
    list(JOIN strays "\n" strays)
    message(FATAL_ERROR "names that programs may have themselves:\n${strays}")
endif()

set(shared "${PREFIX}/lib/libtork${SUFFIX}.so")
if(EXISTS "${PREFIX}/lib/libtork${SUFFIX}.a")
    return()
endif()

# Each class that an installed header defines is exported, except the one without any function of its
# own, and no other.
string(REGEX MATCHALL "\n(class|struct) [^;\n]*\n{" classes "${declared}")
string(REGEX MATCHALL "\nTORK_EXPORT [^(]*\\(" functions "${declared}")
set(promised "")
foreach(definition IN LISTS classes functions)
    if(definition MATCHES "(Tork[A-Za-z_]+)( : [^\n]*)?[(\n]" AND
       NOT CMAKE_MATCH_1 STREQUAL "TorkXmlLayout")
        list(APPEND promised "${CMAKE_MATCH_1}")
    endif()
endforeach()
list_symbols(symbols "${shared}" -D)
set(exported "")
foreach(symbol IN LISTS symbols)
    name_of("${symbol}" name)
    list(APPEND exported "${name}")
endforeach()
list(REMOVE_DUPLICATES exported)
list(SORT exported)
list(SORT promised)
if(NOT exported STREQUAL promised)
    message(FATAL_ERROR "${shared} exports\n${exported}\ninstead of\n${promised}")
endif()
