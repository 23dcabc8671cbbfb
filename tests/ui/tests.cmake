target_sources(test_ui PRIVATE ${CMAKE_CURRENT_LIST_DIR}/time_limit.cpp)

# A handler of a wrong shape does not compile: each case is compiled on its own.
find_package(Python3 REQUIRED COMPONENTS Interpreter)
add_test(NAME ui.compile_fail COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/compile_fail.py
  ${PROJECT_SOURCE_DIR} ${CMAKE_CURRENT_LIST_DIR}/compile_fail.cpp ${CMAKE_CXX_COMPILER})
