include(CMakePackageConfigHelpers)

set(KELCORE_CMAKE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/kelcore)

install(TARGETS kelcore EXPORT kelcoreTargets
        LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
        ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
        RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR}
        INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/kelcore
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}
        FILES_MATCHING PATTERN "*.h")
install(EXPORT kelcoreTargets NAMESPACE kelcore:: DESTINATION ${KELCORE_CMAKE_DIR})

configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/kelcoreConfig.cmake.in
  ${PROJECT_BINARY_DIR}/kelcoreConfig.cmake INSTALL_DESTINATION ${KELCORE_CMAKE_DIR})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/kelcoreConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/kelcoreConfig.cmake
              ${PROJECT_BINARY_DIR}/kelcoreConfigVersion.cmake
        DESTINATION ${KELCORE_CMAKE_DIR})

configure_file(${PROJECT_SOURCE_DIR}/cmake/kelcore.pc.in ${PROJECT_BINARY_DIR}/kelcore.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/kelcore.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
