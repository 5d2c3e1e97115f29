# What all our libraries have in common: the names that they export, the version in their file names, and
# hardened code. A library joins with harden() and export_symbols().

include(CheckCXXCompilerFlag)
set(CMAKE_REQUIRED_FLAGS -Werror) # Clang only warns about a flag of another machine
check_cxx_compiler_flag(-fcf-protection ZELNLS2_HAS_CF_PROTECTION) # x86
check_cxx_compiler_flag(-mbranch-protection=standard ZELNLS2_HAS_BRANCH_PROTECTION) # ARM
unset(CMAKE_REQUIRED_FLAGS)

# Only in release builds: sanitizers replace the same functions, and debug builds have no use for it.
function(harden)
  foreach(target IN LISTS ARGN)
    target_compile_options(
      ${target}
      PRIVATE $<$<CONFIG:Release>:-fstack-protector-strong>
              $<$<CONFIG:Release>:-U_FORTIFY_SOURCE>
              $<$<CONFIG:Release>:-D_FORTIFY_SOURCE=2>
              $<$<AND:$<CONFIG:Release>,$<BOOL:${ZELNLS2_HAS_CF_PROTECTION}>>:-fcf-protection>
              $<$<AND:$<CONFIG:Release>,$<BOOL:${ZELNLS2_HAS_BRANCH_PROTECTION}>>:-mbranch-protection=standard>)
    target_link_options(${target} PRIVATE $<$<CONFIG:Release>:-Wl,-z,relro,-z,now>)
  endforeach()
endfunction()

# The Debian package of a library: libzelnls2-0, libzelhost0.
function(runtime_package variable target)
  set(name lib${target}${PROJECT_VERSION_MAJOR})
  if(target MATCHES "[0-9]$")
    set(name lib${target}-${PROJECT_VERSION_MAJOR})
  endif()
  set(${variable} ${name} PARENT_SCOPE)
endfunction()

# Exports what lib<target>.symbols lists, and nothing else. A line there is
#   KIND NAME NODE VERSION
# with nm's letter for the kind, the version node ("Base": none) and the release that brought the name.
# Lines of kind U name what the library takes from its host. The Debian package's symbols file comes
# from the same list.
function(export_symbols target)
  set(list ${CMAKE_CURRENT_SOURCE_DIR}/lib${target}.symbols)
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${list})
  runtime_package(package ${target})
  set(debian "lib${target}.so.${PROJECT_VERSION_MAJOR} ${package} #MINVER#\n")
  set(nodes "")
  file(STRINGS ${list} lines REGEX "^[^U]")
  foreach(line IN LISTS lines)
    if(NOT line MATCHES "^[A-Z] ([^ ]+) ([^ ]+) ([0-9.]+)$")
      message(FATAL_ERROR "${list}: not KIND NAME NODE VERSION: ${line}")
    endif()
    set(node ${CMAKE_MATCH_2})
    if(NOT node IN_LIST nodes AND NOT node STREQUAL Base)
      string(APPEND debian " ${node}@${node} ${CMAKE_MATCH_3}\n")
    endif()
    list(APPEND nodes ${node})
    string(APPEND names_${node} "    ${CMAKE_MATCH_1};\n")
    string(APPEND debian " ${CMAKE_MATCH_1}@${node} ${CMAKE_MATCH_3}\n")
  endforeach()

  list(REMOVE_DUPLICATES nodes)
  set(script "")
  set(rest "  local:\n    *;\n")
  set(before "")
  foreach(node IN LISTS nodes)
    set(title "${node} ")
    if(node STREQUAL Base)
      set(title "")
    endif()
    string(APPEND script "${title}{\n  global:\n${names_${node}}${rest}}${before};\n")
    set(rest "")
    set(before " ${node}")
  endforeach()
  set(map ${CMAKE_CURRENT_BINARY_DIR}/lib${target}.map)
  file(CONFIGURE OUTPUT ${map} CONTENT "${script}" @ONLY)
  file(CONFIGURE OUTPUT ${PROJECT_BINARY_DIR}/symbols/${target}/symbols CONTENT "${debian}" @ONLY)

  target_link_options(${target} PRIVATE -Wl,--version-script=${map} -Wl,--as-needed)
  set_target_properties(${target} PROPERTIES VERSION ${PROJECT_VERSION} LINK_DEPENDS ${map}
                                             SOVERSION ${PROJECT_VERSION_MAJOR})
endfunction()
