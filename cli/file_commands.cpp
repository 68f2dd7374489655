// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "cli/setup_file.h"
#include "platform/files.h"

namespace tervane {

namespace {

int Save(CFlowModelDoc& document, const std::string& file, Streams streams) {
  if (!document.OnSaveDocument(file)) {
    fmt::print(streams.err, "{}\n", document.Error());
    return kCouldNot;
  }
  for (const std::string& note : document.SaveNotes()) fmt::print(streams.err, "{}: {}\n", file, note);
  return kDone;
}

}  // namespace

int Refuse(Streams streams, const std::string& reason) {
  fmt::print(streams.err, "{}\n", reason);
  return kCouldNot;
}

bool RefuseToReplace(const std::string& file, bool force, Streams streams) {
  if (RefuseHeld(file, force, streams)) return true;
  if (force || !FileExists(file)) return false;
  fmt::print(streams.err, "{} exists; choose another name, or add --force to replace it\n", file);
  return true;
}

int NewCommand(const std::string& file, bool force, Streams streams) {
  if (RefuseToReplace(file, force, streams)) return kCouldNot;
  CFlowModelDoc document;
  return Save(document, file, streams);
}

int ConvertCommand(const std::string& in, const std::string& out, bool force, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, in, streams)) return kCouldNot;
  // Converting a file in its place keeps the original beside it.
  const bool isInPlace = in == out || IsSameFile(in, out);
  if (isInPlace ? RefuseHeld(out, force, streams) : RefuseToReplace(out, force, streams)) return kCouldNot;
  TellReport(document, streams);
  return Save(document, out, streams);
}

}  // namespace tervane
