// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QPointer>
#include <QSettings>
#include <QWidget>

#include "core/host.h"

namespace tervane {

/// The questions of pages and documents as dialogs of the desktop.
class QtHost : public Host {
 public:
  QtHost(QWidget* window, QSettings& settings) : window_(window), settings_(settings) {}

  /// Nobody is there to answer, as while a picture is made: what would be shown is printed, and what would be asked is
  /// declined.
  void SetUnattended() { isUnattended_ = true; }

  /// Asks with buttons of these texts: the number of the pressed one, or nothing for Cancel, which is the default.
  std::optional<int> Choose(const QString& text, const QString& explanation, const QStringList& answers);

  Answer Ask(const std::string& text, Icon icon, Buttons buttons) override;
  std::optional<std::string> AskFileToOpen(const FileQuestion& question) override;
  std::optional<std::string> AskFileToSave(const FileQuestion& question) override;
  std::optional<int> AskItem(const ItemQuestion& question) override;
  std::optional<LibraryChoice> SelectLibraryEntry(const LibraryQuestion& question) override;
  void OpenBrowser(const std::string& address) override;
  /// The window that takes what is sent.
  void SetReceiver(MessageReceiver* receiver) { receiver_ = receiver; }
  bool Send(const Message& message) override { return receiver_ && receiver_->Receive(message); }
  bool Compute(const std::shared_ptr<Computation>& computation) override;
  std::string Setting(const std::string& name) const override;
  void SetSetting(const std::string& name, const std::string& value) override;

 private:
  QPointer<QWidget> window_;
  QSettings& settings_;
  MessageReceiver* receiver_ = nullptr;
  bool isUnattended_ = false;
};

/// A filter of texts and patterns in turn, "Grid file (*.nds2)|*.nds2||", as the toolkit's dialogs want it.
QString DialogFilter(const std::string& filter);

}  // namespace tervane
