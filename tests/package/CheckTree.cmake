# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Compares the names in PREFIX with those an application developer is promised: no file less, and
# no header or folder more. The names that differ between systems and builds are left out.

set(expected
    appdata.cfg
    include/tork/app/AppPaths.h
    include/tork/app/AppUtils.h
    include/tork/app/FailedWrites.h
    include/tork/app/LaunchOption.h
    include/tork/app/LaunchOptionParser.h
    include/tork/app/QuitOnSignal.h
    include/tork/app/UserMessages.h
    include/tork/common/config/TorkConfigFile.h
    include/tork/common/config/TorkConfigFileDocHandler.h
    include/tork/common/config/TorkConfigFileSection.h
    include/tork/common/config/TorkConfigText.h
    include/tork/common/log/TorkLog.h
    include/tork/common/xml/TorkErrorDictionary.h
    include/tork/common/xml/TorkErrorHandler.h
    include/tork/common/xml/TorkXmlLimits.h
    include/tork/common/xml/TorkXmlFile.h
    include/tork/common/xml/TorkXmlGuard.h
    include/tork/common/xml/TorkXmlLayout.h
    include/tork/common/xml/TorkXmlResult.h
    include/tork/common/xml/TorkXmlStream.h
    include/tork/common/xml/TorkXml_FlushUnknownElement.h
    include/tork/common/xml/TorkXml_ParseManager_Base.h
    include/tork/common/xml/TorkXml_ParseState_Base.h
    lib/cmake/Tork/TorkConfig.cmake
    lib/cmake/Tork/TorkConfigVersion.cmake
    lib/cmake/Tork/TorkTargets.cmake
    lib/cmake/Tork/VelocorTargets.cmake
    lib/pkgconfig/tork.pc)

file(GLOB_RECURSE found RELATIVE "${PREFIX}" "${PREFIX}/*")
list(FILTER found EXCLUDE REGEX "^(bin|Velocor\\.app)/")
list(FILTER found EXCLUDE REGEX "^lib/lib")
list(FILTER found EXCLUDE REGEX "^lib/cmake/Tork/[A-Za-z]+Targets-[a-z]+\\.cmake$")

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
