# Builds the sample repository: one .tar.gz per bundle, and the catalogue with each archive's size
# and SHA-256 filled in.
#   cmake -DSOURCE_DIR=... -DOUTPUT_DIR=... -DCATALOGUE=... -DPOCKETSPHINX_MODEL_DIR=... -P SampleRepository.cmake
#
# Recognizer bundles whose Info.plist names the pocketsphinx engine get the US English model of the
# distribution's pocketsphinx-en-us package (POCKETSPHINX_MODEL_DIR) copied in: the model is large
# and never committed, and the repository offers only languages that really recognise.
foreach(kind voices recognizers)
    file(MAKE_DIRECTORY "${OUTPUT_DIR}/${kind}")
    # Archives of bundles no longer in the sources must not linger in the repository.
    file(GLOB stale "${OUTPUT_DIR}/${kind}/*.tar.gz")
    if(stale)
        file(REMOVE ${stale})
    endif()
    file(GLOB bundles RELATIVE "${SOURCE_DIR}/${kind}" "${SOURCE_DIR}/${kind}/*.Speech*")
    foreach(bundle IN LISTS bundles)
        set(archive "${OUTPUT_DIR}/${kind}/${bundle}.tar.gz")
        set(from "${SOURCE_DIR}/${kind}")
        file(READ "${SOURCE_DIR}/${kind}/${bundle}/Info.plist" info)
        if(info MATCHES "<string>pocketsphinx</string>")
            if(NOT EXISTS "${POCKETSPHINX_MODEL_DIR}/en-us.lm.bin")
                message(FATAL_ERROR "${bundle} needs the pocketsphinx US English model (pocketsphinx-en-us)")
            endif()
            set(from "${OUTPUT_DIR}/staging")
            set(staged "${from}/${bundle}")
            file(REMOVE_RECURSE "${staged}")
            file(COPY "${SOURCE_DIR}/${kind}/${bundle}" DESTINATION "${from}")
            file(MAKE_DIRECTORY "${staged}/Resources/acoustic")
            file(GLOB acoustic "${POCKETSPHINX_MODEL_DIR}/en-us/*")
            file(COPY ${acoustic} DESTINATION "${staged}/Resources/acoustic")
            file(COPY_FILE "${POCKETSPHINX_MODEL_DIR}/en-us.lm.bin" "${staged}/Resources/language.lm.bin")
            file(COPY_FILE "${POCKETSPHINX_MODEL_DIR}/cmudict-en-us.dict" "${staged}/Resources/pronunciation.dict")
        endif()
        # A fixed time keeps the archives, and so their checksums, the same from build to build.
        execute_process(
            COMMAND "${CMAKE_COMMAND}" -E tar czf "${archive}" --format=gnutar "--mtime=2026-01-01 00:00:00 UTC"
                    ${bundle}
            WORKING_DIRECTORY "${from}"
            RESULT_VARIABLE failed)
        if(failed)
            message(FATAL_ERROR "cannot pack ${bundle}")
        endif()
        string(REGEX REPLACE "\\.Speech(Voice|Recognition)$" "" base "${bundle}")
        file(SIZE "${archive}" BYTES_${base})
        file(SHA256 "${archive}" SHA256_${base})
    endforeach()
endforeach()
file(REMOVE_RECURSE "${OUTPUT_DIR}/staging")
configure_file("${SOURCE_DIR}/SpeechDataDefaults.plist.in" "${CATALOGUE}" @ONLY)
