// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Buttons and choices that stand beside a data file on a page.
#pragma once

#include <optional>
#include <string>

#include "core/file_name.h"
#include "document/global.h"
#include "forms/page.h"

namespace tervane {

/// Asks where a new file is to stand and writes it. Nothing when the user gave up, or when it fails, which is told.
/// `now` is the file that the page has.
std::optional<FileName> CreateFileByDialog(const CYbSEDlgBase& page, Host::FileQuestion question, const FileName& now,
                                           const std::function<FileResult(const std::string& path)>& write);

/// Lets an editor that this file is handed to ask for a part of the setup; nothing for an empty name.
void AllowRequest(const CYbSEKvfBase& node, const FileName& file, bool EditorRequests::*part);

/// Opens a data file of a page in the program's viewer, with the backdrop prepared for it and, where one is told, its
/// item.
void EditDataFile(const PageContext& context, const CYbSEKvfBase& node, const FileName& file,
                  std::optional<int> item = {});
/// True when the setup has a name, beside which files can be made; else the user is told so.
bool MayCreateFile(const PageContext& context);

inline constexpr const char* kGridFileFilter = "Two Dim Files (*.nds2) |*.nds2|All Files (*.*) |*.*||";
inline constexpr const char* kShapeFileFilter = "Shape Files (*.shp) |*.shp|All Files (*.*) |*.*||";
inline constexpr const char* kSeriesFileFilter = "Time series files (*.nds0) |*.nds0|All Files (*.*) |*.*||";

/// The units of an item type as a choice list over the key that a setup stores.
Control& UnitKeyChoice(PageForm& form, const std::string& label, const char* key, int& unitKey, int itemType);

}  // namespace tervane
