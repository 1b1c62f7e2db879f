# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Compares the names in PREFIX with those an application developer is promised: no file missing,
# and no additional header or folder. Names that differ between systems and builds are ignored.
# SUFFIX tells the libraries for Qt 6 from those for Qt 5.
# SOURCE is the source tree, whose headers are for applications unless their names end in _p.h.

set(expected
    appdata.cfg
    lib/cmake/Tork${SUFFIX}/TorkConfig.cmake
    lib/cmake/Tork${SUFFIX}/TorkConfigVersion.cmake
    lib/cmake/Tork${SUFFIX}/TorkLaunchData.cmake
    lib/cmake/Tork${SUFFIX}/TorkTargets.cmake
    lib/cmake/Tork${SUFFIX}/VelocorTargets.cmake
    lib/pkgconfig/tork${SUFFIX}.pc
    lib/pkgconfig/velocor-frame${SUFFIX}.pc
    share/licenses/tork/MIT.txt)
if(NOT EXISTS "${PREFIX}/Velocor.app")
    list(APPEND expected share/Tork/Velocor/velocor.defaults.cfg)
endif()

file(GLOB headers RELATIVE "${SOURCE}" "${SOURCE}/app/*.h" "${SOURCE}/common/*.h" "${SOURCE}/common/*/*.h")
list(FILTER headers EXCLUDE REGEX "_p\\.h$")
list(TRANSFORM headers PREPEND include/tork/)
list(APPEND expected ${headers})

file(GLOB_RECURSE found RELATIVE "${PREFIX}" "${PREFIX}/*")
list(FILTER found EXCLUDE REGEX "^(bin|Velocor\\.app)/")
list(FILTER found EXCLUDE REGEX "^lib/lib(tork|velocor_frame)${SUFFIX}\\.")
list(FILTER found EXCLUDE REGEX "^lib/cmake/Tork${SUFFIX}/[A-Za-z]+Targets-[a-z]+\\.cmake$")

list(SORT expected)
list(SORT found)
if(NOT found STREQUAL expected)
    set(missing ${expected})
    list(REMOVE_ITEM missing ${found})
    list(REMOVE_ITEM found ${expected})
    message(FATAL_ERROR "missing: ${missing}\nunexpected: ${found}")
endif()

if(NOT EXISTS "${PREFIX}/bin/velocor" AND NOT EXISTS "${PREFIX}/Velocor.app")
    message(FATAL_ERROR "missing: the program")
endif()
