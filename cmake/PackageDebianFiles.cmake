# Run by CPack once the project is installed into the package's staging folder and before the
# package is made (see cmake/Package.cmake): adds what Debian asks of every package around what
# `cmake --install` installed, and nothing else.
#   usr/share/doc/nightdome/copyright             the licences, in Debian's machine-readable form
#   usr/share/doc/nightdome/changelog.gz          the changelog of a package that is its own
#                                                 upstream (its version has no Debian revision)
#   usr/share/lintian/overrides/nightdome         the tags we keep, each with the reason beside it
#   usr/share/man/man1/*.1 -> *.1.gz              manual pages are kept gzipped
# and takes out of the programs, which CPack has stripped, the compilers' notes (.comment), as
# Debian's own packaging does.
# gzip -n leaves the name and time out of the header, so the same input makes the same package.
set(root "${CPACK_TEMPORARY_INSTALL_DIRECTORY}${CPACK_PACKAGING_INSTALL_PREFIX}")
set(doc "${root}/share/doc/${CPACK_PACKAGE_NAME}")
set(man "${root}/share/man/man1")
if(NOT IS_DIRECTORY "${doc}" OR NOT IS_DIRECTORY "${man}")
    message(FATAL_ERROR "The staging folder ${root} holds no installation to package")
endif()

function(nd_gzip file)
    execute_process(COMMAND gzip -9nf "${file}" RESULT_VARIABLE failed)
    if(failed)
        message(FATAL_ERROR "gzip ${file} failed")
    endif()
endfunction()

set(permissions OWNER_READ OWNER_WRITE GROUP_READ WORLD_READ)
function(nd_add source target)
    get_filename_component(folder "${target}" DIRECTORY)
    file(MAKE_DIRECTORY "${folder}")
    file(COPY_FILE "${source}" "${target}")
    file(CHMOD "${target}" PERMISSIONS ${permissions})
endfunction()

nd_add("${CPACK_ND_DEBIAN_DIR}/copyright" "${doc}/copyright")
nd_add("${CPACK_ND_DEBIAN_DIR}/lintian-overrides"
    "${root}/share/lintian/overrides/${CPACK_PACKAGE_NAME}")

file(GLOB programs "${root}/bin/*")
foreach(program IN LISTS programs)
    execute_process(COMMAND objcopy --remove-section=.comment "${program}" RESULT_VARIABLE failed)
    if(failed)
        message(FATAL_ERROR "objcopy ${program} failed")
    endif()
endforeach()

# The changelog's one entry carries the release date, as a Debian changelog writes it.
execute_process(COMMAND date -R -u -d "${CPACK_ND_RELEASE_DATE} 12:00"
    OUTPUT_VARIABLE ND_CHANGELOG_DATE OUTPUT_STRIP_TRAILING_WHITESPACE RESULT_VARIABLE failed)
if(failed)
    message(FATAL_ERROR "The release date '${CPACK_ND_RELEASE_DATE}' is not a date")
endif()
configure_file("${CPACK_ND_DEBIAN_DIR}/changelog.in" "${doc}/changelog" @ONLY)
file(CHMOD "${doc}/changelog" PERMISSIONS ${permissions})
nd_gzip("${doc}/changelog")

# The program's manual page names the data folder of the prefix the tree was configured for;
# the package puts the sky under its own prefix, where the program finds it beside itself.
set(packaged_data "${CPACK_PACKAGING_INSTALL_PREFIX}/share")
if(NOT CPACK_ND_INSTALL_DATADIR STREQUAL packaged_data)
    file(READ "${man}/nightdome.1" page)
    string(REPLACE "${CPACK_ND_INSTALL_DATADIR}/nightdome/" "${packaged_data}/nightdome/" page
        "${page}")
    file(WRITE "${man}/nightdome.1" "${page}")
endif()
file(GLOB pages "${man}/*.1")
foreach(page IN LISTS pages)
    nd_gzip("${page}")
endforeach()
