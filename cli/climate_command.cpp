// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <charconv>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "access/climate_change.h"
#include "access/climate_scenario.h"
#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "core/open_kvf.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct ClimateOptions {
  std::string setup, out, folder, definition;
  ClimateScenario scenario;
  bool force = false, json = false;
};

/// What a setup has of a quantity, a line or an object each.
void ListClimate(const CGlobal& root, bool json, Streams streams) {
  std::vector<std::string> objects;
  const auto tell = [&](const ClimateFamily& family, const char* kind, int number, const std::string& value, int item) {
    if (json)
      objects.push_back(JsonObject({{"quantity", JsonQuoted(family.name)},
                                    {"kind", JsonQuoted(kind)},
                                    {"number", std::to_string(number)},
                                    {item ? "file" : "value", item ? JsonQuoted(value) : value},
                                    {"item", item ? std::to_string(item) : std::string()}}));
    else
      fmt::print(streams.out, "{} {} {}: {}{}\n", family.name, kind, number, value,
                 item ? fmt::format(", item {}", item) : std::string());
  };
  for (const ClimateFamily& family : kClimateFamilies) {
    const ClimateInputs inputs(root, family);
    int number = 0;
    for (const ClimateValue& value : inputs.Values())
      tell(family, "value", ++number, fmt::format("{}", *value.value), 0);
    number = 0;
    for (const DataFileNode* file : inputs.NamedSeries())
      tell(family, "series", ++number, file->File.Absolute(), file->SelectedItem());
    if (const DataFileNode* grid = inputs.Grid()) tell(family, "grids", 1, grid->File.Absolute(), grid->SelectedItem());
  }
  if (json) fmt::print(streams.out, "{}\n", JsonObject({{"climate", JsonArray(objects)}}));
}

/// Counting in the order of the families defines all that there is.
int WriteDefinition(const CGlobal& root, const ClimateOptions& options, Streams streams) {
  if (RefuseToReplace(options.definition, options.force, streams)) return kCouldNot;
  const OpenKvf file(kvfCreate());
  kvfGetErrorGlb();  // what an earlier writer left
  DefineClimate(file.get(), root);
  kvfWrite(file.get(), options.definition);
  return kvfGetErrorGlb() == kKvfNoError ? kDone : Refuse(streams, kvfErrorText());
}

int ChangeClimate(CFlowModelDoc& document, const ClimateOptions& options, Streams streams) {
  if (options.out.empty())
    return Refuse(streams, "where the changed setup is to be written was expected, as -o warmer.tvd");
  if (RefuseToReplace(options.out, options.force, streams)) return kCouldNot;
  const std::string out = AbsoluteFromHere(options.out);
  const std::string folder = options.folder.empty()
                                 ? ResolvedPath(std::string(BaseNameOf(out)) + "_climate", std::string(FolderOf(out)))
                                 : AbsoluteFromHere(options.folder);
  std::vector<std::string> changes;
  if (const std::string problem = ApplyClimateScenario(document.Global(), options.scenario, folder, changes);
      !problem.empty())
    return Refuse(streams, problem);
  if (!SaveSetup(document, out, "climate-change", streams)) return kCouldNot;
  for (const std::string& change : changes) fmt::print(streams.out, "{}\n", change);
  if (changes.empty()) fmt::print(streams.out, "the setup has nothing of what is to be changed\n");
  return kDone;
}

int ClimateCommand(const ClimateOptions& options, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, options.setup, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  if (!options.definition.empty())
    if (const int status = WriteDefinition(document.Global(), options, streams); status != kDone) return status;
  const bool isChanged =
      !std::ranges::all_of(options.scenario, [](const ClimateRule& rule) { return rule.ChangesNothing(); });
  if (isChanged || !options.out.empty()) return ChangeClimate(document, options, streams);
  ListClimate(document.Global(), options.json, streams);
  return kDone;
}

/// Reads "temperature=2" or twelve numbers for the months into a rule of that quantity; why not, where it is none.
std::string TakeRule(const std::string& typed, std::array<double, 12> ClimateRule::*numbers, bool mayBeOne,
                     ClimateScenario& scenario) {
  constexpr const char* kExpected = "a quantity and what becomes of it was expected, as precipitation=1.1";
  const std::size_t equals = typed.find('=');
  if (equals == std::string::npos) return kExpected;
  const std::string name(Trimmed(typed.substr(0, equals)));
  const auto family = std::ranges::find_if(kClimateFamilies, [&](const auto& each) { return name == each.name; });
  if (family == kClimateFamilies.end())
    return fmt::format("{} is none of precipitation, evapotranspiration and temperature", name);
  std::vector<double> values;
  for (std::string_view rest = std::string_view(typed).substr(equals + 1); !rest.empty();) {
    const std::size_t end = std::min(rest.find(','), rest.size());
    const std::string_view text = Trimmed(rest.substr(0, end));
    double value = 0;
    const auto [last, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || last != text.data() + text.size() || !std::isfinite(value)) return kExpected;
    values.push_back(value);
    rest.remove_prefix(std::min(end + 1, rest.size()));
  }
  ClimateRule& rule = scenario[static_cast<std::size_t>(family - kClimateFamilies.begin())];
  if (mayBeOne && values.size() == 1)
    (rule.*numbers).fill(values.front());
  else if (values.size() == 12)
    std::ranges::copy(values, (rule.*numbers).begin());
  else
    return fmt::format("{} numbers were given, {}twelve were expected, January first", values.size(),
                       mayBeOne ? "one or " : "");
  return {};
}

}  // namespace

void OfferClimateCommand(CommandOffers& offers) {
  auto options = std::make_shared<ClimateOptions>();
  Command climate =
      offers.Offer("climate-change", "List the climate that drives a setup, or write the setup under another one",
                   [offers, options] { return ClimateCommand(*options, offers.Output()); });
  climate.Add("FILE", options->setup, "The setup (.tvd)").Required();
  climate.Add("-o,--output", options->out, "The changed setup");
  climate.AddTaken(
      "--scale",
      [options](const std::string& typed) { return TakeRule(typed, &ClimateRule::factor, true, options->scenario); },
      "QUANTITY=FACTOR: precipitation, evapotranspiration or temperature times this");
  climate.AddTaken(
      "--monthly",
      [options](const std::string& typed) { return TakeRule(typed, &ClimateRule::factor, false, options->scenario); },
      "QUANTITY=F1,...,F12: a factor for each month, January first");
  climate.AddTaken(
      "--shift",
      [options](const std::string& typed) { return TakeRule(typed, &ClimateRule::shift, true, options->scenario); },
      "QUANTITY=BY: plus this, in mm/day or degrees Celsius; one number or one for each month");
  climate.Add("--folder", options->folder, "Where changed data files are written; NAME_climate beside the new setup");
  climate.Add("--definition", options->definition, "Writes where each value stands in the setup");
  climate.AddFlag("--force", options->force, "Replaces files of these names");
  climate.AddFlag("--json", options->json, "As JSON");
  climate.Footer(
      "Without a change it lists what there is. Factors come before shifts. Data files are copied with their values\n"
      "changed, the originals stay.");
}

}  // namespace tervane
