// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/climate_change.h"

#include "access/ole_date.h"
#include "geometry/cart.h"
#include "platform/paths.h"
#include "simspec/periods.h"
#include "spatial/domain.h"

namespace tervane {

struct CClimateChange_TVN::Shared {
  explicit Shared(Host* host) : setup(host), outside(host), definition(kvfCreate()) {
    kvfAddTarget(definition, "CCCompare");
  }
  Shared(const Shared&) = delete;
  Shared& operator=(const Shared&) = delete;
  ~Shared() {
    kvfEndSection(definition);
    if (const std::string path = DefinitionFile(); !path.empty()) kvfWrite(definition, path);
    kvfGetErrorGlb();  // nobody is there to be told
    kvfClose(&definition);
  }

  std::string DefinitionFile() const {
    const std::string chosen = outside ? outside->Setting(kDefinitionSetting) : std::string();
    if (!chosen.empty()) return chosen;
#ifdef _WIN32
    return "C:\\CCDefinition_TVN.def";
#else
    const std::string folder = setup.Folder();
    return folder.empty() ? std::string() : ResolvedPath("CCDefinition_TVN.def", folder);
#endif
  }

  AccessedSetup setup;
  Host* outside;
  KvfFile* definition;
};

CClimateChange_TVN::CClimateChange_TVN(Host* host) : shared_(std::make_shared<Shared>(host)) {}

int CClimateChange_TVN::OpenFile(const std::string& path) { return shared_->setup.Open(path); }

int CClimateChange_TVN::SaveFile(const std::string& path) {
  shared_->setup.Save(path);
  return 1;
}

const std::string& CClimateChange_TVN::Error() const { return shared_->setup.Error(); }

CGlobal& CClimateChange_TVN::Root() const { return shared_->setup.Root(); }

std::string CClimateChange_TVN::DefinitionFile() const { return shared_->DefinitionFile(); }

int CClimateChange_TVN::GetSimulationPeriod(double& start, double& end) const {
  const auto* period = Root().Important(kSimulationPeriod);
  if (!period) return 0;
  start = OleDateOf(period->SIMSTART);
  end = OleDateOf(period->SIMEND);
  return 1;
}

int CClimateChange_TVN::GetLongLat(double& longitude, double& latitude) const {
  longitude = latitude = 0;
  const auto* domain = Root().Important(kDomain);
  if (!domain) return 0;
  const GridGeometry geometry = domain->GetModelGeometry();
  if (CYbMapProjection(geometry.projection).IsLocal()) return 0;
  const CYbCartography cartography(geometry.projection, 0, 0, 0);
  return cartography.Problem().empty() && cartography.Proj2Geo(geometry.x0, geometry.y0, longitude, latitude);
}

// ---- Counting, which defines what it counts

int CClimateChange_TVN::CountValues(Family family) {
  kvfAddSection(shared_->definition, kClimateFamilies[family].section);
  return DefineValues(shared_->definition, Inputs(family));
}

int CClimateChange_TVN::CountSeries(Family family) { return DefineSeries(shared_->definition, Inputs(family)); }

int CClimateChange_TVN::CountGrids(Family family) {
  const int count = DefineGrids(shared_->definition, Inputs(family));
  kvfEndSection(shared_->definition);
  return count;
}

// ---- Values and files

namespace {

template <class List>
auto* AtNumber(List& list, int i) {
  return i >= 1 && i <= static_cast<int>(list.size()) ? &list[static_cast<std::size_t>(i) - 1] : nullptr;
}

int ReadFileOf(const DataFileNode* node, std::string& file, int& item) {
  if (!node || node->File.IsEmpty()) return 0;
  file = node->File.Absolute();
  item = node->SelectedItem();
  return 1;
}

int ChooseFileOf(DataFileNode* node, const std::string& file) {
  if (!node) return 0;
  node->Choose(FileName::Picked(file, node->GetRoot()->SetupFolder()));
  return 1;
}

}  // namespace

int CClimateChange_TVN::GetValue(Family family, int i, float& value) const {
  const std::vector<ClimateValue> values = Inputs(family).Values();
  const ClimateValue* found = AtNumber(values, i);
  if (found) value = *found->value;
  return found != nullptr;
}

int CClimateChange_TVN::SetValue(Family family, int i, float value) {
  const std::vector<ClimateValue> values = Inputs(family).Values();
  const ClimateValue* found = AtNumber(values, i);
  if (found) *found->value = value;
  return found != nullptr;
}

DataFileNode* CClimateChange_TVN::SeriesAt(Family family, int i) const {
  const std::vector<DataFileNode*> series = Inputs(family).Series();
  DataFileNode* const* found = AtNumber(series, i);
  return found ? *found : nullptr;
}

int CClimateChange_TVN::GetSeries(Family family, int i, std::string& file, int& item) const {
  return ReadFileOf(SeriesAt(family, i), file, item);
}

int CClimateChange_TVN::SetSeries(Family family, int i, const std::string& file) {
  return ChooseFileOf(SeriesAt(family, i), file);
}

int CClimateChange_TVN::GetGrid(Family family, int i, std::string& file, int& item) const {
  return i == 1 ? ReadFileOf(Inputs(family).Grid(), file, item) : 0;
}

int CClimateChange_TVN::SetGrid(Family family, int i, const std::string& file) {
  return i == 1 ? ChooseFileOf(Inputs(family).Grid(), file) : 0;
}

}  // namespace tervane
