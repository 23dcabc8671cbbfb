# The installed package, moved and used from outside. A build with sanitizers is not for others to link.
if(CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  return()
endif()
find_package(Python3 REQUIRED COMPONENTS Interpreter)
set(package_kinds cmake pkgconfig headers)
if(WIN32)
  set(package_kinds cmake imports headers)
endif()
foreach(kind ${package_kinds})
  add_test(NAME package.${kind} COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/package_test.py
    ${kind} ${PROJECT_SOURCE_DIR} ${PROJECT_BINARY_DIR} ${CMAKE_TOOLCHAIN_FILE})
  set_tests_properties(package.${kind} PROPERTIES TIMEOUT 300)
endforeach()

# What the library exports is what its installed headers declare.
find_program(DOXYGEN doxygen)
if(DOXYGEN)
  add_test(NAME package.exports COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/exports_test.py
    ${PROJECT_SOURCE_DIR} ${PROJECT_BINARY_DIR} $<TARGET_FILE:qxcore11e>)
  set_tests_properties(package.exports PROPERTIES TIMEOUT 300)
else()
  add_test(NAME package.exports COMMAND ${CMAKE_COMMAND} -E echo "left out: the exported names, because doxygen is not installed")
endif()
