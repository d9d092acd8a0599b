# The options of every target of the project, and the function that declares a layer.

add_library(varnel_options INTERFACE)
target_compile_options(varnel_options INTERFACE -Wall -Wextra -Wpedantic -Wnon-virtual-dtor
                                                -Woverloaded-virtual -Wimplicit-fallthrough)
target_include_directories(varnel_options INTERFACE ${PROJECT_SOURCE_DIR})
# A program links only libraries that it really calls: the offline decoder needs no Qt.
target_link_options(varnel_options INTERFACE -Wl,--as-needed)
# While the program runs, the tables for calls into libraries are read-only.
target_link_options(varnel_options INTERFACE -Wl,-z,relro,-z,now)
if(VARNEL_SANITIZE)
  target_compile_options(varnel_options INTERFACE -fsanitize=${VARNEL_SANITIZE} -fno-sanitize-recover=all
                                                  -fno-omit-frame-pointer)
  target_link_options(varnel_options INTERFACE -fsanitize=${VARNEL_SANITIZE})
  if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    # In instrumented code, GCC 12 wrongly warns about uninitialized members in <regex> and <optional>. The sanitizers find
    # real ones.
    target_compile_options(varnel_options INTERFACE -Wno-maybe-uninitialized)
  endif()
endif()
if(VARNEL_COVERAGE)
  # Several threads and processes count at once.
  target_compile_options(varnel_options INTERFACE --coverage -fprofile-abs-path -fprofile-update=atomic)
  target_link_options(varnel_options INTERFACE --coverage)
endif()
if(VARNEL_FUZZ)
  # Reporting every comparison to the fuzzer took a fifth of the time, and the fuzzer has a dictionary.
  target_compile_options(varnel_options INTERFACE -fsanitize=fuzzer-no-link -fno-sanitize-coverage=trace-cmp)
endif()

# varnel_layer(NAME SOURCES a.cpp ... USES lower_layer ...): a static library and the layers that it may use. A layer
# without sources has only headers.
function(varnel_layer name)
  cmake_parse_arguments(ARG "" "" "SOURCES;USES" ${ARGN})
  if(ARG_SOURCES)
    add_library(${name} STATIC ${ARG_SOURCES})
    target_link_libraries(${name} PUBLIC varnel_options ${ARG_USES})
  else()
    add_library(${name} INTERFACE)
    target_link_libraries(${name} INTERFACE varnel_options ${ARG_USES})
  endif()
endfunction()
