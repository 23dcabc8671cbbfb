# The tool as a process, the same list on both targets.
if(TARGET qxtool)
  find_package(Python3 REQUIRED COMPONENTS Interpreter)
  foreach(list tool files corpus zip zip_corpus settings)
    add_test(NAME tool.${list} COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/${list}_test.py
      $<TARGET_FILE:qxtool> $<$<BOOL:${WIN32}>:wine>
      COMMAND_EXPAND_LISTS)
    set_tests_properties(tool.${list} PROPERTIES TIMEOUT 900)
  endforeach()
endif()
