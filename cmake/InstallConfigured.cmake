# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# Installs a file made from a template whose @CMAKE_INSTALL_FULL_BINDIR@ and
# @CMAKE_INSTALL_FULL_LIBEXECDIR@ name where the programs land. The template is filled when installing,
# not when configuring, so `cmake --install BUILD --prefix DIR` puts both the file and the paths it
# names below DIR (DESTDIR staging is honoured as usual).
#
#   cadenza_install_configured(TEMPLATE DESTINATION)   DESTINATION relative to the install prefix
function(cadenza_install_configured template destination)
    get_filename_component(name "${template}" NAME)
    string(REGEX REPLACE "\\.in$" "" name "${name}")
    set(filled "${CMAKE_CURRENT_BINARY_DIR}/install-time/${name}")
    # Inside the install script CMAKE_INSTALL_PREFIX is the prefix of this installation.
    install(CODE "
        set(CMAKE_INSTALL_FULL_BINDIR \"${CMAKE_INSTALL_BINDIR}\")
        set(CMAKE_INSTALL_FULL_LIBEXECDIR \"${CMAKE_INSTALL_LIBEXECDIR}\")
        foreach(dir CMAKE_INSTALL_FULL_BINDIR CMAKE_INSTALL_FULL_LIBEXECDIR)
            if(NOT IS_ABSOLUTE \"\${\${dir}}\")
                set(\${dir} \"\${CMAKE_INSTALL_PREFIX}/\${\${dir}}\")
            endif()
        endforeach()
        configure_file(\"${template}\" \"${filled}\" @ONLY)
    ")
    install(FILES "${filled}" DESTINATION "${destination}")
endfunction()
