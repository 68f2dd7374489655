// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/theme.h"

#include <QApplication>
#include <QDir>
#include <QImage>
#include <QPainter>
#include <QPalette>
#include <QStyle>
#include <QStyleOption>
#include <algorithm>
#include <cmath>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "shell/maps/map_drawing.h"
#include "shell/maps/map_palette.h"
#include "shell/widgets/banner.h"
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

/// What is seen where one colour lies over another.
QColor Over(const QColor& color, const QColor& ground) {
  const auto mix = [part = color.alphaF()](float above, float below) { return above * part + below * (1 - part); };
  return QColor::fromRgbF(mix(color.redF(), ground.redF()), mix(color.greenF(), ground.greenF()),
                          mix(color.blueF(), ground.blueF()));
}

TEST_P(ContrastOf, LinesOfAMapStandOutOnItsPaperAndByTheirEdgesOnEveryGrid) {
  const bool isDark = Theme::Get().IsDark();
  const QColor paper = QApplication::palette().color(QPalette::Base);
  const std::pair<const char*, QColor> lines[] = {{"line", LineColor(isDark)},
                                                  {"ink", InkColor(isDark)},
                                                  {"domain", DomainColor(isDark)},
                                                  {"what stands out", kHighlightColor}};
  std::vector<QColor> grounds{paper};
  for (const Ramp ramp :
       {Ramp::Amounts, Ramp::Terrain, Ramp::VioletToYellow, Ramp::BlueToYellow, Ramp::VioletToOrange, Ramp::Difference})
    for (const double part : {0.0, 0.25, 0.5, 0.75, 1.0}) grounds.push_back(QColor(RampColor(part, ramp)));
  for (std::size_t code = 0; code < 12; ++code) grounds.push_back(QColor(CodeColor(code)));
  for (const auto& [line, ink] : lines) {
    Expect(kMark, std::string(line) + " on paper", ink, paper);
    for (const QColor& ground : grounds)
      Expect(kMark, std::string(line) + " beside its edge", ink, Over(EdgeColor(isDark), ground));
  }
}

TEST_P(ContrastOf, BarsBelowADocumentAreRead) {
  const QColor text = QApplication::palette().color(QPalette::WindowText);
  for (const auto tone : {Banner::Tone::Question, Banner::Tone::Good, Banner::Tone::Bad})
    Expect(kText, "bar", text, Banner::Ground(tone, Theme::Get().IsDark()));
}

/// The colours of a picture, those of most pixels first.
std::vector<QColor> ColorsOf(const QImage& picture) {
  std::map<QRgb, int> counts;
  int all = 0;
  for (int y = 0; y < picture.height(); ++y)
    for (int x = 0; x < picture.width(); ++x)
      if (const QRgb pixel = picture.pixel(x, y); qAlpha(pixel) == 255) ++all, ++counts[pixel];
  std::vector<std::pair<int, QRgb>> byCount;
  for (const auto& [pixel, count] : counts)
    if (count * 20 > all) byCount.emplace_back(count, pixel);
  std::ranges::sort(byCount, std::greater());
  std::vector<QColor> colors;
  for (const auto& [count, pixel] : byCount) colors.emplace_back(pixel);
  return colors;
}

TEST_P(ContrastOf, EveryIconStandsOutAndSoDoesTheSignInIt) {
  const QPalette palette = QApplication::palette();
  const QStringList drawings = QDir(":/icons").entryList({"*.svg"});
  EXPECT_GT(drawings.size(), 25);
  for (const QString& drawing : drawings) {
    const std::string name = drawing.toStdString();
    // The program's own picture is no sign within a window.
    if (drawing == "quarzel.svg") continue;
    const std::vector<QColor> colors =
        ColorsOf(Theme::Get().Icon(QString(drawing).remove(".svg")).pixmap(QSize(64, 64), 1.0).toImage());
    ASSERT_FALSE(colors.empty()) << name;
    for (const auto role : {QPalette::Window, QPalette::Base, QPalette::AlternateBase, QPalette::Button}) {
      double best = 0;
      for (const QColor& color : colors) best = std::max(best, Contrast(color, palette.color(role)));
      EXPECT_GE(best, kMark) << name << " on " << palette.color(role).name().toStdString();
    }
    if (colors.size() > 1) Expect(kMark, name, colors[1], colors[0]);
  }
}

TEST_P(ContrastOf, BoxesAndFieldsHaveAnOutlineThatIsSeen) {
  for (const auto role : {QPalette::Window, QPalette::Base}) {
    for (const auto element : {QStyle::PE_IndicatorCheckBox, QStyle::PE_IndicatorRadioButton,
                               QStyle::PE_IndicatorItemViewItemCheck, QStyle::PE_FrameLineEdit}) {
      QStyleOptionFrame frame;
      QStyleOptionButton box;
      QStyleOptionViewItem item;
      QStyleOption& option = element == QStyle::PE_FrameLineEdit                ? static_cast<QStyleOption&>(frame)
                             : element == QStyle::PE_IndicatorItemViewItemCheck ? static_cast<QStyleOption&>(item)
                                                                                : static_cast<QStyleOption&>(box);
      option.palette = QApplication::palette();
      option.state = QStyle::State_Enabled | QStyle::State_Off;
      option.rect = QRect(4, 4, 16, 16);
      frame.lineWidth = 1;
      QImage picture(24, 24, QImage::Format_RGB32);
      const QColor ground = option.palette.color(role);
      picture.fill(ground);
      QPainter painter(&picture);
      QApplication::style()->drawPrimitive(element, &option, &painter);
      painter.end();
      // Through the middle of its left side.
      double best = 0;
      for (int x = 2; x < 9; ++x) best = std::max(best, Contrast(picture.pixelColor(x, 12), ground));
      EXPECT_GE(best, kMark) << "element " << element << " on " << ground.name().toStdString();
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Contrast, ContrastOf, testing::Values(Theme::Appearance::Light, Theme::Appearance::Dark));

}  // namespace
}  // namespace tervane::theme_test
