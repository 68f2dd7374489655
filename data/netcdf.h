// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What reading and writing of data files share: the lock around the netCDF library, handles, attributes, and errors in
// words. Only sources of data files include this.
#pragma once

#include <cstddef>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "data/netcdf_calls.h"

namespace tervane::netcdf {

/// To be held around every call of netCDF, HDF5 and GDAL's drivers for them, none of which is made for threads. It also
/// keeps HDF5 from printing its errors: they come back as statuses.
class Lock {
 public:
  Lock();

 private:
  std::lock_guard<std::mutex> guard_;
};

/// Of a classic file that is written, in bytes.
inline constexpr std::size_t kBufferSize = std::size_t{1} << 18;
/// Of one that is read: what is read at one time.
inline constexpr std::size_t kReadSize = std::size_t{1} << 16;

/// Why a call failed, for the person who must act.
std::string InWords(int status);

/// An open file of the library. The lock must be held wherever it is made, used or closed.
class Handle {
 public:
  Handle() = default;
  explicit Handle(int id) : id_(id) {}
  Handle(Handle&& other) noexcept : id_(std::exchange(other.id_, -1)) {}
  Handle& operator=(Handle&& other) noexcept {
    std::swap(id_, other.id_);
    return *this;
  }
  ~Handle() {
    if (id_ >= 0) Library().nc_close(id_);
  }

  int Id() const { return id_; }
  bool IsOpen() const { return id_ >= 0; }
  /// The library's status.
  int Close() { return Library().nc_close(std::exchange(id_, -1)); }

 private:
  int id_ = -1;
};

/// Closes a file under the lock. Where none is open the library is not even loaded.
void CloseLocked(Handle& file);

/// A text attribute, of characters or of one string; "" when it is missing, of another type or longer than 1 MB.
std::string TextAttribute(int file, int variable, const char* name);
/// The numbers of an attribute; none when it is missing, a text or longer than 1000 numbers.
std::vector<double> NumbersAttribute(int file, int variable, const char* name);
/// A single whole number.
std::optional<int> IntAttribute(int file, int variable, const char* name);

/// Checks a classic netCDF file (CDF-1, -2, -5) against its own header, since the library reads what was cut off as
/// zeros and takes every count of a damaged header at its word. "" when it is whole or of another kind, else what is
/// wrong: "it is cut: it has 120 bytes, its header tells of 4096". `isClassic` tells the kind.
/// Layout: the chapter on file formats of the NetCDF Users Guide, https://docs.unidata.ucar.edu/nug/current/.
std::string WhyClassicFileIsBad(const std::string& path, bool& isClassic);

}  // namespace tervane::netcdf
