// qxtool: the library's services for files on the command line.

#include <cstdlib>

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/qxtool/command_line.h"

int main(int argc, char** argv) {
  console::SetUp();
  try {
    int code = RunCommandLine(console::Arguments(argc, argv));
    FlushPrinted();
    return code;
  } catch (const BrokenPipe&) {
    // The buffered rest has no reader, either; leave without trying to write it.
    std::_Exit(kDone);
  } catch (const SEIOAbortedException&) {
    Complain("cancelled");
    return console::InterruptedCode();
  } catch (const Failure& failure) {
    Complain(failure.place.empty() ? failure.text : failure.place + ": " + failure.text);
    return failure.code;
  } catch (...) {
    Complain(ReasonOfCurrentException());
    return kFailed;
  }
}
