# Servers without a desktop have no X library, so the library must not ask for one.
if(NOT WIN32)
  add_test(NAME graphics.no_x_library COMMAND sh -c "! ldd $<TARGET_FILE:qxcore11e> | grep -E 'libX|libxcb|libcairo|libwayland'")
endif()
