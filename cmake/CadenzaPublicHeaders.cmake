# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# The public API of a Cadenza library is a chosen list of headers. Applications include each public
# class by its name, `#include <Cadenza/CZVoicePopUpButton>`: a forwarding header made here that
# includes the real header. Everything not named here is private and is not installed.
#
#   cadenza_public_headers(TARGET
#       BASE_DIR <folder the paths below are relative to; the library's include root>
#       CLASSES <header>...   # one forwarding header each, named after the file
#       SUPPORT <header>...)  # installed because a class header includes it; no forwarding header
#
# The real headers keep their path below the include root, in the build tree (where the library's
# own include root already reaches them) and when installed (below include/cadenza), so a public
# header includes the others the same way in both places. The forwarding headers go to
# <build>/include/Cadenza/ and include/cadenza/Cadenza/.
set(CADENZA_FORWARDING_HEADERS_DIR ${PROJECT_BINARY_DIR}/include CACHE INTERNAL "")

function(cadenza_public_headers target)
    cmake_parse_arguments(ARG "" "BASE_DIR" "CLASSES;SUPPORT" ${ARGN})
    if(NOT ARG_BASE_DIR)
        set(ARG_BASE_DIR ${CMAKE_CURRENT_SOURCE_DIR})
    endif()
    set(forwarding_files)
    foreach(header IN LISTS ARG_CLASSES)
        get_filename_component(name ${header} NAME_WE)
        set(forwarding ${CADENZA_FORWARDING_HEADERS_DIR}/Cadenza/${name})
        if(EXISTS ${forwarding})
            file(READ ${forwarding} existing)
        else()
            set(existing "")
        endif()
        set(content "#include <${header}>\n")
        # Written only when it changes, so that a reconfiguration rebuilds nothing.
        if(NOT existing STREQUAL content)
            file(WRITE ${forwarding} ${content})
        endif()
        list(APPEND forwarding_files ${forwarding})
    endforeach()
    foreach(header IN LISTS ARG_CLASSES ARG_SUPPORT)
        if(NOT EXISTS ${ARG_BASE_DIR}/${header})
            message(FATAL_ERROR "cadenza_public_headers(${target}): no header ${ARG_BASE_DIR}/${header}")
        endif()
        get_filename_component(folder ${header} DIRECTORY)
        install(FILES ${ARG_BASE_DIR}/${header} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/cadenza/${folder})
    endforeach()
    install(FILES ${forwarding_files} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/cadenza/Cadenza)
    target_include_directories(${target} INTERFACE $<BUILD_INTERFACE:${CADENZA_FORWARDING_HEADERS_DIR}>)
endfunction()
