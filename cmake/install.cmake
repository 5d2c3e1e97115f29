# What cmake --install installs: headers, libraries, the command, manual pages, the CMake package and the
# pkg-config files. The installed tree can be moved as a whole.

include(CMakePackageConfigHelpers)
find_program(ZELNLS2_AWK NAMES awk mawk gawk REQUIRED)

# Files without a component are for those who build programs.
set(CMAKE_INSTALL_DEFAULT_COMPONENT_NAME development)
set(_package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/zelnls2)
add_custom_target(manual_pages ALL)

# Installs a library: the file as a component of its own, its name for the linker with the development
# files. With HEADER also the header, a manual page for each function in it, which refers to OVERVIEW,
# and a pkg-config file with REQUIRES and LIBS_PRIVATE.
function(install_library target)
  cmake_parse_arguments(PARSE_ARGV 1 arg "" "HEADER;OVERVIEW;DESCRIPTION;REQUIRES;LIBS_PRIVATE" "")
  set_target_properties(${target} PROPERTIES INSTALL_RPATH "$ORIGIN")
  install(
    TARGETS ${target}
    EXPORT zelnls2Targets
    LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
            COMPONENT ${target}
            NAMELINK_COMPONENT development)
  if(NOT arg_HEADER)
    return()
  endif()
  set(header ${PROJECT_SOURCE_DIR}/include/${arg_HEADER})
  set(overview ${PROJECT_SOURCE_DIR}/docs/${arg_OVERVIEW})
  install(FILES ${header} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})

  set(script ${PROJECT_SOURCE_DIR}/cmake/manual_pages.awk)
  set(pages ${PROJECT_BINARY_DIR}/manual_pages/${target})
  add_custom_command(
    OUTPUT ${pages}.made
    COMMAND ${CMAKE_COMMAND} -E rm -rf ${pages}
    COMMAND ${CMAKE_COMMAND} -E make_directory ${pages}
    COMMAND ${ZELNLS2_AWK} -f ${script} -v overview=${overview} -v library=lib${target}.so -v
            folder=${pages} ${header}
    COMMAND ${CMAKE_COMMAND} -E touch ${pages}.made
    DEPENDS ${script} ${header} ${overview}
    VERBATIM)
  add_custom_target(${target}_manual_pages DEPENDS ${pages}.made)
  add_dependencies(manual_pages ${target}_manual_pages)
  install(DIRECTORY ${pages}/ DESTINATION ${CMAKE_INSTALL_MANDIR}/man3)

  # The pkg-config file finds the tree from its own place.
  file(RELATIVE_PATH PREFIX_FROM_PC ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_PREFIX})
  configure_file(${PROJECT_SOURCE_DIR}/cmake/library.pc.in ${target}.pc @ONLY)
  install(FILES ${CMAKE_CURRENT_BINARY_DIR}/${target}.pc
          DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
endfunction()

install_library(zelhost)
install_library(
  zelnls2
  HEADER nls2.h
  OVERVIEW zelnls2.3
  DESCRIPTION "${PROJECT_DESCRIPTION}"
  REQUIRES "icu-uc icu-io"
  LIBS_PRIVATE -lzelhost)
install_library(
  zelfields
  HEADER nls2_fields.h
  OVERVIEW zelfields.3
  DESCRIPTION "Fields and records between code pages, over ICU"
  REQUIRES zelnls2)

install(FILES ${PROJECT_SOURCE_DIR}/include/nls2.hpp DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(
  DIRECTORY ${PROJECT_SOURCE_DIR}/include/nls2
  DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}
  FILES_MATCHING
  PATTERN *.hpp)
install(FILES ${PROJECT_SOURCE_DIR}/docs/zelnls2.3 ${PROJECT_SOURCE_DIR}/docs/zelfields.3
        DESTINATION ${CMAKE_INSTALL_MANDIR}/man3)
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
write_basic_package_version_file(zelnls2ConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/zelnls2Config.cmake
              ${CMAKE_CURRENT_BINARY_DIR}/zelnls2ConfigVersion.cmake DESTINATION ${_package_dir})
