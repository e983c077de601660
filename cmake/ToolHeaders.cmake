# tevpf_tool_headers: the header-only libraries that the command-line tool needs (CLI11 and
# nlohmann-json). They are linked into a folder of their own, because a cross-compiler must not see
# the other headers that lie beside them.
include_guard(GLOBAL)

find_path(TEVPF_CLI11_DIR CLI/CLI.hpp PATHS /usr/include /usr/local/include
  NO_CMAKE_FIND_ROOT_PATH)
find_path(TEVPF_JSON_DIR nlohmann/json.hpp PATHS /usr/include /usr/local/include
  NO_CMAKE_FIND_ROOT_PATH)
mark_as_advanced(TEVPF_CLI11_DIR TEVPF_JSON_DIR)
if(NOT TEVPF_CLI11_DIR OR NOT TEVPF_JSON_DIR)
  message(FATAL_ERROR "The tool needs CLI11 and nlohmann-json (Debian: libcli11-dev, "
    "nlohmann-json3-dev). -DTEVPF_BUILD_TOOL=OFF builds the library without it.")
endif()

set(folder "${PROJECT_BINARY_DIR}/tool-headers")
file(MAKE_DIRECTORY "${folder}")
file(CREATE_LINK "${TEVPF_CLI11_DIR}/CLI" "${folder}/CLI" SYMBOLIC)
file(CREATE_LINK "${TEVPF_JSON_DIR}/nlohmann" "${folder}/nlohmann" SYMBOLIC)

add_library(tevpf_tool_headers INTERFACE)
target_include_directories(tevpf_tool_headers SYSTEM INTERFACE "${folder}")
