# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Runs each of PROGRAMS.

separate_arguments(PROGRAMS)
foreach(program IN LISTS PROGRAMS)
    execute_process(COMMAND ./${program} RESULT_VARIABLE result)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "${program} returned ${result}")
    endif()
endforeach()
