# The program that a test starts: the built program or, if the build is for another machine, a script that
# runs it in the emulator.

function(runnable_file variable target)
  if(NOT CMAKE_CROSSCOMPILING_EMULATOR)
    set(${variable} $<TARGET_FILE:${target}> PARENT_SCOPE)
    return()
  endif()
  list(JOIN CMAKE_CROSSCOMPILING_EMULATOR "' '" emulator)
  set(script ${CMAKE_CURRENT_BINARY_DIR}/emulated/${target})
  file(
    GENERATE
    OUTPUT ${script}
    CONTENT "#!/bin/sh\nexec '${emulator}' '$<TARGET_FILE:${target}>' \"$@\"\n"
    FILE_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ
                     WORLD_EXECUTE)
  set(${variable} ${script} PARENT_SCOPE)
endfunction()
