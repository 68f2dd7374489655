// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/cell_checks.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <map>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "spatial/data2d.h"

namespace tervane {

namespace {

/// The cells of the domain as places, and what quantities are there.
class CellReader {
 public:
  CellReader(const CTvn2DOrthoRotatedGridData& domain, ProgressPart progress) : progress_(progress) {
    const std::vector<SectionPoint> centres = CentresOf(domain);
    for (std::size_t i = 0; i < centres.size(); ++i)
      if (!domain.IsEmptyValue(domain.Values()[i])) cells_.push_back(centres[i]);
  }

  std::size_t Count() const { return cells_.size(); }

  /// Elevations at the cells; NaN where nothing is known.
  std::vector<double> Elevations(const CheckedQuantity& quantity, const std::vector<double>& ground) {
    return ElevationsAt(quantity, cells_, ground);
  }
  std::vector<double> ElevationsAt(const CheckedQuantity& quantity, const std::vector<SectionPoint>& places,
                                   const std::vector<double>& ground) {
    progress_.ThrowIfCancelled();
    Level level;
    level.value = static_cast<double>(quantity.value);
    if (quantity.isAboveGround) level.reference = Level::Reference::AboveGround;
    if (!quantity.isUniform) {
      level.grid = GridOf(quantity);
      if (!level.grid) level.value = std::numeric_limits<double>::quiet_NaN();
    }
    return ElevationsAlong(level, places, ground, GridSampling::Nearest);
  }
  std::vector<double> NoGround() const {
    return std::vector<double>(cells_.size(), std::numeric_limits<double>::quiet_NaN());
  }

  std::string InCells(std::size_t count) const {
    return fmt::format("in {} of {} cells ({:.2g} %)", count, cells_.size(),
                       100.0 * static_cast<double>(count) / static_cast<double>(cells_.size()));
  }

 private:
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> GridOf(const CheckedQuantity& quantity) {
    if (quantity.grid) {
      quantity.grid->Run(progress_);
      return quantity.grid->Result();
    }
    auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
    return BuildGrid(quantity.source, progress_, *grid).Ok() ? grid : nullptr;
  }

  ProgressPart progress_;
  std::vector<SectionPoint> cells_;
};

Finding Warning(std::string text) { return {Severity::Warning, std::move(text), {}, {}}; }

void CheckLevels(const CellCheck& check, CellReader& cells, std::vector<Finding>& findings) {
  const std::vector<double> ground = cells.Elevations(check.ground, cells.NoGround());
  const bool isDescending = check.kind == CellCheck::Kind::LevelsDescend;
  std::vector<double> above = ground;
  std::string nameAbove = check.ground.name;
  for (const CheckedQuantity& quantity : check.quantities) {
    const std::vector<double> level = cells.Elevations(quantity, ground);
    std::size_t wrong = 0;
    for (std::size_t i = 0; i < level.size(); ++i) wrong += level[i] > above[i] ? 1 : 0;
    if (wrong > 0)
      findings.push_back(Warning(fmt::format("{} lies above {} {}", quantity.name, nameAbove, cells.InCells(wrong))));
    if (!isDescending) continue;
    above = level;
    nameAbove = quantity.name;
  }
}

void CheckCodes(const CellCheck& check, CellReader& cells, std::vector<Finding>& findings) {
  for (const CheckedQuantity& quantity : check.quantities) {
    std::map<int, std::size_t> unknown;
    std::size_t wrong = 0;
    for (const double value : cells.Elevations(quantity, cells.NoGround())) {
      if (std::isnan(value)) continue;
      const int code = static_cast<int>(std::lround(value));
      if (std::ranges::find(check.codes, code) != check.codes.end()) continue;
      ++unknown[code];
      ++wrong;
    }
    if (wrong == 0) continue;
    std::vector<int> codes;
    for (const auto& [code, count] : unknown) codes.push_back(code);
    constexpr std::size_t kMost = 8;
    const std::string more = codes.size() > kMost ? fmt::format(" and {} more", codes.size() - kMost) : std::string();
    codes.resize(std::min(codes.size(), kMost));
    findings.push_back(Warning(fmt::format("{} has codes of no unit {}: {}{}", quantity.name, cells.InCells(wrong),
                                           fmt::join(codes, ", "), more)));
  }
}

void CheckPlaces(const CellCheck& check, CellReader& cells, std::vector<Finding>& findings) {
  if (check.quantities.empty()) return;
  std::vector<SectionPoint> places;
  for (const CheckedPlace& place : check.places) places.push_back({0, place.place});
  const std::vector<double> none(places.size(), std::numeric_limits<double>::quiet_NaN());
  const std::vector<double> ground = cells.ElevationsAt(check.ground, places, none);
  const std::vector<double> level = cells.ElevationsAt(check.quantities.back(), places, ground);
  for (std::size_t i = 0; i < places.size(); ++i)
    if (check.places[i].height < level[i])
      findings.push_back(Warning(fmt::format("{} reaches down to {:.6g} m, below {} at {:.6g} m", check.places[i].name,
                                             double{check.places[i].height}, check.quantities.back().name, level[i])));
}

}  // namespace

CheckedQuantity AskQuantity(std::string name, CData2DKvf& quantity) {
  CheckedQuantity asked{.name = std::move(name)};
  asked.isUniform = quantity.Type == CData2DKvf::kUniform;
  asked.value = quantity.FixedValue;
  asked.isAboveGround = quantity.HasRelativeToGround() && quantity.RelativeToGround != 0;
  if (!asked.isUniform) {
    asked.source = quantity.CurrentSource();
    asked.grid = quantity.GridComputation();
  }
  return asked;
}

std::vector<Finding> FindingsInCells(const CellCheck& check, const CTvn2DOrthoRotatedGridData& domain,
                                     ProgressPart progress) {
  std::vector<Finding> findings;
  CellReader cells(domain, progress);
  if (cells.Count() == 0) return findings;
  switch (check.kind) {
    case CellCheck::Kind::LevelsDescend:
    case CellCheck::Kind::BelowGround:
      CheckLevels(check, cells, findings);
      break;
    case CellCheck::Kind::CodesKnown:
      CheckCodes(check, cells, findings);
      break;
    case CellCheck::Kind::PlacesAboveLevel:
      CheckPlaces(check, cells, findings);
      break;
  }
  return findings;
}

}  // namespace tervane
