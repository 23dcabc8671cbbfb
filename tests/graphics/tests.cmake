# Servers without a desktop have no X library, so the library must not ask for one.
if(NOT WIN32)
  add_test(NAME graphics.no_x_library COMMAND sh -c "! ldd $<TARGET_FILE:qxcore11e> | grep -E 'libX|libxcb|libcairo|libwayland'")
endif()

# Drawing once more as on processors without the wider instructions.
add_test(NAME graphics.base_processor COMMAND test_graphics --gtest_filter=*Pictures*:*Gradient*)
set_tests_properties(graphics.base_processor PROPERTIES ENVIRONMENT QXCORE_PROCESSOR=base)
