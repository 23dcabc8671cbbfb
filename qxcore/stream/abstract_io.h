// The names that readers and writers of text share. Threads: nothing here is changed at run time.
#pragma once

class SAbstractIO {
 public:
  class SIOSeekableCharReader;  // characters with positions: seekable_char_reader.h
  class SMultiFormatSupport;    // encodings and their names: multi_format_support.h
};
