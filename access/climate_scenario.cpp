// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/climate_scenario.h"

#include <algorithm>
#include <filesystem>
#include <map>
#include <tuple>

#include <fmt/format.h>

#include "data/datafile_writer.h"
#include "platform/key_number.h"
#include "platform/paths.h"

namespace tervane {

bool ClimateRule::IsEven() const {
  const auto areSame = [](const std::array<double, 12>& months) {
    return std::ranges::all_of(months, [&](double value) { return SameNumber(value, months.front()); });
  };
  return areSame(factor) && areSame(shift);
}

namespace {

/// The month, from 0, in which the value of a step holds.
std::size_t MonthOf(const TimeAxis& time, const DataItem& item, std::size_t step) {
  std::int64_t at = time.stamps[step];
  if (item.valueType == ValueType::MeanStep || item.valueType == ValueType::StepAccumulated) {
    std::int64_t begin = at - time.stepSeconds;
    if (step > 0)
      begin = time.stamps[step - 1];
    else if (time.begin)
      begin = time.begin->SecondsSinceEpoch();
    at = begin + (at - begin) / 2;
  }
  return static_cast<std::size_t>(CYbDateTime::FromSecondsSinceEpoch(at).Month() - 1);
}

std::string CopyChanged(const DataFile& file, int number, const ClimateRule& rule, double shiftInFile,
                        DataFileWriter& writer, ProgressPart progress) {
  const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)];
  const TimeAxis& time = file.Time();
  std::vector<float> values(item.Cells());
  for (std::size_t step = 0; step < time.steps; ++step) {
    if (progress.IsCancelled()) return "cancelled";
    progress.Report(static_cast<double>(step) / static_cast<double>(time.steps));
    if (std::string problem = file.Read({number, step, 1, {}}, values); !problem.empty()) return problem;
    const std::size_t month = MonthOf(time, item, step);
    const double factor = rule.factor[month], shift = rule.shift[month] * shiftInFile;
    for (float& value : values)
      if (value != kDeleteValue) value = static_cast<float>(static_cast<double>(value) * factor + shift);
    if (std::string problem = writer.AddStep(time.Stamp(step)); !problem.empty()) return problem;
    if (std::string problem = writer.Put(1, values); !problem.empty()) return problem;
  }
  return {};
}

}  // namespace

FileResult WriteChangedClimate(const std::string& from, int item, const ClimateRule& rule, int quantityItemType,
                               const std::string& to, ProgressPart progress) {
  const auto refuse = [](std::string why) { return FileResult{std::move(why), {}}; };
  DataFile file;
  if (std::string problem = file.Open(from); !problem.empty()) return refuse(std::move(problem));
  if (item < 1 || item > static_cast<int>(file.Items().size()))
    return refuse(fmt::format("{}: there is no item {}: the file has {}", from, item, file.Items().size()));
  const DataItem& source = file.Items()[static_cast<std::size_t>(item - 1)];
  if (!file.Time().hasDates) return refuse(fmt::format("{}: it has no dates, so that no month is known", from));
  if (source.valueType == ValueType::Accumulated && !rule.IsEven())
    return refuse(fmt::format("{}: sums since the start cannot be changed month by month", from));
  // A shift is a difference: only the size of the unit counts.
  double shiftInFile = 1;
  const ItemType* type = FindItemType(source.itemType != quantity::kUndefined ? source.itemType : quantityItemType);
  if (type && source.scale)
    if (const auto toFile = ConversionBetween(BaseUnit(*type).scale, *source.scale))
      shiftInFile = (*toFile)(1) - (*toFile)(0);
  NewDataFile content;
  content.dimensions = source.dimensions;
  content.geometry = source.geometry;
  content.items = {{source.name, source.itemType, source.unitKey, source.valueType}};
  content.begin = file.Time().begin;
  DataFileWriter writer;
  if (std::string problem = writer.Create(to, content); !problem.empty()) return refuse(std::move(problem));
  if (std::string problem = CopyChanged(file, item, rule, shiftInFile, writer, progress); !problem.empty())
    return refuse(std::move(problem));
  return writer.Finish();
}

namespace {

/// Makes the files of a scenario, each once.
class ScenarioFiles {
 public:
  ScenarioFiles(std::string folder, std::vector<std::string>& changes)
      : folder_(std::move(folder)), changes_(changes) {}

  std::string Change(DataFileNode& node, const ClimateRule& rule, const ClimateFamily& family, int itemType) {
    const std::string from = node.File.Absolute();
    const int item = node.SelectedItem();
    std::string& made = made_[{family.name, from, item}];
    if (made.empty()) {
      if (std::string problem = MakeFolder(); !problem.empty()) return problem;
      const std::string path = FreePath(from);
      if (const FileResult written = WriteChangedClimate(from, item, rule, itemType, path); !written.Ok())
        return written.error;
      made = path;
      changes_.push_back(fmt::format("{}: item {} of {} is changed in {}", family.name, item, from, path));
    }
    node.Choose(FileName::Picked(made, node.GetRoot()->SetupFolder()));
    return {};
  }
  /// Leaves nothing of what was made.
  void TakeBack() const {
    std::error_code ignored;
    for (const auto& [source, path] : made_) std::filesystem::remove(NativePath(path), ignored);
    // Only an empty one goes.
    std::filesystem::remove(NativePath(folder_), ignored);
  }

 private:
  std::string MakeFolder() {
    if (isFolderMade_) return {};
    isFolderMade_ = true;
    std::error_code error;
    std::filesystem::create_directories(NativePath(folder_), error);
    return error ? fmt::format("{}: {}", folder_, error.message()) : std::string();
  }
  /// A name that no file has, by that of the file that is changed.
  std::string FreePath(const std::string& from) const {
    const std::string stem(BaseNameOf(from)), extension(ExtensionOf(from));
    std::string path = ResolvedPath(stem + extension, folder_);
    for (int number = 2; FileExists(path); ++number)
      path = ResolvedPath(fmt::format("{}_{}{}", stem, number, extension), folder_);
    return path;
  }

  std::string folder_;
  std::vector<std::string>& changes_;
  bool isFolderMade_ = false;
  std::map<std::tuple<std::string, std::string, int>, std::string> made_;
};

}  // namespace

namespace {

std::string ChangeAll(const CGlobal& root, const ClimateScenario& scenario, ScenarioFiles& files,
                      std::vector<std::string>& changes) {
  for (std::size_t i = 0; i < kClimateFamilies.size(); ++i) {
    const ClimateFamily& family = kClimateFamilies[i];
    const ClimateRule& rule = scenario[i];
    const ClimateInputs inputs(root, family);
    if (rule.ChangesNothing() || !inputs.Node()) continue;
    const std::vector<ClimateValue> values = inputs.Values();
    if (!values.empty() && !rule.IsEven())
      return fmt::format("{}: a constant cannot be changed month by month; give it a series", family.name);
    for (const ClimateValue& value : values) {
      const float before = *value.value;
      *value.value = static_cast<float>(static_cast<double>(before) * rule.factor[0] + rule.shift[0]);
      changes.push_back(fmt::format("{}: {} becomes {}", family.name, before, *value.value));
    }
    std::vector<DataFileNode*> nodes = inputs.NamedSeries();
    if (DataFileNode* grid = inputs.Grid()) nodes.push_back(grid);
    for (DataFileNode* node : nodes)
      if (std::string problem = files.Change(*node, rule, family, inputs.Node()->GetItemType()); !problem.empty())
        return problem;
  }
  return {};
}

}  // namespace

std::string ApplyClimateScenario(const CGlobal& root, const ClimateScenario& scenario, const std::string& folder,
                                 std::vector<std::string>& changes) {
  ScenarioFiles files(folder, changes);
  std::string problem = ChangeAll(root, scenario, files, changes);
  if (!problem.empty()) files.TakeBack();
  return problem;
}

}  // namespace tervane
