// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/theme.h"

#include <QApplication>
#include <QPalette>
#include <algorithm>
#include <cmath>
#include <string>

#include <gtest/gtest.h>

#include "shell/widgets/layer_colors.h"

namespace tervane::theme_test {
namespace {

constexpr double kText = 4.5;  ///< What small text needs to be read.
constexpr double kMark = 3;    ///< Marks, lines and frames that tell something by themselves.

double Linear(double part) { return part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4); }

double Luminance(const QColor& color) {
  return 0.2126 * Linear(color.redF()) + 0.7152 * Linear(color.greenF()) + 0.0722 * Linear(color.blueF());
}

double Contrast(const QColor& a, const QColor& b) {
  const auto [dark, light] = std::minmax({Luminance(a), Luminance(b)});
  return (light + 0.05) / (dark + 0.05);
}

void Expect(double least, const std::string& what, const QColor& color, const QColor& ground) {
  EXPECT_GE(Contrast(color, ground), least)
      << what << ": " << color.name().toStdString() << " on " << ground.name().toStdString();
}

class ContrastOf : public testing::TestWithParam<Theme::Appearance> {
 protected:
  void SetUp() override { Theme::Get().SetAppearance(GetParam()); }
  void TearDown() override { Theme::Get().SetAppearance(Theme::Appearance::System); }
};

TEST(Contrast, IsThatOfTheKnownPairs) {
  EXPECT_NEAR(Contrast(Qt::black, Qt::white), 21, 1e-6);
  EXPECT_NEAR(Contrast(QColor(0x77, 0x77, 0x77), Qt::white), 4.48, 0.01);
}

TEST_P(ContrastOf, EveryTextIsReadOnEveryGround) {
  const QPalette colors = QApplication::palette();
  const Theme& theme = Theme::Get();
  const auto color = [&](QPalette::ColorRole role) { return colors.color(QPalette::Active, role); };
  const std::pair<const char*, QColor> grounds[] = {{"window", color(QPalette::Window)},
                                                    {"field", color(QPalette::Base)},
                                                    {"other row", color(QPalette::AlternateBase)},
                                                    {"button", color(QPalette::Button)}};
  const std::pair<const char*, QColor> texts[] = {{"text", color(QPalette::Text)},
                                                  {"window text", color(QPalette::WindowText)},
                                                  {"button text", color(QPalette::ButtonText)},
                                                  {"link", color(QPalette::Link)},
                                                  {"visited link", color(QPalette::LinkVisited)},
                                                  {"error", theme.ErrorColor()},
                                                  {"warning", theme.WarningColor()},
                                                  {"note", theme.NoteColor()},
                                                  {"quiet", theme.QuietColor()}};
  for (const auto& [ground, back] : grounds)
    for (const auto& [text, ink] : texts) Expect(kText, std::string(text) + " on " + ground, ink, back);
  Expect(kText, "placeholder", color(QPalette::PlaceholderText), color(QPalette::Base));
  Expect(kText, "selected", color(QPalette::HighlightedText), color(QPalette::Highlight));
  Expect(kText, "tool tip", color(QPalette::ToolTipText), color(QPalette::ToolTipBase));
}

TEST_P(ContrastOf, MarksAndLinesStandOutOnTheirGround) {
  const QPalette colors = QApplication::palette();
  for (const auto role : {QPalette::Window, QPalette::Base, QPalette::AlternateBase})
    Expect(kMark, "focus frame", colors.color(QPalette::Highlight), colors.color(role));
  for (std::size_t curve = 0; curve < 8; ++curve)
    Expect(kMark, "curve " + std::to_string(curve), CurveColor(curve, Theme::Get().IsDark()),
           colors.color(QPalette::Base));
}

INSTANTIATE_TEST_SUITE_P(Contrast, ContrastOf, testing::Values(Theme::Appearance::Light, Theme::Appearance::Dark));

}  // namespace
}  // namespace tervane::theme_test
