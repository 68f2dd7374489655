// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/netcdf.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <limits>
#include <system_error>

#include <fmt/format.h>

#include "platform/os.h"
#include "platform/program_module.h"

namespace tervane::netcdf {

namespace {

std::mutex& Mutex() {
  static std::mutex mutex;
  return mutex;
}

const LateCalls<Calls>& Loaded() {
  static const LateCalls<Calls> loaded = LoadCalls<Calls>(kModuleName, kEntryName, "reads data files");
  return loaded;
}

}  // namespace

const Calls& Library() { return *Loaded().calls; }
const std::string& WhyNoLibrary() { return Loaded().problem; }

Lock::Lock() : guard_(Mutex()) {
  if (!Loaded().calls) return;
  // The setting is one of each thread.
  thread_local const herr_t silenced = Library().H5Eset_auto2(H5E_DEFAULT, nullptr, nullptr);
  static_cast<void>(silenced);
}

std::string InWords(int status) {
  switch (status) {
    case ENOSPC:
      return "no space left on the device; free some or choose another place";
    case EFBIG:
      return "the file would be larger than this system's limit on the size of files";
    case NC_ENOTNC:
      return "it is no netCDF file, or its header is damaged";
    case NC_EHDFERR:
      return "it is cut or damaged (the HDF5 library refuses it)";
    case NC_ENOMEM:
      return "it needs more than the free memory";
    case NC_EVARSIZE:
      return "its grids are too large for this format (4 GB for one step of one item)";
    case NC_ERANGE:
      return "a number does not fit";
    case NC_ENOFILTER:
      return "it is compressed by a method that is not installed here";
    default:
      return Library().nc_strerror(status);
  }
}

void CloseLocked(Handle& file) {
  if (!file.IsOpen()) return;
  const Lock lock;
  file = Handle();
}

std::string TextAttribute(int file, int variable, const char* name) {
  constexpr std::size_t kLongest = 1u << 20;
  nc_type type = NC_NAT;
  std::size_t length = 0;
  if (Library().nc_inq_att(file, variable, name, &type, &length) != NC_NOERR) return {};
  if (type == NC_STRING && length == 1) {
    char* text = nullptr;
    if (Library().nc_get_att_string(file, variable, name, &text) != NC_NOERR || text == nullptr) return {};
    std::string result = text;
    Library().nc_free_string(1, &text);
    return result;
  }
  if (type != NC_CHAR || length > kLongest) return {};
  std::string text(length, '\0');
  if (Library().nc_get_att_text(file, variable, name, text.data()) != NC_NOERR) return {};
  // Some programs write the zero that ends a text in C.
  text.resize(std::min(text.find('\0'), text.size()));
  return text;
}

std::vector<double> NumbersAttribute(int file, int variable, const char* name) {
  constexpr std::size_t kMost = 1000;
  nc_type type = NC_NAT;
  std::size_t length = 0;
  if (Library().nc_inq_att(file, variable, name, &type, &length) != NC_NOERR) return {};
  if (type == NC_CHAR || type > NC_UINT64 || length > kMost) return {};
  std::vector<double> numbers(length);
  if (Library().nc_get_att_double(file, variable, name, numbers.data()) != NC_NOERR) return {};
  return numbers;
}

std::optional<int> IntAttribute(int file, int variable, const char* name) {
  const std::vector<double> numbers = NumbersAttribute(file, variable, name);
  if (numbers.size() != 1 || std::abs(numbers[0]) > std::numeric_limits<int>::max()) return std::nullopt;
  if (std::trunc(numbers[0]) != numbers[0]) return std::nullopt;
  return static_cast<int>(numbers[0]);
}

namespace {

/// The largest size that is added up: far above every disk, and far from the end of the integer.
constexpr std::uint64_t kMostBytes = std::uint64_t{1} << 60;

std::uint64_t Product(std::uint64_t a, std::uint64_t b) {
  if (a == 0 || b == 0) return 0;
  return a > kMostBytes / b ? kMostBytes : a * b;
}

std::uint64_t Padded(std::uint64_t size) { return (size + 3) / 4 * 4; }

/// Walks a classic header from the file's start.
class ClassicHeaderReader {
 public:
  explicit ClassicHeaderReader(const std::string& path) { file_ = os::File::OpenForReading(path, error_); }

  /// The size of the file by the system; 0 when it cannot be told.
  std::uint64_t FileSize() { return file_.IsOpen() ? file_.GetStatus(error_).size : 0; }
  bool IsBad() const { return isBad_ || error_; }
  void Refuse() { isBad_ = true; }

  /// A big-endian number.
  std::uint64_t Number(int bytes) {
    std::uint64_t number = 0;
    for (int i = 0; i < bytes; ++i) number = number << 8 | Byte();
    return number;
  }
  void Skip(std::uint64_t bytes) {
    for (; bytes > 0 && !IsBad(); --bytes) Byte();
  }

 private:
  unsigned Byte() {
    if (place_ == filled_) {
      filled_ = IsBad() ? 0 : file_.Read(buffer_.data(), buffer_.size(), error_);
      place_ = 0;
      if (filled_ == 0) {
        isBad_ = true;
        return 0;
      }
    }
    return static_cast<unsigned char>(buffer_[place_++]);
  }

  os::File file_;
  std::error_code error_;
  std::array<char, 8192> buffer_{};
  std::size_t place_ = 0, filled_ = 0;
  bool isBad_ = false;
};

struct ClassicHeader {
  ClassicHeaderReader& in;
  int sizeBytes;    ///< Of a count.
  int offsetBytes;  ///< Of a place in the file.
  std::uint64_t fileSize;

  std::uint64_t Count() {
    const std::uint64_t count = in.Number(sizeBytes);
    // Every counted thing takes at least a byte of the file, so that no damaged count makes a long loop.
    if (count > fileSize) in.Refuse();
    return in.IsBad() ? 0 : count;
  }
  /// The number of elements of a list, whose tag must be the given one or, when it is empty, 0.
  std::uint64_t ListCount(std::uint64_t tag) {
    const std::uint64_t found = in.Number(4);
    const std::uint64_t count = Count();
    if (found != tag && (found != 0 || count != 0)) in.Refuse();
    return in.IsBad() ? 0 : count;
  }
  void SkipName() { in.Skip(Padded(Count())); }
  std::uint64_t SizeOfType() {
    constexpr std::array<std::uint64_t, 12> kSizes{0, 1, 1, 2, 4, 4, 8, 1, 2, 4, 8, 8};
    const std::uint64_t type = in.Number(4);
    // CDF-1 and -2 have the first six types alone.
    if (type == 0 || type > (sizeBytes == 8 ? 11u : 6u)) in.Refuse();
    return in.IsBad() ? 0 : kSizes[type];
  }
  void SkipAttributes() {
    for (std::uint64_t left = ListCount(0x0C); left > 0 && !in.IsBad(); --left) {
      SkipName();
      const std::uint64_t size = SizeOfType();
      in.Skip(Padded(Product(size, Count())));
    }
  }
};

/// The bytes that the file must have at least; the last one's padding need not be there.
std::uint64_t NeededSize(ClassicHeader& header) {
  ClassicHeaderReader& in = header.in;
  const std::uint64_t records = in.Number(header.sizeBytes);
  // The number that stands for "as many as there are", of a file that is being written.
  const bool isStreaming = records == (header.sizeBytes == 8 ? ~std::uint64_t{0} : 0xFFFFFFFFu);
  std::vector<std::uint64_t> lengths;
  for (std::uint64_t left = header.ListCount(0x0A); left > 0 && !in.IsBad(); --left) {
    header.SkipName();
    lengths.push_back(in.Number(header.sizeBytes));
  }
  header.SkipAttributes();

  struct RecordVariable {
    std::uint64_t begin, size;
  };
  std::vector<RecordVariable> recordVariables;
  std::uint64_t needed = 0;
  for (std::uint64_t left = header.ListCount(0x0B); left > 0 && !in.IsBad(); --left) {
    header.SkipName();
    std::uint64_t cells = 1;
    bool isRecord = false;
    const std::uint64_t dimensions = header.Count();
    for (std::uint64_t i = 0; i < dimensions && !in.IsBad(); ++i) {
      const std::uint64_t dimension = in.Number(header.sizeBytes);
      if (dimension >= lengths.size()) {
        in.Refuse();
      } else if (lengths[dimension] != 0) {
        cells = Product(cells, lengths[dimension]);
      } else if (i == 0) {
        isRecord = true;
      } else {
        in.Refuse();
      }
    }
    header.SkipAttributes();
    const std::uint64_t size = Product(cells, header.SizeOfType());
    in.Number(header.sizeBytes);  // The padded size, which cannot tell of more than 4 GB: the shape does.
    const std::uint64_t begin = std::min(in.Number(header.offsetBytes), kMostBytes);
    if (isRecord) {
      recordVariables.push_back({begin, size});
    } else {
      needed = std::max(needed, begin + size);
    }
  }
  // A single variable with records is not padded.
  std::uint64_t recordSize = 0;
  for (const RecordVariable& variable : recordVariables)
    recordSize += recordVariables.size() == 1 ? variable.size : Padded(variable.size);
  if (records > 0 && !isStreaming) {
    for (const RecordVariable& variable : recordVariables)
      needed = std::max(needed, variable.begin + Product(records - 1, recordSize) + variable.size);
  }
  return needed;
}

}  // namespace

std::string WhyClassicFileIsBad(const std::string& path, bool& isClassic) {
  isClassic = false;
  ClassicHeaderReader in(path);
  const std::uint64_t size = in.FileSize();
  if (size < 4) return "it is too short for a netCDF file";
  const std::uint64_t magic = in.Number(3);
  const std::uint64_t version = in.Number(1);
  if (magic != 0x434446) return {};  // "CDF"
  isClassic = true;
  if (version != 1 && version != 2 && version != 5) return "it is no netCDF file of a known version";
  ClassicHeader header{in, version == 5 ? 8 : 4, version == 1 ? 4 : 8, size};
  const std::uint64_t needed = NeededSize(header);
  if (in.IsBad()) return "its header is cut or damaged; get the file again";
  if (needed > size) {
    return fmt::format("it is cut: it has {} bytes, its header tells of {}; get the file again", size, needed);
  }
  return {};
}

}  // namespace tervane::netcdf
