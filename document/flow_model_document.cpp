// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/flow_model_document.h"

#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

CFlowModelDoc::CFlowModelDoc() : CYbSEDocument(std::make_unique<CGlobal>()) { Root().Validate(); }

void CFlowModelDoc::OnLoaded() { Root().Validate(); }

std::string CFlowModelDoc::ResultFile(std::string_view stemEnd, std::string_view extension) const {
  return ResultFileName(getResultFolder(), std::string(BaseNameOf(PathName())) + std::string(stemEnd), extension);
}

CPreprocessedDataManager* CFlowModelDoc::AttachPreprocessorReport() const {
  auto* processed = Root().Important<CProcDataKvf>("PROCESSED_DATA");
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
