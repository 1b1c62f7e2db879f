# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Runs both programs; the one that uses the frame may be larger by at most BOUND bytes.

foreach(name minimal_without minimal_with_frame)
    execute_process(COMMAND ./${name} RESULT_VARIABLE result)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "${name} returned ${result}")
    endif()
endforeach()

file(SIZE minimal_without without)
file(SIZE minimal_with_frame with)
math(EXPR more "${with} - ${without}")
message(STATUS "a minimal program: ${without} bytes, with the frame ${with}, ${more} more")
if(more GREATER BOUND)
    message(FATAL_ERROR "the frame adds ${more} bytes, more than ${BOUND}")
endif()
