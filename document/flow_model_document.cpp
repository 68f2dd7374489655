// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/flow_model_document.h"

#include <fmt/format.h>

#include "document/river_simulation_file.h"
#include "execution/execute_flags.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "simspec/model_components.h"
#include "simspec/river_files.h"
#include "wqpt/kinetra_specification.h"
#include "wqpt/sources.h"

namespace tervane {

CFlowModelDoc::CFlowModelDoc() : CYbSEDocument(std::make_unique<CGlobal>()) { Root().Validate(); }

void CFlowModelDoc::OnLoaded() {
  // The mass of that version was another quantity.
  constexpr int kVersionOfOtherMass = 10;
  const auto* quality = Root().Important(kWaterQualityComponents);
  if (Global().ReadDocVersion() == kVersionOfOtherMass && ModelCompOf(Root()).WQ && quality && quality->OL)
    AddToReport(LoadReport::Kind::Warning,
                "You have opened a Release 2007 tvd file\r\nwith Water Quality included for the Overland "
                "component.\r\nPlease check that the Initial Overland Mass is correct.");
  if (const auto* sources = Root().Important(kSources))
    for (int number = 1; number <= sources->GetItemCount(); ++number) sources->GetItem(number)->UpdateStrength();
  if (auto* templates = Root().Important(kKinetraSpecification)) {
    for (const CYbSEKvfBase* child = templates->GetFirstChild(); child; child = templates->GetNextChild(child))
      if (const auto* bindings = dynamic_cast<const CKinetraCompSpecKvf*>(child))
        if (!bindings->ReadingMessage().empty()) AddToReport(LoadReport::Kind::Warning, bindings->ReadingMessage());
    for (const std::string& added : templates->RefreshTemplates())
      AddToReport(LoadReport::Kind::Note, fmt::format("added, since a process template declares it: {}", added));
  }
  Root().Validate();
}

// ---- Saving

bool CFlowModelDoc::OnSaveDocument(const std::string& path) {
  if (!CYbSEDocument::OnSaveDocument(path)) return false;
  const CModelCompKvf& components = ModelCompOf(Root());
  const auto* river = Root().Important(kRiver);
  if (!river || !components.River) return true;
  RewriteRiverFile(river->GetFilename());
  const auto* waterQuality = Root().Important(kWaterQualityComponents);
  if (components.WQ && waterQuality && waterQuality->River) RewriteRiverFile(river->GetFilenameWQ());
  return true;
}

void CFlowModelDoc::RewriteRiverFile(const FileName& file) {
  if (file.IsEmpty()) return;
  // A name that was typed before the first save has got its folder by now.
  const std::string& setupFolder = Root().SetupFolder();
  const std::string river = ResolvedPath(file.TextIn(setupFolder), setupFolder);
  const std::string folder(FolderOf(river));
  std::string error;
  if (RewriteRiverSimulationFile(river, ProjectResultRoot().TextIn(folder), UseCustomResultFolder,
                                 CustomResultFolder.TextIn(folder), error) != 0)
    AddSaveNote(fmt::format("the river simulation file did not get the result folder of the setup: {}", error));
}

// ---- Engines

bool CFlowModelDoc::SaveForRun() {
  EngineShell* shell = GetEngineShell();
  if (!shell) return false;
  if (!shell->HasChanges() || shell->DoFileSave()) return true;
  shell->Outside().ShowMessage("Unable to run setup: Failed to save specification file.", Host::Icon::Error);
  return false;
}

void CFlowModelDoc::RunEngine(const std::string& argument) {
  if (!SaveForRun()) return;
  const bool isShiftHeld = GetEngineShell()->IsShiftHeld();
  SetExtraExecuteArgument(argument);
  SetEngine("Tvn_Simulation.exe");
  SetInputName(PathName());
  const auto* flags = Root().Important(kExecuteFlags);
  const bool preprocesses = argument.empty() ? flags && flags->PP != 0 : argument == "/PP";
  SetReport(preprocesses ? ResolvedPath(PreprocessorReport(), {}) : std::string());
  if (ModelCompOf(Root()).River) {
    if (const auto* river = Root().Important(kRiver)) {
      const std::string file = river->GetFilename().Absolute();
      if (!file.empty()) SetExtraLog(file.substr(0, file.size() - ExtensionOf(file).size()) + "FvrProgress.log");
    }
  }
  RunEnginePrg2(isShiftHeld ? 0 : 1, "", 1, 1, 0, 0);
}

void CFlowModelDoc::RunExtraction(int engine, int selection) {
  if (!SaveForRun()) return;
  const bool isShiftHeld = GetEngineShell()->IsShiftHeld();
  SetExtraExecuteArgument(fmt::format("/Engine {} /SelPostProc {}", engine, selection));
  SetEngine("PTRetrieval_Launch.exe");
  SetInputName(PathName());
  SetReport({});
  RunEnginePrg2(isShiftHeld ? 0 : 1, "", 0, 0, 0, 0);
}

// ---- Files

std::string CFlowModelDoc::ResultFile(std::string_view stemEnd, std::string_view extension) const {
  return ResultFileName(getResultFolder(), std::string(BaseNameOf(PathName())) + std::string(stemEnd), extension);
}

CPreprocessedDataManager* CFlowModelDoc::AttachPreprocessorReport() const {
  auto* processed = Root().Important(kProcessedData);
  if (!processed || PathName().empty()) return nullptr;
  processed->SetPath(ResolvedPath(PreprocessorReport(), {}));
  return processed->Manager();
}

std::string ResultFileName(std::string_view folder, std::string_view stem, std::string_view extension) {
  std::string name = Replaced(Trimmed(folder), "/", "\\");
  if (name.empty() || name.back() != '\\') name += '\\';
  name += stem;
  if (extension.empty()) return name;
  if (extension.front() != '.') name += '.';
  return name += extension;
}

}  // namespace tervane
