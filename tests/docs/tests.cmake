# The examples of the guides, run as a reader would run them. A guide with C++ examples has them all
# in one program.
set(guides README.md docs/strings.md docs/writing-text.md docs/text-encodings.md docs/containers.md docs/binary-format.md docs/notifications.md
  docs/files-and-finders.md docs/time.md docs/settings.md docs/archives.md docs/mapped-files.md docs/drawing.md
  docs/windows.md docs/unattended.md docs/rtf.md docs/status-bars.md docs/splitters-and-tabs.md docs/workbench.md)
find_package(Python3 REQUIRED COMPONENTS Interpreter)
if(TARGET qxtool)
  foreach(guide ${guides})
    string(MAKE_C_IDENTIFIER ${guide} name)
    set(program)
    file(STRINGS ${PROJECT_SOURCE_DIR}/${guide} cpp_blocks REGEX "^```cpp( program)?$")
    if(cpp_blocks)
      set(source ${CMAKE_CURRENT_BINARY_DIR}/${name}.cpp)
      add_custom_command(OUTPUT ${source}
        COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/make_program.py ${PROJECT_SOURCE_DIR}/${guide} ${source}
        DEPENDS ${PROJECT_SOURCE_DIR}/${guide} ${CMAKE_CURRENT_LIST_DIR}/make_program.py ${CMAKE_CURRENT_LIST_DIR}/guide_blocks.py)
      add_executable(examples_${name} ${source})
      target_link_libraries(examples_${name} PRIVATE qxcore11e qxcore_options)
      set_target_properties(examples_${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR})
      set(program --program $<TARGET_FILE:examples_${name}>)
    endif()
    add_test(NAME docs.${name} COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/run_examples.py ${program}
      ${PROJECT_SOURCE_DIR}/${guide} ${PROJECT_SOURCE_DIR}/samples/texts/files $<TARGET_FILE:qxtool>
      $<$<BOOL:${WIN32}>:wine>
      COMMAND_EXPAND_LISTS)
    set_tests_properties(docs.${name} PROPERTIES TIMEOUT 300)
  endforeach()
endif()

# The examples of the headers are compiled and run by test_docs.
add_custom_target(header_examples COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/header_examples.py
  ${PROJECT_SOURCE_DIR} ${CMAKE_CURRENT_BINARY_DIR}/header_examples)
add_dependencies(test_docs header_examples)
target_include_directories(test_docs PRIVATE ${CMAKE_CURRENT_BINARY_DIR}/header_examples)
target_sources(test_docs PRIVATE ${CMAKE_CURRENT_LIST_DIR}/../ui/time_limit.cpp)
target_link_libraries(test_docs PRIVATE ZLIB::ZLIB)

# The arrows between folders that docs/architecture.md draws are those of the includes, and nothing goes in circles.
add_test(NAME docs.layers COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/layers_test.py ${PROJECT_SOURCE_DIR})

# The reference pages: a public name without a comment is an error.
if(NOT WIN32)
  find_program(DOXYGEN doxygen)
  if(DOXYGEN)
    add_test(NAME docs.reference COMMAND sh -c "mkdir -p build/docs && '${DOXYGEN}' docs/Doxyfile" WORKING_DIRECTORY ${PROJECT_SOURCE_DIR})
  else()
    add_test(NAME docs.reference COMMAND ${CMAKE_COMMAND} -E echo "left out: the reference pages, because doxygen is not installed")
  endif()
endif()
