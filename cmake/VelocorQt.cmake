# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Which Qt to build with.
#
#   VELOCOR_QT          5 or 6: what the project around this one has already found, or else 5 if it is
#                       installed
#   VELOCOR_QT_PACKAGE  with its version, for find_package()
#   VELOCOR_QT_XML      the libraries with Qt's XML classes, which Qt 6 has moved
#   VELOCOR_QT_SUFFIX   of the names of the installed libraries: those for Qt 5 and for Qt 6 fit into
#                       one prefix

if(NOT VELOCOR_QT)
    if(QT_VERSION_MAJOR AND NOT VELOCOR_IS_TOP_LEVEL)
        set(found_qt ${QT_VERSION_MAJOR})
    elseif(TARGET Qt6::Core AND NOT TARGET Qt5::Core)
        set(found_qt 6) # find_package(Qt6) does not set QT_VERSION_MAJOR
    else()
        find_package(Qt5 5.9 QUIET COMPONENTS Core)
        if(Qt5_FOUND)
            set(found_qt 5)
        else()
            set(found_qt 6)
        endif()
    endif()
endif()
set(VELOCOR_QT "${found_qt}" CACHE STRING "Major version of Qt: 5 or 6")
set_property(CACHE VELOCOR_QT PROPERTY STRINGS 5 6)

if(VELOCOR_QT EQUAL 5)
    set(VELOCOR_QT_PACKAGE Qt5 5.9)
    set(VELOCOR_QT_XML Qt5::Xml)
    set(VELOCOR_QT_COMPONENTS Core Gui Widgets Xml)
    set(VELOCOR_QT_SUFFIX "")
elseif(VELOCOR_QT EQUAL 6)
    set(VELOCOR_QT_PACKAGE Qt6 6.4)
    set(VELOCOR_QT_XML Qt6::Xml Qt6::Core5Compat)
    set(VELOCOR_QT_COMPONENTS Core Gui Widgets Xml Core5Compat)
    set(VELOCOR_QT_SUFFIX -qt6)
else()
    message(FATAL_ERROR "VELOCOR_QT is \"${VELOCOR_QT}\", but only Qt 5 and Qt 6 are supported")
endif()
find_package(${VELOCOR_QT_PACKAGE} REQUIRED COMPONENTS ${VELOCOR_QT_COMPONENTS})

# Catalogs of the program; another project builds none.
if(VELOCOR_IS_TOP_LEVEL)
    find_package(Qt${VELOCOR_QT}LinguistTools REQUIRED)
endif()
