# Project-wide build helpers: warnings on our own code, sanitizers for the test build.

if(DV_FUZZ)
  add_compile_options(-fsanitize=fuzzer-no-link,address,undefined -fno-omit-frame-pointer)
  add_link_options(-fsanitize=address,undefined)
elseif(DV_SANITIZE)
  add_compile_options(-fsanitize=address,undefined -fno-sanitize-recover=all
                      -fno-omit-frame-pointer)
  add_link_options(-fsanitize=address,undefined)
endif()

# Every target of ours gets the strict warnings; third-party headers come in as SYSTEM.
function(dv_strict target)
  target_compile_options(${target} PRIVATE -Wall -Wextra -Wno-unused-parameter)
  # The fuzz build uses another compiler, whose warnings are not the ones we keep at zero.
  if(NOT DV_FUZZ)
    target_compile_options(${target} PRIVATE -Werror)
  endif()
  # GCC 12 at -O2 and above warns falsely about std::string assignments (its bug 105329).
  if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    target_compile_options(${target} PRIVATE -Wno-restrict)
  endif()
endfunction()

# A platform layer: one shared library, so that process-wide state (the desktop, the
# settings store, the loaded servers) exists once even when the host and the component
# both link the layer.
function(dv_layer target)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  if(NOT ARG_SOURCES)
    message(STATUS "${target}: no sources yet, not built")
    return()
  endif()
  add_library(${target} SHARED ${ARG_SOURCES})
  target_include_directories(${target} PUBLIC ${PROJECT_SOURCE_DIR}/src)
  target_link_libraries(${target} PUBLIC ${ARG_DEPS})
  dv_strict(${target})
endfunction()
