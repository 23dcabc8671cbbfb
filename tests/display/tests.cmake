# The screen of an X server, where its module is built. It is no unit test program: it needs a server of its own.
if(TARGET qxcore-display-sdl)
  add_executable(test_screen ${CMAKE_CURRENT_LIST_DIR}/screen.cpp ${CMAKE_CURRENT_LIST_DIR}/x_client.cpp
    ${CMAKE_CURRENT_LIST_DIR}/../ui/time_limit.cpp)
  target_link_libraries(test_screen PRIVATE qxcore_test_main X11::X11 ${CMAKE_DL_LIBS})
  set_target_properties(test_screen PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR})
  add_dependencies(test_screen qxcore-display-sdl)
  find_package(Python3 REQUIRED COMPONENTS Interpreter)
  add_test(NAME screen COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/screen_test.py $<TARGET_FILE:test_screen>)
elseif(NOT WIN32)
  add_test(NAME screen COMMAND ${CMAKE_COMMAND} -E echo "left out: the screen of an X server, because libsdl2-dev is not installed")
endif()
