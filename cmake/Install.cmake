# What `cmake --install` lays out: headers, libraries, CMake package, pkg-config files, documents. The
# components are those of cmake/Package.cmake.
include(CMakePackageConfigHelpers)
set(CMAKE_INSTALL_DEFAULT_COMPONENT_NAME development)

set(package_dir "${CMAKE_INSTALL_LIBDIR}/cmake/tevpf")

install(TARGETS tevpf tevpf_static tevpf_cpp tevpf_cpp_static EXPORT tevpfTargets
  RUNTIME COMPONENT library
  LIBRARY COMPONENT library NAMELINK_COMPONENT development)
install(DIRECTORY include/ DESTINATION "${CMAKE_INSTALL_INCLUDEDIR}"
  FILES_MATCHING PATTERN "*.h" PATTERN "*.hpp")
install(EXPORT tevpfTargets NAMESPACE tevpf:: DESTINATION "${package_dir}")

configure_package_config_file(cmake/tevpfConfig.cmake.in
  "${PROJECT_BINARY_DIR}/tevpfConfig.cmake" INSTALL_DESTINATION "${package_dir}")
write_basic_package_version_file("${PROJECT_BINARY_DIR}/tevpfConfigVersion.cmake"
  COMPATIBILITY SameMajorVersion)
install(FILES "${PROJECT_BINARY_DIR}/tevpfConfig.cmake"
  "${PROJECT_BINARY_DIR}/tevpfConfigVersion.cmake" DESTINATION "${package_dir}")

# Paths relative to the .pc file, so that an installed tree can be moved as a whole.
file(RELATIVE_PATH TEVPF_PC_PREFIX
  "/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/")
string(REGEX REPLACE "/$" "" TEVPF_PC_PREFIX "${TEVPF_PC_PREFIX}")
set(TEVPF_CXX_RUNTIME stdc++)
if(CMAKE_CXX_FLAGS MATCHES "-stdlib=libc[+][+]")
  set(TEVPF_CXX_RUNTIME c++)
endif()
foreach(name tevpf tevpf-cpp)
  configure_file(cmake/${name}.pc.in "${PROJECT_BINARY_DIR}/${name}.pc" @ONLY)
  install(FILES "${PROJECT_BINARY_DIR}/${name}.pc"
    DESTINATION "${CMAKE_INSTALL_LIBDIR}/pkgconfig")
endforeach()

install(FILES LICENSE README.md CHANGELOG.md DESTINATION "${CMAKE_INSTALL_DOCDIR}")
install(DIRECTORY docs/ DESTINATION "${CMAKE_INSTALL_DOCDIR}" OPTIONAL
  FILES_MATCHING PATTERN "*.md" PATTERN "*.svg")

if(TARGET tevpf_tool)
  install(TARGETS tevpf_tool COMPONENT tool)
  install(FILES tools/tevpf.1 DESTINATION "${CMAKE_INSTALL_MANDIR}/man1" COMPONENT tool)
  install(FILES tools/tevpf.bash DESTINATION "${CMAKE_INSTALL_DATADIR}/bash-completion/completions"
    RENAME tevpf COMPONENT tool)
  install(FILES tools/_tevpf DESTINATION "${CMAKE_INSTALL_DATADIR}/zsh/site-functions" COMPONENT tool)
endif()
