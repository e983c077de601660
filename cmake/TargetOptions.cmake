# tevpf_target_options(target): what every target of this project is compiled with. All of it is
# private; a consumer sees none of these flags.
function(tevpf_target_options target)
  set_target_properties(${target} PROPERTIES
    C_STANDARD 99 C_STANDARD_REQUIRED ON C_EXTENSIONS OFF
    CXX_STANDARD 20 CXX_STANDARD_REQUIRED ON CXX_EXTENSIONS OFF)
  if(CMAKE_SIZEOF_VOID_P EQUAL 4)
    # Files beyond 2 GB, and the same arithmetic as on 64-bit machines: no extended precision.
    target_compile_definitions(${target} PRIVATE _FILE_OFFSET_BITS=64)
    target_compile_options(${target} PRIVATE -msse2 -mfpmath=sse)
  endif()
  target_compile_options(${target} PRIVATE -ffp-contract=off)
  if(TEVPF_BUILD_QUICKLY AND CMAKE_BUILD_TYPE STREQUAL "Debug")
    target_compile_options(${target} PRIVATE -g1)  # the lines of a backtrace
  endif()
  if(TEVPF_STRICT)
    # Counts are signed and sizes are not; compilers disagree whether -Wconversion includes that.
    target_compile_options(${target} PRIVATE
      -Wall -Wextra -Wpedantic -Wconversion -Wno-sign-conversion -Wshadow -Werror)
    if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
      # False alarms of gcc 12 in the standard library's string concatenation.
      target_compile_options(${target} PRIVATE -Wno-restrict)
    endif()
  endif()
endfunction()

# tevpf_library_options(target): in addition, what the library's own code is compiled with.
function(tevpf_library_options target)
  tevpf_target_options(${target})
  # The sources of a folder together. Not what users get: gcc 12 takes variables for uninitialised that
  # are not when it optimises a whole folder.
  set(together OFF)
  if(TEVPF_BUILD_QUICKLY OR (TEVPF_BUILD_ONCE AND CMAKE_BUILD_TYPE STREQUAL "Debug"))
    set(together ON)
  endif()
  set_target_properties(${target} PROPERTIES
    POSITION_INDEPENDENT_CODE ON C_VISIBILITY_PRESET hidden
    CXX_VISIBILITY_PRESET hidden VISIBILITY_INLINES_HIDDEN ON
    UNITY_BUILD ${together} UNITY_BUILD_MODE GROUP)
  target_include_directories(${target} PRIVATE "${PROJECT_SOURCE_DIR}")
  target_compile_definitions(${target} PRIVATE TEVPF_BUILD)
  # The library is loaded into C programs: nothing may be thrown through it.
  target_compile_options(${target} PRIVATE
    $<$<COMPILE_LANGUAGE:CXX>:-fno-exceptions> $<$<COMPILE_LANGUAGE:CXX>:-fno-rtti>)
  if(NOT WIN32)
    # Calls of the library's own functions and of the C runtime take no detour.
    target_compile_options(${target} PRIVATE -fno-semantic-interposition -fno-plt)
  endif()
  if(TEVPF_BUILD_QUICKLY)
    if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
      target_compile_options(${target} PRIVATE -Wno-maybe-uninitialized)
    endif()
  elseif(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_BUILD_TYPE STREQUAL "Release" AND NOT WIN32)
    # Small operations spend a sixth of their time on calls between files. The objects hold plain
    # code too, for the static library. Neighbouring fields stored as one vector cost the next
    # operation, which reads one of them, more than the store saves.
    target_compile_options(${target} PRIVATE
      -flto=auto -ffat-lto-objects -fno-tree-slp-vectorize)
  endif()
endfunction()

# tevpf_precompile(target header... | REUSE_FROM other): headers that most files of the target include, in
# a quick build. In another one, each of them would compile the whole target again when it changes.
function(tevpf_precompile target)
  if(TEVPF_BUILD_QUICKLY)
    if(ARGV1 STREQUAL "REUSE_FROM")
      target_precompile_headers(${target} ${ARGN})
    else()
      target_precompile_headers(${target} PRIVATE ${ARGN})
    endif()
    if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
      target_compile_options(${target} PRIVATE -fpch-preprocess)  # ccache asks for it
    endif()
  endif()
endfunction()
