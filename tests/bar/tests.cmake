target_sources(test_bar PRIVATE ${CMAKE_CURRENT_LIST_DIR}/../ui/time_limit.cpp)
if(WIN32)
  target_link_libraries(test_bar PRIVATE comctl32 gdi32)
endif()
