// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The conditions at the outer boundary of a computational layer: segments that follow each other clockwise around the
// model domain, each from its point to the next one's.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "core/list.h"
#include "spatial/domain_boundary.h"
#include "subsurface/valued_boundary.h"

namespace tervane {

class CGeoDataBoundCondItemKvf : public CYbSEKvfBase, public ValuedBoundary {
 public:
  explicit CGeoDataBoundCondItemKvf(CYbSEKvfBase* parent);

  enum Boundary : int { kZeroFlux = 0, kFixedHead = 1, kFlux = 2, kGradient = 3 };
  static constexpr KeyChoice kBoundaryTypes[] = {
      {kZeroFlux, "Zero-Flux"}, {kFixedHead, "Fixed Head"}, {kFlux, "Flux"}, {kGradient, "Gradient"}};

  std::string Name;
  double X = GetUndefinedValue(), Y = GetUndefinedValue();  ///< Where the segment starts.

  /// Takes another type and corrects `Type` for a flux and a gradient.
  void SetBoundaryType(int type);
  /// The quantity of the value.
  int GetBoundaryQuantity() const;
  /// What a coordinate is while the user has given none.
  static double GetUndefinedValue();
  bool HasPoint() const;

  /// The name, or the numbers of this segment and the next one: "2 to 3".
  const std::string& GetTitle() const override { return GetAbbreviatedTitle(); }
  const std::string& GetAbbreviatedTitle() const override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  mutable std::string shownTitle_;
};

class CGeoDataBoundCondListKvf : public CYbSEKvfListBase<CGeoDataBoundCondItemKvf> {
 public:
  explicit CGeoDataBoundCondListKvf(CYbSEKvfBase* parent);

  bool DomainLoaded = false;  ///< Not stored: the domain was once read and traced.

  /// Makes sure that the domain is read and its boundary traced; false where that is not possible. The trace is the
  /// domain's, and all lists share it.
  bool LoadDomain();
  /// Why the domain's boundary cannot be traced; empty where it can, and where the domain cannot be read.
  std::string GetTraceFault() const;
  /// The tracing, for those who can wait; null in a tree without a domain.
  std::shared_ptr<Computed<TracedDomain>> Trace() const;
  /// The traced domain; null where there is none yet.
  const CGeoDataBoundCondCatchmentData* GetCatchmentData() const;

  /// The segments as they are painted.
  std::vector<BoundaryItem> Segments() const;
  /// Brings the segments in the order in which they follow each other along the boundary; false where they stood so,
  /// and where the order cannot be told.
  bool SortSegments();
  /// The segment behind that one, the first one behind the last.
  const CGeoDataBoundCondItemKvf& Next(const CGeoDataBoundCondItemKvf& segment) const;

  /// A domain that cannot be traced is no error of a list; the saturated zone tells it once for all.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfBoundaryConditions", *this); }
};

/// The length of each segment along the centres of its boundary cells, in metres; 0 where it covers none.
std::vector<double> LengthsAlong(const CGeoDataBoundCondCatchmentData& traced,
                                 const std::vector<BoundaryItem>& segments);
/// How much of that line belongs to each cell of the grid, in metres: half of the way to the boundary cells on both
/// sides; 0 off the boundary.
std::vector<double> LengthsInCells(const CGeoDataBoundCondCatchmentData& traced);

}  // namespace tervane
