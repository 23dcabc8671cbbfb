# Real documents, converted in a process each.
add_executable(rtf_converter rtf/rtf_converter.cpp)
target_link_libraries(rtf_converter PRIVATE qxcore11e qxcore_options)
target_include_directories(rtf_converter PRIVATE ${PROJECT_SOURCE_DIR})
set_target_properties(rtf_converter PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR})
find_package(Python3 REQUIRED COMPONENTS Interpreter)
add_test(NAME rtf.corpus COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/corpus_test.py $<TARGET_FILE:rtf_converter>
  $<$<BOOL:${WIN32}>:wine>
  COMMAND_EXPAND_LISTS)
set_tests_properties(rtf.corpus PROPERTIES TIMEOUT 900)
