# The common controls are asked for by name.
if(WIN32)
  target_link_libraries(test_window PRIVATE comctl32)
endif()
