# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# The names that the static libraries in PREFIX add to every program that links them: in namespace
# Velocor, with the framework's prefix, or declared by an installed header. Any other could clash
# with the program's own.

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
set(strays "")
foreach(library IN LISTS libraries)
    execute_process(COMMAND "${NM}" -C -g --defined-only "${library}"
        OUTPUT_VARIABLE symbols RESULT_VARIABLE result)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "${NM} ${library}: ${result}")
    endif()
    # Uppercase means a global symbol; templates and inline functions (V, W, u) are exempt.
    string(REGEX MATCHALL "[0-9a-f]+ [TDBRSC] [^\n]+" symbols "${symbols}")
    if(NOT symbols)
        message(FATAL_ERROR "no symbols in ${library}")
    endif()
    foreach(symbol IN LISTS symbols)
        string(REGEX REPLACE "^[0-9a-f]+ . (non-virtual thunk to |vtable for |typeinfo for )?" ""
            name "${symbol}")
        string(REGEX REPLACE "[^A-Za-z0-9_].*" "" name "${name}")
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
