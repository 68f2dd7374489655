// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Dialogs that make a first data file from inside a page, for its node. Each gives the name of the new file, or nothing
// when the user gave up.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "forms/page.h"
#include "geometry/grid.h"

namespace tervane {

/// For a dialog, which changes no setup.
PageContext WithoutDocument(PageContext context);

/// A grid file with the geometry of the model and one value everywhere, or the values of a text file.
class CData2DNdsCreateDlg : public CYbSEDlgBase {
 public:
  /// A grid of a quantity.
  CData2DNdsCreateDlg(const PageContext& context, float value, CYbSEKvfBase& node, int itemType);
  /// A grid of the model domain: 1 inside, 2 along its edge.
  CData2DNdsCreateDlg(const PageContext& context, CYbSEKvfBase& node);

  std::optional<FileName> Run();

 protected:
  void Describe(PageForm& form) override;

 private:
  CData2DNdsCreateDlg(const PageContext& context, CYbSEKvfBase& node, float value, float deleteValue, int itemType,
                      bool isDomain);
  std::string ImportText();
  /// The key of the unit in which the file holds its values, the user's; 0 for values without a quantity.
  int ValueUnit() const;
  /// Why the file cannot be made yet; empty when it stands.
  std::string CreateFile();
  /// What makes the grid of one value, from copies of what the form holds.
  std::function<std::string(CTvn2DOrthoRotatedGridData&)> GridMaker() const;

  enum Contents : int { kFixedValue = 0, kTextFile = 1 };

  const bool isDomain_;
  const int itemType_;
  GridGeometry geometry_;
  int contents_ = kFixedValue;
  float fixedValue_, deleteValue_;
  FileName textFile_, gridFile_;
  struct ImportedGrid {
    CTvn2DOrthoRotatedGridData grid;
    std::string note;
  };
  std::shared_ptr<const ImportedGrid> imported_;  ///< Null until a text file was loaded.
};

/// An empty shape file.
class CData2DShpCreateDlg : public CYbSEDlgBase {
 public:
  CData2DShpCreateDlg(const PageContext& context, CYbSEKvfBase& node, const std::string& baseName);
  std::optional<FileName> Run();

 protected:
  void Describe(PageForm& form) override;

 private:
  std::string CreateFile();

  FileName file_;
};

/// A time series file: one value over a period, or rows that are pasted from elsewhere.
class CTvnCreate0DNdsDlg : public CYbSEDlgBase {
 public:
  /// Without value types all are offered.
  CTvnCreate0DNdsDlg(const PageContext& context, CYbSEKvfBase& node, float value, std::vector<int> itemTypes,
                     std::vector<int> valueTypes);
  /// What the series is called, after which its file is named; the title of the node unless told.
  void SetTitle(std::string title);
  std::optional<FileName> Run();

 protected:
  void Describe(PageForm& form) override;

 private:
  std::string CreateFile();

  std::string title_;
  const std::vector<int> itemTypes_, valueTypes_;
  CYbDateTime start_, end_;
  double stepHours_ = 24;
  double value_;
  int itemType_ = 0, valueType_ = 0;  ///< Places in the lists.
  std::string rows_;                  ///< Dates and values, a line each; empty for one value.
  FileName file_;
};

}  // namespace tervane
