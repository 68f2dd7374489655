// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/engine_output.h"

#include <fmt/format.h>

namespace tervane {

namespace {

std::string WithPlace(std::string_view place, std::string_view text) {
  return place.empty() ? std::string(text) : fmt::format("{}: {}", place, text);
}

}  // namespace

void EngineOutput::Line(std::string_view text) { out_ << text << '\n' << std::flush; }

void EngineOutput::Progress(int percent, std::string_view doing) {
  Line(fmt::format("progress {} {}", percent, doing));
}

void EngineOutput::Error(std::string_view place, std::string_view text) {
  ++errors_;
  Line("error: " + WithPlace(place, text));
}

void EngineOutput::Warning(std::string_view place, std::string_view text) {
  warnings_.push_back(WithPlace(place, text));
  Line("warning: " + warnings_.back());
}

}  // namespace tervane
