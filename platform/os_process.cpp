// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/os_process.h"

#include <atomic>
#include <cstdlib>
#include <utility>

#include "platform/os.h"
#include "platform/paths.h"

#ifdef _WIN32
#ifndef NOMINMAX
#define NOMINMAX
#endif
#define WIN32_LEAN_AND_MEAN
#include <windows.h>
#else
#include <array>
#include <cerrno>
#include <climits>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <unordered_map>

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>
#ifdef __linux__
#include <sys/prctl.h>
#endif
extern char** environ;
#endif

namespace tervane::os {

namespace {

/// Requests to end this process: how many since the last look, and what the latest was.
std::atomic<int> g_endRequests{0};
std::atomic<int> g_latestRequest{0};

}  // namespace

DetachedProgram& DetachedProgram::operator=(DetachedProgram&& other) noexcept {
  std::swap(id_, other.id_);
  std::swap(handle_, other.handle_);
  std::swap(end_, other.end_);
  return *this;
}

int TakeEndRequests() { return g_endRequests.exchange(0); }

#ifdef _WIN32

namespace {

std::error_code LastError() { return {static_cast<int>(GetLastError()), std::system_category()}; }

std::wstring Wide(const std::string& path) { return NativePath(path).wstring(); }

/// An argument as the C library of the started program takes it apart again.
void AppendQuoted(std::wstring& line, const std::wstring& argument) {
  line += L'"';
  std::size_t backslashes = 0;
  for (const wchar_t c : argument) {
    if (c == L'"') line.append(backslashes + 1, L'\\');
    backslashes = c == L'\\' ? backslashes + 1 : 0;
    line += c;
  }
  line.append(backslashes, L'\\');
  line += L'"';
}

/// Starts a program; gives its process, whose first thread is in `thread`.
HANDLE Create(const ProgramStart& start, DWORD flags, HANDLE& thread, DWORD& id, std::error_code& error) {
  SECURITY_ATTRIBUTES inheritable{sizeof inheritable, nullptr, TRUE};
  const std::wstring output = start.output.empty() ? L"NUL" : Wide(start.output);
  STARTUPINFOW info{};
  info.cb = sizeof info;
  info.dwFlags = STARTF_USESTDHANDLES;
  info.hStdInput = CreateFileW(L"NUL", GENERIC_READ, 0, &inheritable, OPEN_EXISTING, 0, nullptr);
  info.hStdOutput = CreateFileW(output.c_str(), FILE_APPEND_DATA | SYNCHRONIZE,
                                FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, &inheritable, OPEN_ALWAYS,
                                FILE_ATTRIBUTE_NORMAL, nullptr);
  info.hStdError = info.hStdOutput;
  std::wstring line;
  AppendQuoted(line, Wide(start.program));
  for (const std::string& argument : start.arguments) {
    line += L' ';
    AppendQuoted(line, std::filesystem::u8path(argument).wstring());
  }
  PROCESS_INFORMATION made{};
  const std::wstring folder = Wide(start.folder);
  const bool done = CreateProcessW(Wide(start.program).c_str(), line.data(), nullptr, nullptr, TRUE, flags, nullptr,
                                   folder.empty() ? nullptr : folder.c_str(), &info, &made);
  error = done ? std::error_code() : LastError();
  CloseHandle(info.hStdInput);
  CloseHandle(info.hStdOutput);
  thread = made.hThread;
  id = made.dwProcessId;
  return made.hProcess;
}

std::optional<ProcessEnd> EndOf(HANDLE process) {
  if (!process || WaitForSingleObject(process, 0) == WAIT_TIMEOUT) return std::nullopt;
  DWORD code = 0;
  GetExitCodeProcess(process, &code);
  // Exceptions that nobody caught have this range.
  if (code >= 0xC000'0000) return ProcessEnd{0, static_cast<int>(code)};
  return ProcessEnd{static_cast<int>(code), 0};
}

std::wstring EndEventName(DWORD processId) { return L"Local\\tervane-end-" + std::to_wstring(processId); }

HANDLE g_endEvent = nullptr;

BOOL WINAPI OnConsole(DWORD kind) {
  g_latestRequest = static_cast<int>(kind);
  ++g_endRequests;
  if (g_endEvent) SetEvent(g_endEvent);
  return TRUE;
}

}  // namespace

bool MayStart(const std::string& path) {
  const DWORD attributes = GetFileAttributesW(Wide(path).c_str());
  return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0;
}

std::string SignalText(int signal) {
  return static_cast<DWORD>(signal) == EXCEPTION_ACCESS_VIOLATION ? "access violation" : "exception";
}

DetachedProgram::~DetachedProgram() {
  if (handle_) CloseHandle(handle_);
}

DetachedProgram DetachedProgram::Start(const ProgramStart& start, std::error_code& error) {
  DetachedProgram program;
  HANDLE thread = nullptr;
  DWORD id = 0;
  program.handle_ = Create(start, CREATE_NO_WINDOW | CREATE_NEW_PROCESS_GROUP, thread, id, error);
  if (thread) CloseHandle(thread);
  program.id_ = id;
  return program;
}

bool DetachedProgram::AnnounceWhenReady(const std::string& message) {
  constexpr int kTries = 200;
  constexpr DWORD kPause = 50;
  for (int i = 0; i < kTries; ++i) {
    if (WaitForInputIdle(handle_, kPause) != 0) continue;
    PostMessageW(HWND_BROADCAST, RegisterWindowMessageW(NativePath(message).wstring().c_str()), 0, 0);
    return true;
  }
  return false;
}

std::string RegisteredServerFolder(const std::string& classId) {
  const std::wstring key = L"CLSID\\" + NativePath(classId).wstring() + L"\\LocalServer32";
  wchar_t program[MAX_PATH];
  DWORD size = sizeof program;
  if (RegGetValueW(HKEY_CLASSES_ROOT, key.c_str(), nullptr, RRF_RT_REG_SZ, nullptr, program, &size) != ERROR_SUCCESS)
    return {};
  return std::string(FolderOf(TextOfPath(std::wstring(program))));
}

std::optional<ProcessEnd> DetachedProgram::End() {
  if (!end_) end_ = EndOf(handle_);
  return end_;
}

ProgramTree::~ProgramTree() {
  if (program_) CloseHandle(program_);
  if (job_) CloseHandle(job_);
}

void ProgramTree::Start(const ProgramStart& start, std::error_code& error) {
  job_ = CreateJobObjectW(nullptr, nullptr);
  HANDLE thread = nullptr;
  DWORD id = 0;
  program_ = Create(start, CREATE_SUSPENDED | CREATE_NEW_PROCESS_GROUP, thread, id, error);
  if (error) return;
  id_ = id;
  AssignProcessToJobObject(job_, program_);
  ResumeThread(thread);
  CloseHandle(thread);
}

void ProgramTree::Wait(std::chrono::milliseconds most) {
  const HANDLE handles[] = {program_, g_endEvent};
  WaitForMultipleObjects(g_endEvent ? 2 : 1, handles, FALSE, static_cast<DWORD>(most.count()));
}

const std::optional<ProcessEnd>& ProgramTree::End() {
  if (!end_) end_ = EndOf(program_);
  return end_;
}

std::size_t ProgramTree::Count() {
  JOBOBJECT_BASIC_ACCOUNTING_INFORMATION info{};
  QueryInformationJobObject(job_, JobObjectBasicAccountingInformation, &info, sizeof info, nullptr);
  return info.ActiveProcesses;
}

void ProgramTree::AskToEnd() { GenerateConsoleCtrlEvent(CTRL_BREAK_EVENT, id_); }

void ProgramTree::Kill() { TerminateJobObject(job_, 1); }

void KeepEndRequests() {
  g_endEvent = CreateEventW(nullptr, FALSE, FALSE, EndEventName(GetCurrentProcessId()).c_str());
  SetConsoleCtrlHandler(OnConsole, TRUE);
}

void EndAsRequested() { ExitProcess(static_cast<UINT>(STATUS_CONTROL_C_EXIT)); }

void RequestEnd(std::uint32_t processId) {
  HANDLE event = OpenEventW(EVENT_MODIFY_STATE, FALSE, EndEventName(processId).c_str());
  if (!event) return;
  SetEvent(event);
  CloseHandle(event);
}

void EndGroup(std::uint32_t processId, bool politely) {
  if (politely) {
    GenerateConsoleCtrlEvent(CTRL_BREAK_EVENT, processId);
    return;
  }
  HANDLE process = OpenProcess(PROCESS_TERMINATE, FALSE, processId);
  if (!process) return;
  TerminateProcess(process, 1);
  CloseHandle(process);
}

// ---- Other processes

bool IsProcessAlive(std::uint32_t processId) {
  void* process = OpenProcess(SYNCHRONIZE, FALSE, processId);
  if (!process) return GetLastError() == ERROR_ACCESS_DENIED;
  const bool runs = WaitForSingleObject(process, 0) == WAIT_TIMEOUT;
  CloseHandle(process);
  return runs;
}

std::string ProcessStartTime(std::uint32_t processId) {
  void* process = OpenProcess(PROCESS_QUERY_LIMITED_INFORMATION, FALSE, processId);
  if (!process) return {};
  FILETIME start{}, end{}, kernel{}, user{};
  const bool done = GetProcessTimes(process, &start, &end, &kernel, &user);
  CloseHandle(process);
  return done ? std::to_string((std::uint64_t{start.dwHighDateTime} << 32) | start.dwLowDateTime) : std::string();
}

std::uint32_t ParentOf(std::uint32_t /*processId*/) { return 0; }

#else

namespace {

/// Signal handlers write into it, so that the waiting thread wakes up.
std::array<int, 2> g_wake{-1, -1};

void OnSignal(int signal) {
  const int kept = errno;
  if (signal != SIGCHLD) {
    g_latestRequest = signal;
    ++g_endRequests;
  }
  [[maybe_unused]] const ssize_t written = write(g_wake[1], "", 1);
  errno = kept;
}

void Handle(int number) {
  if (g_wake[0] < 0 && pipe(g_wake.data()) == 0)
    for (const int end : g_wake) {
      fcntl(end, F_SETFD, FD_CLOEXEC);
      fcntl(end, F_SETFL, O_NONBLOCK);
    }
  struct sigaction action {};
  sigaction(number, nullptr, &action);
  if (number != SIGCHLD && action.sa_handler == SIG_IGN) return;
  action = {};
  action.sa_handler = OnSignal;
  action.sa_flags = SA_RESTART | SA_NOCLDSTOP;
  sigaction(number, &action, nullptr);
}

/// Starts a program that has no signal blocked or ignored, whatever this process does with them.
pid_t Spawn(const ProgramStart& start, short group, std::error_code& error) {
  posix_spawn_file_actions_t files;
  posix_spawn_file_actions_init(&files);
  // A file that was replaced by something else meanwhile is refused, and nothing is waited for.
  constexpr int kOutputFlags = O_WRONLY | O_APPEND | O_CREAT | O_NOFOLLOW | O_NONBLOCK;
  const char* output = start.output.empty() ? "/dev/null" : start.output.c_str();
  posix_spawn_file_actions_addopen(&files, 0, "/dev/null", O_RDONLY, 0);
  posix_spawn_file_actions_addopen(&files, 1, output, kOutputFlags, 0666);
  posix_spawn_file_actions_adddup2(&files, 1, 2);
  if (!start.folder.empty()) posix_spawn_file_actions_addchdir_np(&files, start.folder.c_str());

  posix_spawnattr_t attributes;
  posix_spawnattr_init(&attributes);
  sigset_t none, all;
  sigemptyset(&none);
  sigfillset(&all);
  posix_spawnattr_setsigmask(&attributes, &none);
  posix_spawnattr_setsigdefault(&attributes, &all);
  posix_spawnattr_setpgroup(&attributes, 0);
  posix_spawnattr_setflags(&attributes, static_cast<short>(POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF | group));

  std::vector<char*> arguments{const_cast<char*>(start.program.c_str())};
  for (const std::string& argument : start.arguments) arguments.push_back(const_cast<char*>(argument.c_str()));
  arguments.push_back(nullptr);
  pid_t id = 0;
  const int failed = posix_spawn(&id, start.program.c_str(), &files, &attributes, arguments.data(), environ);
  error = {failed, std::generic_category()};
  posix_spawnattr_destroy(&attributes);
  posix_spawn_file_actions_destroy(&files);
  return failed == 0 ? id : 0;
}

ProcessEnd EndOf(int status) {
  if (WIFSIGNALED(status)) return {0, WTERMSIG(status)};
  return {WEXITSTATUS(status), 0};
}

#ifdef __linux__

/// All processes below this one that run; those whose parents have ended are this one's own by then.
std::vector<pid_t> Descendants() {
  std::unordered_multimap<pid_t, pid_t> children;
  std::error_code error;
  for (std::filesystem::directory_iterator entry("/proc", error), end; !error && entry != end; entry.increment(error)) {
    const std::string name = entry->path().filename().string();
    if (name.find_first_not_of("0123456789") != std::string::npos) continue;
    const auto id = static_cast<pid_t>(std::strtol(name.c_str(), nullptr, 10));
    const std::uint32_t parent = ParentOf(static_cast<std::uint32_t>(id));
    if (parent != 0) children.emplace(static_cast<pid_t>(parent), id);
  }
  std::vector<pid_t> found{getpid()};
  for (std::size_t i = 0; i < found.size(); ++i) {
    const auto [begin, end] = children.equal_range(found[i]);
    for (auto child = begin; child != end; ++child) found.push_back(child->second);
  }
  found.erase(found.begin());
  std::erase_if(found, [](pid_t id) { return !IsProcessAlive(static_cast<std::uint32_t>(id)); });
  return found;
}

#endif

}  // namespace

bool MayStart(const std::string& path) {
  struct stat info {};
  return stat(path.c_str(), &info) == 0 && S_ISREG(info.st_mode) &&
         faccessat(AT_FDCWD, path.c_str(), X_OK, AT_EACCESS) == 0;
}

std::string SignalText(int signal) {
  std::string text = strsignal(signal);
  if (!text.empty() && text[0] >= 'A' && text[0] <= 'Z') text[0] = static_cast<char>(text[0] - 'A' + 'a');
  return text;
}

DetachedProgram::~DetachedProgram() = default;

DetachedProgram DetachedProgram::Start(const ProgramStart& start, std::error_code& error) {
  DetachedProgram program;
  program.id_ = static_cast<std::uint32_t>(Spawn(start, POSIX_SPAWN_SETSID, error));
  return program;
}

bool DetachedProgram::AnnounceWhenReady(const std::string& /*message*/) { return true; }

std::string RegisteredServerFolder(const std::string& /*classId*/) { return {}; }

std::optional<ProcessEnd> DetachedProgram::End() {
  int status = 0;
  if (!end_ && id_ != 0 && waitpid(static_cast<pid_t>(id_), &status, WNOHANG) == static_cast<pid_t>(id_))
    end_ = EndOf(status);
  return end_;
}

ProgramTree::~ProgramTree() = default;

void ProgramTree::Start(const ProgramStart& start, std::error_code& error) {
#ifdef __linux__
  prctl(PR_SET_CHILD_SUBREAPER, 1, 0, 0, 0);
#endif
  Handle(SIGCHLD);
  id_ = static_cast<std::uint32_t>(Spawn(start, POSIX_SPAWN_SETPGROUP, error));
}

void ProgramTree::Wait(std::chrono::milliseconds most) {
  pollfd wake{g_wake[0], POLLIN, 0};
  if (poll(&wake, 1, static_cast<int>(most.count())) <= 0) return;
  char bytes[256];
  while (read(g_wake[0], bytes, sizeof bytes) > 0) {
  }
}

const std::optional<ProcessEnd>& ProgramTree::End() {
  int status = 0;
  // All that ended, so that none stays in the table of processes.
  for (pid_t id = waitpid(-1, &status, WNOHANG); id > 0; id = waitpid(-1, &status, WNOHANG))
    if (id == static_cast<pid_t>(id_)) end_ = EndOf(status);
  return end_;
}

std::size_t ProgramTree::Count() {
#ifdef __linux__
  const std::size_t count = Descendants().size();
#else
  const std::size_t count = id_ != 0 && kill(-static_cast<pid_t>(id_), 0) == 0 ? 1 : 0;
#endif
  // Those that have ended do not count, and are to leave the table of processes.
  End();
  return count;
}

void ProgramTree::AskToEnd() {
#ifdef __linux__
  for (const pid_t id : Descendants()) kill(id, SIGTERM);
#else
  EndGroup(id_, true);
#endif
}

void ProgramTree::Kill() {
  // Again and again, since they may start others meanwhile.
  for (int round = 0; round < 200 && Count() > 0; ++round) {
#ifdef __linux__
    for (const pid_t id : Descendants()) kill(id, SIGKILL);
#else
    EndGroup(id_, false);
#endif
    Wait(std::chrono::milliseconds(5));
  }
}

void KeepEndRequests() {
  for (const int signal : {SIGINT, SIGTERM, SIGHUP}) Handle(signal);
}

void EndAsRequested() {
  const int request = g_latestRequest != 0 ? g_latestRequest.load() : SIGTERM;
  signal(request, SIG_DFL);
  raise(request);
  std::_Exit(128 + request);
}

void RequestEnd(std::uint32_t processId) {
  if (processId != 0) kill(static_cast<pid_t>(processId), SIGTERM);
}

void EndGroup(std::uint32_t processId, bool politely) {
  // 0 and 1 would be the own group and everybody's.
  if (processId > 1) kill(-static_cast<pid_t>(processId), politely ? SIGTERM : SIGKILL);
}

// ---- Other processes

namespace {

/// A field of what the system tells of a process, from 3 on; empty where it tells nothing.
std::string StatusField(std::uint32_t processId, int wanted) {
  std::ifstream file("/proc/" + std::to_string(processId) + "/stat");
  std::string text;
  std::getline(file, text, '\0');
  // The second field is the program's name in parentheses, which may itself hold blanks and parentheses.
  const std::size_t nameEnd = text.rfind(')');
  if (nameEnd == std::string::npos) return {};
  std::istringstream fields(text.substr(nameEnd + 1));
  std::string field;
  for (int number = 3; number <= wanted; ++number) fields >> field;
  return fields ? field : std::string();
}

}  // namespace

bool IsProcessAlive(std::uint32_t processId) {
  if (processId == 0 || processId > static_cast<std::uint32_t>(INT_MAX)) return false;
  if (kill(static_cast<pid_t>(processId), 0) != 0 && errno != EPERM) return false;
  // One that has ended stays in the table until its parent asks how it went.
  constexpr int kState = 3;
  const std::string state = StatusField(processId, kState);
  return state != "Z" && state != "X";
}

std::string ProcessStartTime(std::uint32_t processId) {
  constexpr int kStartTime = 22;
  const std::string field = StatusField(processId, kStartTime);
  // It counts from the start of the machine.
  std::string boot;
  std::ifstream("/proc/sys/kernel/random/boot_id") >> boot;
  return field.empty() ? std::string() : field + " " + boot;
}

std::uint32_t ParentOf(std::uint32_t processId) {
  constexpr int kParent = 4;
  return static_cast<std::uint32_t>(std::strtoul(StatusField(processId, kParent).c_str(), nullptr, 10));
}

#endif

}  // namespace tervane::os
