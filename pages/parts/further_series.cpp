// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/further_series.h"

#include <algorithm>
#include <set>
#include <utility>

#include <fmt/format.h>

#include "core/host.h"
#include "data/datafile_facts.h"
#include "forms/page_form.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/plot_content.h"
#include "platform/paths.h"

namespace tervane {

void FurtherSeries::AddTo(SeriesContent& chart) {
  std::set<std::size_t> used;
  for (std::size_t i = 0; i < chart.series.size(); ++i) used.insert(chart.series[i].color.value_or(i));
  for (Chosen& chosen : chosen_) {
    // It keeps its colour unless the chart itself has come to need it.
    while (!used.insert(chosen.color).second) ++chosen.color;
    chosen.series = RecentSeries(chosen.offer.path, chosen.offer.item);
    const auto data = NowOrAwaited(chosen.series, chart.awaited);
    if (!data && !chosen.series->IsDone()) continue;
    Series& added = data ? chart.series.emplace_back(*data) : chart.series.emplace_back();
    added.name = data ? chosen.offer.name : fmt::format("{} (cannot be read)", chosen.offer.name);
    added.color = chosen.color;
  }
  chart.choice =
      SeriesChoice{[this] { return AllOffers(); }, [this](const SeriesOffer& offer) { return IsShown(offer); },
                   [this](const SeriesOffer& offer, bool shown) { Show(offer, shown); },
                   [this](Host& host) { return AddFile(host); }};
}

std::vector<SeriesOffer> FurtherSeries::AllOffers() const {
  std::vector<SeriesOffer> all = offers_();
  std::ranges::copy_if(added_, std::back_inserter(all), [&all](const SeriesOffer& added) {
    return std::ranges::none_of(all, [&](const SeriesOffer& offer) { return offer.IsSame(added); });
  });
  return all;
}

bool FurtherSeries::IsShown(const SeriesOffer& offer) const {
  return std::ranges::any_of(chosen_, [&](const Chosen& chosen) { return chosen.offer.IsSame(offer); });
}

void FurtherSeries::Show(const SeriesOffer& offer, bool shown) {
  if (shown == IsShown(offer)) return;
  if (!shown) {
    std::erase_if(chosen_, [&](const Chosen& chosen) { return chosen.offer.IsSame(offer); });
    return;
  }
  // The first colour that none has. The first one of all is that of the chart's own series.
  std::size_t color = 1;
  while (std::ranges::find(chosen_, color, &Chosen::color) != chosen_.end()) ++color;
  chosen_.push_back({offer, color, nullptr});
}

bool FurtherSeries::AddFile(Host& host) {
  CTvnData0DFile file({}, nullptr);
  PageForm form(file);
  Control& control = form.DataFile({}, file).Filter(kSeriesFileFilter).DefaultExtension("nds0");
  control.fileQuestion.title = "Add a Series";
  if (!control.browse(host)) return false;
  const std::string path = file.File.Absolute();
  const auto facts = DataFileFactsOf(path);
  const int item = file.SelectedItem();
  if (item < 1 || item > static_cast<int>(facts->items.size())) return false;
  const SeriesOffer offer{facts->items[static_cast<std::size_t>(item - 1)].name, std::string(FileNameOf(path)), path,
                          item};
  added_.push_back(offer);
  Show(offer, true);
  return true;
}

std::function<SeriesContent()> WithFurtherSeries(std::function<SeriesContent()> chart, FurtherSeries::Offers offers) {
  const auto further = std::make_shared<FurtherSeries>(std::move(offers));
  return [chart = std::move(chart), further] {
    SeriesContent content = chart();
    further->AddTo(content);
    return content;
  };
}

std::vector<SeriesOffer> OffersBeside(const DataFileNode& file, const std::string& group,
                                      const std::vector<NamedFile>& others) {
  std::vector<SeriesOffer> offers;
  const std::string own = file.File.IsEmpty() ? std::string() : file.File.Absolute();
  std::set<std::pair<std::string, int>> told = {{own, file.SelectedItem()}};
  for (const NamedFile& other : others) {
    if (other.file->File.IsEmpty()) continue;
    SeriesOffer offer{other.name, group, other.file->File.Absolute(), other.file->SelectedItem()};
    if (told.emplace(offer.path, offer.item).second) offers.push_back(std::move(offer));
  }
  if (own.empty()) return offers;
  const auto facts = DataFileFactsOf(own);
  for (int item = 1; item <= static_cast<int>(facts->items.size()); ++item) {
    const DataItem& described = facts->items[static_cast<std::size_t>(item - 1)];
    if (described.dimensions == 0 && told.emplace(own, item).second)
      offers.push_back({described.name, "In the same file", own, item});
  }
  return offers;
}

}  // namespace tervane
