// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/named_places.h"

#include <algorithm>
#include <array>
#include <optional>

#include <fmt/format.h>

#include "data/csv_reader.h"
#include "geometry/shapes.h"
#include "libraries/wells.h"
#include "platform/files.h"
#include "platform/text.h"
#include "platform/text_fields.h"
#include "simspec/model_components.h"
#include "subsurface/wells.h"

namespace tervane {

namespace {

/// The attribute that names points: NAME in any case, or the first text; nothing without one.
std::optional<std::size_t> NameColumn(const std::vector<ShapeField>& fields) {
  const auto find = [&](auto holds) -> std::optional<std::size_t> {
    const auto found = std::ranges::find_if(fields, holds);
    if (found == fields.end()) return std::nullopt;
    return static_cast<std::size_t>(found - fields.begin());
  };
  const auto named = find([](const ShapeField& field) { return EqualIgnoringCase(field.name, "name"); });
  return named ? named : find([](const ShapeField& field) { return field.kind == AttributeKind::Text; });
}

NamedPlaces PlacesOfShapes(const std::string& path) {
  CYbShapeData shapes;
  if (const FileResult read = shapes.ReadShapeAndDbfFile(path, ""); !read.Ok()) return {{}, {}, read.error};
  if (shapes.Kind() != ShapeKind::Point) return {{}, {}, fmt::format("{} holds no points", path)};
  const auto column = NameColumn(shapes.Columns());
  NamedPlaces read;
  for (std::size_t number = 0; number < shapes.GetData().size(); ++number) {
    const Shape& shape = shapes.GetData()[number];
    if (shape.points.empty()) {
      read.notes.push_back(fmt::format("{}: point {} has no place", path, number + 1));
      continue;
    }
    const std::string name = column ? TextOf(shape.values[*column]) : std::string();
    read.places.push_back({name, shape.points.front()});
  }
  return read;
}

NamedPlaces PlacesOfTable(const std::string& path) {
  FileContent content;
  if (const FileResult opened = ReadWholeFile(path, content); !opened.Ok()) return {{}, {}, opened.error};
  if (const std::string why = WhyNoText(content.Text()); !why.empty())
    return {{}, {}, fmt::format("{}: {}", path, why)};
  CsvReader reader(content.Text(), false);
  std::vector<std::string> cells;
  if (!reader.Next(cells)) return {{}, {}, fmt::format("{} is empty", path)};
  constexpr std::array<std::string_view, 3> kHeads{"name", "x", "y"};
  std::array<std::size_t, 3> columns{};
  for (std::size_t head = 0; head < kHeads.size(); ++head) {
    const auto found = std::ranges::find_if(
        cells, [&](const std::string& cell) { return EqualIgnoringCase(Trimmed(cell), kHeads[head]); });
    if (found == cells.end())
      return {
          {}, {}, fmt::format("{}:1: there is no column \"{}\"; the columns are named name, x, y", path, kHeads[head])};
    columns[head] = static_cast<std::size_t>(found - cells.begin());
  }
  NamedPlaces read;
  while (reader.Next(cells)) {
    const auto text = [&](std::size_t head) {
      return columns[head] < cells.size() ? std::string(Trimmed(cells[columns[head]])) : std::string();
    };
    const auto x = ParseCsvNumber(text(1), !reader.SeparatesByComma()),
               y = ParseCsvNumber(text(2), !reader.SeparatesByComma());
    if (x && y)
      read.places.push_back({text(0), {*x, *y}});
    else
      read.notes.push_back(fmt::format("{}:{}: x and y are \"{}\" and \"{}\", numbers were expected", path,
                                       reader.Line(), text(1), text(2)));
  }
  return read;
}

}  // namespace

NamedPlaces ReadNamedPlaces(const std::string& path) {
  NamedPlaces read = LowerCase(path).ends_with(".shp") ? PlacesOfShapes(path) : PlacesOfTable(path);
  if (read.problem.empty() && read.places.empty())
    read.problem = read.notes.empty() ? fmt::format("{} holds no points", path) : read.notes.front();
  return read;
}

NamedPlaces WellPlacesOf(const CYbSEKvfBase& node) {
  const bool byReservoirs = ModelCompOf(node).SZ_ModelType != kFiniteDifferenceSaturated;
  CSZWellKvf* wells = node.Important(byReservoirs ? kReservoirWells : kWells);
  if (!wells || !wells->IsDlgUsedInSetup() || wells->GetFilename().IsEmpty())
    return {{}, {}, "The setup includes no wells, or names no file of them."};
  CTvnWellDataList list;
  if (!list.LoadWellDataFile(wells->GetFilename().Absolute())) return {{}, {}, list.Problem()};
  NamedPlaces read;
  for (const CTvnWellData& well : list.Wells()) read.places.push_back({well.name, well.place});
  if (read.places.empty()) read.problem = "The file of wells holds none.";
  return read;
}

}  // namespace tervane
