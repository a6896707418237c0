# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# Builds the sample repository: one .tar.gz per bundle, and the catalogue with each archive's size
# and SHA-256 filled in. Bundles are completed in a staging folder first: flite voices get their voice
# files, and recognizer bundles whose Info.plist names the pocketsphinx engine get the US English model
# of the distribution's pocketsphinx-en-us package (POCKETSPHINX_MODEL_DIR). Both are large and never
# committed, and the repository offers only voices and languages that really speak or recognise.
#   cmake -DSOURCE_DIR=... -DOUTPUT_DIR=... -DCATALOGUE=... -DSTAGING_DIR=... -DFLITE_VOICES_DIR=...
#         -DPOCKETSPHINX_MODEL_DIR=... -P SampleRepository.cmake
include("${CMAKE_CURRENT_LIST_DIR}/CompleteVoiceBundles.cmake")
cadenza_complete_voice_bundles("${SOURCE_DIR}/voices" "${STAGING_DIR}/voices" "${FLITE_VOICES_DIR}")
file(REMOVE_RECURSE "${STAGING_DIR}/recognizers")
file(COPY "${SOURCE_DIR}/recognizers" DESTINATION "${STAGING_DIR}")
file(GLOB recognizers "${STAGING_DIR}/recognizers/*.SpeechRecognition")
foreach(staged IN LISTS recognizers)
    file(READ "${staged}/Info.plist" info)
    if(info MATCHES "<string>pocketsphinx</string>")
        if(NOT EXISTS "${POCKETSPHINX_MODEL_DIR}/en-us.lm.bin")
            message(FATAL_ERROR "${staged} needs the pocketsphinx US English model (pocketsphinx-en-us)")
        endif()
        file(MAKE_DIRECTORY "${staged}/Resources/acoustic")
        file(GLOB acoustic "${POCKETSPHINX_MODEL_DIR}/en-us/*")
        file(COPY ${acoustic} DESTINATION "${staged}/Resources/acoustic")
        file(COPY_FILE "${POCKETSPHINX_MODEL_DIR}/en-us.lm.bin" "${staged}/Resources/language.lm.bin")
        file(COPY_FILE "${POCKETSPHINX_MODEL_DIR}/cmudict-en-us.dict" "${staged}/Resources/pronunciation.dict")
    endif()
endforeach()
foreach(kind voices recognizers)
    file(MAKE_DIRECTORY "${OUTPUT_DIR}/${kind}")
    # Archives of bundles no longer in the sources must not linger in the repository.
    file(GLOB stale "${OUTPUT_DIR}/${kind}/*.tar.gz")
    if(stale)
        file(REMOVE ${stale})
    endif()
    file(GLOB bundles RELATIVE "${STAGING_DIR}/${kind}" "${STAGING_DIR}/${kind}/*.Speech*")
    foreach(bundle IN LISTS bundles)
        set(archive "${OUTPUT_DIR}/${kind}/${bundle}.tar.gz")
        # A fixed time keeps the archives, and so their checksums, the same from build to build.
        execute_process(
            COMMAND "${CMAKE_COMMAND}" -E tar czf "${archive}" --format=gnutar "--mtime=2026-01-01 00:00:00 UTC"
                    ${bundle}
            WORKING_DIRECTORY "${STAGING_DIR}/${kind}"
            RESULT_VARIABLE failed)
        if(failed)
            message(FATAL_ERROR "cannot pack ${bundle}")
        endif()
        string(REGEX REPLACE "\\.Speech(Voice|Recognition)$" "" base "${bundle}")
        file(SIZE "${archive}" BYTES_${base})
        file(SHA256 "${archive}" SHA256_${base})
    endforeach()
endforeach()
configure_file("${SOURCE_DIR}/SpeechDataDefaults.plist.in" "${CATALOGUE}" @ONLY)
