// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Makes a data file, or opens one, changes it as its editor does and saves it: `save_once make|save KIND FILE`.
#include <string>
#include <vector>

#include <fmt/format.h>

#include "data/datafile_writer.h"
#include "edits/grid_edit.h"
#include "edits/series_edit.h"

namespace {

using namespace tervane;

std::string Make(const std::string& path, bool isGrid) {
  NewDataFile content;
  content.dimensions = isGrid ? 2 : 0;
  content.geometry.nx = 6;
  content.geometry.ny = 5;
  content.geometry.cellSize = 10;
  content.items = {{"Level", quantity::kElevation, 1000, {}}};
  DataFileWriter writer;
  std::string error = writer.Create(path, content);
  const std::vector<float> values(isGrid ? 30 : 1, 4.5F);
  for (int day = 1; day <= 3 && error.empty(); ++day) {
    error = writer.AddStep(CYbDateTime(2000, 1, day));
    if (error.empty()) error = writer.Put(1, values);
  }
  return error.empty() ? writer.Finish().error : error;
}

/// What could not be read is not changed.
template <class Edit, class Change>
std::string ChangeAndSave(const std::string& path, const Change& change) {
  Edit edit(path);
  std::string problem = edit.Problem().empty() ? edit.WhyReadOnly() : edit.Problem();
  if (problem.empty()) problem = change(edit);
  return problem.empty() ? edit.Save(path).error : problem;
}

/// A value of a series, its times, or the cells of a grid.
std::string ChangeAndSave(const std::string& path, const std::string& kind) {
  if (kind == "grid")
    return ChangeAndSave<GridEdit>(path, [](GridEdit& edit) {
      return edit.PutCells("Paste", {{1, 2, 7.5F}, {3, 3, 8.5F}});
    });
  return ChangeAndSave<SeriesEdit>(
      path, [&kind](SeriesEdit& edit) { return kind == "times" ? edit.InsertRow(1) : edit.SetValue(0, 1, 7.5F); });
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 4) return 2;
  const std::string what = argv[1], kind = argv[2], path = argv[3];
  const std::string problem = what == "make" ? Make(path, kind == "grid") : ChangeAndSave(path, kind);
  if (!problem.empty()) fmt::print(stderr, "{}\n", problem);
  return problem.empty() ? 0 : 1;
}
