// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/placement.h"

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "geometry/cart.h"
#include "geometry/shapes.h"
#include "geometry/xyz_text.h"
#include "platform/paths.h"
#include "platform/units.h"
#include "spatial/domain.h"
#include "spatial/file_fixes.h"

namespace tervane {

namespace {

Envelope InMetres(const Envelope& box, int axisUnit) {
  const Unit* unit = FindUnit(axisUnit);
  if (!unit || unit->scale.dimension != Dimension::Length) return box;
  const UnitConversion toMetres = *ConversionBetween(unit->scale, UnitScale{Dimension::Length});
  return {toMetres(box.xMin), toMetres(box.yMin), toMetres(box.xMax), toMetres(box.yMax)};
}

FilePlace LocateItem(const std::string& path, int number) {
  FilePlace place;
  const auto facts = DataFileFactsOf(path);
  const DataItem* item = facts->Item(number);
  if (!item || item->dimensions < 2) return place;
  place.isUnplaced = !item->geometry.IsPlaced();
  if (place.isUnplaced) return place;
  place.isKnown = true;
  place.extent = EnvelopeOf(item->geometry);
  place.isGeographical = item->geometry.isGeographical;
  place.projection = item->geometry.projection;
  return place;
}

FilePlace LocateShapes(const FileUse& use) {
  FilePlace place;
  const auto facts = ShapeFactsOf(use.path);
  if (!facts->error.empty() || !facts->extent) return place;
  place.isKnown = true;
  place.projection = facts->projection;
  place.isGeographical = CYbMapProjection(facts->projection).IsGeographical();
  place.extent = place.isGeographical ? *facts->extent : InMetres(*facts->extent, use.axisUnit);
  if (place.projection.empty())
    place.projectionFile = use.path.substr(0, use.path.size() - ExtensionOf(use.path).size()) + ".prj";
  return place;
}

std::string BoxInWords(const Envelope& box) {
  return fmt::format("x {} to {}, y {} to {}", FormatNumber(box.xMin, "%.9g"), FormatNumber(box.xMax, "%.9g"),
                     FormatNumber(box.yMin, "%.9g"), FormatNumber(box.yMax, "%.9g"));
}

bool Overlap(const Envelope& a, const Envelope& b) {
  return a.xMin <= b.xMax && b.xMin <= a.xMax && a.yMin <= b.yMax && b.yMin <= a.yMax;
}

std::string NameOf(const std::string& projection) {
  const CYbMapProjection system(projection);
  return system.IsLocal() ? "a local plane" : system.Name();
}

}  // namespace

FilePlace LocateFile(const FileUse& use) {
  if (use.path.empty()) return {};
  if (use.kind == FileUse::Kind::Data) return LocateItem(use.path, use.item);
  if (use.kind == FileUse::Kind::Shape) return LocateShapes(use);
  FilePlace place;
  const auto facts = XyzFactsOf(use.path);
  if (!facts->error.empty()) return place;
  place.isKnown = true;
  place.extent = InMetres(facts->extent, use.axisUnit);
  return place;
}

std::optional<GridGeometry> DomainGeometryOf(const CYbSEKvfBase& node) {
  const auto* domain = node.Important(kDomain);
  if (!domain || !domain->HasGeometry()) return std::nullopt;
  return domain->GetModelGeometry();
}

std::vector<Finding> FindMisplacement(const FilePlace& place, const GridGeometry& domain) {
  std::vector<Finding> findings;
  const auto add = [&](Severity severity, const char* text, std::string detail) {
    findings.push_back({severity, text, "FILE_NAME", std::move(detail)});
  };
  if (place.isUnplaced)
    add(Severity::Warning, "The file does not tell where its grid lies",
        "it is taken to begin at 0, 0 with cells of 1 m; give its rows and columns coordinates");
  if (!place.isKnown) return findings;
  if (place.isGeographical) {
    // Degrees and metres have no place in common that could be compared.
    add(Severity::Warning, kInDegrees,
        fmt::format("{}; transform it to {}, the system of the model domain",
                    place.projection.empty() ? "its system is not told" : "its system is " + NameOf(place.projection),
                    NameOf(domain.projection)));
    return findings;
  }
  const CYbMapProjection own(place.projection), wanted(domain.projection);
  if (!place.projectionFile.empty()) {
    add(Severity::Note, "The file tells no projection",
        fmt::format("{} does not exist; its coordinates are taken for those of the model domain",
                    place.projectionFile));
  } else if (const std::string problem = own.Problem(); !problem.empty()) {
    add(Severity::Warning, "The projection of the file is not known",
        problem + "; its coordinates are taken for those of the model domain");
  } else if (!place.projection.empty() && !own.IsSameAs(wanted) && !(own.IsLocal() && wanted.IsLocal())) {
    add(Severity::Warning, kOtherProjection,
        fmt::format("it is in {}, the domain in {}; its coordinates are taken for those of the domain",
                    NameOf(place.projection), NameOf(domain.projection)));
  }
  const Envelope area = EnvelopeOf(domain);
  if (place.extent && !Overlap(*place.extent, area))
    add(Severity::Warning, "The file does not overlap the model domain",
        fmt::format("it covers {}, the domain {}", BoxInWords(*place.extent), BoxInWords(area)));
  return findings;
}

}  // namespace tervane
