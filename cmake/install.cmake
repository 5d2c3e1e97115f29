# What cmake --install puts where: headers, libraries, the command, manual pages, the CMake package and the
# pkg-config file. The installed tree can be moved as a whole.

include(CMakePackageConfigHelpers)

# What names no component serves those who build programs.
set(CMAKE_INSTALL_DEFAULT_COMPONENT_NAME development)
set(_package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/zelnls2)

set_target_properties(zelnls2 PROPERTIES INSTALL_RPATH "$ORIGIN")
install(
  TARGETS zelnls2
  EXPORT zelnls2Targets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
          COMPONENT library
          NAMELINK_COMPONENT development)
install(
  TARGETS zelhost
  EXPORT zelnls2Targets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
          COMPONENT command
          NAMELINK_COMPONENT development)
install(FILES ${PROJECT_SOURCE_DIR}/include/nls2.h ${PROJECT_SOURCE_DIR}/include/nls2.hpp
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/nls2 DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(FILES ${PROJECT_SOURCE_DIR}/docs/zelnls2.3 DESTINATION ${CMAKE_INSTALL_MANDIR}/man3)
install(FILES ${PROJECT_SOURCE_DIR}/host/trc1.h ${PROJECT_SOURCE_DIR}/host/sys1.h
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/zelnls2)
if(ZELNLS2_BUILD_TOOL)
  file(RELATIVE_PATH _lib_from_bin ${CMAKE_INSTALL_FULL_BINDIR} ${CMAKE_INSTALL_FULL_LIBDIR})
  set_target_properties(nls2 PROPERTIES INSTALL_RPATH "$ORIGIN/${_lib_from_bin}")
  install(TARGETS nls2 DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT command)
  install(
    FILES ${PROJECT_SOURCE_DIR}/docs/nls2.1
    DESTINATION ${CMAKE_INSTALL_MANDIR}/man1
    COMPONENT command)
  install(
    FILES ${PROJECT_SOURCE_DIR}/docs/nls2.7
    DESTINATION ${CMAKE_INSTALL_MANDIR}/man7
    COMPONENT command)
  install(
    FILES ${PROJECT_SOURCE_DIR}/completions/nls2.bash
    DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions
    COMPONENT command
    RENAME nls2)
endif()

install(
  EXPORT zelnls2Targets
  NAMESPACE zelnls2::
  DESTINATION ${_package_dir})
configure_package_config_file(${CMAKE_CURRENT_LIST_DIR}/zelnls2Config.cmake.in zelnls2Config.cmake
                              INSTALL_DESTINATION ${_package_dir})
write_basic_package_version_file(zelnls2ConfigVersion.cmake COMPATIBILITY SameMinorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/zelnls2Config.cmake
              ${CMAKE_CURRENT_BINARY_DIR}/zelnls2ConfigVersion.cmake DESTINATION ${_package_dir})

# pkg-config finds the tree from the place of its own file.
file(RELATIVE_PATH ZELNLS2_PREFIX_FROM_PC ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig
     ${CMAKE_INSTALL_PREFIX})
configure_file(${CMAKE_CURRENT_LIST_DIR}/zelnls2.pc.in zelnls2.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/zelnls2.pc
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
