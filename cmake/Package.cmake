# The Debian package, made by CPack's DEB generator from a built tree:
#
#     cpack --config build/CPackConfig.cmake -B <folder>
#
# writes <folder>/nightdome_<version>_<arch>.deb. CPack installs the project into a staging
# folder exactly as `cmake --install` does, under /usr, so the package holds what an installation
# holds; cmake/PackageDebianFiles.cmake then adds what Debian asks of every package (the
# copyright in its machine-readable form, the changelog, lintian's overrides) and compresses the
# manual pages, which Debian keeps gzipped. The run-time dependencies are those dpkg-shlibdeps
# finds from the two binaries.
#
# The binaries are stripped on the way in: the plain tree is built -O2 -g, as Debian builds its
# own packages before it strips them, so the package carries the code the tests ran, without its
# debugging information.
include(GNUInstallDirs)

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME nightdome)
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGE_VENDOR "The Nightdome developers")
set(CPACK_PACKAGE_CONTACT "The Nightdome developers <nightdome@quillmark.org>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "interactive 3D map of the stars around the Sun")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_SOURCE_GENERATOR "")

set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION science)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_HOMEPAGE ${ND_HOMEPAGE})
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
# Qt loads its Wayland platform when the program starts, so no binary links it and shlibdeps
# cannot find it; on a Wayland desktop the program runs natively with it, through XWayland
# without.
set(CPACK_DEBIAN_PACKAGE_RECOMMENDS qt6-wayland)
# The sky is nine tenths of the package: gzip packs it to 19.4 MB in 7 s here, xz to 16.7 MB in
# 30 to 110 s (on every core of two); dpkg and lintian take both (zstd lintian rejects).
set(CPACK_DEBIAN_COMPRESSION_TYPE gzip)
# The long description, under the summary line CPack puts first; lines stay within 80 columns.
set(CPACK_DEBIAN_PACKAGE_DESCRIPTION
    "Nightdome shows the stars around the Sun in three dimensions, in perspective,
and turns them in real time. The chart is turned with a virtual trackball, the
camera moved in and out, the stars' brightness and contrast set, and systems
beyond a clipping distance hidden. Query panels select systems by name,
spectral class, absolute magnitude, distance, right ascension or declination;
list windows combine sets of systems with drop pads; a Hertzsprung-Russell
diagram and a star-information terminal show the systems dropped onto them.
.
The package carries nightdome-import, which makes a sky from other catalogues,
and the default sky, made when the package was built from:
${ND_SKY_DESCRIPTION}.")

# What Debian adds around the installation; the script reads these.
set(CPACK_PRE_BUILD_SCRIPTS ${PROJECT_SOURCE_DIR}/cmake/PackageDebianFiles.cmake)
set(CPACK_ND_DEBIAN_DIR ${PROJECT_SOURCE_DIR}/desktop/debian)
set(CPACK_ND_RELEASE_DATE ${ND_RELEASE_DATE})
set(CPACK_ND_INSTALL_DATADIR ${CMAKE_INSTALL_FULL_DATADIR})

include(CPack)
