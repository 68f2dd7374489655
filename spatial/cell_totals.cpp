// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/cell_totals.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/data2d.h"

namespace tervane {

namespace {

using GridData = CTvn2DOrthoRotatedGridData;
using Values = std::vector<double>;  ///< One for each cell of the domain; NaN where nothing is known.

constexpr double kUnknown = std::numeric_limits<double>::quiet_NaN();

class CellAdder {
 public:
  CellAdder(const CellTotals& totals, ProgressPart progress) : totals_(totals), progress_(progress) {}

  std::string Add(CellTotalsResult& result);

 private:
  std::string Read(const TotalledQuantity& quantity, Values& values);
  /// The levels at which the bodies end, each at or below the one before it, the ground first.
  std::string ReadLevels(const TotalledBodies& bodies, std::vector<Values>& levels);
  Values WeightsOf(std::size_t layer, const std::vector<Values>& levels, const std::vector<Values>& bodies,
                   const std::vector<Values>& shares) const;
  double CellArea() const { return domain_.Geometry().cellSize * domain_.Geometry().cellSize; }

  const CellTotals& totals_;
  ProgressPart progress_;
  GridData domain_;
  std::size_t cells_ = 0;
};

std::string CellAdder::Read(const TotalledQuantity& asked, Values& values) {
  progress_.ThrowIfCancelled();
  const CheckedQuantity& quantity = asked.quantity;
  if (quantity.isUniform) {
    values.assign(cells_, static_cast<double>(quantity.value));
  } else {
    std::shared_ptr<const GridData> grid;
    if (quantity.grid) {
      quantity.grid->Run(progress_);
      progress_.ThrowIfCancelled();
      if (!(grid = quantity.grid->Result())) return quantity.grid->Problem();
    } else {
      auto made = std::make_shared<GridData>();
      if (const FileResult built = BuildGrid(quantity.source, progress_, *made); !built.Ok()) return built.error;
      grid = std::move(made);
    }
    const ItemType* type = FindItemType(asked.itemType);
    const Unit* unit = FindUnit(grid->ItemUnit());
    const bool converts = type && unit && AllowsUnit(*type, unit->key);
    values.clear();
    for (const std::optional<float>& value : ValuesIn(domain_, *grid)) {
      const double stored = value ? static_cast<double>(*value) : kUnknown;
      values.push_back(converts ? Convert(stored, *unit, BaseUnit(*type)) : stored);
    }
  }
  if (asked.valueOfCode.empty()) return {};
  for (double& value : values) {
    const auto found = std::isnan(value) ? asked.valueOfCode.end() : asked.valueOfCode.find(static_cast<int>(value));
    value = found == asked.valueOfCode.end() ? kUnknown : double{found->second};
  }
  return {};
}

std::string CellAdder::ReadLevels(const TotalledBodies& bodies, std::vector<Values>& levels) {
  levels.resize(1);
  if (std::string problem = Read(bodies.ground, levels[0]); !problem.empty()) return problem;
  for (const TotalledQuantity& bottom : bodies.bottoms) {
    Values values;
    if (std::string problem = Read(bottom, values); !problem.empty()) return problem;
    for (std::size_t cell = 0; cell < cells_; ++cell) {
      if (bottom.quantity.isAboveGround) values[cell] += levels[0][cell];
      // Not a number where either is none.
      if (!(values[cell] <= levels.back()[cell]) && !std::isnan(values[cell])) values[cell] = levels.back()[cell];
    }
    levels.push_back(std::move(values));
  }
  return {};
}

Values CellAdder::WeightsOf(std::size_t layer, const std::vector<Values>& levels, const std::vector<Values>& bodies,
                            const std::vector<Values>& shares) const {
  Values weights(cells_, 0);
  for (std::size_t cell = 0; cell < cells_; ++cell) {
    const double top = levels[layer][cell], bottom = levels[layer + 1][cell];
    double counted = 0, met = 0;
    for (std::size_t body = 0; body < shares.size(); ++body) {
      const double inBody = std::min(top, bodies[body][cell]) - std::max(bottom, bodies[body + 1][cell]);
      if (!(inBody > 0)) continue;
      met += inBody;
      counted += inBody * shares[body][cell];
    }
    // What no body holds is not known, but for what rounding leaves.
    constexpr double kClose = 1e-3;
    const bool isHeld = met >= (top - bottom) * (1 - kClose);
    weights[cell] = isHeld && !std::isnan(top - bottom) ? counted * CellArea() : kUnknown;
  }
  return weights;
}

std::string CellAdder::Add(CellTotalsResult& result) {
  constexpr double kBegin = 0.1;
  if (const FileResult read = ReadDomain(totals_.domain, progress_.Part(0, kBegin), domain_); !read.Ok())
    return read.error;
  for (const float value : domain_.Values()) cells_ += !domain_.IsEmptyValue(value);
  result.cells = cells_;
  std::vector<Values> levels, bodies, shares;
  if (totals_.levels) {
    if (std::string problem = ReadLevels(*totals_.levels, levels); !problem.empty()) return problem;
    if (std::string problem = ReadLevels(totals_.bodies, bodies); !problem.empty()) return problem;
    for (const TotalledQuantity& share : totals_.shares)
      if (std::string problem = Read(share, shares.emplace_back()); !problem.empty()) return problem;
  }
  for (std::size_t layer = 0; layer < totals_.layers.size(); ++layer) {
    progress_.Report(kBegin + (1 - kBegin) * static_cast<double>(layer) / static_cast<double>(totals_.layers.size()));
    CellTotalsResult::Sum& sum = result.layers.emplace_back();
    if (!totals_.layers[layer].problem.empty()) continue;
    Values values;
    if (std::string problem = Read(totals_.layers[layer].value, values); !problem.empty()) return problem;
    if (totals_.levels) {
      const Values weights = WeightsOf(layer, levels, bodies, shares);
      for (std::size_t cell = 0; cell < cells_; ++cell) values[cell] *= weights[cell];
    }
    if (totals_.isForArea)
      for (double& value : values) value *= CellArea();
    for (const double value : values) {
      if (std::isnan(value))
        ++sum.unknown;
      else
        sum.sum += value;
    }
    sum.sum *= totals_.factor;
  }
  return {};
}

std::string WithUnitOf(double value, const CellTotals& totals) {
  const std::string number = fmt::format("{:.6g}", value);
  return totals.unit.empty() ? number : fmt::format("{} {}", number, totals.unit);
}

}  // namespace

TotalledQuantity AskTotalled(CData2DKvf& quantity) {
  return {AskQuantity(quantity.GetTitle(), quantity), quantity.GetItemType(), {}};
}

FileResult AddUpCells(const CellTotals& totals, ProgressPart progress, CellTotalsResult& result) {
  try {
    return {CellAdder(totals, progress).Add(result), {}};
  } catch (const Cancelled&) {
    return {"cancelled", {}};
  }
}

const TotalsOfQuantities* TotalsAbove(const CYbSEKvfBase& node) {
  for (const CYbSEKvfBase* above = node.GetParent(); above; above = above->GetParent())
    if (const auto* totals = dynamic_cast<const TotalsOfQuantities*>(above)) return totals;
  return nullptr;
}

std::string TotalsText(const CellTotals& totals, const CellTotalsResult& result) {
  if (totals.layer >= result.layers.size()) return {};
  double all = 0;
  std::size_t added = 0, unknown = 0;
  for (std::size_t layer = 0; layer < result.layers.size(); ++layer) {
    if (!totals.layers[layer].problem.empty()) continue;
    all += result.layers[layer].sum;
    unknown += result.layers[layer].unknown;
    ++added;
  }
  const CellTotals::Layer& own = totals.layers[totals.layer];
  std::string text = totals.title + ": ";
  text += own.problem.empty() ? fmt::format("{} in {}", WithUnitOf(result.layers[totals.layer].sum, totals), own.name)
                              : fmt::format("not known in {}, since {}", own.name, own.problem);
  if (added > 1) text += fmt::format(", {} in all {} layers", WithUnitOf(all, totals), added);
  text += ".";
  if (added < totals.layers.size()) text += fmt::format(" {} layers are left out.", totals.layers.size() - added);
  if (unknown > 0) text += fmt::format(" {} cells are left out, since something is not known there.", unknown);
  if (!totals.remark.empty()) text += " " + totals.remark;
  return text;
}

}  // namespace tervane
