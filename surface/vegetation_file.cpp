// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/vegetation_file.h"

namespace tervane {

void CTvnVegPropFile::SetVegetationName(std::string name) {
  if (VegetationNames.empty()) VegetationNames.emplace_back();
  VegetationNames.front() = std::move(name);
}

void CTvnVegPropFile::Choose(FileName file, std::string vegetation) {
  File = std::move(file);
  VegetationNames = {std::move(vegetation)};
}

CTvnVegPropStageDataList CTvnVegPropFile::Stages() const {
  return File.IsEmpty() ? CTvnVegPropStageDataList() : GetVegPropStages(File.Absolute(), VegetationName());
}

int CTvnVegPropFile::ValidateData() {
  if (!IsFileUsed()) return 1;
  if (File.IsEmpty()) {
    AddError("The vegetation property file is not valid", "FILE_NAME", "no file is chosen");
    return 0;
  }
  const std::string path = File.Absolute();
  const auto reading = ReadLibraryOnce(kVegetationLibrary, path);
  if (!reading->problem.empty()) {
    AddError("The vegetation property file is not valid", "FILE_NAME", reading->problem);
    return 0;
  }
  const std::string reason = VegetationName().empty() ? std::string("no vegetation is chosen")
                                                      : WhyNoEntry(path, reading->library, VegetationName());
  if (reason.empty()) return 1;
  AddError("The vegetation is not valid", "VEGETATION", reason);
  return 0;
}

void CTvnVegPropFile::ExchangeKeys(KeyExchange& keys) {
  keys("FILE_NAME", File);
  keys.Several("VEGETATION", VegetationNames);
}

}  // namespace tervane
