# How every target of the project is compiled. One interface target, linked by tavrin_library() and
# tavrin_program(), carries the warnings, the sanitizers and the paths, so no folder repeats them.
file(RELATIVE_PATH TAVRIN_RELATIVE_ROOT "${CMAKE_BINARY_DIR}" "${CMAKE_SOURCE_DIR}")
string(REGEX REPLACE "/$" "" TAVRIN_RELATIVE_ROOT "${TAVRIN_RELATIVE_ROOT}")
add_library(tavrin_flags INTERFACE)
target_include_directories(tavrin_flags INTERFACE "${CMAKE_SOURCE_DIR}")
target_compile_options(tavrin_flags INTERFACE
  -Wall -Wextra -Wshadow -Wconversion -Wnon-virtual-dtor -Woverloaded-virtual
  # A log record names its source file; the path starts at the root of the project, also when a
  # compiler cache hands the compiler relative paths.
  "-fmacro-prefix-map=${CMAKE_SOURCE_DIR}/=" "-fmacro-prefix-map=${TAVRIN_RELATIVE_ROOT}/=")
target_compile_definitions(tavrin_flags INTERFACE QT_NO_KEYWORDS QT_NO_CAST_FROM_ASCII
  QT_NO_CAST_TO_ASCII)
if(TAVRIN_WERROR)
  target_compile_options(tavrin_flags INTERFACE -Werror)
endif()
if(CMAKE_BUILD_TYPE STREQUAL "Debug")
  # -Og keeps the debugger honest and the widget tests fast enough.
  target_compile_options(tavrin_flags INTERFACE -Og -g1)
endif()
if(TAVRIN_SANITIZE)
  target_compile_options(tavrin_flags INTERFACE -fsanitize=${TAVRIN_SANITIZE}
    -fno-omit-frame-pointer)
  target_link_options(tavrin_flags INTERFACE -fsanitize=${TAVRIN_SANITIZE})
endif()

find_program(TAVRIN_MOLD mold)
if(TAVRIN_MOLD)
  target_link_options(tavrin_flags INTERFACE -fuse-ld=mold)
endif()
find_program(TAVRIN_CCACHE ccache)
if(TAVRIN_CCACHE)
  set(CMAKE_C_COMPILER_LAUNCHER "${TAVRIN_CCACHE}")
  set(CMAKE_CXX_COMPILER_LAUNCHER "${TAVRIN_CCACHE}")
endif()

# Where no compiler cache stands in the way, the standard headers that nearly every file includes are
# compiled once a target: it takes a third off a build from nothing.
option(TAVRIN_PRECOMPILE "Precompile the standard headers" ON)
function(tavrin_precompile name)
  if(TAVRIN_PRECOMPILE AND NOT TAVRIN_CCACHE)
    target_precompile_headers(${name} PRIVATE <algorithm> <chrono> <functional> <map> <memory>
      <mutex> <optional> <string> <string_view> <unordered_map> <vector> ${ARGN})
  endif()
endfunction()

# tavrin_library(<name> SOURCES … LINKS …): a static library of one folder. LINKS are the floors
# below that its headers show; PRIVATE_LINKS the libraries that only its sources see.
function(tavrin_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS;PRIVATE_LINKS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_link_libraries(${name} PUBLIC tavrin_flags ${ARG_LINKS} PRIVATE ${ARG_PRIVATE_LINKS})
  tavrin_precompile(${name})
endfunction()

# tavrin_program(<name> SOURCES … LINKS …)
function(tavrin_program name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE tavrin_flags ${ARG_LINKS})
  set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/bin")
endfunction()
