# Fails when a C++ or Java source under the tracked directories differs from
# what clang-format makes of it with the repository's .clang-format.
set(dirs platform src vexel tests bench java desktop fuzz reader)
set(files)
foreach(dir ${dirs})
  file(GLOB_RECURSE found ${SOURCE_DIR}/${dir}/*.cpp ${SOURCE_DIR}/${dir}/*.h
                          ${SOURCE_DIR}/${dir}/*.hpp ${SOURCE_DIR}/${dir}/*.java)
  list(APPEND files ${found})
endforeach()
set(unformatted)
foreach(file ${files})
  execute_process(COMMAND ${CLANG_FORMAT} --style=file --dry-run -Werror ${file}
                  WORKING_DIRECTORY ${SOURCE_DIR} RESULT_VARIABLE result
                  OUTPUT_QUIET ERROR_QUIET)
  if(NOT result EQUAL 0)
    list(APPEND unformatted ${file})
  endif()
endforeach()
if(unformatted)
  string(REPLACE ";" "\n  " listing "${unformatted}")
  message(FATAL_ERROR "not formatted with clang-format --style=file:\n  ${listing}")
endif()
list(LENGTH files count)
message(STATUS "${count} files follow .clang-format")
