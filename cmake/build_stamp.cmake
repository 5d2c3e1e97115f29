# Writes the text that NLS2_BuildStamp returns, as a string literal. Run in the build, with -D for each
# name used here. string(TIMESTAMP) takes SOURCE_DATE_EPOCH if it is set, and a reproducible build must
# not name its host either.

file(READ ${OPTIONS_FILE} options)
string(STRIP "${options}" options)
string(REGEX REPLACE " +" " " options "${options}")
string(TIMESTAMP date "%Y-%m-%dT%H:%M:%SZ" UTC)
set(host "")
if(NOT DEFINED ENV{SOURCE_DATE_EPOCH})
  cmake_host_system_information(RESULT host QUERY HOSTNAME)
  string(PREPEND host " on ")
endif()
set(stamp "zelnls2 ${VERSION}, ${COMPILER}, options ${options}, built${host} at ${date}")
string(REPLACE "\\" "\\\\" stamp "${stamp}")
string(REPLACE "\"" "\\\"" stamp "${stamp}")
file(WRITE ${OUTPUT} "\"${stamp}\"\n")
