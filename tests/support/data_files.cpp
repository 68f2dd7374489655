// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/data_files.h"

#include <stdexcept>

#include "data/grid_files.h"
#include "platform/item_types.h"

namespace tervane::test {

void Require(const std::string& error) {
  if (!error.empty()) throw std::runtime_error(error);
}

void WriteGrid(const std::string& path, const GridGeometry& geometry, std::vector<float> values, int itemType) {
  CTvn2DOrthoRotatedGridData grid;
  Require(grid.TakeValues(geometry, std::move(values), kUsualDeleteValue, 0, itemType));
  Require(WriteGridData(path, grid).error);
}

void WriteCodes(const std::string& path, std::vector<float> codes) {
  const int nx = static_cast<int>(codes.size());
  WriteGrid(path, {nx, 1, 100, 0, 0, 0, {}}, std::move(codes), quantity::kCode);
}

void WriteShapes(const std::string& path, ShapeKind kind, AttributeKind attribute,
                 const std::vector<ShapeValue>& values) {
  CTvnShapeData data;
  data.Create(kind, {{"CODE", attribute}}, "");
  double x = 0;
  for (const ShapeValue& value : values) {
    const bool isPoint = kind == ShapeKind::Point;
    std::vector<MapPoint> points{{x, 0}, {x, 10}, {x + 10, 10}, {x + 10, 0}, {x, 0}};
    data.AddShape({.points = isPoint ? std::vector<MapPoint>{{x + 5, 5}} : std::move(points),
                   .z = {},
                   .m = {},
                   .parts = isPoint ? std::vector<std::size_t>{} : std::vector<std::size_t>{0},
                   .values = {value}});
    x += 10;
  }
  Require(data.SaveShapeFile(path).error);
}

}  // namespace tervane::test
