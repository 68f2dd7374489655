// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/theme.h"

#include <QApplication>
#include <QFile>
#include <QFont>
#include <QPainter>
#include <QPalette>
#include <QPixmap>
#include <QPointer>
#include <QProxyStyle>
#include <QStyleFactory>
#include <QStyleOption>
#include <QSvgRenderer>
#include <algorithm>
#include <cmath>

namespace tervane {

namespace {

QPointer<Theme> theTheme;

QPalette LightPalette() {
  QPalette palette(QColor(0xf3, 0xf4, 0xf6));
  palette.setColor(QPalette::Window, QColor(0xf3, 0xf4, 0xf6));
  palette.setColor(QPalette::Base, Qt::white);
  palette.setColor(QPalette::AlternateBase, QColor(0xf7, 0xf8, 0xfa));
  palette.setColor(QPalette::Button, QColor(0xf9, 0xfa, 0xfb));
  for (const auto role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText})
    palette.setColor(role, QColor(0x1f, 0x24, 0x2b));
  palette.setColor(QPalette::Highlight, QColor(0x1b, 0x6f, 0xa8));
  palette.setColor(QPalette::HighlightedText, Qt::white);
  palette.setColor(QPalette::Link, QColor(0x1b, 0x6f, 0xa8));
  palette.setColor(QPalette::LinkVisited, QColor(0x6b, 0x4f, 0xa0));
  palette.setColor(QPalette::PlaceholderText, QColor(0x6b, 0x72, 0x80));
  for (const auto role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText})
    palette.setColor(QPalette::Disabled, role, QColor(0x8a, 0x91, 0x9c));
  palette.setColor(QPalette::Disabled, QPalette::Base, QColor(0xee, 0xf0, 0xf2));
  return palette;
}

QPalette DarkPalette() {
  QPalette palette(QColor(0x33, 0x38, 0x40));
  palette.setColor(QPalette::Window, QColor(0x28, 0x2d, 0x34));
  palette.setColor(QPalette::Base, QColor(0x1c, 0x1f, 0x24));
  palette.setColor(QPalette::AlternateBase, QColor(0x22, 0x26, 0x2b));
  palette.setColor(QPalette::Button, QColor(0x3d, 0x43, 0x4c));
  for (const auto role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText, QPalette::ToolTipText})
    palette.setColor(role, QColor(0xe6, 0xe8, 0xeb));
  palette.setColor(QPalette::ToolTipBase, QColor(0x33, 0x38, 0x40));
  palette.setColor(QPalette::Highlight, QColor(0x2b, 0x7b, 0xb5));
  palette.setColor(QPalette::HighlightedText, Qt::white);
  palette.setColor(QPalette::Link, QColor(0x6c, 0xb6, 0xe8));
  palette.setColor(QPalette::LinkVisited, QColor(0xc4, 0xb0, 0xf5));
  palette.setColor(QPalette::PlaceholderText, QColor(0x93, 0x9a, 0xa5));
  for (const auto role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText})
    palette.setColor(QPalette::Disabled, role, QColor(0x8f, 0x96, 0xa1));
  palette.setColor(QPalette::Disabled, QPalette::Base, QColor(0x28, 0x2c, 0x32));
  return palette;
}

/// Of what is filled in: the style's own outline is too near to its ground to be seen by everybody.
QColor OutlineColor(bool isDark) { return isDark ? QColor(0x76, 0x7f, 0x8c) : QColor(0x83, 0x8b, 0x97); }

/// The style with marks that grow with the texts beside them, and with outlines that are seen.
class ZoomedStyle : public QProxyStyle {
 public:
  ZoomedStyle() : QProxyStyle(QStyleFactory::create("Fusion")) {}

  int pixelMetric(PixelMetric metric, const QStyleOption* option, const QWidget* widget) const override {
    const int size = QProxyStyle::pixelMetric(metric, option, widget);
    switch (metric) {
      case PM_IndicatorWidth:
      case PM_IndicatorHeight:
      case PM_ExclusiveIndicatorWidth:
      case PM_ExclusiveIndicatorHeight:
      case PM_TreeViewIndentation:
      case PM_SmallIconSize:
      case PM_ListViewIconSize:
      case PM_ButtonIconSize:
      case PM_TabCloseIndicatorWidth:
      case PM_TabCloseIndicatorHeight:
      case PM_TabBarScrollButtonWidth:
      case PM_ScrollBarExtent:
      case PM_MenuButtonIndicator:
        return theTheme ? theTheme->Scaled(size) : size;
      default:
        return size;
    }
  }

  void drawPrimitive(PrimitiveElement element, const QStyleOption* option, QPainter* painter,
                     const QWidget* widget) const override {
    QProxyStyle::drawPrimitive(element, option, painter, widget);
    const bool isRound = element == PE_IndicatorRadioButton;
    const bool isOutlined = isRound || element == PE_IndicatorCheckBox || element == PE_IndicatorItemViewItemCheck ||
                            element == PE_FrameLineEdit;
    // What has the keyboard is outlined in the colour of the choice.
    const bool hasFocus = element == PE_FrameLineEdit && (option->state & State_HasFocus);
    if (isOutlined && !hasFocus) Outline(*option, *painter, isRound);
  }

  void drawComplexControl(ComplexControl control, const QStyleOptionComplex* option, QPainter* painter,
                          const QWidget* widget) const override {
    QProxyStyle::drawComplexControl(control, option, painter, widget);
    const auto* list = qstyleoption_cast<const QStyleOptionComboBox*>(option);
    const auto* number = qstyleoption_cast<const QStyleOptionSpinBox*>(option);
    const bool isFramed = (list && list->frame) || (number && number->frame);
    if (isFramed && !(option->state & State_HasFocus)) Outline(*option, *painter, false);
  }

 private:
  static void Outline(const QStyleOption& option, QPainter& painter, bool isRound) {
    if (!(option.state & State_Enabled) || !theTheme) return;
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setBrush(Qt::NoBrush);
    painter.setPen(OutlineColor(theTheme->IsDark()));
    const QRectF edge = QRectF(option.rect).adjusted(0.5, 0.5, -0.5, -0.5);
    constexpr double kCorner = 2;
    if (isRound)
      painter.drawEllipse(edge);
    else
      painter.drawRoundedRect(edge, kCorner, kCorner);
    painter.restore();
  }
};

}  // namespace

Theme::Theme() {
  theTheme = this;
  systemIsDark_ = QApplication::palette().color(QPalette::Window).lightness() < 128;
  basePointSize_ = QApplication::font().pointSizeF() > 0 ? QApplication::font().pointSizeF() : 10;
  QApplication::setStyle(new ZoomedStyle);
  Apply();
}

Theme::~Theme() = default;

Theme& Theme::Get() { return *theTheme; }

void Theme::SetAppearance(Appearance appearance) {
  appearance_ = appearance;
  Apply();
}

void Theme::SetZoom(double zoom) {
  zoom_ = std::clamp(zoom, 0.5, 3.0);
  Apply();
}

void Theme::Apply() {
  isDark_ = appearance_ == Appearance::Dark || (appearance_ == Appearance::System && systemIsDark_);
  QApplication::setPalette(isDark_ ? DarkPalette() : LightPalette());
  QFont font = QApplication::font();
  font.setPointSizeF(basePointSize_ * zoom_);
  QApplication::setFont(font);
  icons_.clear();
  emit Changed();
}

int Theme::Scaled(int pixels) const { return static_cast<int>(std::lround(pixels * zoom_)); }

QIcon Theme::Icon(const QString& name) const {
  if (const auto known = icons_.constFind(name); known != icons_.constEnd()) return *known;
  QFile file(":/icons/" + name + ".svg");
  if (!file.open(QIODevice::ReadOnly)) return {};
  const QByteArray drawing = file.readAll();
  QIcon icon;
  const auto add = [&](QIcon::Mode mode, const QColor& color) {
    QSvgRenderer renderer(QByteArray(drawing).replace("currentColor", color.name().toLatin1()));
    for (const int size : {16, 24, 32, 48, 64}) {
      QPixmap pixmap(size, size);
      pixmap.fill(Qt::transparent);
      QPainter painter(&pixmap);
      renderer.render(&painter);
      icon.addPixmap(pixmap, mode);
    }
  };
  const QPalette palette = QApplication::palette();
  add(QIcon::Normal, palette.color(QPalette::Active, QPalette::ButtonText));
  // Without a drawing of its own the style tints that of a selected row.
  add(QIcon::Selected, palette.color(QPalette::Active, QPalette::ButtonText));
  add(QIcon::Disabled, palette.color(QPalette::Disabled, QPalette::ButtonText));
  icons_.insert(name, icon);
  return icon;
}

QColor Theme::ErrorColor() const { return isDark_ ? QColor(0xff, 0x90, 0x88) : QColor(0xc4, 0x26, 0x1d); }
QColor Theme::WarningColor() const { return isDark_ ? QColor(0xe3, 0xb3, 0x41) : QColor(0x8f, 0x5f, 0x00); }
QColor Theme::NoteColor() const { return isDark_ ? QColor(0x6c, 0xb6, 0xe8) : QColor(0x1b, 0x6f, 0xa8); }
QColor Theme::QuietColor() const { return isDark_ ? QColor(0xa9, 0xb0, 0xba) : QColor(0x5f, 0x67, 0x73); }

}  // namespace tervane
