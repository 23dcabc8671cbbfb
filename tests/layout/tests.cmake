target_sources(test_layout PRIVATE ${CMAKE_CURRENT_LIST_DIR}/pane_view.cpp
  ${CMAKE_CURRENT_LIST_DIR}/../ui/time_limit.cpp)
