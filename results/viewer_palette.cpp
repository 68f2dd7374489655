// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/viewer_palette.h"

#include <algorithm>
#include <cmath>
#include <functional>

namespace tervane {

const std::array<PaletteColor, kPaletteClasses> kResultColors = {{{128, 0, 128},
                                                                  {85, 0, 171},
                                                                  {42, 0, 213},
                                                                  {0, 0, 255},
                                                                  {0, 56, 225},
                                                                  {0, 111, 195},
                                                                  {0, 166, 166},
                                                                  {0, 196, 110},
                                                                  {0, 196, 110},
                                                                  {0, 255, 0},
                                                                  {85, 255, 0},
                                                                  {85, 255, 0},
                                                                  {255, 255, 0},
                                                                  {255, 170, 0},
                                                                  {255, 85, 0},
                                                                  {255, 0, 0}}};

namespace {

constexpr std::array<PaletteColor, kPaletteClasses> kVectorColors = {{{128, 0, 128},
                                                                      {85, 0, 171},
                                                                      {42, 0, 213},
                                                                      {0, 0, 255},
                                                                      {0, 56, 225},
                                                                      {0, 111, 195},
                                                                      {0, 166, 166},
                                                                      {0, 196, 110},
                                                                      {0, 226, 55},
                                                                      {0, 255, 0},
                                                                      {85, 255, 0},
                                                                      {170, 255, 0},
                                                                      {255, 255, 0},
                                                                      {255, 170, 0},
                                                                      {255, 85, 0},
                                                                      {255, 0, 0}}};
constexpr std::array<double, kPaletteClasses> kVectorValues = {-0.4, -0.35, -0.3, -0.25, -0.2, -0.15, -0.1, -0.05,
                                                               0,    0.05,  0.1,  0.15,  0.2,  0.25,  0.3,  0.35};

/// `putValue` adds the upper end of a class.
void WritePalette(KvfFile* file, const std::string& title, bool isTopmostShown,
                  const std::array<PaletteColor, kPaletteClasses>& colors,
                  const std::function<void(std::size_t)>& putValue) {
  kvfAddSection(file, "Quarzel_Palette_Definition");
  kvfPutParam(file, "Palette_Title", title);
  kvfPutParam(file, "Palette_Type", 1);
  kvfPutParam(file, "Locked", false);
  kvfPutParam(file, "Topmost_Value", isTopmostShown);
  kvfPutParam(file, "Nice_Value", true);
  kvfPutListParam(file, "RGB_Delete_Color", "iii", 255, 255, 255);
  for (std::size_t i = 0; i < colors.size(); ++i) {
    kvfPutListParam(file, "RGB_Color_Value", "iii", colors[i].red, colors[i].green, colors[i].blue);
    putValue(i);
  }
  kvfEndSection(file);
}

/// The smallest easy number that is not below a step.
double NiceStep(double step) {
  double normalised = step, power = 1;
  while (normalised > 10) normalised /= 10, power *= 10;
  while (normalised <= 1) normalised *= 10, power /= 10;
  for (const double nice : {1.5, 2.0, 2.5, 4.0, 5.0, 6.0, 8.0})
    if (nice >= normalised) return nice * power;
  return 10 * power;
}

}  // namespace

PaletteRange ScaledRange(double a, double b) {
  if (a > b) std::swap(a, b);
  const double even = (b - a) / kPaletteClasses;
  const double step = NiceStep(even > 0 && std::isfinite(even) ? even : 1);
  constexpr double kSame = 1e-10;
  const double steps = b / step;
  const bool isMultiple = std::abs(b - std::trunc(steps + kSame) * step) < kSame;
  const double high = isMultiple ? b : (std::trunc(steps) + 1) * step;
  return {high - kPaletteClasses * step, high};
}

std::array<float, kPaletteClasses> ClassesOf(const PaletteRange& range) {
  std::array<float, kPaletteClasses> values{};
  for (int k = 1; k <= kPaletteClasses; ++k)
    values[static_cast<std::size_t>(k - 1)] =
        static_cast<float>(range.low + (range.high - range.low) * k / kPaletteClasses);
  return values;
}

void WriteResultPalette(KvfFile* file, const std::string& title, const PaletteRange& range) {
  const auto values = ClassesOf(range);
  WritePalette(file, title, true, kResultColors, [&](std::size_t i) { kvfAddFloat(file, values[i]); });
}

void WriteVectorPalette(KvfFile* file) {
  WritePalette(file, "Flow in xy-direction", false, kVectorColors,
               [&](std::size_t i) { kvfAddDouble(file, kVectorValues[i]); });
}

}  // namespace tervane
