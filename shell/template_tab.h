// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <QWidget>
#include <string>

#include "pages/template_view.h"

namespace tervane {

class PageView;
class TextFileView;

/// A process template in its tab: what it declares as a table, and its text beside it. Nothing is changed here; a file
/// that is replaced on the disk is read again.
class TemplateTab : public QWidget {
  Q_OBJECT

 public:
  TemplateTab(const std::string& path, Host& host);
  ~TemplateTab() override;

  const std::string& Path() const { return view_.Path(); }
  /// The name of the file.
  QString Title() const;
  /// Why there is nothing to show; empty when there is.
  const std::string& Problem() const { return view_.Problem(); }
  /// Reads the file again if it is another one than before.
  void Reload();
  /// Makes all anew that was computed from colours and sizes.
  void Redraw();

 private:
  TemplateView view_;
  Host& host_;
  QWidget* pagePlace_;
  PageView* page_ = nullptr;
  TextFileView* text_;
  QTimer disk_;
};

}  // namespace tervane
