# Run by cpack between installing and packing.

# pkg-config files name the place that a package has, as all others do there.
file(GLOB_RECURSE _files ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*.pc)
foreach(_file IN LISTS _files)
  file(READ ${_file} _text)
  string(REGEX REPLACE "^prefix=[^\n]*" "prefix=${CPACK_PACKAGING_INSTALL_PREFIX}" _text "${_text}")
  file(WRITE ${_file} "${_text}")
endforeach()

# Debian wants manual pages and change logs compressed; -n keeps the time of the build out of them.
file(GLOB_RECURSE _files ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*/usr/share/man/*
     ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*/usr/share/doc/*/changelog)
execute_process(COMMAND gzip -9nf ${_files} COMMAND_ERROR_IS_FATAL ANY)
