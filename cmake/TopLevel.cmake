# Conveniences that only a build of this project itself gets, never a project that embeds it.
if(NOT CMAKE_BUILD_TYPE)
  set(CMAKE_BUILD_TYPE Release CACHE STRING "Debug, Release, RelWithDebInfo or MinSizeRel" FORCE)
endif()
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)

find_program(TEVPF_CCACHE ccache)
mark_as_advanced(TEVPF_CCACHE)
if(TEVPF_CCACHE AND NOT CMAKE_CXX_COMPILER_LAUNCHER)
  set(CMAKE_C_COMPILER_LAUNCHER "${TEVPF_CCACHE}")
  set(CMAKE_CXX_COMPILER_LAUNCHER "${TEVPF_CCACHE}")
endif()
