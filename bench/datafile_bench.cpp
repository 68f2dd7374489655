// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Reading and writing of a grid over time, beside loops that call the netCDF library alone, and the header of a large
// file.
#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstddef>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include <fcntl.h>
#include <fmt/format.h>
#include <netcdf.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "data/datafile.h"
#include "data/datafile_writer.h"
#include "platform/item_types.h"

namespace tervane::bench {

namespace {

constexpr int kSide = 1000;
constexpr std::size_t kCells = std::size_t{kSide} * kSide;
constexpr std::size_t kSteps = 10;
/// 400 MB.
constexpr std::size_t kManySteps = 100;

std::vector<float> Terrain() {
  std::vector<float> values(kCells);
  for (std::size_t i = 0; i < kCells; ++i)
    values[i] = i % 97 == 0 ? kDeleteValue : 100.0f + 50.0f * std::sin(static_cast<float>(i) * 1e-3f);
  return values;
}

int Check(int status) {
  if (status != NC_NOERR) fmt::print("WRONG: {}\n", nc_strerror(status));
  return status;
}

void StopAt(const std::string& error) {
  if (!error.empty()) fmt::print("WRONG: {}\n", error);
}

int WriteOurs(const std::string& path, const std::vector<float>& values, std::size_t steps) {
  NewDataFile content;
  content.geometry.nx = content.geometry.ny = kSide;
  content.geometry.cellSize = 50;
  content.items = {{"Elevation", quantity::kElevation, 1000, {}}};
  DataFileWriter writer;
  StopAt(writer.Create(path, content));
  for (std::size_t step = 0; step < steps; ++step) {
    StopAt(writer.AddStep(CYbDateTime(2000, 1, 1) + CYbDateTimeSpan::Days(static_cast<double>(step))));
    StopAt(writer.Put(1, values));
  }
  StopAt(writer.Finish().error);
  return 0;
}

/// The same dimensions and variables, without attributes; flushed to the disk, as ours is.
int WriteBare(const std::string& path, const std::vector<float>& values) {
  int file = 0, dimensions[3] = {}, time = 0, variable = 0, old = 0;
  Check(nc_create(path.c_str(), NC_CLOBBER | NC_64BIT_OFFSET, &file));
  Check(nc_set_fill(file, NC_NOFILL, &old));
  Check(nc_def_dim(file, "time", NC_UNLIMITED, &dimensions[0]));
  Check(nc_def_dim(file, "y", kSide, &dimensions[1]));
  Check(nc_def_dim(file, "x", kSide, &dimensions[2]));
  Check(nc_def_var(file, "time", NC_DOUBLE, 1, dimensions, &time));
  Check(nc_def_var(file, "v", NC_FLOAT, 3, dimensions, &variable));
  Check(nc_enddef(file));
  for (std::size_t step = 0; step < kSteps; ++step) {
    const auto stamp = static_cast<double>(step) * 86400;
    Check(nc_put_var1_double(file, time, &step, &stamp));
    const std::size_t start[3] = {step, 0, 0}, count[3] = {1, kSide, kSide};
    Check(nc_put_vara_float(file, variable, start, count, values.data()));
  }
  Check(nc_close(file));
  const int descriptor = open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (fsync(descriptor) != 0) fmt::print("WRONG: the file is not flushed\n");
  return close(descriptor);
}

float ReadOurs(const std::string& path, std::vector<float>& buffer) {
  DataFile file;
  StopAt(file.Open(path));
  for (std::size_t step = 0; step < file.Time().steps; ++step) StopAt(file.Read({1, step, 1, {}}, buffer));
  return buffer[1];
}

float ReadBare(const std::string& path, std::vector<float>& buffer) {
  int file = 0, variable = 0;
  Check(nc_open(path.c_str(), NC_NOWRITE, &file));
  Check(nc_inq_varid(file, "Elevation", &variable));
  for (std::size_t step = 0; step < kSteps; ++step) {
    const std::size_t start[3] = {step, 0, 0}, count[3] = {1, kSide, kSide};
    Check(nc_get_vara_float(file, variable, start, count, buffer.data()));
  }
  Check(nc_close(file));
  return buffer[1];
}

/// Milliseconds of one opening.
double TimeOfHeader(const std::string& path) {
  const auto start = std::chrono::steady_clock::now();
  DataFile file;
  StopAt(file.Open(path));
  const std::chrono::duration<double, std::milli> time = std::chrono::steady_clock::now() - start;
  return time.count();
}

/// Milliseconds of `tervane data info` from start to end of the process; negative when it could not run.
double TimeOfInfo(const std::string& path) {
  const std::string command = fmt::format("'{}/tervane' data info '{}' >/dev/null", TERVANE_BIN_DIR, path);
  const auto start = std::chrono::steady_clock::now();
  const int status = std::system(command.c_str());
  const std::chrono::duration<double, std::milli> time = std::chrono::steady_clock::now() - start;
  return status == 0 ? time.count() : -1;
}

void MeasureHeader(const std::string& path, const std::vector<float>& values) {
  WriteOurs(path, values, kManySteps);
  std::vector<double> opens, infos;
  for (int run = 0; run < 21; ++run) {
    opens.push_back(TimeOfHeader(path));
    infos.push_back(TimeOfInfo(path));
  }
  std::nth_element(opens.begin(), opens.begin() + 10, opens.end());
  std::nth_element(infos.begin(), infos.begin() + 10, infos.end());
  fmt::print("\nfile of {} MB, medians of 21 runs: opened in {:.2f} ms, tervane data info {:.2f} ms (limit 50)  {}\n",
             std::filesystem::file_size(path) / 1'000'000, opens[10], infos[10],
             infos[10] < 0 ? "not run" : Verdict(infos[10], 50));
}

int Run(int argc, char** argv) {
  const std::filesystem::path folder =
      std::filesystem::temp_directory_path() / fmt::format("tervane_datafile_bench_{}", getpid());
  std::filesystem::create_directory(folder);
  const std::string ours = folder / "ours.nds2", written = folder / "written.nds2", bare = folder / "bare.nc";
  const std::vector<float> values = Terrain();
  std::vector<float> buffer(kCells);
  WriteOurs(ours, values, kSteps);
  if (ReadOurs(ours, buffer) != values[1] || ReadBare(ours, buffer) != values[1])
    fmt::print("WRONG: the values do not come back\n");

  MedianTable table(31);
  table.Add("read 10 steps of 4 MB", [&] { return ReadOurs(ours, buffer); });
  table.Add("read with the bare library", [&] { return ReadBare(ours, buffer); });
  table.Add("write 10 steps of 4 MB", [&] { return WriteOurs(written, values, kSteps); });
  table.Add("write with the bare library", [&] { return WriteBare(bare, values); });
  table.Limit("read 10 steps of 4 MB", "read with the bare library", 1.05);
  table.Limit("write 10 steps of 4 MB", "write with the bare library", 1.1);
  table.Run(argc, argv);
  MeasureHeader(folder / "large.nds2", values);
  std::filesystem::remove_all(folder);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
