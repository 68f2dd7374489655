// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "pages/parts/plot_content.h"
#include "spatial/file_nodes.h"

namespace tervane {

/// What a user has laid over the series of a chart: others of its file, those of other stations, or of any file. It is
/// no part of the setup, and lives with its page. A series keeps its colour while others come and go.
class FurtherSeries {
 public:
  using Offers = std::function<std::vector<SeriesOffer>()>;

  /// `offers` tells what there is to choose, whenever the user looks.
  explicit FurtherSeries(Offers offers) : offers_(std::move(offers)) {}

  /// Adds what is chosen to the chart's own series, and the choice.
  void AddTo(SeriesContent& chart);

 private:
  struct Chosen {
    SeriesOffer offer;
    std::size_t color = 0;
    std::shared_ptr<Computed<FileSeries>> series;  ///< As it was last asked for.
  };

  std::vector<SeriesOffer> AllOffers() const;
  bool IsShown(const SeriesOffer& offer) const;
  void Show(const SeriesOffer& offer, bool shown);
  bool AddFile(Host& host);

  Offers offers_;
  std::vector<SeriesOffer> added_;  ///< Of other files.
  std::vector<Chosen> chosen_;
};

/// A page's chart over which the user may lay others.
std::function<SeriesContent()> WithFurtherSeries(std::function<SeriesContent()> chart, FurtherSeries::Offers offers);

/// The series that a station or the like uses.
struct NamedFile {
  std::string name;
  const DataFileNode* file;
};
/// What others use, by their names, and the other series of a node's own file. None is offered twice, nor the node's
/// own.
std::vector<SeriesOffer> OffersBeside(const DataFileNode& file, const std::string& group,
                                      const std::vector<NamedFile>& others);

}  // namespace tervane
