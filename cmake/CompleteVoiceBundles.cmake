# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# Copies voice bundles and completes the flite ones: a bundle whose Engine names "flite" gets the
# .flitevox file its Engine/Voice names (written out at build time from the Debian flite package) in
# its Resources, and its Info.plist gets that file's real size and SHA-256 (@VOICE_FILE_SIZE@,
# @VOICE_FILE_SHA256@).
#   cmake -DSOURCE_DIR=... -DOUTPUT_DIR=... -DFLITE_VOICES_DIR=... -P CompleteVoiceBundles.cmake
function(cadenza_complete_voice_bundles source output flite_voices)
    file(REMOVE_RECURSE "${output}")
    file(MAKE_DIRECTORY "${output}")
    file(GLOB bundles RELATIVE "${source}" "${source}/*.SpeechVoice")
    foreach(bundle IN LISTS bundles)
        file(COPY "${source}/${bundle}" DESTINATION "${output}")
        file(READ "${source}/${bundle}/Info.plist" info)
        if(NOT info MATCHES "<key>Name</key>[ \t\r\n]*<string>flite</string>")
            continue()
        endif()
        if(NOT info MATCHES "<key>Voice</key>[ \t\r\n]*<string>([A-Za-z0-9_]+\\.flitevox)</string>")
            message(FATAL_ERROR "${bundle}: a flite bundle must name its .flitevox in Engine/Voice")
        endif()
        set(voice_file "${CMAKE_MATCH_1}")
        if(NOT EXISTS "${flite_voices}/${voice_file}")
            message(FATAL_ERROR "${bundle}: no ${voice_file} in ${flite_voices}")
        endif()
        file(MAKE_DIRECTORY "${output}/${bundle}/Resources")
        file(COPY "${flite_voices}/${voice_file}" DESTINATION "${output}/${bundle}/Resources")
        file(SIZE "${flite_voices}/${voice_file}" VOICE_FILE_SIZE)
        file(SHA256 "${flite_voices}/${voice_file}" VOICE_FILE_SHA256)
        configure_file("${source}/${bundle}/Info.plist" "${output}/${bundle}/Info.plist" @ONLY)
    endforeach()
endfunction()

if(CMAKE_SCRIPT_MODE_FILE AND CMAKE_SCRIPT_MODE_FILE STREQUAL CMAKE_CURRENT_LIST_FILE)
    cadenza_complete_voice_bundles("${SOURCE_DIR}" "${OUTPUT_DIR}" "${FLITE_VOICES_DIR}")
    if(STAMP)
        file(TOUCH "${STAMP}")
    endif()
endif()
