// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The messages that setups, editors and the main window of a program send each other by name.
#pragma once

#include <string>
#include <variant>

namespace tervane {

struct CTvnFlowModelData;
struct KvfFile;
class MessageReceiver;

/// What goes along with a message: a path, data to fill or filled, a window, or the tree of a parameter file, which
/// belongs to the sender and is there during the call alone.
using MessageContent = std::variant<std::monostate, std::string, CTvnFlowModelData*, MessageReceiver*, const KvfFile*>;

struct Message {
  std::string name;
  int wParam = 0;
  MessageContent lParam = {};
};

/// A window that takes messages.
class MessageReceiver {
 public:
  virtual ~MessageReceiver() = default;
  /// False when the message is none of its own.
  virtual bool Receive(const Message& message) = 0;
};

/// To the main window from a page: `OpenFile`.
inline constexpr const char* kMainWindowMessage = "QuarzelSwitchBoardSevice";
/// Between the frame of a setup, other editors and the main window: all others.
inline constexpr const char* kFrameMessage = "TervaneSwitchBoardSevice";

/// The meanings of wParam.
enum MessageKind : int {
  kAskLayers = 1,       ///< To the frame, with data to fill.
  kOpenFile = 2,        ///< Of `kMainWindowMessage`: with the path of what is opened in an editor.
  kLayers = 2,          ///< Of `kFrameMessage`: the answer to `kAskLayers`.
  kAskOverlayList = 3,  ///< To the frame, with the window that wants it.
  kOverlayList = 4,     ///< The answer, with the tree of a parameter file.
  kAskDomain = 6,       ///< To the frame, with data to fill.
  kDomainData = 7,      ///< The answer.
};

}  // namespace tervane
