# The Debian packages, which cpack or the target "package" makes: the library, the development files, and
# the command with the host library. The preset "packages" has Debian's places, /usr and the library
# folder of the architecture, and no search path in the files. The packages of other builds work too;
# their libraries are in /usr/lib.
#
# libzelnls2.so.0 does not start without a libzelhost.so.0, even in a program with trace and lock services
# of its own. So the library depends on the package that has it, and these two need each other: dpkg and
# apt install them in one step. A host that brings its own libzelhost.so.0 provides "libzelhost0" and
# conflicts with nls2; the library then takes it in place of ours.

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_CONTACT "The zelnls2 maintainers <maintainers@zelnls2.example>")
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
    OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
set(CPACK_PRE_BUILD_SCRIPTS ${CMAKE_CURRENT_LIST_DIR}/compress_documents.cmake)

set(CPACK_COMPONENTS_ALL library development command)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SOURCE ${PROJECT_NAME})
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)

# dpkg-shlibdeps finds what the files need of Debian's libraries. Our own two belong to no installed
# package, so the dependencies on them are given by hand.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR}/src ${PROJECT_BINARY_DIR}/host)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY ">=")

set(_same "(= ${PROJECT_VERSION})")
set(_about
    "zelnls2 translates fields and records between numbered code pages, EBCDIC
among them, with the blanks of fixed-length records, and compares, searches
and reads text by the rules of a language.
")
# The first line of each description is the summary.
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")

set(CPACK_DEBIAN_LIBRARY_PACKAGE_NAME libzelnls2-0)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_DEPENDS "nls2 ${_same} | libzelhost0")
set(CPACK_COMPONENT_LIBRARY_DESCRIPTION
    "national-language support over ICU - library
${_about}
This package contains the library.")

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libzelnls2-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS
    "libzelnls2-0 ${_same}, nls2 ${_same}, libicu-dev (>= 66)")
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION
    "national-language support over ICU - development files
${_about}
This package contains the headers for C and C++, a CMake package, a
pkg-config file and the manual page of the functions.")

set(CPACK_DEBIAN_COMMAND_PACKAGE_NAME nls2)
set(CPACK_DEBIAN_COMMAND_PACKAGE_SECTION utils)
set(CPACK_DEBIAN_COMMAND_PACKAGE_DEPENDS "libzelnls2-0 ${_same}")
set(CPACK_DEBIAN_COMMAND_PACKAGE_PROVIDES "libzelhost0 ${_same}")
set(CPACK_COMPONENT_COMMAND_DESCRIPTION
    "national-language support over ICU - command and host library
${_about}
This package contains the command nls2, and the host library, which gives
programs a lock and a trace facility.")

# Only the packages have these.
foreach(_component IN LISTS CPACK_COMPONENTS_ALL)
  string(TOUPPER ${_component} _upper)
  set(_documents ${CMAKE_INSTALL_DATAROOTDIR}/doc/${CPACK_DEBIAN_${_upper}_PACKAGE_NAME})
  install(
    FILES ${PROJECT_SOURCE_DIR}/LICENSE
    DESTINATION ${_documents}
    COMPONENT ${_component}
    RENAME copyright
    EXCLUDE_FROM_ALL)
  install(
    FILES ${PROJECT_SOURCE_DIR}/CHANGELOG.md
    DESTINATION ${_documents}
    COMPONENT ${_component}
    RENAME changelog
    EXCLUDE_FROM_ALL)
endforeach()

include(CPack)
