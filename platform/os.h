// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The only place, beside platform/os_process.h, that calls the operating system directly; each call has its counterpart
// for Windows.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <system_error>
#include <typeinfo>

namespace tervane::os {

/// To be called once when a program starts: a file size limit or a closed pipe becomes an error of the write that met
/// it, not the end of the process.
void PrepareProcess();

/// True when nobody reads the standard output any more, as behind `| head`.
bool IsOutputClosed();

/// An open file. Closed by the destructor; `Close` tells the error that a close can report.
class File {
 public:
  File() = default;
  File(File&& other) noexcept;
  File& operator=(File&& other) noexcept;
  File(const File&) = delete;
  File& operator=(const File&) = delete;
  ~File();

  /// Opens for reading without waiting for a writer (FIFO). What is to be a file of the program's own is not looked for
  /// behind a symbolic link.
  enum class Links { Follow, Refuse };
  static File OpenForReading(const std::string& path, std::error_code& error, Links links = Links::Follow);
  /// Creates a file that must not exist yet, readable and writable as the process's mask allows, or by its owner only.
  enum class Access { AsMaskAllows, OwnerOnly };
  static File CreateNew(const std::string& path, Access access, std::error_code& error);
  /// Opens a file of the program's own for reading and writing, or creates an empty one. Symbolic links and what is no
  /// regular file are refused, and nothing is waited for.
  static File OpenOrCreate(const std::string& path, std::error_code& error);

  bool IsOpen() const;
  /// Reads up to `size` bytes; 0 at the end. Interrupted reads go on.
  std::size_t Read(char* buffer, std::size_t size, std::error_code& error);
  /// Writes all bytes or reports why not. Interrupted and short writes go on.
  void WriteAll(std::string_view bytes, std::error_code& error);
  /// The next read or write begins at this byte.
  void Seek(std::uint64_t place, std::error_code& error);
  void Flush(std::error_code& error);
  void Close(std::error_code& error);

  struct Status {
    bool isRegular = false;
    bool isFolder = false;
    std::uint64_t size = 0;
    std::uint64_t links = 1;
    /// Both together are the same for two open files exactly when these are one file.
    std::uint64_t volume = 0;
    std::uint64_t number = 0;
  };
  Status GetStatus(std::error_code& error) const;

  /// Keeps every other open file of this one from the same, until this one is closed; also by the end of the process.
  /// Never waits. `error` is set where the file system knows no such lock; false without an error when another has it.
  bool TryLock(std::error_code& error);

  /// Gives this file the owner, group, permissions and extended attributes (access control lists among them) of
  /// `other`. Where the process or the file system may not, the name of what could not be kept is appended to
  /// `notKept`.
  void TakeAttributesOf(const File& other, std::string& notKept, std::error_code& error);

 private:
#ifdef _WIN32
  void* handle_ = nullptr;
#else
  int descriptor_ = -1;
#endif
};

/// True when the user may write to the file; where nothing stands, `error` tells.
bool MayWrite(const std::string& path, std::error_code& error);
/// Renames over an existing file in one step.
void RenameOver(const std::string& from, const std::string& to, std::error_code& error);
/// Renames to a name at which nothing may stand, else the error says that something exists.
void RenameToNew(const std::string& from, const std::string& to, std::error_code& error);
/// Flushes a folder, so that a rename in it outlives a power cut. File systems that cannot do so are left alone.
void FlushFolder(const std::string& folder, std::error_code& error);

/// While it lives, this thread works in the "C" locale, for libraries that read numbers by the process's locale and so
/// fail where a comma stands for the point. To be destroyed by the thread that made it.
class CLocaleScope {
 public:
  CLocaleScope();
  ~CLocaleScope();
  CLocaleScope(const CLocaleScope&) = delete;
  CLocaleScope& operator=(const CLocaleScope&) = delete;

 private:
#ifdef _WIN32
  int perThread_ = 0;
  std::string before_;
#else
  void* before_ = nullptr;
#endif
};

/// Path of the running program; empty where unknown.
std::string ProgramPath();

/// Loads a shared library into the process, where it stays to the end. Null, with the system's reason, when that fails.
void* LoadSharedLibrary(const std::string& path, std::string& reason);
/// A function of a loaded library by its name; null when there is none.
void* FunctionOf(void* library, const char* name);
/// The file name of a shared library that is loaded in this way.
std::string SharedLibraryName(std::string_view name);

/// Name of a type as it stands in the source, with its namespaces.
std::string DemangledName(const std::type_info& type);

std::uint32_t ProcessId();
/// True when a process with this number runs on this machine, also one of another user.
bool IsProcessAlive(std::uint32_t processId);
/// When that process of this machine started, in a form to be compared alone; also different after the machine started
/// anew. Tells a process from a later one with the same number. Empty where unknown.
std::string ProcessStartTime(std::uint32_t processId);
/// The process that started this one, or that has adopted it; 0 where unknown.
std::uint32_t ParentOf(std::uint32_t processId);
std::string HostName();
/// The name under which the user is known to the system; empty where unknown.
std::string UserName();
/// The size of the process's resident memory in bytes, and its peak; 0 where unknown.
std::uint64_t ResidentMemory();
std::uint64_t PeakResidentMemory();
/// To be called before a large piece of memory is filled: has the system give it in large pages where it can do so for
/// the asking, which takes a fraction of the time. Less than 4 MB is left as it is.
void PreferLargePages(void* memory, std::size_t size);

}  // namespace tervane::os
