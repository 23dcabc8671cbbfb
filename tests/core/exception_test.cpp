// Codes, texts and classes of the exceptions; targets and their catchers.

#include "qxcore/core/exception.h"

#include <cerrno>
#include <memory>

#include "qxcore/core/error_cause.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/throw_target.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/stream/output_file.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/text.h"

namespace {

template <class Exception>
void Expect(std::uint32_t code, const WCHAR* text, const WCHAR* name) {
  bool caught = false;
  try {
    throw Exception();
  } catch (const SException& thrown) {
    caught = true;
    EXPECT_EQ(static_cast<std::uint32_t>(thrown.GetCode()), code);
    EXPECT_EQ(SString(thrown.GetText()), text);
    EXPECT_EQ(SString(thrown.GetExceptionName()), name);
  }
  EXPECT_TRUE(caught);
}

TEST(Exceptions, EachHasItsCodeTextAndName) {
  Expect<SEEOFException>(0x80990041, WTEXT("Unexpected end of file."), WTEXT("SEEOFException"));
  Expect<SEIODiskFullException>(0x80990042, WTEXT("Disk Full."), WTEXT("SEIODiskFullException"));
  Expect<SEIOAbortedException>(0x80004004, WTEXT("User aborted."), WTEXT("SEIOAbortedException"));
  Expect<SEIOCantOpenForWriting>(0x80990051, WTEXT("Cannot open for writing"), WTEXT("SEIOCantOpenForWriting"));
  Expect<SEIOResetInvalid>(0x80990055, WTEXT("Resetting to invalid mark"), WTEXT("SEIOResetInvalid"));
  Expect<SEEncodingException>(0x80990056, WTEXT("Unexpected UTF encoding!"), WTEXT("SEEncodingException"));
  Expect<SEIONoUnicodeBOM>(0x80990057, WTEXT("There is no known Unicode BOM (Byte Order Mark) in input"),
                           WTEXT("SEIONoUnicodeBOM"));
  Expect<SEIONonASCII>(0x8099005B, WTEXT("Illegal non ASCII character"), WTEXT("SEIONonASCII"));
  Expect<SEIOCantMap_UTF16_UTF8>(
      0x80990066,
      WTEXT(
          "Some characters could not be mapped through UTF-16 --> UTF8 conversion (would cause a loss of information)"),
      WTEXT("SEIOCantMap_UTF16_UTF8"));
  EXPECT_THROW(throw SEEOFException(), SEIOException);
  EXPECT_THROW(throw SEIOMismatchedBOM(), SEEncodingException);
}

template <class... Exceptions>
void ExpectOwnTexts() {
  std::set<std::uint32_t> codes;
  std::set<std::basic_string<WCHAR>> texts;
  const auto add = [&](const SException& made) {
    codes.insert(static_cast<std::uint32_t>(made.GetCode()));
    texts.insert(made.GetText());
  };
  (add(Exceptions()), ...);
  EXPECT_EQ(codes.size(), sizeof...(Exceptions));
  EXPECT_EQ(texts.size(), sizeof...(Exceptions));
}

TEST(Exceptions, NoTwoShareACodeOrAText) {
  ExpectOwnTexts<SEEOFException, SEIODiskFullException, SEIOAbortedException, SEIOCantOpenForReading,
                 SEIOCantOpenForWriting, SEIOWriteFailed, SEIOCouldNotTrunc, SEIOPushBackFull, SEIOResetInvalid,
                 SEIONoUnicodeBOM, SEIOMismatchedBOM, SEIODetectFailed, SEIOInvalidEncoding, SEIONonASCII,
                 SEIOCantMap_OEM_UTF16, SEIOCantMap_UTF8_UTF16, SEIOCantMap_MBCS_UTF16, SEIOCantMap_OEM_MBCS,
                 SEIOCantMap_UTF16_MBCS, SEIOCantMap_UTF16_UTF8>();
}

TEST(Exceptions, IOException_TellsErrno) {
  errno = ENOENT;
  SEIOException thrown;
  EXPECT_EQ(static_cast<std::uint32_t>(thrown.GetCode()), 0x80990040u);
  EXPECT_EQ(SString(thrown.GetText()), WTEXT("No such file or directory"));
}

TEST(Exceptions, OutOfMemory_AsksTheSystemForItsText) {
  try {
    throw SEOutOfMemory();
  } catch (const SECOMException& thrown) {
    EXPECT_EQ(thrown.GetCode(), E_OUTOFMEMORY);
    EXPECT_NE(SString(thrown.GetText()).FindNoCase(WTEXT("memory")), nullptr);
  }
  SECOMException given(E_OUTOFMEMORY, WTEXT("given"));
  EXPECT_EQ(SString(given.GetText()), WTEXT("given"));
  SEWinError error(ERROR_FILE_NOT_FOUND);
  SString text = error.GetText();
  EXPECT_FALSE(text.IsEmpty());
  EXPECT_NE(text.GetAt(text.Length() - 1), WTEXT('\n'));
}

class Catcher : public SThrowTarget {
 public:
  using SThrowTarget::Activate;
  using SThrowTarget::SThrowTarget;
};

TEST(ThrowTargets, NestedCatchersAreCounted) {
  STargetedException abort(WTEXT("Scripting,DlgAbort"), WTEXT("text"));
  EXPECT_EQ(abort.HasTarget(), 0);
  Catcher outer(WTEXT("Scripting"));
  outer.Activate();
  outer.Activate();
  EXPECT_EQ(abort.HasTarget(), 1);
  {
    Catcher inner(WTEXT("Other,Scripting"));
    inner.Activate();
    outer.Done();
    outer.Done();
    EXPECT_EQ(abort.HasTarget(), 1);
  }
  EXPECT_EQ(abort.HasTarget(), 0);
  EXPECT_EQ(abort.GetMessageText(), WTEXT("text"));
  EXPECT_EQ(abort.GetValue(), 0);
}

// Done must not need memory: it is called while unwinding.
TEST(ThrowTargets, WithoutMemory_CountsStayRight) {
  // Longer than what lies ready in pools.
  const SString longName{SStringView(WideString(5000, WTEXT('n')))};
  const SString names = longName + WTEXT(",Second,Second");
  STargetedException abort(names, WTEXT(""));
  const int failures = WithEachAllocationFailing(
      [&] {
        Catcher catcher(names);
        catcher.Activate();
        catcher.Done();
        catcher.Activate();
      },
      [&] { EXPECT_EQ(abort.HasTarget(), 0); });
  EXPECT_GT(failures, 0);
  Catcher catcher(WTEXT("Second,Second"));
  catcher.Activate();
  SMemFailAt(1, true);
  catcher.Done();
  SMemFailAt(0);
  EXPECT_EQ(abort.HasTarget(), 0);
  catcher.Activate();
  EXPECT_EQ(abort.HasTarget(), 1);
}

TEST(Exceptions, CarryTheErrorBehindThem) {
  const auto causeOf = [](auto&& operation) {
    try {
      operation();
    } catch (const SEIOException& failure) {
      return SGetErrorCause(failure);
    }
    return -1;
  };
  EXPECT_EQ(causeOf([] { SInputFile file(SString(WTEXT("C:\\no\\such\\file"))); }), ENOENT);
  EXPECT_EQ(causeOf([] { SInputFile file(SString(WTEXT("C:\\"))); }), EACCES);
  EXPECT_EQ(causeOf([] { SOutputFile file(SString(WTEXT("C:\\no\\such\\file"))); }), ENOENT);
  EXPECT_EQ(causeOf([] { throw SEIOCantOpenForReading(); }), 0);
}

TEST(ThrowTargets, Match_LooksAtTheEndOfNamesOnly) {
  STargetedException abort(WTEXT("Abort,Stop"), WTEXT(""));
  EXPECT_EQ(abort.Match(Catcher(WTEXT("Abort"))), 1);
  EXPECT_EQ(abort.Match(Catcher(WTEXT("XAbort,Y"))), 1) << "meant";
  EXPECT_EQ(abort.Match(Catcher(WTEXT("AbortX"))), 0);
  EXPECT_EQ(abort.Match(Catcher(WTEXT("AbortX,Abort"))), 1);
  EXPECT_EQ(abort.Match(Catcher(WTEXT("A,B"))), 0);
}

}  // namespace
