// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/kinetra_specification.h"

#include <algorithm>
#include <chrono>
#include <unordered_map>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "platform/files.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "wqpt/ground.h"
#include "wqpt/kinetra_parameters.h"
#include "wqpt/kinetra_values.h"
#include "wqpt/pages.h"
#include "wqpt/species.h"
#include "wqpt/water_quality_layers.h"

namespace tervane {

namespace {

constexpr KeyChoice kMethods[] = {
    {CKinetraSolver::kEuler, "EULER"}, {CKinetraSolver::kRk4, "RK4"}, {CKinetraSolver::kRkqc, "RKQC"}};

struct CompartmentRow {
  const char *enabledKey, *fileKey, *methodKey, *frequencyKey;
  const char *constants, *constantsTitle, *forcings, *forcingsTitle;
  int CModelCompWQKvf::*component;
  std::uint64_t needs;
};
constexpr CompartmentRow kCompartmentRows[kKinetraCompartments] = {
    {"Kinetra_OL", "TemplateFile_OL", "Method_OL", "Freq_OL", "OL_Constants", "Kinetra Constants, OL", "OL_Forcings",
     "Kinetra Forcings, OL", &CModelCompWQKvf::OL, kNeedsOverland},
    {"Kinetra_UZ", "TemplateFile_UZ", "Method_UZ", "Freq_UZ", "UZ_Constants", "Kinetra Constants, UZ", "UZ_Forcings",
     "Kinetra Forcings, UZ", &CModelCompWQKvf::UZ, kNeedsUnsaturated},
    {"Kinetra_SZ", "TemplateFile_SZ", "Method_SZ", "Freq_SZ", "SZ_Constants", "Kinetra Constants, SZ", "SZ_Forcings",
     "Kinetra Forcings, SZ", &CModelCompWQKvf::SZ, kNeedsSaturated}};

const CompartmentRow& RowOf(int compartment) { return kCompartmentRows[static_cast<std::size_t>(compartment)]; }

/// Year, month, day, hour, minute and second of the latest writing, in UTC; six times -1 where there is no file.
std::vector<int> WriteTimeOf(const FileName& file) {
  const FileStamp stamp = file.IsEmpty() ? FileStamp() : StampOf(file.Absolute());
  if (!stamp.exists) return std::vector<int>(6, -1);
  const auto written =
      std::chrono::floor<std::chrono::seconds>(std::chrono::file_clock::to_sys(stamp.time)).time_since_epoch();
  const CYbDateTime time = CYbDateTime::FromSecondsSinceEpoch(written.count());
  return {time.Year(), time.Month(), time.Day(), time.Hour(), time.Minute(), time.Second()};
}

std::vector<KinetraBinding> Unbound(const std::vector<CKinetraSolverItem>& items) {
  std::vector<KinetraBinding> bindings;
  for (const CKinetraSolverItem& item : items) bindings.push_back({&item});
  return bindings;
}

/// Bindings by their symbols, of which a template may have very many. Of two that differ in case only the first counts.
class BindingIndex {
 public:
  explicit BindingIndex(std::vector<KinetraBinding>& bindings) {
    for (KinetraBinding& binding : bindings) bindings_.try_emplace(LowerCase(binding.item->symbol), &binding);
  }
  KinetraBinding* Find(const std::string& symbol) const {
    const auto found = bindings_.find(LowerCase(symbol));
    return found == bindings_.end() ? nullptr : found->second;
  }

 private:
  std::unordered_map<std::string, KinetraBinding*> bindings_;
};

/// The symbols that need values of their own.
std::vector<std::string> SymbolsWithValues(const std::vector<KinetraBinding>& bindings) {
  std::vector<std::string> symbols;
  for (const KinetraBinding& binding : bindings)
    if (!binding.item->IsModelParameter()) symbols.push_back(binding.item->symbol);
  return symbols;
}

const CKinetraSpecKvf* SpecificationOf(const CYbSEKvfBase& node) { return node.Important(kKinetraSpecification); }

}  // namespace

// ---- A template in use

void CKinetraSolver::Load() {
  const auto before = content_;  // Which the old bindings lead to.
  auto oldConstants = std::move(constants), oldForcings = std::move(forcings);
  content_ = ReadKinetraTemplate(file.IsEmpty() ? std::string() : file.Absolute());
  constants = Unbound(content_->constants);
  forcings = Unbound(content_->forcings);
  for (auto [bindings, old] : {std::pair{&constants, &oldConstants}, std::pair{&forcings, &oldForcings}}) {
    const BindingIndex oldBindings(*old);
    for (KinetraBinding& binding : *bindings)
      if (const KinetraBinding* same = oldBindings.Find(binding.item->symbol)) {
        binding.dataType = same->dataType;
        binding.unit = same->unit;
      }
  }
}

std::vector<int> CKinetraSolver::BoundNumbers() const {
  std::vector<int> numbers;
  for (const auto* bindings : {&constants, &forcings})
    for (const KinetraBinding& binding : *bindings) numbers.insert(numbers.end(), {binding.dataType, binding.unit});
  return numbers;
}

void CKinetraSolver::Restore(std::shared_ptr<const KinetraTemplate> content, const std::vector<int>& boundNumbers) {
  content_ = std::move(content);
  constants = Unbound(content_->constants);
  forcings = Unbound(content_->forcings);
  auto number = boundNumbers.begin();
  for (auto* bindings : {&constants, &forcings})
    for (KinetraBinding& binding : *bindings) {
      if (boundNumbers.end() - number < 2) return;
      binding.dataType = *number++;
      binding.unit = *number++;
    }
}

// ---- The bindings of a compartment

CKinetraCompSpecKvf::CKinetraCompSpecKvf(int compartment, bool isOfForcings, CYbSEKvfBase* parent)
    : CTvnKvfBase(isOfForcings ? RowOf(compartment).forcingsTitle : RowOf(compartment).constantsTitle,
                  isOfForcings ? RowOf(compartment).forcings : RowOf(compartment).constants, parent),
      compartment_(compartment),
      isOfForcings_(isOfForcings) {
  SetPage(kKinetraBindingPage);
  TakesPartWhen(On(Solver().enabled));
}

CKinetraSolver& CKinetraCompSpecKvf::Solver() const {
  return static_cast<CKinetraSpecKvf*>(GetParent())->Solver(compartment_);
}

std::uint64_t CKinetraCompSpecKvf::Mask() const {
  std::uint64_t mask = RowOf(compartment_).needs;
  if (compartment_ == kKinetraUnsaturated && FullMacroporeFlow().Holds(*this)) mask |= kNeedsMacropores;
  if (compartment_ == kKinetraSaturated && ImmobileWaterModelled().Holds(*this)) mask |= kNeedsSecondaryPorosity;
  return mask;
}

void CKinetraCompSpecKvf::ExchangeKeys(KeyExchange& keys) {
  std::vector<KeyLine> lines;
  const char* key = isOfForcings_ ? "Forcing" : "Constant";
  if (!keys.Section())
    for (const KinetraBinding& binding : Bindings())
      lines.push_back({binding.item->symbol, binding.dataType, binding.unit});
  keys.Lines(isOfForcings_ ? "NumberOfForcings" : "NumberOfConstants", key, lines);
  if (!keys.Section()) return;
  std::vector<std::string> unknown;
  const BindingIndex bindings(Bindings());
  for (const KeyLine& line : lines) {
    if (KinetraBinding* binding = bindings.Find(line.text)) {
      binding->dataType = line.first;
      binding->unit = line.second;
    } else {
      unknown.push_back(line.text);
    }
  }
  readingMessage_.clear();
  if (unknown.empty()) return;
  readingMessage_ =
      "An Kinetra constant or forcing variable used in this Tervane setup file\nis not defined in the referenced "
      "Kinetra "
      "template file";
  kvfAddNote(keys.Section(), key, fmt::format("the template does not declare {}", fmt::join(unknown, ", ")));
}

// ---- The node

CKinetraSpecKvf::CKinetraSpecKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Kinetra Template Specification", "KinetraTemplateSpecification", parent) {
  SetPage(kKinetraSpecificationPage);
  TakesPartWhen(WaterQualityProcesses(kKinetra));
  for (int compartment = 0; compartment < kKinetraCompartments; ++compartment)
    for (const bool isOfForcings : {false, true}) NewChild<CKinetraCompSpecKvf>(compartment, isOfForcings);
}

bool CKinetraSpecKvf::IsCompartmentActive(int bits) const { return CompartmentActive(bits).Holds(*this); }

bool CKinetraSpecKvf::IsBuiltInUsed(int code) const {
  const auto isBound = [code](const KinetraBinding& binding) {
    return binding.item->IsModelParameter() && binding.dataType == code;
  };
  return std::ranges::any_of(solvers_, [&](const CKinetraSolver& solver) {
    return solver.enabled &&
           (std::ranges::any_of(solver.constants, isBound) || std::ranges::any_of(solver.forcings, isBound));
  });
}

void CKinetraSpecKvf::SetTemplate(int compartment, FileName file, bool lSync) {
  CKinetraSolver& solver = Solver(compartment);
  if (compartment == kKinetraOverland && EqualIgnoringCase(file.Text(), solver.file.Text())) return;
  solver.file = std::move(file);
  solver.Load();
  if (!lSync) return;
  std::vector<std::string> added;
  SynchronizeValues(compartment, added);
  UpdateSpecies(added);
}

std::vector<std::string> CKinetraSpecKvf::RefreshTemplates() {
  std::vector<std::string> added;
  for (int compartment = 0; compartment < kKinetraCompartments; ++compartment) {
    if (!IsCompartmentActive(1 << compartment)) continue;
    Solver(compartment).Load();
    SynchronizeValues(compartment, added);
  }
  UpdateSpecies(added);
  return added;
}

std::vector<std::string> CKinetraSpecKvf::TemplatesOtherOnDisk() const {
  std::vector<std::string> paths;
  for (int compartment = 0; compartment < kKinetraCompartments; ++compartment) {
    const KinetraTemplate& content = Solver(compartment).Content();
    if (!IsCompartmentActive(1 << compartment) || std::ranges::find(paths, content.path) != paths.end()) continue;
    if (content.IsOtherOnDisk()) paths.push_back(content.path);
  }
  return paths;
}

void CKinetraSpecKvf::CompleteLayers() {
  std::vector<std::string> added;
  if (IsCompartmentActive(kSaturated)) SynchronizeValues(kKinetraSaturated, added);
}

void CKinetraSpecKvf::SynchronizeValues(int compartment, std::vector<std::string>& added) {
  const CKinetraSolver& solver = Solver(compartment);
  const auto append = [&](CYbSEKvfBase* node, const std::vector<KinetraBinding>& bindings) {
    auto* values = dynamic_cast<KinetraValueList*>(node);
    if (!values) return;
    for (const std::string& symbol : values->AppendMissing(SymbolsWithValues(bindings)))
      added.push_back(fmt::format("{}: {}", PathOf(*node), symbol));
  };
  switch (compartment) {
    case kKinetraOverland:
      append(Important(kKinetraConstantsOverland), solver.constants);
      append(Important(kKinetraForcingsOverland), solver.forcings);
      break;
    case kKinetraUnsaturated:
      append(Important(kKinetraConstantsSoil), solver.constants);
      append(Important(kKinetraForcingsSoil), solver.forcings);
      break;
    default: {
      const auto* layers = Important(kWaterQualityLayers);
      for (int number = 1; layers && number <= layers->GetItemCount(); ++number) {
        append(layers->GetItem(number)->Child<CKinetraConstantsSZKvf>(), solver.constants);
        append(layers->GetItem(number)->Child<CKinetraForcingsSZKvf>(), solver.forcings);
      }
    }
  }
}

void CKinetraSpecKvf::UpdateSpecies(std::vector<std::string>& added) {
  auto* species = Important(kSpecies);
  if (!species) return;
  // The second part of a variable that is in two phases.
  const auto isSecondPart = [](const std::string& symbol) { return symbol.size() > 2 && symbol.ends_with("_2"); };
  for (int compartment = 0; compartment < kKinetraCompartments; ++compartment) {
    if (!IsCompartmentActive(1 << compartment)) continue;
    for (const CKinetraSolverItem& variable : Solver(compartment).Content().stateVariables) {
      if (isSecondPart(variable.symbol) || species->FindByName(variable.symbol)) continue;
      species->AddItem()->SetName(variable.symbol);
      added.push_back(fmt::format("{}: {}", PathOf(*species), variable.symbol));
    }
  }
}

void CKinetraSpecKvf::ReadData(KvfNode* section) {
  CTvnKvfBase::ReadData(section);
  for (CKinetraSolver& solver : solvers_) solver.Load();
}

int CKinetraSpecKvf::ValidateData() {
  for (int compartment = 0; compartment < kKinetraCompartments; ++compartment) {
    const CKinetraSolver& solver = Solver(compartment);
    if (!IsCompartmentActive(1 << compartment)) continue;
    const char* key = RowOf(compartment).fileKey;
    if (solver.file.IsEmpty())
      AddWarning("A process template is on and no file is chosen", key);
    else if (!solver.Content().problem.empty())
      AddWarning("The process template cannot be read", key, solver.Content().problem);
    else if (!solver.Content().gap.empty())
      AddWarning("The process template is read in part", key, solver.Content().gap);
    for (const std::string& odd : solver.Content().Oddities()) AddWarning("The process template is odd", key, odd);
  }
  return 1;
}

void CKinetraSpecKvf::ExchangeKeys(KeyExchange& keys) {
  for (int compartment = 0; compartment < kKinetraCompartments; ++compartment) {
    const CompartmentRow& row = RowOf(compartment);
    CKinetraSolver& solver = Solver(compartment);
    keys(row.enabledKey, solver.enabled);
    keys.FileWith(row.fileKey, solver.file, [&solver] { return WriteTimeOf(solver.file); });
    keys(row.methodKey, solver.method).OneOf(kMethods);
    keys(row.frequencyKey, solver.frequency);
  }
}

void CKinetraSpecKvf::ExchangeState(KeyExchange& keys) {
  ExchangeKeys(keys);
  for (CKinetraSolver& solver : solvers_) {
    const auto found = std::ranges::find(contents_, solver.SharedContent());
    int place = static_cast<int>(found - contents_.begin());
    if (found == contents_.end()) contents_.push_back(solver.SharedContent());
    std::vector<int> numbers = solver.BoundNumbers();
    keys("Content", place);
    keys.Several("Bindings", numbers);
    if (keys.IsReading()) solver.Restore(contents_[static_cast<std::size_t>(place)], numbers);
  }
}

// ---- Rules

Condition CompartmentMayHaveTemplate(int compartment) {
  return WaterQualityProcesses(kKinetra) && WaterQualityComponent(RowOf(compartment).component);
}

Condition CompartmentActive(int bits) {
  Condition active = WaterQualityProcesses(kKinetra);
  for (int compartment = 0; compartment < kKinetraCompartments; ++compartment) {
    if (!(bits & (1 << compartment))) continue;
    active = active && WaterQualityComponent(RowOf(compartment).component) &&
             Condition::OfKey(
                 [compartment](const CYbSEKvfBase& node) -> Condition::KeyOfNode {
                   const CKinetraSpecKvf* found = SpecificationOf(node);
                   if (!found) return {};
                   const int& enabled = found->Solver(compartment).enabled;
                   return {found, &enabled, enabled};
                 },
                 {}, true);
  }
  return active;
}

}  // namespace tervane
