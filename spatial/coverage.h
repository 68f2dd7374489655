// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Whether the data of a setup cover its simulation and its model domain, and what its forcings come to each year: what
// a modeller looks at before a run. What nodes tell is collected in their own thread, and computed in any other.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "core/node.h"
#include "geometry/grid.h"
#include "platform/progress.h"
#include "spatial/cell_checks.h"
#include "spatial/data_use.h"
#include "spatial/domain_cells.h"
#include "spatial/series_totals.h"

namespace tervane {

// ---- What is asked

/// A file in use.
struct CoverageFile {
  std::string path;          ///< Of its node.
  std::uint64_t serial = 0;  ///< Of its node.
  std::string title;         ///< What it holds: "Topography", "Sion: Precipitation Rate".
  std::string quantity;      ///< The same without whose it is: "Precipitation Rate".
  FileUse use;
  std::optional<GridSource> values;         ///< The quantity that is to have a value in every cell of the domain.
  bool mayLeaveCells = false;               ///< Or in some of them.
  std::vector<Finding> findings;            ///< Of its node.
  std::shared_ptr<ComputedGrid> grid = {};  ///< Of the quantity, where its node keeps it.

  bool operator==(const CoverageFile&) const = default;
};

struct CoverageForcing {
  std::string path;
  std::uint64_t serial = 0;
  Forcing forcing;

  bool operator==(const CoverageForcing&) const = default;
};

/// What a node wants held against each other in the cells of the domain.
struct CoverageCheck {
  std::string path;
  std::uint64_t serial = 0;
  CellCheck check;

  bool operator==(const CoverageCheck&) const = default;
};

/// A list of values for spans of stress periods.
struct CoverageSpans {
  std::string title;
  std::vector<int> ends;  ///< The last period of each span.

  bool operator==(const CoverageSpans&) const = default;
};

struct CoverageRequest {
  std::optional<TimeSpan> simulation;   ///< Nothing while its dates are none.
  std::vector<TimeSpan> stressPeriods;  ///< Into which an engine divides it, ascending; none where it does not.
  std::vector<CoverageSpans> spans;
  DomainSource domain;
  std::vector<CoverageFile> files;
  std::vector<CoverageForcing> forcings;
  std::vector<CoverageCheck> checks;

  bool operator==(const CoverageRequest&) const = default;
};
/// Asks the nodes that take part, as of the latest validation. Reads no values.
CoverageRequest AskCoverage(CYbSEKvfBase& root);

// ---- What is answered

enum class CoverageState { Fine, Note, Warning, Error };
std::string_view NameOf(CoverageState state);

/// How a file covers time and area.
struct CoverageRow {
  CoverageFile file;
  CoverageState state = CoverageState::Fine;
  std::string problem;  ///< Why it cannot be used; then the rest is empty.
  std::string item;     ///< "Rain [mm/day]".

  std::optional<TimeSpan> period;  ///< Of its values; nothing where they hold always.
  std::size_t steps = 0;
  std::int64_t late = 0, early = 0;  ///< Seconds of the simulation before its begin and behind its end.
  std::vector<TimeSpan> gaps;        ///< Within the simulation.

  std::optional<Envelope> extent;
  bool isInDegrees = false;
  std::size_t cells = 0;                                           ///< Of the domain; 0 where none were asked for.
  std::size_t missing = 0;                                         ///< Of these, without a value.
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> missingCells;  ///< 2 where one is missing, 1 in the others.

  std::vector<Finding> remarks;  ///< Of the node and of what was met here, the worst first.

  /// "1990-01-01 to 1999-12-31", "at all times", or empty for what has no times.
  std::string PeriodText() const;
  /// "covers the simulation", "starts 31 days late; 2 gaps, 5 days"; empty where nothing is asked.
  std::string TimeText() const;
  /// "covers the domain", "312 of 5285 cells have no value", "covers 66 of 5285 cells" where that is enough; empty
  /// where nothing is asked.
  std::string AreaText() const;
};

/// What a forcing comes to, in all calendar years that the simulation touches and in the simulation itself.
struct ForcingTotals {
  CoverageForcing forcing;
  TotalForm form;
  struct Column {
    std::string name;  ///< Of the station; "all" for one that serves all, "domain" for the mean over the area.
    std::optional<double> share;  ///< Of the cells of the domain.
    std::vector<PeriodSum> sums;  ///< One for each period.
    std::string problem;
  };
  std::vector<Column> columns;
  std::vector<Finding> remarks;

  /// "Precipitation Rate, total [mm]".
  std::string Heading() const;
  /// "Sion (12%)": with the share of the domain where it is known.
  std::string ColumnText(std::size_t column) const;
  /// "1106", "512 (56%)" with the share of the time that has values, or empty where nothing is known.
  std::string ValueText(std::size_t column, std::size_t period, const TimeSpan& span, int decimals) const;
  /// With how many decimals all its values are told: five digits of the largest at most, and no more than they have.
  int Decimals() const;
};

/// A period for which totals are made.
struct TotalsPeriod {
  std::string name;  ///< "1998", "simulation".
  TimeSpan span;
};

/// What such a check found.
struct CoverageCheckResult {
  CoverageCheck check;
  std::vector<Finding> findings;
};

struct CoverageBoard {
  CoverageRequest request;
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> domain;
  std::string domainProblem;
  std::size_t domainCells = 0;
  std::vector<CoverageRow> rows;
  std::vector<TotalsPeriod> periods;
  std::vector<ForcingTotals> forcings;
  std::vector<CoverageCheckResult> checks;
  std::vector<Finding> spans;  ///< Stress periods without values.
};

/// Computes the board; what `previous` answers to the same question is taken from it. An error is "cancelled" alone.
FileResult ComputeCoverage(const CoverageRequest& request, const CoverageBoard* previous, CoverageBoard& board,
                           ProgressPart progress = {});

/// "312 cells of the domain have no topography"; empty when all have one, or enough.
std::string MissingCellsText(const CoverageRow& row);

}  // namespace tervane
