# The facts that NLS2_BuildStamp tells. string(TIMESTAMP) takes SOURCE_DATE_EPOCH where it is set, and
# a reproducible build must not name its host either.

string(TOUPPER "${CMAKE_BUILD_TYPE}" _type)
string(STRIP "${CMAKE_CXX_FLAGS} ${CMAKE_CXX_FLAGS_${_type}}" ZELNLS2_STAMP_OPTIONS)
string(TIMESTAMP ZELNLS2_STAMP_DATE "%Y-%m-%dT%H:%M:%SZ" UTC)
if(DEFINED ENV{SOURCE_DATE_EPOCH})
  set(ZELNLS2_STAMP_HOST "")
else()
  cmake_host_system_information(RESULT ZELNLS2_STAMP_HOST QUERY HOSTNAME)
  string(PREPEND ZELNLS2_STAMP_HOST " on ")
endif()
set(ZELNLS2_STAMP
    "zelnls2 ${PROJECT_VERSION}, ${CMAKE_CXX_COMPILER_ID} ${CMAKE_CXX_COMPILER_VERSION}, options \
${ZELNLS2_STAMP_OPTIONS}, built${ZELNLS2_STAMP_HOST} at ${ZELNLS2_STAMP_DATE}")
string(REPLACE "\\" "\\\\" ZELNLS2_STAMP "${ZELNLS2_STAMP}")
string(REPLACE "\"" "\\\"" ZELNLS2_STAMP "${ZELNLS2_STAMP}")
configure_file(${CMAKE_CURRENT_LIST_DIR}/build_stamp.inc.in ${CMAKE_CURRENT_BINARY_DIR}/build_stamp.inc
               @ONLY)
