# Debian packages, as users install other libraries: `cpack -G DEB` in a build tree makes
#   libavpost1     the shared library (SONAME libavpost.so.1) and the JPEG library stand-in
#   libavpost-dev  headers, avpost.pc, the CMake package and the libavpost.so link
#   avpost-tools   the avpost command-line tool
# Run-time dependencies come from dpkg-shlibdeps; the -dev and tools packages depend on the
# library package of the same version.
set(CPACK_PACKAGE_NAME avpost)
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "${PROJECT_DESCRIPTION}")
set(CPACK_PACKAGE_CONTACT "avpost developers <avpost@localhost>")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_ALL runtime development tools)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
# The tool links the library of this very build, which no installed package describes yet.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS "${PROJECT_BINARY_DIR}")
set(CPACK_DEBIAN_ENABLE_COMPONENT_DEPENDS ON)
set(CPACK_COMPONENT_DEVELOPMENT_DEPENDS runtime)
set(CPACK_COMPONENT_TOOLS_DEPENDS runtime)

set(CPACK_DEBIAN_RUNTIME_PACKAGE_NAME libavpost1)
set(CPACK_DEBIAN_RUNTIME_PACKAGE_SECTION libs)
set(CPACK_COMPONENT_RUNTIME_DESCRIPTION
  "audio and video post-processing stages (shared library)\n Stages that wrap a host's decoders: constant frame rate, resizing, picture\n adjustments and filters, deinterlacing, watermarks, frame capture; audio gap\n filling, rate and channel conversion, volume.")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libavpost-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION
  "audio and video post-processing stages (development files)\n Headers, pkg-config file and CMake package of libavpost.")
set(CPACK_DEBIAN_TOOLS_PACKAGE_NAME avpost-tools)
set(CPACK_DEBIAN_TOOLS_PACKAGE_SECTION video)
set(CPACK_COMPONENT_TOOLS_DESCRIPTION
  "audio and video post-processing stages (command-line tool)\n The avpost program runs the stages over media files.")
include(CPack)
