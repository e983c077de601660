# The library in its three forms: shared (tevpf), static (tevpf_static), and the static form with
# test hooks (tevpf_testing) that only tests link; and the C++ interface over it.
get_property(TEVPF_SOURCES GLOBAL PROPERTY TEVPF_SOURCES)

function(tevpf_public_header target)
  target_include_directories(${target} PUBLIC
    "$<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}/include>"
    "$<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>")
endfunction()

# These have inner names of their neighbours, or the macros of <windows.h>.
set(apart ${TEVPF_SOURCES})
list(FILTER apart INCLUDE REGEX "reports/list_dump|tables/table_builder|core/io/(environment|wide_name|.*windows)")
set_source_files_properties(${apart} PROPERTIES SKIP_UNITY_BUILD_INCLUSION ON)

add_library(tevpf_objects OBJECT ${TEVPF_SOURCES})
tevpf_library_options(tevpf_objects)
tevpf_public_header(tevpf_objects)

add_library(tevpf SHARED $<TARGET_OBJECTS:tevpf_objects>)
add_library(tevpf::tevpf ALIAS tevpf)
tevpf_public_header(tevpf)
set_target_properties(tevpf PROPERTIES
  LINKER_LANGUAGE CXX VERSION ${PROJECT_VERSION} SOVERSION ${PROJECT_VERSION_MAJOR})
if(WIN32)
  set_target_properties(tevpf PROPERTIES PREFIX "")
  target_link_options(tevpf PRIVATE -static -static-libgcc -static-libstdc++)
else()
  # The version script keeps the standard library's templates out of the symbol table, which
  # hidden visibility does not.
  set(exports "${PROJECT_SOURCE_DIR}/cmake/exports.map")
  target_link_options(tevpf PRIVATE
    "-Wl,--version-script=${exports}" -Wl,--exclude-libs,ALL -Wl,-Bsymbolic-functions)
  if(NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
    target_link_options(tevpf PRIVATE -Wl,--no-undefined)
  endif()
  set_target_properties(tevpf PROPERTIES LINK_DEPENDS "${exports}")
endif()

if(WIN32)
  # Objects marked for a DLL do not belong in a static library.
  add_library(tevpf_static STATIC ${TEVPF_SOURCES})
  tevpf_library_options(tevpf_static)
else()
  add_library(tevpf_static STATIC $<TARGET_OBJECTS:tevpf_objects>)
  if(CMAKE_OBJCOPY)
    # What the compiler keeps in objects for optimising across files suits no other version of it.
    add_custom_command(TARGET tevpf_static POST_BUILD COMMAND "${CMAKE_OBJCOPY}" -w
      --remove-section=.gnu.lto_* --remove-section=.gnu.debuglto_* "$<TARGET_FILE:tevpf_static>"
      VERBATIM)
  endif()
endif()
add_library(tevpf::tevpf_static ALIAS tevpf_static)
tevpf_public_header(tevpf_static)
target_compile_definitions(tevpf_static PUBLIC TEVPF_STATIC)
set_target_properties(tevpf_static PROPERTIES LINKER_LANGUAGE CXX OUTPUT_NAME tevpf)

# A quick build for Windows checks the DLL; one under sanitizers runs the test programs, which have the
# library with test hooks.
if(TEVPF_BUILD_QUICKLY AND WIN32)
  set_target_properties(tevpf_static PROPERTIES EXCLUDE_FROM_ALL ON)
elseif(TEVPF_BUILD_QUICKLY AND CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  set_target_properties(tevpf_objects tevpf tevpf_static PROPERTIES EXCLUDE_FROM_ALL ON)
endif()

# The C++ interface: headers over the one or the other.
foreach(form "" _static)
  add_library(tevpf_cpp${form} INTERFACE)
  add_library(tevpf::cpp${form} ALIAS tevpf_cpp${form})
  set_target_properties(tevpf_cpp${form} PROPERTIES EXPORT_NAME cpp${form})
  target_compile_features(tevpf_cpp${form} INTERFACE cxx_std_20)
  target_link_libraries(tevpf_cpp${form} INTERFACE tevpf${form})
endforeach()

if(TEVPF_BUILD_TESTS OR TEVPF_BUILD_FUZZ)
  add_library(tevpf_testing STATIC EXCLUDE_FROM_ALL ${TEVPF_SOURCES})
  tevpf_library_options(tevpf_testing)
  tevpf_public_header(tevpf_testing)
  target_include_directories(tevpf_testing INTERFACE "${PROJECT_SOURCE_DIR}")
  target_compile_definitions(tevpf_testing PUBLIC TEVPF_STATIC TEVPF_TEST_HOOKS)
endif()
