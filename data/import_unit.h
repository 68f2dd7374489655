// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The unit of values that come from another program's file.
#pragma once

#include <span>
#include <string>

#include "data/datafile_writer.h"
#include "platform/units.h"

namespace tervane {

/// Sets the unit of an item of that type to the one that a text names; an empty text means the type's base unit. Where
/// the type knows the unit, the values stay as they are; else they are converted to the base unit. "" or why the unit
/// does not fit.
std::string TakeUnit(const std::string& text, const ItemType& type, NewItem& item, std::span<float> values);

}  // namespace tervane
