// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/boundary.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdint>
#include <numeric>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "spatial/domain.h"
#include "subsurface/pages.h"

namespace tervane {

namespace {

using Segment = CGeoDataBoundCondItemKvf;

constexpr float kUndefinedCoordinate = -1e-31F;
static_assert(std::bit_cast<std::uint32_t>(kUndefinedCoordinate) == 0x8C01CEB3);

/// A coordinate of a file that stands for none, by the version of the file.
bool MeansUndefined(double coordinate, int version) {
  constexpr int kLastVersionWithDeleteValues = 12;
  if (version <= kLastVersionWithDeleteValues) return std::abs(coordinate - -1e-35) <= 1e-37;
  // The text of a file has fewer digits than the value.
  constexpr double kUndefinedValue = kUndefinedCoordinate;
  return std::abs(coordinate - kUndefinedValue) < std::abs(kUndefinedValue) / 100;
}

double StepBetween(const CGeoDataBoundCondCatchmentData& traced, const GridCell& from, const GridCell& to) {
  return traced.Geometry().cellSize * std::hypot(to.i - from.i, to.j - from.j);
}

}  // namespace

CGeoDataBoundCondItemKvf::CGeoDataBoundCondItemKvf(CYbSEKvfBase* parent)
    : CYbSEKvfBase("OuterBoundaryProp", "OuterBoundaryProp_%d", parent) {
  SetPage(kBoundarySegmentPage);
  MakeFiles(
      *this, [this] { return GetBoundaryQuantity(); }, !Is(BoundaryType, kZeroFlux), Is(BoundaryType, kFixedHead));
}

double CGeoDataBoundCondItemKvf::GetUndefinedValue() { return kUndefinedCoordinate; }

bool CGeoDataBoundCondItemKvf::HasPoint() const {
  const auto isDefined = [](double coordinate) {
    return std::isfinite(coordinate) && coordinate != GetUndefinedValue();
  };
  return isDefined(X) && isDefined(Y);
}

void CGeoDataBoundCondItemKvf::SetBoundaryType(int type) {
  BoundaryType = type;
  if (type != kFlux && type != kGradient) return;
  if (Type > kSeries) Type = kInitialValue;
  Type = std::max<int>(Type, kConstant);
}

int CGeoDataBoundCondItemKvf::GetBoundaryQuantity() const {
  switch (BoundaryType) {
    case kFixedHead:
      return quantity::kElevation;
    case kFlux:
      return quantity::kDischarge;
    case kGradient:
      return quantity::kHeadGradient;
    default:
      return quantity::kUndefined;
  }
}

const std::string& CGeoDataBoundCondItemKvf::GetAbbreviatedTitle() const {
  if (!Name.empty()) return Name;
  const int number = GetNumberWhatAmI();
  const auto* list = dynamic_cast<const CGeoDataBoundCondListKvf*>(GetParent());
  const bool isLast = !list || number >= list->GetItemCount();
  shownTitle_ = fmt::format("{} to {}", number, isLast ? 1 : number + 1);
  return shownTitle_;
}

void CGeoDataBoundCondItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Name", Name);
  keys("X", X).Quantity(quantity::kMapCoordinate);
  keys("Y", Y).Quantity(quantity::kMapCoordinate);
  keys("BoundaryType", BoundaryType).OneOf(kBoundaryTypes);
  keys("FixedValue", FixedValue).Quantity(GetBoundaryQuantity());
  keys("Type", Type);
  if (!keys.Section()) return;
  for (double* coordinate : {&X, &Y})
    if (MeansUndefined(*coordinate, keys.DocVersion())) *coordinate = kUndefinedCoordinate;
}

// ---- The list

CGeoDataBoundCondListKvf::CGeoDataBoundCondListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("Outer Boundary Conditions", "OuterBoundary", parent) {
  SetPage(kOuterBoundaryPage);
  TakesPartWhen(Component(&CModelCompKvf::WM));
}

std::shared_ptr<Computed<TracedDomain>> CGeoDataBoundCondListKvf::Trace() const {
  auto* domain = Important(kDomain);
  return domain ? domain->Traced() : nullptr;
}

bool CGeoDataBoundCondListKvf::LoadDomain() {
  const auto trace = Trace();
  if (trace) trace->Run();
  return GetCatchmentData() != nullptr;
}

std::string CGeoDataBoundCondListKvf::GetTraceFault() const {
  const auto trace = Trace();
  return trace && trace->IsDone() && trace->Result() ? trace->Result()->fault : std::string();
}

const CGeoDataBoundCondCatchmentData* CGeoDataBoundCondListKvf::GetCatchmentData() const {
  const auto trace = Trace();
  const bool isTraced = trace && trace->IsDone() && trace->Result() && trace->Result()->fault.empty();
  return isTraced ? &trace->Result()->grid : nullptr;
}

std::vector<BoundaryItem> CGeoDataBoundCondListKvf::Segments() const {
  std::vector<BoundaryItem> segments;
  segments.reserve(static_cast<std::size_t>(GetItemCount()));
  for (int number = 1; number <= GetItemCount(); ++number) {
    const Segment& segment = *GetItem(number);
    std::optional<MapPoint> point;
    if (segment.HasPoint()) point = MapPoint{segment.X, segment.Y};
    segments.push_back({point, segment.BoundaryType});
  }
  return segments;
}

bool CGeoDataBoundCondListKvf::SortSegments() {
  const auto* traced = GetCatchmentData();
  if (!traced || GetItemCount() < 2) return false;
  const std::vector<std::size_t> order = traced->BoundaryOrder(Segments());
  if (std::ranges::is_sorted(order)) return false;
  std::vector<std::size_t> now(order.size());
  std::iota(now.begin(), now.end(), std::size_t{0});
  for (std::size_t place = 0; place < order.size(); ++place) {
    auto at = static_cast<std::size_t>(std::ranges::find(now, order[place]) - now.begin());
    for (; at > place; --at) {
      MoveItemUp(static_cast<int>(at) + 1, 1);
      std::swap(now[at], now[at - 1]);
    }
  }
  return true;
}

const CGeoDataBoundCondItemKvf& CGeoDataBoundCondListKvf::Next(const CGeoDataBoundCondItemKvf& segment) const {
  const int number = GetNumberWhatIs(&segment);
  return *GetItem(number < GetItemCount() ? number + 1 : 1);
}

int CGeoDataBoundCondListKvf::ValidateData() {
  if (GetItemCount() > 0 && !DomainLoaded) DomainLoaded = LoadDomain();
  return 1;
}

std::vector<double> LengthsAlong(const CGeoDataBoundCondCatchmentData& traced,
                                 const std::vector<BoundaryItem>& segments) {
  const std::vector<GridCell>& cells = traced.BoundaryCells;
  const std::size_t count = cells.size();
  std::vector<double> lengths(segments.size(), 0.0);
  // How far it is from the first cell of the trace to each cell, and once around.
  std::vector<double> far(count + 1, 0.0);
  for (std::size_t place = 0; place < count; ++place) {
    far[place + 1] = far[place] + StepBetween(traced, cells[place], cells[(place + 1) % count]);
  }
  if (segments.size() == 1) lengths.front() = far.back();
  if (segments.size() < 2 || !std::ranges::all_of(segments, [](const auto& item) { return item.point.has_value(); }))
    return lengths;
  std::vector<double> starts;
  for (const BoundaryItem& segment : segments) {
    const GridCell start = traced.NearestBoundaryCell(segment.point->x, segment.point->y);
    starts.push_back(far[static_cast<std::size_t>(std::max(traced.GetBoundaryIndex(start) - 1, 0))]);
  }
  for (std::size_t number = 0; number < segments.size(); ++number) {
    const double length = starts[(number + 1) % starts.size()] - starts[number];
    lengths[number] = length < 0 ? length + far.back() : length;
  }
  return lengths;
}

std::vector<double> LengthsInCells(const CGeoDataBoundCondCatchmentData& traced) {
  const GridGeometry& geometry = traced.Geometry();
  const std::vector<GridCell>& cells = traced.BoundaryCells;
  std::vector<double> lengths(geometry.CellCount(), 0.0);
  const auto of = [&](const GridCell& cell) -> double& {
    return lengths[static_cast<std::size_t>(cell.j) * static_cast<std::size_t>(geometry.nx) +
                   static_cast<std::size_t>(cell.i)];
  };
  for (std::size_t place = 0; place < cells.size(); ++place) {
    const GridCell &from = cells[place], &to = cells[(place + 1) % cells.size()];
    const double half = StepBetween(traced, from, to) / 2;
    of(from) += half;
    of(to) += half;
  }
  return lengths;
}

}  // namespace tervane
