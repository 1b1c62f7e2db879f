# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT

# tork_launch_data(target file)
#
# Builds a program into a folder of its own, TARGET.root/bin in the current build folder, with a copy
# of this launch data file as TARGET.root/appdata.cfg: where the program looks for it, as it does once
# it is installed. On macOS, a bundle is next to the file. Without the file, a program has placeholder
# names, which its data folder follows from.
function(tork_launch_data target file)
    set(root "${CMAKE_CURRENT_BINARY_DIR}/${target}.root")
    set(folder "${root}/bin")
    get_target_property(bundle ${target} MACOSX_BUNDLE)
    if(APPLE AND bundle)
        set(folder "${root}")
    endif()
    # The expression keeps generators of several configurations from adding a folder for each.
    set_target_properties(${target} PROPERTIES RUNTIME_OUTPUT_DIRECTORY "$<1:${folder}>")
    configure_file("${file}" "${root}/appdata.cfg" COPYONLY)
endfunction()
