# The tests of archives compress what the library decompresses.
target_link_libraries(test_stream PRIVATE ZLIB::ZLIB)

# The readers once more by the way that processors without AVX-512 take.
add_test(NAME stream.base_processor COMMAND test_stream
  --gtest_filter=Evidence.*:Selection.*:Reading.*:Losses.*:CodePages.*:ProvisionalChoice.*:Positions.*:LongInputs.*:FullUnicode.*:RoundTrips.*)
set_tests_properties(stream.base_processor PROPERTIES ENVIRONMENT QXCORE_PROCESSOR=base)

# An active code page of two bytes, which a process keeps once it has asked for it.
if(NOT WIN32)
  add_test(NAME stream.page.932 COMMAND test_stream --gtest_filter=DoubleByteFiles.*)
  set_tests_properties(stream.page.932 PROPERTIES ENVIRONMENT QXCORE_ACP=932)
endif()
