// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/file_nodes.h"

#include "platform/file_cache.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "simspec/periods.h"
#include "spatial/file_fixes.h"
#include "spatial/placement.h"

namespace tervane {

namespace {

constexpr const char* kNotValid = "File is not valid";
constexpr const char* kNoFile = "no file is chosen";

std::vector<int> AsItemTypes(int itemType) {
  return itemType == 0 || itemType == quantity::kUndefined ? std::vector<int>() : std::vector{itemType};
}

/// What a user should know of where a valid file lies.
std::vector<Finding> MisplacementOf(const CYbSEKvfBase& node, const FileUse& use) {
  const std::optional<GridGeometry> domain = use.isOverArea ? DomainGeometryOf(node) : std::nullopt;
  return domain ? FindMisplacement(LocateFile(use), *domain) : std::vector<Finding>();
}

}  // namespace

void DataFileNode::SetItemType(int itemType) { ItemTypes = AsItemTypes(itemType); }

DataFileRequest DataFileNode::SetUpNdsValidation() const {
  DataFileRequest request;
  request.itemTypes = itemType_ ? AsItemTypes(itemType_()) : ItemTypes;
  request.dimensions = dimensions_;
  return request;
}

DataFileRequest DataFileNode::WithSimulationPeriod(DataFileRequest request) const {
  if (const auto* period = Important(kSimulationPeriod)) request.period = {period->GetSimStartDate(), period->SIMEND};
  return request;
}

std::string DataFileNode::WhyNotValid() const {
  if (!IsFileUsed()) return {};
  return File.IsEmpty() ? kNoFile : WhyNotMet(File.Absolute(), Items, SetUpNdsValidation());
}

int DataFileNode::ValidateData() {
  if (!IsFileUsed()) return 1;
  if (const std::string reason = WhyNotValid(); !reason.empty()) {
    AddError(kNotValid, "FILE_NAME", reason);
    return 0;
  }
  if (ChecksPeriod())
    if (const std::string reason = WhyNotMet(File.Absolute(), Items, WithSimulationPeriod(SetUpNdsValidation()));
        !reason.empty())
      AddWarning(kNotCovering, "FILE_NAME", reason);
  for (Finding& finding : MisplacementOf(*this, *UsedFile())) AddFinding(std::move(finding));
  return 1;
}

std::optional<FileUse> DataFileNode::UsedFile() const {
  if (!IsFileUsed()) return std::nullopt;
  FileUse use;
  use.path = File.IsEmpty() ? std::string() : File.Absolute();
  use.stamps = StampsOf(use.path);
  use.item = SelectedItem();
  use.isOverTime = ChecksPeriod();
  use.isOverArea = DomainCheck != 0 && dimensions_ >= 2;
  return use;
}

CTvnData2DNdsFile::CTvnData2DNdsFile(int itemType, CYbSEKvfBase* parent)
    : DataFileNode("Grid file", "NDS_2D_DATA_FILE", 2, parent) {
  SetItemType(itemType);
}

DataFileRequest CFMData2DNdsFile::SelectionRequest() const {
  return PeriodCheck ? WithSimulationPeriod(SetUpNdsValidation()) : SetUpNdsValidation();
}

DataFileRequest CFMData0DFile::SelectionRequest() const { return WithSimulationPeriod(SetUpNdsValidation()); }

void CData2DShpFile::Choose(FileName file, std::string attribute) {
  File = std::move(file);
  Items.clear();
  if (!attribute.empty()) Items.push_back(std::move(attribute));
}

FileResult CData2DShpFile::CheckFile() const {
  if (!IsFileUsed()) return {};
  return File.IsEmpty() ? FileResult{kNoFile, {}} : CheckShapeFile(File.Absolute(), request_, Attribute());
}

int CData2DShpFile::ValidateData() {
  if (!IsFileUsed()) return 1;
  const FileResult checked = CheckFile();
  if (!checked.Ok()) {
    AddError(kNotValid, "FILE_NAME", checked.error);
    return 0;
  }
  if (!checked.note.empty())
    AddFinding({Severity::Note, "The file was read with reservations", "FILE_NAME", checked.note});
  for (Finding& finding : MisplacementOf(*this, *UsedFile())) AddFinding(std::move(finding));
  return 1;
}

std::optional<FileUse> CData2DShpFile::UsedFile() const {
  if (!IsFileUsed()) return std::nullopt;
  FileUse use;
  use.kind = FileUse::Kind::Shape;
  use.path = File.IsEmpty() ? std::string() : File.Absolute();
  use.stamps = StampsOfShape(use.path);
  use.attribute = Attribute();
  if (axisUnit_) use.axisUnit = *axisUnit_;
  use.isOverArea = true;
  return use;
}

std::optional<FileUse> CData2DXyzFile::UsedFile() const {
  if (!usedWhen_.Holds(*this)) return std::nullopt;
  FileUse use;
  use.kind = FileUse::Kind::Points;
  use.path = File.IsEmpty() ? std::string() : File.Absolute();
  use.stamps = StampsOf(use.path);
  if (axisUnit_) use.axisUnit = *axisUnit_;
  use.isOverArea = true;
  return use;
}

void CData2DXyzFile::ExchangeKeys(KeyExchange& keys) {
  keys.Since(3)("FILE_NAME", File);
  // A setup written before version 3 holds a plain text.
  std::string text;
  if (keys.Until(2, "FILE_NAME", text)) File = FileName(text, GetRoot() ? GetRoot()->SetupFolder() : std::string());
}

}  // namespace tervane
