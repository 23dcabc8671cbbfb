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

# The reference pages: a public name without a comment is an error.
if(NOT WIN32)
  find_program(DOXYGEN doxygen)
  if(DOXYGEN)
    add_test(NAME docs.reference COMMAND sh -c "mkdir -p build/docs && '${DOXYGEN}' docs/Doxyfile" WORKING_DIRECTORY ${PROJECT_SOURCE_DIR})
  else()
    add_test(NAME docs.reference COMMAND ${CMAKE_COMMAND} -E echo "left out: the reference pages, because doxygen is not installed")
  endif()
endif()
