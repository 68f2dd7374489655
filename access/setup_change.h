// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "document/flow_model_document.h"

namespace tervane {

/// A key by its path, and the value that it is to hold, typed as `TakeTyped` takes it.
struct TypedChange {
  std::string path, value;
};

/// The setup with a change: the value is put where the file would hold it, and the whole is read as any other file, so
/// that a key means here what it means to the nodes. Null with the reason, and `document` as it was, when there is no
/// such key, the text is no such value, or the setup would be saved with another.
std::unique_ptr<CFlowModelDoc> ReadWithChange(CFlowModelDoc& document, const TypedChange& change, std::string& problem);

}  // namespace tervane
