# Packages: `cmake --build build/release --target package` makes Debian's, as Debian would split them,
# and an archive that can be unpacked anywhere. scripts/package.sh makes them for a release.
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
  find_program(TEVPF_DPKG dpkg)
  mark_as_advanced(TEVPF_DPKG)
  if(TEVPF_DPKG)
    list(APPEND CPACK_GENERATOR DEB)
  endif()
endif()

# One archive with everything; one Debian package for each component.
set(CPACK_ARCHIVE_COMPONENT_INSTALL OFF)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_ENABLE_COMPONENT_DEPENDS ON)

# tevpf_package(COMPONENT package section "what it is" "a paragraph about it")
function(tevpf_package component package section summary text)
  string(TOUPPER "${component}" key)
  set(CPACK_DEBIAN_${key}_PACKAGE_NAME "${package}" PARENT_SCOPE)
  set(CPACK_DEBIAN_${key}_PACKAGE_SECTION "${section}" PARENT_SCOPE)
  set(CPACK_DEBIAN_${key}_DESCRIPTION "${summary}\n${text}" PARENT_SCOPE)
  set(CPACK_COMPONENTS_ALL "${CPACK_COMPONENTS_ALL};${component}" PARENT_SCOPE)
  # Debian's place for licence and history; the archive needs neither twice.
  if(CMAKE_INSTALL_PREFIX STREQUAL "/usr")
    set(folder "${CMAKE_INSTALL_DATAROOTDIR}/doc/${package}")
    install(FILES "${PROJECT_SOURCE_DIR}/LICENSE" DESTINATION "${folder}" RENAME copyright
      COMPONENT ${component})
    install(FILES "${PROJECT_BINARY_DIR}/changelog.gz" DESTINATION "${folder}"
      COMPONENT ${component})
  endif()
endfunction()

# lintian wants the history compressed, in Debian's form.
if(CMAKE_INSTALL_PREFIX STREQUAL "/usr")
  string(TIMESTAMP date "%a, %d %b %Y %H:%M:%S +0000" UTC)
  file(WRITE "${PROJECT_BINARY_DIR}/changelog"
    "tevpf (${PROJECT_VERSION}) unstable; urgency=medium\n\n"
    "  * See /usr/share/doc/tevpf/CHANGELOG.md in libtevpf-dev.\n\n"
    " -- ${CPACK_PACKAGE_CONTACT}  ${date}\n")
  execute_process(COMMAND gzip -9nf "${PROJECT_BINARY_DIR}/changelog" COMMAND_ERROR_IS_FATAL ANY)
endif()

set(what "libtevpf keeps named technical parameters and tables in compact binary files.")
tevpf_package(library libtevpf${PROJECT_VERSION_MAJOR} libs
  "parameter files: shared library" "${what} This is the library that programs load.")
tevpf_package(development libtevpf-dev libdevel
  "parameter files: headers and static library"
  "${what} This is what programs in C and C++ are built with, and the documents.")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS
  "libtevpf${PROJECT_VERSION_MAJOR} (= ${PROJECT_VERSION})")
if(TARGET tevpf_tool)
  tevpf_package(tool tevpf utils "parameter files: command-line tool"
    "${what} The tool shows, checks and changes them.")
endif()
if(TARGET tevpf_sqlite)
  tevpf_package(sql libsqlite3-mod-tevpf database "parameter files: extension of SQLite"
    "${what} This extension of SQLite reads and changes them by SQL.")
endif()
if(TARGET tevpf_python)
  tevpf_package(python python3-tevpf python "parameter files: Python 3 package"
    "${what} This package gives their lists as mappings and their tables as arrays of numpy.")
  set(CPACK_DEBIAN_PYTHON_PACKAGE_DEPENDS "python3, python3-numpy")
endif()

include(CPack)
