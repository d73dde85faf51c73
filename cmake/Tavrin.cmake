# How every target of the project is compiled. One interface target, linked by tavrin_library() and
# tavrin_program(), carries the warnings, the sanitizers and the paths, so no folder repeats them.
find_program(TAVRIN_CCACHE ccache)
if(TAVRIN_CCACHE)
  set(CMAKE_C_COMPILER_LAUNCHER "${TAVRIN_CCACHE}")
  set(CMAKE_CXX_COMPILER_LAUNCHER "${TAVRIN_CCACHE}")
endif()

# A build from nothing, without a compiler cache, compiles the standard headers that nearly every file
# includes once a target, and several sources as one: it takes far less time. Names of a source's own
# have to differ from those of its neighbours for that.
if(TAVRIN_CCACHE)
  set(from_nothing OFF)
else()
  set(from_nothing ON)
endif()
option(TAVRIN_COMPILE_TOGETHER "Precompile the standard headers, compile sources together"
  ${from_nothing})

file(RELATIVE_PATH TAVRIN_RELATIVE_ROOT "${CMAKE_BINARY_DIR}" "${CMAKE_SOURCE_DIR}")
string(REGEX REPLACE "/$" "" TAVRIN_RELATIVE_ROOT "${TAVRIN_RELATIVE_ROOT}")
add_library(tavrin_flags INTERFACE)
target_include_directories(tavrin_flags INTERFACE "${CMAKE_SOURCE_DIR}")
target_compile_options(tavrin_flags INTERFACE
  -Wall -Wextra -Wshadow -Wconversion -Wnon-virtual-dtor -Woverloaded-virtual
  # A log record names its source file; the path starts at the root of the project, also when a
  # compiler cache hands the compiler relative paths.
  "-fmacro-prefix-map=${CMAKE_SOURCE_DIR}/=" "-fmacro-prefix-map=${TAVRIN_RELATIVE_ROOT}/=")
if(TAVRIN_COMPILE_TOGETHER)
  # A screen's hidden parts may be of types of its own source, which looks like a header's here.
  target_compile_options(tavrin_flags INTERFACE -Wno-subobject-linkage)
endif()
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

function(tavrin_compile_together name)
  if(TAVRIN_COMPILE_TOGETHER)
    target_precompile_headers(${name} PRIVATE <algorithm> <chrono> <functional> <map> <memory>
      <mutex> <optional> <string> <string_view> <unordered_map> <vector> ${ARGN})
    set_target_properties(${name} PROPERTIES UNITY_BUILD ON UNITY_BUILD_BATCH_SIZE 12)
  endif()
endfunction()

# tavrin_library(<name> SOURCES … LINKS …): a static library of one folder. LINKS are the floors
# below that its headers show; PRIVATE_LINKS the libraries that only its sources see.
function(tavrin_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS;PRIVATE_LINKS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_link_libraries(${name} PUBLIC tavrin_flags ${ARG_LINKS} PRIVATE ${ARG_PRIVATE_LINKS})
  tavrin_compile_together(${name})
endfunction()

# tavrin_program(<name> SOURCES … LINKS …)
function(tavrin_program name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE tavrin_flags ${ARG_LINKS})
  set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/bin")
endfunction()
