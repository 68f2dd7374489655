// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a page or a document asks of the program around it: a desktop implements it with windows, the command line on
// the terminal, a test with a script of expected questions and answers.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "core/message.h"
#include "platform/computation.h"

namespace tervane {

struct LibraryKind;

class Host {
 public:
  virtual ~Host() = default;

  enum class Icon { Information, Warning, Error, Question };
  enum class Buttons { Ok, OkCancel, YesNo, YesNoCancel };
  enum class Answer { Ok, Cancel, Yes, No };
  virtual Answer Ask(const std::string& text, Icon icon, Buttons buttons) = 0;
  void ShowMessage(const std::string& text, Icon icon) { Ask(text, icon, Buttons::Ok); }

  /// What a file dialog shows. The filter is a list of text and patterns in turn, as "Grid file (*.nds2)|*.nds2||".
  struct FileQuestion {
    std::string title;
    std::string filter;
    std::string defaultExtension;  ///< Without its dot.
    std::string current;           ///< What is chosen at first; may be empty.
  };
  /// The chosen path, or nothing when the user gave up.
  virtual std::optional<std::string> AskFileToOpen(const FileQuestion& question) = 0;
  virtual std::optional<std::string> AskFileToSave(const FileQuestion& question) = 0;

  /// What is chosen among the contents of a file: a row of texts each, with why it cannot be chosen.
  struct ItemQuestion {
    struct Row {
      std::vector<std::string> cells;
      std::string refusal;  ///< Empty when it may be chosen.
    };
    std::string title;
    std::string file;
    std::vector<std::string> heads;
    std::vector<Row> rows;
    int current = -1;  ///< The row that is chosen at first.
  };
  /// The chosen row, or nothing when the user gave up or no row may be chosen.
  virtual std::optional<int> AskItem(const ItemQuestion& question) = 0;

  /// What is chosen among the libraries of a kind: a file, and one of its entries by its name.
  struct LibraryQuestion {
    const LibraryKind& kind;
    std::string file;  ///< What is chosen at first; both may be empty.
    std::string entry;
  };
  struct LibraryChoice {
    std::string file, entry;

    bool operator==(const LibraryChoice&) const = default;
  };
  /// A library that is there with an entry of it, or nothing when the user gave up.
  virtual std::optional<LibraryChoice> SelectLibraryEntry(const LibraryQuestion& question) = 0;

  virtual void OpenBrowser(const std::string& address) = 0;

  /// Sends a message to the main window of the program; false where there is none, or it does not take it.
  virtual bool Send(const Message& /*message*/) { return false; }
  /// Has a file opened in an editor of its kind.
  void OpenInEditor(const std::string& path) {
    if (!path.empty()) Send({kMainWindowMessage, kOpenFile, path});
  }

  /// Does what the user has asked for and waits for. A desktop shows meanwhile how far it is, in a window in which it
  /// can be cancelled; what is computed must touch no node and nothing of the caller's, since that may be done in
  /// another thread, which may end a little later. False when it was cancelled.
  virtual bool Compute(const std::shared_ptr<Computation>& computation) { return computation->Run(); }

  /// A setting of the program, "" when it was never set.
  virtual std::string Setting(const std::string& name) const = 0;
  virtual void SetSetting(const std::string& name, const std::string& value) = 0;
};

/// A host for what only shows pages: every question is given up, nothing is kept.
class NobodyToAsk : public Host {
 public:
  Answer Ask(const std::string& /*text*/, Icon /*icon*/, Buttons /*buttons*/) override { return Answer::Cancel; }
  std::optional<std::string> AskFileToOpen(const FileQuestion& /*question*/) override { return std::nullopt; }
  std::optional<std::string> AskFileToSave(const FileQuestion& /*question*/) override { return std::nullopt; }
  std::optional<int> AskItem(const ItemQuestion& /*question*/) override { return std::nullopt; }
  std::optional<LibraryChoice> SelectLibraryEntry(const LibraryQuestion& /*question*/) override { return std::nullopt; }
  void OpenBrowser(const std::string& /*address*/) override {}
  std::string Setting(const std::string& /*name*/) const override { return {}; }
  void SetSetting(const std::string& /*name*/, const std::string& /*value*/) override {}
};

}  // namespace tervane
