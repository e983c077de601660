# Run by CPack: makes Debian's packages with debhelper, from what cmake/Package.cmake wrote.
set(folder "${CPACK_TEVPF_DEBIAN_FOLDER}")
file(GLOB old "${folder}/*.deb")
if(old)
  file(REMOVE ${old})
endif()
# debhelper gives the compiler another home folder.
find_program(ccache ccache)
if(ccache)
  execute_process(COMMAND "${ccache}" --get-config cache_dir OUTPUT_VARIABLE cache
    OUTPUT_STRIP_TRAILING_WHITESPACE)
  set(ENV{CCACHE_DIR} "${cache}")
endif()
execute_process(COMMAND dh_clean WORKING_DIRECTORY "${folder}" COMMAND_ERROR_IS_FATAL ANY)
execute_process(COMMAND debian/rules binary WORKING_DIRECTORY "${folder}" COMMAND_ERROR_IS_FATAL ANY)
file(GLOB CPACK_EXTERNAL_BUILT_PACKAGES "${folder}/*.deb")
