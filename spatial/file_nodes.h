// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Nodes that hold a data file's name and what was chosen in it, and know what a usable file looks like. A file that is
// not in use is never an error.
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "core/condition.h"
#include "core/file_selection.h"
#include "data/datafile_request.h"
#include "geometry/shapes.h"
#include "spatial/data_use.h"

namespace tervane {

/// A node over a file of grids or time series.
class DataFileNode : public YbSENdsSelection, public FileUser {
 public:
  DataFileNode(std::string title, std::string section, int dimensions, CYbSEKvfBase* parent)
      : YbSENdsSelection(std::move(title), std::move(section), parent), dimensions_(dimensions) {}

  int FileUsed = 1;            ///< Not stored: 0 switches the validation off.
  int DomainCheck = 1;         ///< Not stored: a file of grids is to lie where the model domain lies.
  std::vector<int> ItemTypes;  ///< Not stored: what the selected item may be; empty for anything.

  void SetItemType(int itemType);
  /// An item type that the owner's values decide, asked whenever it matters.
  void SetItemTypeBy(std::function<int()> itemType) { itemType_ = std::move(itemType); }
  void SetMultiItemTypes(std::vector<int> itemTypes) { ItemTypes = std::move(itemTypes); }
  void SetFileUsed(int used) { FileUsed = used; }
  /// The owner's rule, asked whenever it matters.
  void UsedWhen(Condition rule) { usedWhen_ = std::move(rule); }
  bool IsFileUsed() const { return FileUsed != 0 && usedWhen_.Holds(*this); }
  void SetDomainCheck(int check) { DomainCheck = check; }

  /// The number of the selected item; item 1 where none is selected.
  int SelectedItem() const { return Items.empty() ? 1 : Items.front(); }
  /// Takes a file and selects its first item.
  void Choose(FileName file) {
    File = std::move(file);
    Items = {1};
  }

  /// What this node demands of a file.
  virtual DataFileRequest SetUpNdsValidation() const;
  /// The same with the period that a chosen file must cover.
  virtual DataFileRequest SelectionRequest() const { return SetUpNdsValidation(); }
  /// Why the file cannot be used; empty for a valid one, and while it is not in use.
  std::string WhyNotValid() const;
  /// "File is not valid" with the reason behind it; warnings where a usable file does not cover the simulation, or does
  /// not lie where the model domain lies.
  int ValidateData() override;
  std::optional<FileUse> UsedFile() const override;

 protected:
  /// The request with the simulation's period in it.
  DataFileRequest WithSimulationPeriod(DataFileRequest request) const;
  /// Whether the file is to cover the simulation.
  virtual bool ChecksPeriod() const { return false; }

 private:
  int dimensions_;
  Condition usedWhen_;
  std::function<int()> itemType_;
};

/// A grid file.
class CTvnData2DNdsFile : public DataFileNode {
 public:
  /// Without an item type (0, or 999 which means none) any item will do.
  CTvnData2DNdsFile(int itemType, CYbSEKvfBase* parent);
  explicit CTvnData2DNdsFile(CYbSEKvfBase* parent) : CTvnData2DNdsFile(0, parent) {}
};

/// A grid file with a time axis that is to cover the simulation.
class CFMData2DNdsFile : public CTvnData2DNdsFile {
 public:
  using CTvnData2DNdsFile::CTvnData2DNdsFile;

  int PeriodCheck = 1;  ///< Not stored.

  DataFileRequest SelectionRequest() const override;

 protected:
  bool ChecksPeriod() const override { return PeriodCheck != 0; }
};

/// A file of time series.
class CTvnData0DFile : public DataFileNode {
 public:
  CTvnData0DFile(std::string section, CYbSEKvfBase* parent)
      : DataFileNode("Time series file", std::move(section), 0, parent) {}
};

/// A file of time series that is to cover the simulation.
class CFMData0DFile : public CTvnData0DFile {
 public:
  using CTvnData0DFile::CTvnData0DFile;

  DataFileRequest SelectionRequest() const override;

 protected:
  bool ChecksPeriod() const override { return true; }
};

/// A file with layers of grids.
class CUZData3DNdsFile : public DataFileNode {
 public:
  explicit CUZData3DNdsFile(CYbSEKvfBase* parent) : DataFileNode("Nds3 file", "NDS_3D_DATA_FILE", 3, parent) {}

  void SetValidateFlag(int validate) { FileUsed = validate; }
};

/// A shape file and the one attribute that was chosen in it.
class CData2DShpFile : public YbSEShpSelection, public FileUser {
 public:
  explicit CData2DShpFile(CYbSEKvfBase* parent) : YbSEShpSelection("Shape file", "SHAPE_FILE", parent) {}

  int ValidateFlag = 1;  ///< Not stored; 0 switches the validation off.

  void SetValidateFlag(int validate) { ValidateFlag = validate; }
  /// The owner's rule, asked whenever it matters.
  void UsedWhen(Condition rule) { usedWhen_ = std::move(rule); }
  bool IsFileUsed() const { return ValidateFlag != 0 && usedWhen_.Holds(*this); }
  /// The owner's key of the unit of coordinates; metres where none is told.
  void SetAxisUnit(const int& unit) { axisUnit_ = &unit; }
  // Who asks for a kind of shapes asks for the attribute that holds their values.
  void SetPolygonShape(int accepted) { AskFor(request_.polygons, accepted); }
  void SetLineShape(int accepted) { AskFor(request_.lines, accepted); }
  void SetPointShape(int accepted) { AskFor(request_.points, accepted); }
  /// The shapes themselves are all that is needed.
  void NeedNoAttribute() { request_.needsAttribute = false; }
  /// The attribute is to hold real or whole numbers.
  void UseRealField() { request_.attribute = AttributeKind::Real; }
  void UseWholeField() { request_.attribute = AttributeKind::Whole; }

  std::string Attribute() const { return ItemDescr(0); }
  /// Takes a file with an attribute, which may be empty.
  void Choose(FileName file, std::string attribute);

  const ShapeRequest& Request() const { return request_; }
  /// Why the file cannot be used; empty for a valid one, and while it is not in use.
  std::string WhyNotValid() const { return CheckFile().error; }
  int ValidateData() override;
  std::optional<FileUse> UsedFile() const override;

 private:
  void AskFor(bool& kind, int accepted) {
    kind = accepted != 0;
    request_.needsAttribute |= kind;
  }
  FileResult CheckFile() const;

  ShapeRequest request_;
  Condition usedWhen_;
  const int* axisUnit_ = nullptr;
};

/// A text file of points. It has no validation: what is wrong with it is told where it is read.
class CData2DXyzFile : public CTvnKvfBase, public FileUser {
 public:
  explicit CData2DXyzFile(CYbSEKvfBase* parent) : CTvnKvfBase("XYZ file", "XYZ_FILE", parent) {}

  FileName File;

  /// The owner's rule, asked whenever it matters.
  void UsedWhen(Condition rule) { usedWhen_ = std::move(rule); }
  void SetAxisUnit(const int& unit) { axisUnit_ = &unit; }
  std::optional<FileUse> UsedFile() const override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  Condition usedWhen_;
  const int* axisUnit_ = nullptr;
};

}  // namespace tervane
