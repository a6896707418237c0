# Builds the sample repository: one .tar.gz per bundle, and the catalogue with each archive's size
# and SHA-256 filled in. Voice bundles are completed first (flite voices get their voice files).
#   cmake -DSOURCE_DIR=... -DOUTPUT_DIR=... -DCATALOGUE=... -DSTAGING_DIR=... -DFLITE_VOICES_DIR=...
#         -P SampleRepository.cmake
include("${CMAKE_CURRENT_LIST_DIR}/CompleteVoiceBundles.cmake")
cadenza_complete_voice_bundles("${SOURCE_DIR}/voices" "${STAGING_DIR}/voices" "${FLITE_VOICES_DIR}")
file(REMOVE_RECURSE "${STAGING_DIR}/recognizers")
file(COPY "${SOURCE_DIR}/recognizers" DESTINATION "${STAGING_DIR}")
foreach(kind voices recognizers)
    file(MAKE_DIRECTORY "${OUTPUT_DIR}/${kind}")
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
