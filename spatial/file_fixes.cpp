// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/file_fixes.h"

#include <optional>

#include <fmt/format.h>

#include "geometry/cart.h"
#include "platform/units.h"
#include "simspec/periods.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

std::string ItemInWords(const DataFileFacts& facts, int number) {
  const DataItem* item = facts.Item(number);
  return item && !item->name.empty() ? fmt::format("{} ({})", number, item->name) : std::to_string(number);
}

void PlanItem(DataFileNode& node, FixPlan& plan) {
  const auto leave = [&](std::string why) { plan.left.push_back({&node, "FILE_NAME", std::move(why)}); };
  const auto facts = DataFileFactsOf(node.File.Absolute());
  if (!facts->error.empty()) return leave(facts->error);
  const DataFileRequest request = node.SetUpNdsValidation();
  std::vector<int> fitting;
  for (int number = 1; facts->Item(number); ++number)
    if (WhyNotMet(*facts, {&number, 1}, request).empty()) fitting.push_back(number);
  if (fitting.empty()) return leave("no item of the file will do");
  if (fitting.size() > 1)
    return leave(fmt::format("{} items of the file will do: choose one on the page", fitting.size()));
  const int item = fitting.front();
  plan.values.push_back(
      {&node, "ITEM_NUMBERS", ItemInWords(*facts, node.SelectedItem()), ItemInWords(*facts, item), [&node, item] {
         node.Items = {item};
         return std::string();
       }});
}

void PlanAttribute(CData2DShpFile& node, FixPlan& plan) {
  const auto leave = [&](std::string why) { plan.left.push_back({&node, "FILE_NAME", std::move(why)}); };
  const std::string path = node.File.Absolute();
  const auto facts = ShapeFactsOf(path);
  if (!facts->error.empty()) return leave(facts->error);
  std::vector<std::string> fitting;
  for (const ShapeField& field : facts->fields)
    if (CheckShapeFile(path, node.Request(), field.name).Ok()) fitting.push_back(field.name);
  if (fitting.empty()) return leave("no attribute of the file will do");
  if (fitting.size() > 1)
    return leave(fmt::format("{} attributes of the file will do: choose one on the page", fitting.size()));
  plan.values.push_back({&node, "ITEM_NUMBERS", node.Attribute(), fitting.front(), [&node, name = fitting.front()] {
                           node.Items = {name};
                           return std::string();
                         }});
}

bool HasUnfitItem(const FoundAt& found) {
  if (found.key != "FILE_NAME") return false;
  if (const auto* file = dynamic_cast<const DataFileNode*>(found.node))
    return !file->File.IsEmpty() && FileExists(file->File.Absolute()) && !file->WhyNotValid().empty();
  const auto* shapes = dynamic_cast<const CData2DShpFile*>(found.node);
  return shapes && !shapes->File.IsEmpty() && FileExists(shapes->File.Absolute()) && !shapes->WhyNotValid().empty();
}

void PlanItems(std::span<const FoundAt> found, const FixContext&, FixPlan& plan) {
  for (const FoundAt& finding : found) {
    if (auto* file = dynamic_cast<DataFileNode*>(finding.node))
      PlanItem(*file, plan);
    else if (auto* shapes = dynamic_cast<CData2DShpFile*>(finding.node))
      PlanAttribute(*shapes, plan);
  }
}

/// A date as a setup holds it, with whole minutes; not before it when `up`.
CYbDateTime WholeMinute(const CYbDateTime& date, bool up) {
  const std::int64_t seconds = date.Second();
  return seconds == 0 ? date : date + CYbDateTimeSpan{up ? 60 - seconds : -seconds};
}

struct Coverage {
  CYbDateTime start, end;
};

std::optional<Coverage> CoverageOf(const DataFileNode& node) {
  const auto facts = DataFileFactsOf(node.File.Absolute());
  const DataItem* item = facts->Item(node.SelectedItem());
  if (!item || !item->hasTime || facts->time.stamps.empty()) return std::nullopt;
  return Coverage{WholeMinute(StartOfValues(*item, facts->time), true), WholeMinute(facts->time.End(), false)};
}

void PlanPeriod(std::span<const FoundAt> found, const FixContext&, FixPlan& plan) {
  std::optional<Coverage> common;
  for (const FoundAt& finding : found) {
    const auto* file = dynamic_cast<const DataFileNode*>(finding.node);
    const std::optional<Coverage> own = file ? CoverageOf(*file) : std::nullopt;
    if (!own) {
      plan.left.push_back({finding.node, finding.key, "the file tells no dates"});
      continue;
    }
    if (!common) common = own;
    common->start = std::max(common->start, own->start);
    common->end = std::min(common->end, own->end);
  }
  auto* period = common ? found.front().node->Important(kSimulationPeriod) : nullptr;
  if (!period) return;
  const CYbDateTime held = period->GetSimStartDate();
  const auto leave = [&](std::string_view key, std::string why) {
    plan.left.push_back({period, std::string(key), std::move(why)});
  };
  const CYbDateTime start = std::max(held, common->start), end = std::min(period->SIMEND, common->end);
  if (!start.IsValid() || !end.IsValid() || end <= start)
    return leave("SIMEND", fmt::format("no simulation lies within what the files cover, {} to {}",
                                       DateInWords(common->start), DateInWords(common->end)));
  const auto change = [&](const char* key, const CYbDateTime& before, const CYbDateTime& after, CYbDateTime& member) {
    plan.values.push_back({period, key, DateInWords(before), DateInWords(after), [&member, after] {
                             member = after;
                             return std::string();
                           }});
  };
  if (start != held) {
    if (held != period->SIMSTART)
      leave("SIMSTART", "the simulation starts from the date of the hot start: choose another one on the page");
    else
      change("SIMSTART", held, start, period->SIMSTART);
  }
  if (end != period->SIMEND) change("SIMEND", period->SIMEND, end, period->SIMEND);
}

CCatchmentKvf* DomainOfShapes(const FoundAt& found) {
  auto* domain = found.node->Important(kDomain);
  return domain && domain->Type == CCatchmentKvf::kShapeFile && found.node == &domain->ShapeFile() ? domain : nullptr;
}

void PlanProjection(std::span<const FoundAt> found, const FixContext&, FixPlan& plan) {
  for (const FoundAt& finding : found) {
    CCatchmentKvf* domain = DomainOfShapes(finding);
    if (!domain) continue;
    const std::string projection = ShapeFactsOf(domain->ShapeFile().File.Absolute())->projection;
    const CYbMapProjection system(projection);
    if (projection.empty() || !system.Problem().empty() || system.IsGeographical()) {
      plan.left.push_back({domain, "MapProjShp", "the file's system is none in which a model can lie"});
      continue;
    }
    const auto nameOf = [](const CYbMapProjection& of) { return of.IsLocal() ? "a local plane" : of.Name(); };
    plan.values.push_back(
        {domain, "MapProjShp", nameOf(CYbMapProjection(domain->MapProjShp)), nameOf(system), [domain, projection] {
           domain->MapProjShp = projection;
           return std::string();
         }});
  }
}

}  // namespace

const FixKind kOnlyItem{"only-item", "Take the Only Item That Will Do", HasUnfitItem, PlanItems};
const FixKind kPeriodOfData{
    "period-of-data", "Set the Simulation Period to What the Data Cover",
    [](const FoundAt& found) { return found.text == kNotCovering && dynamic_cast<DataFileNode*>(found.node); },
    PlanPeriod};
const FixKind kProjectionOfShapes{
    "projection", "Take the Projection of the Domain's Shapes",
    [](const FoundAt& found) { return found.text == kOtherProjection && DomainOfShapes(found); }, PlanProjection};

}  // namespace tervane
