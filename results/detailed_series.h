// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Points of the model and of its rivers at which a simulation stores series, each with a file of observed values where
// there is one.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "core/named_item.h"
#include "spatial/file_nodes.h"

namespace tervane {

class CCatchmentKvf;

/// A file of observed values, which is told how it lies to the time of the simulation and need not cover it.
class ObservedFile : public CTvnData0DFile {
 public:
  using CTvnData0DFile::CTvnData0DFile;

  std::optional<FileUse> UsedFile() const override;
};

/// A point of either kind. What it is at is told by its class, in front of the observed values.
class DetailedSeriesItem : public NamedItemKvf {
 public:
  DetailedSeriesItem(std::string title, CYbSEKvfBase* list);

  int InclObserved = 0;  ///< A file of observed values belongs to the point.

  CTvnData0DFile& Observed() const { return *observed_; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  /// The keys of what the series is of, and where.
  virtual void ExchangePlace(KeyExchange& keys) = 0;

 private:
  CTvnData0DFile* observed_;
};

/// A point of the model.
class CDetailedTSOutputItemKvf : public DetailedSeriesItem {
 public:
  explicit CDetailedTSOutputItemKvf(CYbSEKvfBase* list) : DetailedSeriesItem("DetailedTSOutputItem", list) {}

  int HydrComp = 0;  ///< A code of the catalogue; 0 where none is chosen.
  int Group = 1;     ///< 1 where the point starts a new plot, 0 where it joins the one above.
  double X = 0, Y = 0;
  double Z = 0;  ///< Depth below ground; kept while the type has none.

  /// A point of that type has a depth.
  bool IsDepthActive() const;
  int ValidateData() override;

 protected:
  void ExchangePlace(KeyExchange& keys) override;
};

/// A point of a river.
class CDetailedFvrTSOutputItemKvf : public DetailedSeriesItem {
 public:
  explicit CDetailedFvrTSOutputItemKvf(CYbSEKvfBase* list) : DetailedSeriesItem("DetailedFvrTSOutputItem", list) {}

  enum Quantity : int { kWaterLevel = 0, kDischarge = 1 };

  int DataType = kWaterLevel;
  std::string BranchName;
  float Chainage = 0;

  int ValidateData() override;

 protected:
  void ExchangePlace(KeyExchange& keys) override;
};

/// What an import has done.
struct DetailedImport {
  int result = 1;       ///< 0 where a line stopped it; the points of the lines above it stand.
  int added = 0;        ///< Points.
  std::string message;  ///< Why it was stopped.
};

/// Adds points of a text file to a list, by the keys that they declare: a line each, with tabs between its fields, of
/// which the last two are the observed file without its extension and the item in it. Empty fields do not count. The
/// message for a line with too few fields begins with `format`. The file's names stand as they are, in `setupFolder`.
DetailedImport ImportDetailedPoints(CYbSEKvfListBaseInterface& list, const std::string& path,
                                    const std::string& setupFolder, std::string_view format);
/// The same of the text of such a file.
DetailedImport ImportDetailedText(CYbSEKvfListBaseInterface& list, std::string_view text, const std::string& path,
                                  const std::string& setupFolder, std::string_view format);

/// What both lists have.
template <class Item>
class DetailedSeriesList : public NamedListKvf<Item> {
 public:
  using NamedListKvf<Item>::NamedListKvf;

  float MinimumOutputTimestep = 0.5f;  ///< In hours.

  /// `setupPath` is that of the setup's folder.
  virtual DetailedImport ImportFile(const std::string& path, const std::string& setupPath) = 0;
};

class CDetailedTSOutputListKvf : public DetailedSeriesList<CDetailedTSOutputItemKvf> {
 public:
  explicit CDetailedTSOutputListKvf(CYbSEKvfBase* storing);

  DetailedImport ImportFile(const std::string& path, const std::string& setupPath) override;
  /// What a series may be of: "code\tname\n" for each type that the setup stores at points.
  std::string GetChoiceText() const;
  /// The model domain, on whose grid the points lie; null where there is none.
  CCatchmentKvf* GetCatchmentGrid() const;
  /// The first point starts a plot, whatever its setup says. True when that changed it.
  bool StartFirstPlot();

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CDetailedFvrTSOutputListKvf : public DetailedSeriesList<CDetailedFvrTSOutputItemKvf> {
 public:
  explicit CDetailedFvrTSOutputListKvf(CYbSEKvfBase* storing);

  DetailedImport ImportFile(const std::string& path, const std::string& setupPath) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
