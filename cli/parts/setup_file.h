// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "access/written_setup.h"
#include "cli/parts/outcome.h"
#include "document/flow_model_document.h"
#include "document/setup_lock.h"

namespace tervane {

/// Opens a setup; tells on the error stream why that failed.
bool OpenSetup(CFlowModelDoc& document, const std::string& file, Streams streams);

/// Saves a setup that the command of that name has changed, with a step in the journal beside it where there is one;
/// tells on the error stream why that failed, and what a user should know of it.
bool SaveSetup(CFlowModelDoc& document, const std::string& file, std::string_view command, Streams streams);

/// Takes the lock of a setup that is read, changed and written, so that no change of another program is lost; waits for
/// other commands that do the same. False, with a message, when an editor that runs has the setup open: its next save
/// would undo what is written here. With `force` it is then written all the same.
bool HoldSetup(SetupLock& lock, const std::string& file, bool force, Streams streams);
/// True, with a message, when an editor that runs has the file open.
bool RefuseHeld(const std::string& file, bool force, Streams streams);

/// Prints the notes on the loading to the error stream, a line each; for commands that write or compare.
void PrintLoadReport(const CFlowModelDoc& document, Streams streams);
/// The same in one line, for commands that only show something.
void PrintLoadReportHint(const CFlowModelDoc& document, Streams streams);

/// Reads what the preprocessor left of the setup, for commands that show places; tells why where there is a report that
/// cannot be read.
void ReadProcessedData(const CFlowModelDoc& document, Streams streams);

/// A place as a person types it, found in a tree; null, with a message that names what comes near, when it is not
/// there.
CYbSEKvfBase* FindNodeOrReport(CFlowModelDoc& document, const SetupPath& path, const std::string& typed,
                               Streams streams);

/// The key that a path names in its section; null, with a message, when it is not there.
KvfNode* FindKeyOrReport(KvfSection& section, const PathStep& key, const std::string& typed, Streams streams);

}  // namespace tervane
