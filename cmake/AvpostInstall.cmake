include(CMakePackageConfigHelpers)

get_property(avpost_headers GLOBAL PROPERTY AVPOST_PUBLIC_HEADERS)
foreach(header IN LISTS avpost_headers)
  file(RELATIVE_PATH rel "${PROJECT_SOURCE_DIR}" "${header}")
  get_filename_component(rel_dir "${rel}" DIRECTORY)
  install(FILES "${header}" DESTINATION "${CMAKE_INSTALL_INCLUDEDIR}/avpost/${rel_dir}" COMPONENT development)
endforeach()

install(TARGETS avpost EXPORT avpostTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime NAMELINK_COMPONENT development
  RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT runtime)
install(EXPORT avpostTargets
  NAMESPACE avpost::
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/avpost
  COMPONENT development)

configure_package_config_file(cmake/avpostConfig.cmake.in
  "${PROJECT_BINARY_DIR}/avpostConfig.cmake"
  INSTALL_DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/avpost)
write_basic_package_version_file("${PROJECT_BINARY_DIR}/avpostConfigVersion.cmake"
  COMPATIBILITY SameMajorVersion)
install(FILES "${PROJECT_BINARY_DIR}/avpostConfig.cmake" "${PROJECT_BINARY_DIR}/avpostConfigVersion.cmake"
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/avpost
  COMPONENT development)

# The pkg-config file finds its prefix from its own place, so an installed tree can move.
file(RELATIVE_PATH AVPOST_PC_TO_PREFIX "/prefix/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/prefix")
configure_file(cmake/avpost.pc.in "${PROJECT_BINARY_DIR}/avpost.pc" @ONLY)
install(FILES "${PROJECT_BINARY_DIR}/avpost.pc" DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)
