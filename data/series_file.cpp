// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/series_file.h"

#include <fmt/format.h>

#include "data/datafile_writer.h"
#include "platform/units.h"

namespace tervane {

FileResult WriteSeriesFile(const std::string& path, const NewSeries& series, ProgressPart progress) {
  const ItemType* type = FindItemType(series.itemType);
  NewDataFile content;
  content.dimensions = 0;
  content.items.push_back({series.name, series.itemType, type ? BaseUnit(*type).key : kDimensionlessUnit,
                           static_cast<ValueType>(series.valueType)});
  DataFileWriter writer;
  std::string error = writer.Create(path, content);
  for (std::size_t step = 0; step < series.times.size() && error.empty(); ++step) {
    error = writer.AddStep(series.times[step]);
    if (error.empty()) error = writer.Put(1, {&series.values[step], 1}, {});
    if (error.empty() && progress.IsCancelled()) error = fmt::format("cannot write {}: {}", path, kCancelled);
    progress.Report(static_cast<double>(step) / static_cast<double>(series.times.size()));
  }
  if (!error.empty()) return {std::move(error), {}};
  return writer.Finish(progress);
}

}  // namespace tervane
