# Installs libOECore.so, the public headers, a CMake package giving the
# target OECore::OECore, and a pkg-config file.
include(CMakePackageConfigHelpers)

set(OECORE_CMAKE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/OECore)

install(TARGETS OECore oecore_headers EXPORT OECoreTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
  RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR}
  INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/oecore DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(FILES ${PROJECT_BINARY_DIR}/include/oecore/version.h DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/oecore)
install(TARGETS omb RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})

install(EXPORT OECoreTargets NAMESPACE OECore:: DESTINATION ${OECORE_CMAKE_DIR})
configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/OECoreConfig.cmake.in
  ${PROJECT_BINARY_DIR}/OECoreConfig.cmake INSTALL_DESTINATION ${OECORE_CMAKE_DIR})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/OECoreConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/OECoreConfig.cmake ${PROJECT_BINARY_DIR}/OECoreConfigVersion.cmake
  DESTINATION ${OECORE_CMAKE_DIR})

# The .pc file finds the prefix relative to itself, so the tree can move.
file(RELATIVE_PATH OECORE_PC_TO_PREFIX "/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/")
configure_file(${PROJECT_SOURCE_DIR}/cmake/oecore.pc.in ${PROJECT_BINARY_DIR}/oecore.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/oecore.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
