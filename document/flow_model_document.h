// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "core/document.h"
#include "document/global.h"
#include "execution/processed_data.h"

namespace tervane {

/// The document of the flow model editor: a setup with its tree, and the names of the files that lie beside it.
class CFlowModelDoc : public CYbSEDocument {
 public:
  CFlowModelDoc();

  CGlobal& Global() const { return static_cast<CGlobal&>(Root()); }
  static constexpr std::string_view kEditorName = "Flow Model";

  /// Saves, and then gives the files of a river simulation that takes part the result location of the setup. A river
  /// file that cannot be written leaves the save done, with a note.
  bool OnSaveDocument(const std::string& path) override;

  // ---- Engines. Both save first, so that a run begins with what the user sees; a save that fails is told, and nothing
  // is started.

  /// Runs the setup. Without an argument the engine does what the flags of the setup say, with "/PP", "/WM" or "/WQ"
  /// that part alone.
  void RunEngine(const std::string& argument);
  /// Extracts from the results of particle tracking: pathlines (1) or registrations (0), of one extraction by its
  /// number or of all (-1).
  void RunExtraction(int engine, int selection);

  // ---- Files in the result folder, written with `\\` behind the folder as the engines expect them

  std::string PreprocessorReport() const { return ResultFile("_PreProcessed", ".kvf"); }
  std::string PreprocessedRiverData() const { return ResultFile("_PreProcessed_River", ".bin"); }
  std::string SimulationCatalogue() const { return ResultFile("", ".tvdres"); }
  std::string WaterQualityCatalogue() const { return ResultFile("", ".TvdWQres"); }
  std::string GridSeriesIndex() const { return ResultFile("", ".fif"); }
  std::string DetailedTimeSeriesPage() const { return ResultFile("DetailedTS", ".HTML"); }
  std::string DetailedRiverTimeSeriesPage() const { return ResultFile("DetailedFvrTS", ".HTML"); }

  /// Tells the node of the processed data where the preprocessor's report is now, and gives its manager. Null for a
  /// setup that was never saved, beside which nothing can lie.
  CPreprocessedDataManager* AttachPreprocessorReport() const;

 protected:
  void OnLoaded() override;

 private:
  bool SaveForRun();
  void RewriteRiverFile(const FileName& file);
  std::string ResultFile(std::string_view stemEnd, std::string_view extension) const;
};

/// Folder, stem and extension as one name: blanks around the folder are dropped, its `/` become `\\`, one `\\` stands
/// between folder and stem, and the extension has one dot before it; an empty extension adds nothing.
std::string ResultFileName(std::string_view folder, std::string_view stem, std::string_view extension);

}  // namespace tervane
