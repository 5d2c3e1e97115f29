# The Debian packages, which cpack or the target "package" makes: one for each library, the development
# files, and the command. The preset "packages" has Debian's places, /usr and the library folder of the
# architecture, and no search path in the files. The packages of other builds work too; their
# libraries are in /usr/lib.

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_CONTACT "The zelnls2 maintainers <maintainers@zelnls2.example>")
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
    OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
set(CPACK_PRE_BUILD_SCRIPTS ${CMAKE_CURRENT_LIST_DIR}/finish_packages.cmake)

set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SOURCE ${PROJECT_NAME})
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)

# dpkg-shlibdeps finds what the files need of Debian's libraries. Our own belong to no installed
# package, so the dependencies on them are given by hand. Other packages find theirs on ours in the
# symbols files.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS
    ${PROJECT_BINARY_DIR}/src ${PROJECT_BINARY_DIR}/host ${PROJECT_BINARY_DIR}/fields)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY ">=")

# The first line of each description is the summary.
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")

# Makes a package of a component, with the documents that only packages have.
macro(add_package component)
  cmake_parse_arguments(_package "" "NAME;SECTION;SUMMARY;CONTENTS" "DEPENDS" ${ARGN})
  string(TOUPPER ${component} _upper)
  list(APPEND CPACK_COMPONENTS_ALL ${component})
  set(CPACK_DEBIAN_${_upper}_PACKAGE_NAME ${_package_NAME})
  set(CPACK_DEBIAN_${_upper}_PACKAGE_SECTION ${_package_SECTION})
  list(JOIN _package_DEPENDS ", " CPACK_DEBIAN_${_upper}_PACKAGE_DEPENDS)
  set(CPACK_COMPONENT_${_upper}_DESCRIPTION
      "national-language support over ICU - ${_package_SUMMARY}
zelnls2 translates fields and records between numbered code pages, EBCDIC
among them, with the blanks of fixed-length records, and compares, searches
and reads text by the rules of a language.

${_package_CONTENTS}")
  set(_documents ${CMAKE_INSTALL_DATAROOTDIR}/doc/${_package_NAME})
  foreach(_file copyright:LICENSE changelog:CHANGELOG.md)
    string(REPLACE ":" ";" _file ${_file})
    list(GET _file 0 _name)
    list(GET _file 1 _source)
    install(
      FILES ${PROJECT_SOURCE_DIR}/${_source}
      DESTINATION ${_documents}
      COMPONENT ${component}
      RENAME ${_name}
      EXCLUDE_FROM_ALL)
  endforeach()
endmacro()

macro(add_library_package target)
  runtime_package(_name ${target})
  add_package(${target} NAME ${_name} SECTION libs ${ARGN})
  set(CPACK_DEBIAN_${_upper}_PACKAGE_CONTROL_EXTRA ${PROJECT_BINARY_DIR}/symbols/${target}/symbols)
endmacro()

set(_zelnls2 "libzelnls2-0 (= ${PROJECT_VERSION})")
set(_zelfields "libzelfields0 (= ${PROJECT_VERSION})")
set(CPACK_COMPONENTS_ALL "")
add_library_package(
  zelhost SUMMARY "host library" CONTENTS
  "This package contains the host library, which gives programs a lock and a
trace facility.")
# Any libzelhost0 will do: a host that has a libzelhost.so.0 of its own puts it into a package that
# provides libzelhost0 and conflicts with ours.
add_library_package(zelnls2 DEPENDS libzelhost0 SUMMARY "library" CONTENTS
                    "This package contains the library.")
add_library_package(
  zelfields DEPENDS "${_zelnls2}" SUMMARY "fields and records" CONTENTS
  "This package contains the library for programs that move much text: code
pages by name, and translators and collators that stay open.")
add_package(
  development
  NAME libzelnls2-dev
  SECTION libdevel
  DEPENDS "${_zelnls2}" "${_zelfields}" libzelhost0 "libicu-dev (>= 66)"
  SUMMARY "development files"
  CONTENTS
  "This package contains the headers for C and C++, a CMake package,
pkg-config files and a manual page for each function.")
get_target_property(_uses nls2 LINK_LIBRARIES)
if(NOT _uses MATCHES zelfields)
  unset(_zelfields)
endif()
add_package(
  command
  NAME nls2
  SECTION utils
  DEPENDS "${_zelnls2}" ${_zelfields}
  SUMMARY "command"
  CONTENTS "This package contains the command nls2.")

include(CPack)
