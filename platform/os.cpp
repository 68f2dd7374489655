// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/os.h"

#include <filesystem>
#include <utility>

#include "platform/beside_program.h"

#ifdef _WIN32
#ifndef NOMINMAX
#define NOMINMAX
#endif
#define WIN32_LEAN_AND_MEAN
#include <algorithm>
#include <clocale>

#include <windows.h>
// Behind windows.h, on which they depend.
#include <lmcons.h>
#include <psapi.h>

#include "platform/paths.h"
#else
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <memory>
#include <sstream>
#include <string_view>
#include <vector>

#include <cxxabi.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <locale.h>
#include <poll.h>
#include <pwd.h>
#include <signal.h>
#include <sys/file.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>
#ifdef __linux__
#include <sys/xattr.h>
#endif
#endif

namespace tervane::os {

namespace {

/// Closes what is no regular file, and says so.
void RefuseUnlessRegular(File& file, std::error_code& error) {
  const File::Status status = file.GetStatus(error);
  if (!error && !status.isRegular) error = std::make_error_code(std::errc::invalid_argument);
  if (error) file = File();
}

}  // namespace

#ifdef _WIN32

namespace {

std::error_code LastError() { return {static_cast<int>(GetLastError()), std::system_category()}; }

void SetError(bool done, std::error_code& error) { error = done ? std::error_code() : LastError(); }

std::wstring Wide(const std::string& path) { return NativePath(path).wstring(); }

constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

}  // namespace

void PrepareProcess() {
  // A missing disk is an error of the call, not a window.
  SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX);
}

// A closed pipe shows at the next write alone.
bool IsOutputClosed() { return GetLastError() == ERROR_NO_DATA || GetLastError() == ERROR_BROKEN_PIPE; }

File::File(File&& other) noexcept : handle_(std::exchange(other.handle_, nullptr)) {}

File& File::operator=(File&& other) noexcept {
  std::swap(handle_, other.handle_);
  return *this;
}

File::~File() {
  if (handle_) CloseHandle(handle_);
}

File File::OpenForReading(const std::string& path, std::error_code& error, Links links) {
  File file;
  // The flag lets a folder be opened, so that its status can tell what it is.
  const DWORD flags = FILE_FLAG_BACKUP_SEMANTICS | (links == Links::Refuse ? FILE_FLAG_OPEN_REPARSE_POINT : 0);
  void* handle = CreateFileW(Wide(path).c_str(), GENERIC_READ, kShareAll, nullptr, OPEN_EXISTING, flags, nullptr);
  SetError(handle != INVALID_HANDLE_VALUE, error);
  if (!error) file.handle_ = handle;
  return file;
}

File File::CreateNew(const std::string& path, Access, std::error_code& error) {
  // Access rights come from the folder.
  File file;
  void* handle = CreateFileW(Wide(path).c_str(), GENERIC_READ | GENERIC_WRITE, kShareAll, nullptr, CREATE_NEW,
                             FILE_ATTRIBUTE_NORMAL, nullptr);
  SetError(handle != INVALID_HANDLE_VALUE, error);
  if (!error) file.handle_ = handle;
  return file;
}

File File::OpenOrCreate(const std::string& path, std::error_code& error) {
  File file;
  void* handle = CreateFileW(Wide(path).c_str(), GENERIC_READ | GENERIC_WRITE, kShareAll, nullptr, OPEN_ALWAYS,
                             FILE_ATTRIBUTE_NORMAL | FILE_FLAG_OPEN_REPARSE_POINT, nullptr);
  SetError(handle != INVALID_HANDLE_VALUE, error);
  if (!error) file.handle_ = handle;
  if (!error) RefuseUnlessRegular(file, error);
  return file;
}

bool File::IsOpen() const { return handle_ != nullptr; }

std::size_t File::Read(char* buffer, std::size_t size, std::error_code& error) {
  DWORD done = 0;
  const DWORD most = static_cast<DWORD>(std::min<std::size_t>(size, 1u << 30));
  SetError(ReadFile(handle_, buffer, most, &done, nullptr), error);
  return done;
}

void File::WriteAll(std::string_view bytes, std::error_code& error) {
  error.clear();
  while (!bytes.empty() && !error) {
    DWORD done = 0;
    const DWORD most = static_cast<DWORD>(std::min<std::size_t>(bytes.size(), 1u << 30));
    SetError(WriteFile(handle_, bytes.data(), most, &done, nullptr), error);
    if (!error && done == 0) error = std::make_error_code(std::errc::io_error);
    bytes.remove_prefix(done);
  }
}

void File::Seek(std::uint64_t place, std::error_code& error) {
  LARGE_INTEGER distance{};
  distance.QuadPart = static_cast<LONGLONG>(place);
  SetError(SetFilePointerEx(handle_, distance, nullptr, FILE_BEGIN), error);
}

void File::Flush(std::error_code& error) { SetError(FlushFileBuffers(handle_), error); }

void File::Close(std::error_code& error) { SetError(CloseHandle(std::exchange(handle_, nullptr)), error); }

File::Status File::GetStatus(std::error_code& error) const {
  BY_HANDLE_FILE_INFORMATION info{};
  SetError(GetFileInformationByHandle(handle_, &info), error);
  Status status;
  status.isFolder = (info.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  status.isRegular = !error && !status.isFolder && GetFileType(handle_) == FILE_TYPE_DISK;
  status.size = (std::uint64_t{info.nFileSizeHigh} << 32) | info.nFileSizeLow;
  status.links = info.nNumberOfLinks;
  status.volume = info.dwVolumeSerialNumber;
  status.number = (std::uint64_t{info.nFileIndexHigh} << 32) | info.nFileIndexLow;
  return status;
}

bool File::TryLock(std::error_code& error) {
  // One byte far behind the end, since nobody could read a locked one.
  OVERLAPPED place{};
  place.OffsetHigh = 0x7FFF'FFFF;
  const bool done = LockFileEx(handle_, LOCKFILE_EXCLUSIVE_LOCK | LOCKFILE_FAIL_IMMEDIATELY, 0, 1, 0, &place);
  SetError(done || GetLastError() == ERROR_LOCK_VIOLATION, error);
  return done;
}

void File::TakeAttributesOf(const File& other, std::string&, std::error_code& error) {
  // Access rights are those of the folder; hidden and the like are kept.
  FILE_BASIC_INFO info{};
  SetError(GetFileInformationByHandleEx(other.handle_, FileBasicInfo, &info, sizeof info), error);
  if (error) return;
  FILE_BASIC_INFO onlyAttributes{};
  onlyAttributes.FileAttributes = info.FileAttributes;
  SetError(SetFileInformationByHandle(handle_, FileBasicInfo, &onlyAttributes, sizeof onlyAttributes), error);
}

bool MayWrite(const std::string& path, std::error_code& error) {
  const DWORD attributes = GetFileAttributesW(Wide(path).c_str());
  SetError(attributes != INVALID_FILE_ATTRIBUTES, error);
  return !error && (attributes & FILE_ATTRIBUTE_READONLY) == 0;
}

void RenameOver(const std::string& from, const std::string& to, std::error_code& error) {
  SetError(MoveFileExW(Wide(from).c_str(), Wide(to).c_str(), MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH),
           error);
}

void RenameToNew(const std::string& from, const std::string& to, std::error_code& error) {
  SetError(MoveFileExW(Wide(from).c_str(), Wide(to).c_str(), MOVEFILE_WRITE_THROUGH), error);
}

void FlushFolder(const std::string&, std::error_code& error) {
  // MOVEFILE_WRITE_THROUGH has done it.
  error.clear();
}

CLocaleScope::CLocaleScope() : perThread_(_configthreadlocale(_ENABLE_PER_THREAD_LOCALE)) {
  if (const char* locale = std::setlocale(LC_ALL, nullptr)) before_ = locale;
  std::setlocale(LC_ALL, "C");
}

CLocaleScope::~CLocaleScope() {
  std::setlocale(LC_ALL, before_.c_str());
  _configthreadlocale(perThread_);
}

namespace {

std::string PathOfModule(HMODULE module) {
  std::wstring path(32768, L'\0');
  path.resize(GetModuleFileNameW(module, path.data(), static_cast<DWORD>(path.size())));
  return TextOfPath(path);
}

}  // namespace

std::string ProgramPath() { return PathOfModule(nullptr); }

std::string CodePath() {
  HMODULE module = nullptr;
  GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                     reinterpret_cast<LPCWSTR>(&CodePath), &module);
  return PathOfModule(module);
}

void* LoadSharedLibrary(const std::string& path, std::string& reason) {
  // Libraries that it needs are looked for beside it too.
  void* const library = LoadLibraryExW(Wide(path).c_str(), nullptr, LOAD_WITH_ALTERED_SEARCH_PATH);
  if (library == nullptr) reason = LastError().message();
  return library;
}

void* FunctionOf(void* library, const char* name) {
  return reinterpret_cast<void*>(GetProcAddress(static_cast<HMODULE>(library), name));
}

std::string SharedLibraryName(std::string_view name) { return std::string(name) + ".dll"; }

std::string DemangledName(const std::type_info& type) {
  // "class tervane::CGlobal"
  const std::string_view name = type.name();
  return std::string(name.substr(name.rfind(' ') + 1));
}

std::uint32_t ProcessId() { return GetCurrentProcessId(); }

std::string UserName() {
  wchar_t name[UNLEN + 1];
  DWORD size = UNLEN + 1;
  return GetUserNameW(name, &size) ? TextOfPath(std::wstring(name)) : std::string();
}

std::string HostName() {
  wchar_t name[MAX_COMPUTERNAME_LENGTH + 1];
  DWORD size = MAX_COMPUTERNAME_LENGTH + 1;
  return GetComputerNameW(name, &size) ? TextOfPath(std::wstring(name, size)) : std::string();
}

std::uint64_t ResidentMemory() {
  PROCESS_MEMORY_COUNTERS counters{};
  return GetProcessMemoryInfo(GetCurrentProcess(), &counters, sizeof counters) ? counters.WorkingSetSize : 0;
}

std::uint64_t PeakResidentMemory() {
  PROCESS_MEMORY_COUNTERS counters{};
  return GetProcessMemoryInfo(GetCurrentProcess(), &counters, sizeof counters) ? counters.PeakWorkingSetSize : 0;
}

// Large pages need a privilege here that users do not have.
void PreferLargePages(void*, std::size_t) {}

#else

namespace {

std::error_code LastError() { return {errno, std::generic_category()}; }

/// Repeats a call that a signal interrupted.
template <typename Call>
auto Uninterrupted(Call call) {
  auto result = call();
  while (result < 0 && errno == EINTR) result = call();
  return result;
}

/// Calls and tells the outcome.
template <typename Call>
auto Checked(std::error_code& error, Call call) {
  const auto result = Uninterrupted(call);
  error = result < 0 ? LastError() : std::error_code();
  return result;
}

void NoteNotKept(std::string_view what, std::string& notKept) {
  if (!notKept.empty()) notKept += ", ";
  notKept += what;
}

#ifdef __linux__

constexpr const char* kAccessControlList = "system.posix_acl_access";

/// The value of an extended attribute, or nothing when there is none (an empty value cannot be told from it: both need
/// no care here).
std::vector<char> AttributeValue(int descriptor, const char* name) {
  for (;;) {
    const ssize_t size = fgetxattr(descriptor, name, nullptr, 0);
    if (size <= 0) return {};
    std::vector<char> value(static_cast<std::size_t>(size));
    const ssize_t read = fgetxattr(descriptor, name, value.data(), value.size());
    if (read >= 0) {
      value.resize(static_cast<std::size_t>(read));
      return value;
    }
    if (errno != ERANGE) return {};
  }
}

/// The names of all extended attributes, each with a zero behind.
std::vector<char> AttributeNames(int descriptor) {
  for (;;) {
    const ssize_t size = flistxattr(descriptor, nullptr, 0);
    if (size <= 0) return {};
    std::vector<char> names(static_cast<std::size_t>(size));
    const ssize_t read = flistxattr(descriptor, names.data(), names.size());
    if (read >= 0) {
      names.resize(static_cast<std::size_t>(read));
      return names;
    }
    if (errno != ERANGE) return {};
  }
}

void CopyExtendedAttributes(int from, int to, std::string& notKept) {
  // What the folder's default list gave to the new file could let in more people than the old file did.
  fremovexattr(to, kAccessControlList);
  const std::vector<char> names = AttributeNames(from);
  for (std::size_t begin = 0; begin < names.size(); begin += std::strlen(&names[begin]) + 1) {
    const char* name = &names[begin];
    // Checksums of the old content.
    if (std::strcmp(name, "security.ima") == 0 || std::strcmp(name, "security.evm") == 0) continue;
    const std::vector<char> value = AttributeValue(from, name);
    if (value == AttributeValue(to, name) && !value.empty()) continue;
    if (fsetxattr(to, name, value.data(), value.size(), 0) != 0) NoteNotKept(name, notKept);
  }
}

#else

void CopyExtendedAttributes(int, int, std::string&) {}

#endif

/// A line of /proc/self/status, which tells sizes in kB; 0 where there is none.
std::uint64_t MemoryFromStatus(std::string_view label) {
  std::ifstream status("/proc/self/status");
  for (std::string line; std::getline(status, line);) {
    if (line.starts_with(label)) return std::strtoull(line.c_str() + label.size(), nullptr, 10) * 1024;
  }
  return 0;
}

}  // namespace

void PrepareProcess() {
  signal(SIGXFSZ, SIG_IGN);
  signal(SIGPIPE, SIG_IGN);
}

bool IsOutputClosed() {
  pollfd output{STDOUT_FILENO, POLLOUT, 0};
  return poll(&output, 1, 0) > 0 && (output.revents & POLLERR) != 0;
}

File::File(File&& other) noexcept : descriptor_(std::exchange(other.descriptor_, -1)) {}

File& File::operator=(File&& other) noexcept {
  std::swap(descriptor_, other.descriptor_);
  return *this;
}

File::~File() {
  if (descriptor_ >= 0) close(descriptor_);
}

File File::OpenForReading(const std::string& path, std::error_code& error, Links links) {
  File file;
  const int flags = O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC | (links == Links::Refuse ? O_NOFOLLOW : 0);
  file.descriptor_ = Checked(error, [&] { return open(path.c_str(), flags); });
  return file;
}

File File::CreateNew(const std::string& path, Access access, std::error_code& error) {
  File file;
  const mode_t mode = access == Access::OwnerOnly ? 0600 : 0666;
  file.descriptor_ =
      Checked(error, [&] { return open(path.c_str(), O_RDWR | O_CREAT | O_EXCL | O_NOCTTY | O_CLOEXEC, mode); });
  return file;
}

File File::OpenOrCreate(const std::string& path, std::error_code& error) {
  File file;
  constexpr int kFlags = O_RDWR | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC;
  file.descriptor_ = Checked(error, [&] { return open(path.c_str(), kFlags, 0666); });
  if (!error) RefuseUnlessRegular(file, error);
  return file;
}

bool File::IsOpen() const { return descriptor_ >= 0; }

std::size_t File::Read(char* buffer, std::size_t size, std::error_code& error) {
  const ssize_t done = Checked(error, [&] { return read(descriptor_, buffer, size); });
  return done < 0 ? 0 : static_cast<std::size_t>(done);
}

void File::WriteAll(std::string_view bytes, std::error_code& error) {
  error.clear();
  while (!bytes.empty()) {
    // On a full disk the first call may write a part; only the next one tells why.
    const ssize_t done = Checked(error, [&] { return write(descriptor_, bytes.data(), bytes.size()); });
    if (done == 0) error = std::make_error_code(std::errc::io_error);
    if (error) return;
    bytes.remove_prefix(static_cast<std::size_t>(done));
  }
}

void File::Seek(std::uint64_t place, std::error_code& error) {
  Checked(error, [&] { return lseek(descriptor_, static_cast<off_t>(place), SEEK_SET); });
}

void File::Flush(std::error_code& error) {
  Checked(error, [&] { return fsync(descriptor_); });
}

void File::Close(std::error_code& error) {
  // An interrupted close has closed: repeated, it could close a file of another thread.
  const int result = close(std::exchange(descriptor_, -1));
  error = result < 0 && errno != EINTR ? LastError() : std::error_code();
}

File::Status File::GetStatus(std::error_code& error) const {
  struct stat info {};
  Checked(error, [&] { return fstat(descriptor_, &info); });
  if (error) return {};
  return {S_ISREG(info.st_mode), S_ISDIR(info.st_mode), static_cast<std::uint64_t>(info.st_size),
          info.st_nlink,         info.st_dev,           info.st_ino};
}

bool File::TryLock(std::error_code& error) {
  Checked(error, [&] { return flock(descriptor_, LOCK_EX | LOCK_NB); });
  if (error != std::errc::operation_would_block) return !error;
  error.clear();
  return false;
}

void File::TakeAttributesOf(const File& other, std::string& notKept, std::error_code& error) {
  struct stat wanted {};
  struct stat own {};
  Checked(error, [&] { return fstat(other.descriptor_, &wanted); });
  if (!error) Checked(error, [&] { return fstat(descriptor_, &own); });
  if (error) return;

  // Owner and group first, because a change of them clears permission bits. Who may not give a file away may still be
  // allowed to set its group.
  mode_t mode = wanted.st_mode & 07777;
  if (own.st_uid != wanted.st_uid && fchown(descriptor_, wanted.st_uid, static_cast<gid_t>(-1)) != 0) {
    NoteNotKept("owner", notKept);
    mode &= ~static_cast<mode_t>(S_ISUID);
  }
  if (own.st_gid != wanted.st_gid && fchown(descriptor_, static_cast<uid_t>(-1), wanted.st_gid) != 0) {
    NoteNotKept("group", notKept);
    // The permissions were meant for the other group: this one gets no more than everybody.
    mode &= ~static_cast<mode_t>(S_ISGID | S_IRWXG) | ((mode & S_IRWXO) << 3);
  }
  CopyExtendedAttributes(other.descriptor_, descriptor_, notKept);
  // Some file systems refuse the call, although all their files have the same permissions.
  if (fchmod(descriptor_, mode) != 0 && (own.st_mode & 07777) != mode) NoteNotKept("permissions", notKept);
}

bool MayWrite(const std::string& path, std::error_code& error) {
  error.clear();
  if (faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) == 0) return true;
  error = LastError();
  return false;
}

void RenameOver(const std::string& from, const std::string& to, std::error_code& error) {
  Checked(error, [&] { return rename(from.c_str(), to.c_str()); });
}

void RenameToNew(const std::string& from, const std::string& to, std::error_code& error) {
#ifdef RENAME_NOREPLACE
  Checked(error, [&] { return renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE); });
  if (error != std::errc::invalid_argument && error != std::errc::function_not_supported) return;
#endif
  // File systems without the call above: a link, too, never replaces.
  Checked(error, [&] { return link(from.c_str(), to.c_str()); });
  if (!error) Checked(error, [&] { return unlink(from.c_str()); });
}

void FlushFolder(const std::string& folder, std::error_code& error) {
  File file = File::OpenForReading(folder, error);
  if (!error) file.Flush(error);
  // EACCES: a folder that may be written and not read cannot be opened.
  if (error == std::errc::invalid_argument || error == std::errc::not_supported ||
      error == std::errc::permission_denied) {
    error.clear();
  }
}

CLocaleScope::CLocaleScope() {
  // The "C" locale as a whole is an object that the C library holds; one with its numbers alone would be made anew.
  static const locale_t cLocale = newlocale(LC_ALL_MASK, "C", locale_t{});
  if (cLocale != locale_t{}) before_ = uselocale(cLocale);
}

CLocaleScope::~CLocaleScope() {
  if (before_ != nullptr) uselocale(static_cast<locale_t>(before_));
}

std::string ProgramPath() {
  std::error_code error;
  return std::filesystem::read_symlink("/proc/self/exe", error).string();
}

std::string CodePath() {
  Dl_info code{};
  // Of the program itself the name is what it was called by, which may be no path.
  const bool isInLibrary = dladdr(reinterpret_cast<void*>(&CodePath), &code) != 0 && code.dli_fname != nullptr &&
                           std::string_view(code.dli_fname).find(".so") != std::string_view::npos;
  if (!isInLibrary) return ProgramPath();
  std::error_code error;
  const std::filesystem::path path = std::filesystem::canonical(code.dli_fname, error);
  return error ? ProgramPath() : path.string();
}

void* LoadSharedLibrary(const std::string& path, std::string& reason) {
  void* const library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (library == nullptr) reason = dlerror();
  return library;
}

void* FunctionOf(void* library, const char* name) { return dlsym(library, name); }

std::string SharedLibraryName(std::string_view name) { return std::string(name) + ".so"; }

std::string DemangledName(const std::type_info& type) {
  int status = 0;
  const std::unique_ptr<char, void (*)(void*)> name(abi::__cxa_demangle(type.name(), nullptr, nullptr, &status),
                                                    std::free);
  return status == 0 ? name.get() : type.name();
}

std::uint32_t ProcessId() { return static_cast<std::uint32_t>(getpid()); }

std::string HostName() {
  char name[256] = {};
  return gethostname(name, sizeof name - 1) == 0 ? name : "";
}

std::string UserName() {
  std::vector<char> memory(16 * 1024);
  passwd entry{};
  passwd* found = nullptr;
  if (getpwuid_r(geteuid(), &entry, memory.data(), memory.size(), &found) == 0 && found) return found->pw_name;
  return std::to_string(geteuid());
}

std::uint64_t ResidentMemory() { return MemoryFromStatus("VmRSS:"); }
std::uint64_t PeakResidentMemory() { return MemoryFromStatus("VmHWM:"); }

void PreferLargePages([[maybe_unused]] void* memory, [[maybe_unused]] std::size_t size) {
#ifdef MADV_HUGEPAGE
  if (size < std::size_t{4} * 1024 * 1024) return;
  // It is a wish about whole pages, so the neighbours on the first and the last may take part. A system without large
  // pages refuses, and nothing is lost.
  const auto page = static_cast<std::uintptr_t>(sysconf(_SC_PAGESIZE));
  const auto place = reinterpret_cast<std::uintptr_t>(memory);
  const std::uintptr_t begin = place & ~(page - 1);
  madvise(reinterpret_cast<void*>(begin), place + size - begin, MADV_HUGEPAGE);
#endif
}

#endif

}  // namespace tervane::os
