// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/soil_curves.h"

#include <cmath>

#include "libraries/soils.h"
#include "platform/text.h"

namespace tervane {

namespace {

// From wet to beyond the wilting point, in metres of suction.
constexpr int kFirstDecade = -2, kLastDecade = 3, kPointsOfDecade = 24;

Series SoilCurve(const char* name, const char* unit, int panel) {
  Series series;
  series.name = name;
  series.unit = unit;
  series.panel = panel;
  return series;
}

/// The chosen class; null when the user gave up.
const SoilTexture* AskTexture(Host& host) {
  Host::ItemQuestion question;
  question.title = "Set from Texture";
  question.file = "Carsel and Parrish (1988): means of the texture classes of the USDA";
  question.heads = {"Class", "Residual", "Saturated", "Alpha [1/cm]", "n", "Ks [cm/h]"};
  for (const SoilTexture& texture : SoilTextures())
    question.rows.push_back({{std::string(texture.name), ShortestNumber(texture.thetaR), ShortestNumber(texture.thetaS),
                              ShortestNumber(texture.alpha), ShortestNumber(texture.n), ShortestNumber(texture.ks)},
                             {}});
  const auto chosen = host.AskItem(question);
  return chosen ? &SoilTextures()[static_cast<std::size_t>(*chosen)] : nullptr;
}

}  // namespace

SeriesContent SoilChart(const Library& /*library*/, const LibraryEntry& entry) {
  SeriesContent chart;
  chart.numbers = {"Suction", "m", true};
  const std::optional<Soil> soil = SoilOf(entry);
  if (!soil) {
    chart.message = "The values of the soil make no curves: see its findings.";
    return chart;
  }
  Series retention = SoilCurve("Water content", "", 0), conductivity = SoilCurve("Conductivity", "m/s", 1);
  conductivity.isLogarithmic = true;
  for (int i = 0; i <= (kLastDecade - kFirstDecade) * kPointsOfDecade; ++i) {
    const double suction = std::pow(10, kFirstDecade + static_cast<double>(i) / kPointsOfDecade);
    retention.positions.push_back(suction);
    retention.values.push_back(WaterContent(*soil, suction));
    conductivity.positions.push_back(suction);
    conductivity.values.push_back(ConductivityAt(*soil, suction));
  }
  chart.series = {std::move(retention), std::move(conductivity)};
  return chart;
}

void DescribeTextures(PageForm& form, CYbSEDlgBase& page, std::function<LibraryEntry*()> current) {
  form.Button("Set from Texture",
              [&page, current] {
                LibraryEntry* soil = current();
                const SoilTexture* texture = soil ? AskTexture(page.Outside()) : nullptr;
                if (!texture) return;
                SetFromTexture(*soil, *texture);
                page.UpdateDoc(kDataChanged, "Set from Texture");
              })
      .ToolTip("Give the soil the mean values of a texture class")
      .EnabledWhen("the library has a soil", [current] { return current() != nullptr; });
}

}  // namespace tervane
