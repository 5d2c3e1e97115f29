# Compresses the manual pages and change logs of the packages, as Debian asks for. Run by cpack between
# installing and packing; -n keeps the time of the build out of the packages.

file(GLOB_RECURSE _documents ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*/usr/share/man/*
     ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*/usr/share/doc/*/changelog)
execute_process(COMMAND gzip -9nf ${_documents} COMMAND_ERROR_IS_FATAL ANY)
