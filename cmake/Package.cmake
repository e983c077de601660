# Packages: `cmake --build build/release --target package` makes an archive that can be unpacked
# anywhere and, where debhelper is installed, Debian's packages. scripts/package.sh makes all of a release.
set(CPACK_PACKAGE_NAME tevpf)
set(CPACK_PACKAGE_VENDOR "libtevpf developers")
set(CPACK_PACKAGE_CONTACT "libtevpf developers <libtevpf@packages.invalid>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "${PROJECT_DESCRIPTION}")
set(CPACK_RESOURCE_FILE_LICENSE "${PROJECT_SOURCE_DIR}/LICENSE")
set(CPACK_STRIP_FILES ON)
set(CPACK_VERBATIM_VARIABLES ON)
if(WIN32)
  set(CPACK_GENERATOR ZIP)
else()
  set(CPACK_GENERATOR TGZ)
  find_program(TEVPF_DEBHELPER dh)
  mark_as_advanced(TEVPF_DEBHELPER)
endif()

# cmake/debian says how Debian's packages are made; debhelper makes them, in a build of their own with
# Debian's paths and flags. Version and names in there are this project's.
if(TEVPF_DEBHELPER AND NOT CMAKE_CROSSCOMPILING)
  list(APPEND CPACK_GENERATOR External)
  set(CPACK_EXTERNAL_PACKAGE_SCRIPT "${PROJECT_SOURCE_DIR}/cmake/DebianPackages.cmake")
  set(folder "${PROJECT_BINARY_DIR}/debian-packages")
  set(CPACK_TEVPF_DEBIAN_FOLDER "${folder}")

  file(STRINGS CHANGELOG.md line REGEX "^## ${PROJECT_VERSION} " LIMIT_COUNT 1)
  string(REGEX MATCH "[0-9]+-[0-9]+-[0-9]+" day "${line}")
  if(day)
    execute_process(COMMAND date --utc --rfc-email "--date=${day}"
      OUTPUT_VARIABLE TEVPF_CHANGELOG_DATE OUTPUT_STRIP_TRAILING_WHITESPACE)
  else()
    string(TIMESTAMP TEVPF_CHANGELOG_DATE "%a, %d %b %Y %H:%M:%S +0000" UTC)
  endif()
  file(READ LICENSE text)
  string(REGEX REPLACE "^MIT License\n\nCopyright[^\n]*\n\n" "" text "${text}")
  string(REGEX REPLACE "\n\n" "\n.\n" text "${text}")
  string(STRIP "${text}" text)
  string(REPLACE "\n" "\n " text "${text}")
  set(TEVPF_LICENSE_TEXT " ${text}")

  foreach(name changelog control copyright rules)
    configure_file(cmake/debian/${name}.in "${folder}/debian/${name}" @ONLY)
  endforeach()
  configure_file(cmake/debian/libtevpf.symbols.in
    "${folder}/debian/libtevpf${PROJECT_VERSION_MAJOR}.symbols" @ONLY)
  foreach(name libsqlite3-mod-tevpf tevpf)
    configure_file(cmake/debian/${name}.lintian-overrides "${folder}/debian" COPYONLY)
  endforeach()
endif()

include(CPack)
