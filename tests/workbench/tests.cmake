# The workbench as a process that is driven by scripts, the same list on both targets.
if(TARGET qxworkbench)
  find_package(Python3 REQUIRED COMPONENTS Interpreter)
  add_test(NAME workbench COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/workbench_test.py
    $<TARGET_FILE:qxworkbench> $<TARGET_FILE:qxtool> $<$<BOOL:${WIN32}>:wine>
    COMMAND_EXPAND_LISTS)
  set_tests_properties(workbench PROPERTIES TIMEOUT 600)
endif()
