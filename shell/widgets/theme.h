// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The looks of the program: colours for light and dark, the zoom of the whole interface, and icons that follow both.
#pragma once

#include <QColor>
#include <QHash>
#include <QIcon>
#include <QObject>
#include <QString>

namespace tervane {

class Theme : public QObject {
  Q_OBJECT

 public:
  enum class Appearance { System, Light, Dark };

  /// Sets the style of the application; to be made once, before the first window.
  Theme();
  ~Theme() override;
  /// The theme of the running program.
  static Theme& Get();

  void SetAppearance(Appearance appearance);
  Appearance GetAppearance() const { return appearance_; }
  bool IsDark() const { return isDark_; }

  /// The size of everything, 1 for the size that the system asks for; kept within 0.5 and 3.
  void SetZoom(double zoom);
  double Zoom() const { return zoom_; }

  /// A length of the design, in pixels at zoom 1, at the present zoom.
  int Scaled(int pixels) const;
  /// An icon of `shell/icons` in the colour of texts.
  QIcon Icon(const QString& name) const;

  QColor ErrorColor() const;
  QColor WarningColor() const;
  QColor NoteColor() const;
  /// Texts that explain and stand back behind the others.
  QColor QuietColor() const;

 signals:
  /// Colours or sizes are others now: what was computed from them must be made anew.
  void Changed();

 private:
  void Apply();

  Appearance appearance_ = Appearance::System;
  bool systemIsDark_ = false;
  bool isDark_ = false;
  double zoom_ = 1;
  double basePointSize_ = 10;
  mutable QHash<QString, QIcon> icons_;  ///< Drawn for the present colours.
};

}  // namespace tervane
