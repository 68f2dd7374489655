// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Pictures with numbers in their names, of which a program for films makes one.
#pragma once

#include <QImage>
#include <cstddef>
#include <functional>
#include <string>

namespace tervane {

/// "heads_0001.png" for "heads.png" and the number 1.
std::string PictureFile(const std::string& path, std::size_t number);

/// Draws so many pictures and writes them beside each other; `draw` gives one, or none with the reason, and
/// `goesOn` is told how many are done and may stop it. All are made before the first one takes its place, so that
/// never some are new and others old. "" or why nothing was written; "cancelled" when it was stopped.
std::string SaveAnimation(const std::string& path, std::size_t count,
                          const std::function<QImage(std::size_t number, std::string& problem)>& draw,
                          const std::function<bool(std::size_t done)>& goesOn);

}  // namespace tervane
