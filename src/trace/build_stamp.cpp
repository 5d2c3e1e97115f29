// NLS2_BuildStamp: how the library was built.

#include "nls2.h"

const char *NLS2_BuildStamp() {
  return
#include "build_stamp.inc" // a string literal, written by cmake/build_stamp.cmake
      ;
}
