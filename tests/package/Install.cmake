# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Installs the built tree BUILD into PREFIX, which is emptied first.

file(REMOVE_RECURSE "${PREFIX}")
set(config)
if(CONFIG)
    set(config --config "${CONFIG}")
endif()
execute_process(COMMAND "${CMAKE_COMMAND}" --install "${BUILD}" --prefix "${PREFIX}" ${config}
    RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "not installed: ${result}. Is everything built?")
endif()
