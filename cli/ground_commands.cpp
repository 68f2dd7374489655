// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The ground along a line and below a place, as tables.
#include <cmath>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/setup_file.h"
#include "data/csv_reader.h"
#include "forms/section_profile.h"
#include "pages/parts/ground_column.h"
#include "pages/parts/ground_section.h"
#include "platform/csv_cell.h"
#include "platform/text.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

/// "X,Y"
std::optional<MapPoint> ParsePlace(const std::string& typed) {
  const std::size_t comma = typed.find(',');
  if (comma == std::string::npos) return std::nullopt;
  const auto x = ParseCsvNumber(Trimmed(std::string_view(typed).substr(0, comma)), false);
  const auto y = ParseCsvNumber(Trimmed(std::string_view(typed).substr(comma + 1)), false);
  const bool isPlace = x && y && std::isfinite(*x) && std::isfinite(*y);
  return isPlace ? std::optional(MapPoint{*x, *y}) : std::nullopt;
}

std::string NoPlace(const std::string& typed) {
  return fmt::format("{}: a place was expected, as 600500,5120500", typed);
}

/// For an option that takes a place.
auto TakePlace(std::function<void(MapPoint)> take) {
  return [take = std::move(take)](const std::string& typed) {
    const auto place = ParsePlace(typed);
    if (place) take(*place);
    return place ? std::string() : NoPlace(typed);
  };
}

void PrintRow(const std::vector<std::string>& cells, std::ostream& out) {
  std::string line;
  for (std::size_t i = 0; i < cells.size(); ++i) line += (i > 0 ? "," : "") + CsvCell(OneLine(cells[i]));
  fmt::print(out, "{}\n", line);
}

/// The saturated zone of a setup that was opened; null, with a message, where it takes no part.
CSatZoneKvf* GroundOrReport(CFlowModelDoc& document, const std::string& file, Streams streams) {
  if (!OpenSetup(document, file, streams)) return nullptr;
  PrintLoadReportHint(document, streams);
  auto* zone = document.Root().Important(kSaturatedZone);
  if (zone && zone->IsDataUsedInSetup()) return zone;
  Refuse(streams, fmt::format("{}: the saturated zone takes no part in the setup, so that there are no layers", file));
  return nullptr;
}

struct SectionOptions {
  std::string file;
  MapPoint from, to;
  std::vector<std::string> through;
  double step = 0;
};

int SectionCommand(const SectionOptions& options, Streams streams) {
  std::vector<MapPoint> line{options.from};
  for (const std::string& typed : options.through) {
    const auto corner = ParsePlace(typed);
    if (!corner) return Refuse(streams, "--through " + NoPlace(typed));
    line.push_back(*corner);
  }
  line.push_back(options.to);
  CFlowModelDoc document;
  const CSatZoneKvf* zone = GroundOrReport(document, options.file, streams);
  if (!zone) return kCouldNot;
  GroundSoils soils(*zone);
  SectionContent section = Finished<SectionContent>([&] { return SectionOf(*zone, soils); });
  section.line = std::move(line);
  if (section.IsEmpty()) return Refuse(streams, fmt::format("{}: {}", options.file, section.message));
  const SectionProfile profile = ProfileOf(section, options.step > 0 ? options.step : StepFor(section));
  if (profile.points.empty()) return Refuse(streams, "the line has no length: it begins and ends at one place");
  for (const auto& row : SectionRows(profile)) PrintRow(row, streams.out);
  return kDone;
}

int ColumnCommand(const std::string& file, MapPoint at, Streams streams) {
  CFlowModelDoc document;
  const CSatZoneKvf* zone = GroundOrReport(document, file, streams);
  if (!zone) return kCouldNot;
  GroundSoils soils(*zone);
  GroundColumn column;
  for (;;) {
    Awaited awaited;
    column = ColumnAt(*zone, soils, at, awaited);
    if (awaited.empty()) break;
    for (const auto& computation : awaited) computation->Run();
  }
  if (std::isnan(column.ground)) return Refuse(streams, fmt::format("{}: the place has no ground", file));
  PrintRow({"Kind", "Name", "Top [m]", "Bottom [m]", "Thickness [m]", "Horizontal conductivity [m/s]",
            "Vertical conductivity [m/s]", "Specific yield", "Specific storage [1/m]", "Unit or zone", "Remark"},
           streams.out);
  const auto number = [](double value) { return std::isnan(value) ? std::string() : FormatNumber(value, "%.7g"); };
  // Parameters are kept as floats.
  const auto parameter = [](double value) { return std::isnan(value) ? std::string() : FormatNumber(value, "%.6g"); };
  for (const ColumnPart& part : column.parts)
    PrintRow({part.kind, part.name, number(part.top), number(part.bottom), number(part.thickness),
              parameter(part.horizontalConductivity), parameter(part.verticalConductivity),
              parameter(part.specificYield), parameter(part.specificStorage), part.zone, part.remark},
             streams.out);
  return kDone;
}

}  // namespace

void OfferGroundCommands(CommandOffers& offers) {
  auto options = std::make_shared<SectionOptions>();
  Command section = offers.Offer("section", "Print the levels of the ground along a line as a table (CSV)",
                                 [offers, options] { return SectionCommand(*options, offers.Output()); });
  AddSetup(section, options->file);
  section
      .AddTaken("--from", TakePlace([options](MapPoint place) { options->from = place; }),
                "Where the line begins, in the coordinates of the model: X,Y")
      .Required();
  section.Add("--through", options->through, "A corner of the line: X,Y; given again for each, in their order")
      .OneAtATime();
  section.AddTaken("--to", TakePlace([options](MapPoint place) { options->to = place; }), "Where the line ends: X,Y")
      .Required();
  section.Add("--step", options->step, "Metres between two rows; by default every cell has some").Positive();

  struct ColumnOptions {
    std::string file;
    MapPoint at;
  };
  auto probe = std::make_shared<ColumnOptions>();
  Command column = offers.Offer("column", "Print all that lies below a place as a table (CSV)",
                                [offers, probe] { return ColumnCommand(probe->file, probe->at, offers.Output()); });
  AddSetup(column, probe->file);
  column
      .AddTaken("--at", TakePlace([probe](MapPoint place) { probe->at = place; }),
                "The place, in the coordinates of the model: X,Y")
      .Required();
}

}  // namespace tervane
