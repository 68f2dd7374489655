// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace tervane {

// What a shell asks of the editor's module before it opens a document. What needs a window is the shell's own.

/// The template: help file, document type, names, filter and extension, separated by line ends.
inline constexpr const char* kDocTemplate =
    "TERVANE.chm\nTVDPar\nTervane  Flow Model\nTervane  Flow Model(*.tvd)\n.tvd\nTVDPar.Document\nTVDPar Document";

int YbGetNumDocTemplates();
/// Sets "Flow Model" and gives 1; 0 on a null pointer.
int YbGetEditorString(std::string* text);
int YbGetNumToolbars();
/// The toolbar's name for number 0, else 0.
int YbGetToolbarString(std::string* text, int toolbar);
int YbGetBitmapId();

}  // namespace tervane
