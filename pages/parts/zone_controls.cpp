// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/zone_controls.h"

#include <algorithm>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "pages/parts/create_dialogs.h"
#include "pages/parts/plot_content.h"
#include "platform/item_types.h"

namespace tervane {

namespace {

/// Which zone fills the gaps between polygons.
Control& GapFillChoice(PageForm& form, std::string& filler, const CFMSEKvfBase& owner) {
  return form
      .Choice(
          "Fill Gaps with:",
          [&filler, &owner] {
            const std::vector<std::string> names = ZoneItemTitles(owner);
            return static_cast<int>(std::ranges::find(names, filler) - names.begin());
          },
          [&filler, &owner](int choice) {
            const std::vector<std::string> names = ZoneItemTitles(owner);
            if (choice >= 0 && choice < static_cast<int>(names.size()))
              filler = names[static_cast<std::size_t>(choice)];
          },
          [&filler, &owner] {
            std::vector<std::string> options = ZoneItemTitles(owner);
            // A name that no zone has is listed last until another one is chosen.
            if (std::ranges::find(options, filler) == options.end())
              options.push_back(filler.empty() ? filler : filler + " (not in the list)");
            return options;
          })
      .Key("ShapeGapFillName");
}

/// Sets `filler` to the first zone when none has that name; true when it did.
bool KeepGapFill(std::string& filler, const CFMSEKvfBase& owner) {
  const std::vector<std::string> names = ZoneItemTitles(owner);
  if (names.empty() || std::ranges::find(names, filler) != names.end()) return false;
  filler = names.front();
  return true;
}

/// Looks for zones while the user may watch and give up; then they are unreadable.
FoundZones FindWatched(Host& host, const ZoneFinder& finder) {
  const auto finding =
      std::make_shared<Computed<FoundZones>>("Looking for zones", [finder](FoundZones& found, ProgressPart progress) {
        found = finder(progress);
        return FileResult{progress.IsCancelled() ? kCancelled : "", {}};
      });
  if (host.Compute(finding) && finding->Result()) return *finding->Result();
  FoundZones none;
  none.unreadable = finding->IsDone() ? finding->Problem() : "The file was not read to its end.";
  return none;
}

/// Brings zones in step with what was found, asking before work of the user's would be lost. Gives the hints of what
/// changed.
int SyncOrAsk(Host& host, const FoundZones& found, ZoneSource& source) {
  if (!found.unreadable.empty()) {
    host.ShowMessage(fmt::format("{}\n\nThe zones stay as they are.", found.unreadable), Host::Icon::Warning);
    return kDataChanged;
  }
  if (!found.message.empty()) {
    host.ShowMessage(found.message, Host::Icon::Warning);
    return kDataChanged;
  }
  if (const SyncPlan plan = source.PlanZones(found); !plan.editedRemoved.empty()) {
    std::vector<std::string> names;
    for (const CFMSEKvfGroupBase* zone : plan.editedRemoved) names.push_back(zone->GetStationName());
    const std::string question = fmt::format(
        "These hold values of yours and would be removed:\n\n{}\n\nRemove them? With No all stay as they are.",
        fmt::join(names, "\n"));
    if (host.Ask(question, Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes) return kDataChanged;
  }
  switch (source.SyncZones(found)) {
    case kAdded:
      return kItemAdded | kOrderChanged;
    case kRemoved:
      return kItemDeleted | kOrderChanged;
    case kAddedAndRemoved:
      return kItemDeleted | kItemAdded | kOrderChanged;
    case kReordered:
      return kOrderChanged;
    case kNothing:
      break;
  }
  return kDataChanged;
}

}  // namespace

int SyncWithSource(Host& host, ZoneSource& source) {
  if (!source.HasZones()) return kDataChanged;
  const FoundZones found = FindWatched(host, source.Finder());
  const int hint = SyncOrAsk(host, found, source);
  if (source.SourceKind().hasGapFill) KeepGapFill(source.ShapeGapFillName, source.Owner());
  return hint;
}

void RefreshZones(const CYbSEDlgBase& page, ZoneSource& source, const std::string& action) {
  if (source.IsInForce()) page.UpdateDoc(SyncWithSource(page.Outside(), source) | kRefreshPlots, action);
}

void DescribeZoneSource(PageForm& form, const CYbSEDlgBase& page, ZoneSource& source, const ZoneSourceWords& words) {
  const Condition byCodes = source.ByCodes(), byPolygons = source.ByPolygons();
  const auto sync = [&page, &source] { return SyncWithSource(page.Outside(), source); };
  form.DataFile(words.grid, source.GridFile())
      .Filter(words.gridFilter)
      .DefaultExtension("nds2")
      .ShownWhen(byCodes)
      .Then(sync);
  Control& edit = form.Button("Edit...",
                              [&page, &source, isDomainWanted = words.isDomainWanted] {
                                const FileName& file = source.GridFile().File;
                                if (isDomainWanted) AllowRequest(page.Node(), file, &EditorRequests::domain);
                                EditDataFile(page.Context(), page.Node(), file);
                              })
                      .ShownWhen(byCodes);
  if (words.isEditBeside) edit.Beside();
  form.Button("Create...",
              [&page, &source, sync, newCode = words.newCode] {
                CData2DNdsCreateDlg dialog(page.Context(), newCode ? newCode(page.Node()) : 1.0F, page.Node(),
                                           quantity::kCode);
                if (const auto file = dialog.Run()) {
                  source.GridFile().Choose(*file);
                  page.UpdateDoc(sync(), "Create Grid File");
                }
              })
      .Beside()
      .ShownWhen(byCodes);
  form.ShapeFile(words.shape, source.ShapeFile())
      .Filter(words.shapeFilter)
      .DefaultExtension("shp")
      .ShownWhen(byPolygons)
      .Then(sync)
      .fileQuestion.title = words.shapeTitle;
  form.Shown("Item Name:", [&source] { return source.ShapeFile().Attribute(); }).ShownWhen(byPolygons);
  UnitKeyChoice(form, words.units, "ShapeAxisUnit", source.ShapeAxisUnit, quantity::kMapCoordinate)
      .ShownWhen(byPolygons);
  if (!source.SourceKind().hasGapFill) return;
  GapFillChoice(form, source.ShapeGapFillName, source.Owner()).ShownWhen(byPolygons);
  form.MendWhenShown("Fill Gaps with the First Zone", [&source] {
    return source.UsesPolygons() && KeepGapFill(source.ShapeGapFillName, source.Owner());
  });
}

MapContent ZoneMap(const ZoneSource& source, const CFMSEKvfGroupBase* highlighted) {
  std::vector<const CodedZoneProp*> zones;
  for (const CYbSEKvfBase* child = source.Owner().GetFirstChild(); child; child = source.Owner().GetNextChild(child))
    if (const auto* zone = dynamic_cast<const CodedZoneProp*>(child)) zones.push_back(zone);
  if (source.UsesPolygons()) {
    MapContent map = ShapeFileMap(source.ShapeFile(), source.ShapeAxisUnit);
    if (!map.shapes.empty()) {
      ShapeLayer& areas = map.shapes.front();
      areas.isFilled = !highlighted;
      areas.withLabels = true;
      for (const CodedZoneProp* zone : zones) areas.names.emplace_back(zone->GRIDCODEID, zone->NAME);
    }
    if (highlighted) LetStandOut(map, {.name = highlighted->GetStationId()});
    return map;
  }
  MapContent map = FileMap(source.GridFile());
  if (!map.grids.empty()) {
    map.grids.front().isCodes = true;
    for (const CodedZoneProp* zone : zones)
      map.grids.front().names.emplace_back(static_cast<unsigned>(zone->StationCode()), zone->NAME);
  }
  if (highlighted) LetStandOut(map, {.code = static_cast<float>(highlighted->StationCode())});
  return map;
}

void GoToPickedZone(MapContent& map, const CYbSEDlgBase& page, const ZoneSource& source) {
  map.picked = [&page, &source](const MapPick& pick) {
    const CFMSEKvfGroupBase* zone = nullptr;
    if (source.UsesGridCodes() && pick.value) zone = source.SelectZoneByCode(static_cast<int>(*pick.value));
    if (source.UsesPolygons() && pick.shape) zone = source.SelectZoneByName(pick.shapeValue);
    if (zone && page.Context().selectNode) page.Context().selectNode(*zone);
  };
}

void ZoneName(PageForm& form, const std::string& label, CodedZoneProp& zone) {
  form.Text(label, zone.NAME).Hint(kTreeRebuilt | kDataChanged).Then([&zone] {
    return zone.SetAbbreviatedTitle(zone.NAME), 0;
  });
}

void ZoneIdentity(PageForm& form, const std::string& zones, const CodedZoneProp& zone, const ZoneSource* source,
                  const std::string& codeLabel) {
  const auto id = [&zone] { return zone.GRIDCODEID; };
  form.Shown(codeLabel, id).ShownWhen(fmt::format("the {} are grid codes", zones), [source] {
    return source && source->UsesGridCodes();
  });
  form.Shown("Polygon:", id).ShownWhen(fmt::format("the {} are polygons", zones), [source] {
    return source && source->UsesPolygons();
  });
}

const CodedZonesKvf* ZonesOf(const CodedZoneProp& zone) { return dynamic_cast<const CodedZonesKvf*>(zone.GetParent()); }

void PlaceOfZone(PageForm& form, const CodedZoneProp& zone) {
  const CodedZonesKvf* zones = ZonesOf(zone);
  form.Map([&zone, zones] { return ZoneMap(*zones, &zone); }).ShownWhen("the zones are distributed", [zones] {
    return zones && zones->IsInForce();
  });
}

void DescribeZones(PageForm& form, const CYbSEDlgBase& page, CodedZonesKvf& zones, const ZoneSourceWords& words,
                   TableOfZones& areas) {
  const auto sync = [&page, &zones] { return SyncWithSource(page.Outside(), zones); };
  if (zones.Kind().distribution) form.Choice("Spatial Distribution:", zones.DistributionType).Then(sync);
  Control& type = form.Choice(words.type, zones.Type).Then(sync);
  if (!words.isTypeAlwaysShown) type.ShownWhen(zones.InForce());
  DescribeZoneSource(form, page, zones, words);
  areas.Describe(form, page);
  form.Map([&page, &zones, &areas] {
        MapContent map = ZoneMap(zones, nullptr);
        GoToPickedZone(map, page, zones);
        if (areas.Follow(map.awaited) && page.Context().syncSoon) page.Context().syncSoon();
        return map;
      })
      .ShownWhen(zones.ByCodes() || zones.ByPolygons());
}

}  // namespace tervane
