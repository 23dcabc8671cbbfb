# The tests of archives compress what the library decompresses.
target_link_libraries(test_stream PRIVATE ZLIB::ZLIB)
