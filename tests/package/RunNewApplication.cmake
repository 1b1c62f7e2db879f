# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# In the build folder of the application Cellar: runs its own test, then installs it below a prefix and
# starts it there through the link in bin/. Where dpkg-deb is, also makes the package and looks into it.

# run(command...)
function(run)
    execute_process(COMMAND ${ARGN} RESULT_VARIABLE result OUTPUT_VARIABLE output ERROR_VARIABLE output)
    if(NOT result EQUAL 0)
        string(REPLACE ";" " " command "${ARGN}")
        message(FATAL_ERROR "${command}: ${result}\n${output}")
    endif()
    set(output "${output}" PARENT_SCOPE)
endfunction()

run("${CMAKE_CTEST_COMMAND}" --output-on-failure)
if(NOT output MATCHES "100% tests passed, 0 tests failed out of 1")
    message(FATAL_ERROR "its own test did not run:\n${output}")
endif()

set(prefix "${CMAKE_CURRENT_BINARY_DIR}/installed")
file(REMOVE_RECURSE "${prefix}" "${prefix}.home")
file(MAKE_DIRECTORY "${prefix}.home")
run("${CMAKE_COMMAND}" --install . --prefix "${prefix}")
file(GLOB_RECURSE installed RELATIVE "${prefix}" "${prefix}/*")
list(SORT installed)
set(expected
    bin/cellar
    lib/cellar/appdata.cfg
    lib/cellar/bin/cellar
    share/Tork/Cellar/cellar.defaults.cfg
    share/applications/cellar.desktop
    share/doc/cellar/copyright
    share/icons/hicolor/scalable/apps/cellar.svg)
if(NOT installed STREQUAL expected)
    message(FATAL_ERROR "installed: ${installed}")
endif()

# Asked to end once it is ready; the last exit code is its own.
set(ENV{HOME} "${prefix}.home")
set(ENV{XDG_DATA_HOME} "${prefix}.home")
set(ENV{QT_QPA_PLATFORM} offscreen)
run(sh -c [[
    "$0" &
    until grep -q ready "$1" 2>/dev/null || ! kill -0 $!
    do sleep 0.1
    done
    kill -TERM $!
    wait $!
    ]] "${prefix}/bin/cellar" "${prefix}.home/Tork/Cellar/logs/cellar.log")
if(NOT EXISTS "${prefix}.home/Tork/Cellar/cellar.cfg")
    message(FATAL_ERROR "the installed program saved no settings")
endif()
file(STRINGS "${prefix}/share/Tork/Cellar/cellar.defaults.cfg" defaults REGEX "</[a-z]+>$")
file(STRINGS "${prefix}.home/Tork/Cellar/cellar.cfg" saved)
foreach(value IN LISTS defaults)
    list(FIND saved "${value}" place)
    if(place EQUAL -1)
        message(FATAL_ERROR "the first start does not save the default ${value}: ${saved}")
    endif()
endforeach()

find_program(DESKTOP_FILE_VALIDATE NAMES desktop-file-validate)
if(DESKTOP_FILE_VALIDATE)
    run("${DESKTOP_FILE_VALIDATE}" "${prefix}/share/applications/cellar.desktop")
endif()

find_program(DPKG_DEB NAMES dpkg-deb)
find_program(DPKG_SHLIBDEPS NAMES dpkg-shlibdeps)
if(DPKG_DEB AND DPKG_SHLIBDEPS)
    file(GLOB old cellar_*.deb)
    if(old)
        file(REMOVE ${old})
    endif()
    run("${CMAKE_CPACK_COMMAND}")
    file(GLOB package cellar_*.deb)
    run("${DPKG_DEB}" --field "${package}" Depends)
    if(NOT output MATCHES "libqt5widgets5|libqt6widgets6")
        message(FATAL_ERROR "the package depends on: ${output}")
    endif()
    run("${DPKG_DEB}" --contents "${package}")
    foreach(name IN LISTS expected)
        if(NOT output MATCHES " \\./usr/${name}( -> \\.\\./lib/cellar/bin/cellar)?\n")
            message(FATAL_ERROR "the package lacks ${name}:\n${output}")
        endif()
    endforeach()
endif()
