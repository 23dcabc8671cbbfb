#include "tools/common/console.h"

#include <cctype>
#include <cerrno>
#include <csignal>
#include <cstdlib>

#include "qxcore/system/file/file.h"

#ifdef _WIN32
#include "qxcore/platform/win32.h"
// Order matters: these need windows.h.
#include <fcntl.h>
#include <io.h>
#include <shellapi.h>
#include <sys/stat.h>
#else
#include <fcntl.h>
#include <unistd.h>

#include <thread>
#endif

namespace console {
namespace {

// By the custom of shells, what a program that was ended by a signal exits with.
constexpr int kSignalBase = 128;

volatile std::sig_atomic_t g_signal = 0;  // that asked for the end; 0: none

#ifdef _WIN32

const WCHAR* volatile g_removeWhenKilled = nullptr;
void (*volatile g_wake)() = nullptr;
UINT g_outputCodePage = 0;

BOOL WINAPI OnConsoleEvent(DWORD event) {
  const bool isBreak = event == CTRL_C_EVENT || event == CTRL_BREAK_EVENT;
  // The system ends the process when it comes back from here with the others: the window was closed.
  if (g_signal != 0 || !isBreak) {
    if (g_removeWhenKilled) DeleteFileW(g_removeWhenKilled);
    ExitProcess(static_cast<UINT>(kSignalBase + (isBreak ? SIGINT : SIGTERM)));
  }
  g_signal = SIGINT;
  if (g_wake != nullptr) g_wake();
  return TRUE;
}

void RestoreConsole() { SetConsoleOutputCP(g_outputCodePage); }

#else

const char* volatile g_removeWhenKilled = nullptr;
int g_wakePipe[2] = {-1, -1};  // a handler may do little more than write to it

void OnSignal(int number) {
  if (g_signal != 0) {
    if (g_removeWhenKilled) unlink(g_removeWhenKilled);
    _exit(kSignalBase + number);
  }
  g_signal = number;
  const int former = errno;
  [[maybe_unused]] const ssize_t written = g_wakePipe[1] < 0 ? 0 : write(g_wakePipe[1], "", 1);
  errno = former;
}

#endif

// The runtime's own buffers are as small as a block of the disk. One file at a time is written beside standard output.
std::FILE* WithLargeBuffer(std::FILE* file) {
  constexpr std::size_t kSize = 1 << 16;
  static char buffers[2][kSize];
  if (file != nullptr) std::setvbuf(file, buffers[file == stdout], _IOFBF, kSize);
  return file;
}

}  // namespace

bool Interrupted() { return g_signal != 0; }

int InterruptedCode() { return kSignalBase + (g_signal != 0 ? g_signal : SIGINT); }

void RemoveWhenKilled(const std::filesystem::path* path) { g_removeWhenKilled = path ? path->c_str() : nullptr; }

#ifdef _WIN32

void SetUpStreams() {
  _setmode(_fileno(stdin), _O_BINARY);
  _setmode(_fileno(stdout), _O_BINARY);
  _setmode(_fileno(stderr), _O_BINARY);
  if (!IsTerminal(stdout)) WithLargeBuffer(stdout);
  if (IsTerminal(stdout) || IsTerminal(stderr)) {
    g_outputCodePage = GetConsoleOutputCP();
    if (g_outputCodePage && SetConsoleOutputCP(CP_UTF8)) std::atexit(RestoreConsole);
  }
}

void SetUp() {
  SetUpStreams();
  SetConsoleCtrlHandler(OnConsoleEvent, TRUE);
}

void WakeWhenInterrupted(void (*wake)()) { g_wake = wake; }

void WantScreen() {}

std::vector<std::string> Arguments(int, char**) {
  // The narrow arguments have lost what the ANSI code page lacks.
  std::vector<std::string> arguments;
  int count = 0;
  WCHAR** wide = CommandLineToArgvW(GetCommandLineW(), &count);
  for (int i = 1; wide && i < count; ++i) {
    int size = WideCharToMultiByte(CP_UTF8, 0, wide[i], -1, nullptr, 0, nullptr, nullptr);
    std::string& argument = arguments.emplace_back(static_cast<std::size_t>(size > 0 ? size - 1 : 0), '\0');
    WideCharToMultiByte(CP_UTF8, 0, wide[i], -1, argument.data(), size, nullptr, nullptr);
  }
  LocalFree(wide);
  return arguments;
}

bool IsTerminal(std::FILE* stream) { return _isatty(_fileno(stream)) != 0; }

// The runtime has no number of its own for a pipe that is being closed and says EINVAL.
bool IsBrokenPipe(int error) { return error == EPIPE || error == EINVAL; }

std::FILE* OpenForWriting(const std::filesystem::path& path) { return WithLargeBuffer(_wfopen(path.c_str(), L"wb")); }

std::FILE* OpenNew(const std::filesystem::path& path, bool) {
  const int file = _wopen(path.c_str(), _O_WRONLY | _O_CREAT | _O_EXCL | _O_BINARY, _S_IREAD | _S_IWRITE);
  return file < 0 ? nullptr : WithLargeBuffer(_fdopen(file, "wb"));
}

bool Synchronise(std::FILE* file) { return std::fflush(file) == 0 && _commit(_fileno(file)) == 0; }

#else

void WantScreen() { setenv("QXCORE_DISPLAY", "sdl", 0); }

void SetUpStreams() {
  std::signal(SIGPIPE, SIG_IGN);
  if (!IsTerminal(stdout)) WithLargeBuffer(stdout);
}

void SetUp() {
  SetUpStreams();
  // Without SA_RESTART a read that waits for a person ends, too.
  struct sigaction action = {};
  action.sa_handler = OnSignal;
  sigaction(SIGINT, &action, nullptr);
  sigaction(SIGTERM, &action, nullptr);
  // Who started the tool with nohup wants it to go on when the terminal is gone.
  struct sigaction former = {};
  if (sigaction(SIGHUP, nullptr, &former) == 0 && former.sa_handler != SIG_IGN) sigaction(SIGHUP, &action, nullptr);
}

void WakeWhenInterrupted(void (*wake)()) {
  if (pipe2(g_wakePipe, O_CLOEXEC) != 0) return;
  std::thread([wake] {
    for (char byte; read(g_wakePipe[0], &byte, 1) == 1;) wake();
  }).detach();
}

std::vector<std::string> Arguments(int argc, char** argv) { return {argv + (argc > 0 ? 1 : 0), argv + argc}; }

bool IsTerminal(std::FILE* stream) { return isatty(fileno(stream)) != 0; }

bool IsBrokenPipe(int error) { return error == EPIPE; }

std::FILE* OpenForWriting(const std::filesystem::path& path) { return WithLargeBuffer(std::fopen(path.c_str(), "wb")); }

std::FILE* OpenNew(const std::filesystem::path& path, bool isPrivate) {
  const int file = open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, isPrivate ? 0600 : 0666);
  return file < 0 ? nullptr : WithLargeBuffer(fdopen(file, "wb"));
}

bool Synchronise(std::FILE* file) {
  if (std::fflush(file) != 0) return false;
  // A pipe or a device cannot be synchronised, and need not be.
  return fsync(fileno(file)) == 0 || errno == EINVAL || errno == EROFS || errno == ENOTSUP;
}

#endif

namespace {

bool HasDrive(const std::string& text) {
  return text.size() >= 3 && std::isalpha(static_cast<unsigned char>(text[0])) != 0 && text[1] == ':' &&
         (text[2] == '\\' || text[2] == '/');
}

}  // namespace

SString NameOf(const std::string& argument) {
  const SString native = SFile::FromNative(argument);
  return HasDrive(argument) && !SFile::Exists(native) ? SString::FromUtf8(argument) : native;
}

std::string NativeOf(const std::string& argument) { return SFile::ToNative(NameOf(argument)); }

#ifdef _WIN32
std::filesystem::path PathOf(const std::string& native) {
  return std::filesystem::path(std::u8string(native.begin(), native.end()));
}
#else
std::filesystem::path PathOf(const std::string& native) { return std::filesystem::path(native); }
#endif

}  // namespace console
