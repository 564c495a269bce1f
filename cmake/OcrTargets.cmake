# Shared settings for the project's own targets.

# Compiler warnings for a library target; the libraries build warning-free.
function(ocr_warnings target)
  target_compile_options(${target} PRIVATE -Wall -Wextra -Wpedantic -Wshadow
                                           -Wnon-virtual-dtor -Wcast-align -Wformat=2)
  if(OCR_WERROR)
    target_compile_options(${target} PRIVATE -Werror)
  endif()
endfunction()

# A static, position-independent library of one engine subsystem, linked into
# the shared engine library and, on its own, into the C++ tests.
#   ocr_subsystem(<name> SOURCES ... [LIBS ...])
function(ocr_subsystem name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LIBS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_include_directories(${name} PUBLIC ${PROJECT_SOURCE_DIR}/src)
  target_link_libraries(${name} PUBLIC ${ARG_LIBS})
  ocr_warnings(${name})
  set_property(GLOBAL APPEND PROPERTY OCR_SUBSYSTEM_LIBS ${name})
endfunction()
