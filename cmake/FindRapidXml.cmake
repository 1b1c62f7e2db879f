# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# Finds the header-only parser rapidxml, which ships no CMake package.
# Some distributions put its headers into a folder of their own, others do not.
# Defines the target RapidXml::RapidXml.

find_path(RapidXml_INCLUDE_DIR NAMES rapidxml.hpp PATH_SUFFIXES rapidxml)

include(FindPackageHandleStandardArgs)
find_package_handle_standard_args(RapidXml REQUIRED_VARS RapidXml_INCLUDE_DIR)

if(RapidXml_FOUND AND NOT TARGET RapidXml::RapidXml)
    add_library(RapidXml::RapidXml INTERFACE IMPORTED)
    set_target_properties(RapidXml::RapidXml PROPERTIES
        INTERFACE_INCLUDE_DIRECTORIES "${RapidXml_INCLUDE_DIR}")
endif()
mark_as_advanced(RapidXml_INCLUDE_DIR)
