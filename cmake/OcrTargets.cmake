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

# One ctest entry per *Test.java among SOURCES (below TEST_DIR), run by the JUnit console
# launcher in a JVM with JVM_FLAGS and CLASSPATH, labelled <prefix>; the engine's log of each goes
# to <build>/<prefix>-logs/<Test>.log. In the ASan build the JVM runs with the sanitizer runtimes
# preloaded (OCR_JVM_SANITIZER_ENVIRONMENT); ENVIRONMENT adds variables of the caller's.
#   ocr_add_junit_tests(<prefix> TEST_DIR dir SOURCES ... CLASSPATH cp JVM_FLAGS ...
#                       WORKING_DIRECTORY dir [ENVIRONMENT var=value ...])
function(ocr_add_junit_tests prefix)
  cmake_parse_arguments(ARG "" "TEST_DIR;CLASSPATH;WORKING_DIRECTORY"
                        "SOURCES;JVM_FLAGS;ENVIRONMENT" ${ARGN})
  file(MAKE_DIRECTORY ${CMAKE_BINARY_DIR}/${prefix}-logs ${ARG_WORKING_DIRECTORY})
  foreach(source ${ARG_SOURCES})
    if(NOT source MATCHES "Test\\.java$")
      continue()
    endif()
    file(RELATIVE_PATH relative ${ARG_TEST_DIR} ${source})
    string(REGEX REPLACE "\\.java$" "" class_path ${relative})
    string(REPLACE "/" "." class_name ${class_path})
    get_filename_component(simple_name ${class_path} NAME)
    add_test(NAME ${prefix}.${simple_name}
             COMMAND ${Java_JAVA_EXECUTABLE} ${ARG_JVM_FLAGS}
                     -jar ${JUNIT_CONSOLE_JAR} --disable-banner --details=tree
                     --fail-if-no-tests --disable-ansi-colors
                     -cp ${ARG_CLASSPATH} --select-class=${class_name})
    set(environment "OCRAR_LOG_FILE=${CMAKE_BINARY_DIR}/${prefix}-logs/${simple_name}.log"
        "OCRAR_LOG_LEVEL=5" ${OCR_JVM_SANITIZER_ENVIRONMENT} ${ARG_ENVIRONMENT})
    set_tests_properties(${prefix}.${simple_name} PROPERTIES
      ENVIRONMENT "${environment}"
      WORKING_DIRECTORY ${ARG_WORKING_DIRECTORY}
      LABELS ${prefix})
  endforeach()
endfunction()
