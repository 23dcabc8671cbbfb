# The script of the project itself, with a package manager that only writes down what it is asked for.
if(NOT WIN32)
  find_package(Python3 REQUIRED COMPONENTS Interpreter)
  add_test(NAME dev.set_up COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/set_up_test.py ${PROJECT_SOURCE_DIR}/dev)
endif()
