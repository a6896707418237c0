# Builds the sample repository: one .tar.gz per bundle, and the catalogue with each archive's size
# and SHA-256 filled in.
#   cmake -DSOURCE_DIR=... -DOUTPUT_DIR=... -DCATALOGUE=... -P SampleRepository.cmake
foreach(kind voices recognizers)
    file(MAKE_DIRECTORY "${OUTPUT_DIR}/${kind}")
    file(GLOB bundles RELATIVE "${SOURCE_DIR}/${kind}" "${SOURCE_DIR}/${kind}/*.Speech*")
    foreach(bundle IN LISTS bundles)
        set(archive "${OUTPUT_DIR}/${kind}/${bundle}.tar.gz")
        # A fixed time keeps the archives, and so their checksums, the same from build to build.
        execute_process(
            COMMAND "${CMAKE_COMMAND}" -E tar czf "${archive}" --format=gnutar "--mtime=2026-01-01 00:00:00 UTC"
                    ${bundle}
            WORKING_DIRECTORY "${SOURCE_DIR}/${kind}"
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
