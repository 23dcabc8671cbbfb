# The examples of the guides, run as a reader would run them.
if(TARGET qxtool)
  find_package(Python3 REQUIRED COMPONENTS Interpreter)
  foreach(guide README.md docs/text-encodings.md)
    string(MAKE_C_IDENTIFIER ${guide} name)
    add_test(NAME docs.${name} COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/run_examples.py
      ${PROJECT_SOURCE_DIR}/${guide} ${PROJECT_SOURCE_DIR}/samples/texts/files $<TARGET_FILE:qxtool>
      $<$<BOOL:${WIN32}>:wine>
      COMMAND_EXPAND_LISTS)
    set_tests_properties(docs.${name} PROPERTIES TIMEOUT 300)
  endforeach()
endif()
