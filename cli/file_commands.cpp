// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/setup_file.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct FileOptions {
  std::string file, in;
  bool force = false;
};

int NewCommand(const std::string& file, bool force, Streams streams) {
  if (!force && !EqualIgnoringCase(ExtensionOf(file), ".tvd"))
    return Refuse(streams, fmt::format("{}: a setup is named NAME.tvd; add --force to write it all the same", file));
  if (RefuseToReplace(file, force, streams)) return kCouldNot;
  SetupLock lock;
  if (!HoldSetup(lock, file, force, streams)) return kCouldNot;
  CFlowModelDoc document;
  return SaveSetup(document, file, "new", streams) ? kDone : kCouldNot;
}

int ConvertCommand(const std::string& in, const std::string& out, bool force, Streams streams) {
  // Converting a file in its place keeps the original beside it.
  const bool isInPlace = in == out || IsSameFile(in, out);
  if (!isInPlace && RefuseToReplace(out, force, streams)) return kCouldNot;
  SetupLock lock;
  if (!HoldSetup(lock, out, force, streams)) return kCouldNot;
  CFlowModelDoc document;
  if (!OpenSetup(document, in, streams)) return kCouldNot;
  PrintLoadReport(document, streams);
  return SaveSetup(document, out, "convert", streams) ? kDone : kCouldNot;
}

}  // namespace

void OfferFileCommands(CommandOffers& offers) {
  auto options = std::make_shared<FileOptions>();
  Command create = offers.Offer("new", "Write a setup with all defaults", [offers, options] {
    return NewCommand(options->file, options->force, offers.Output());
  });
  AddSetup(create, options->file);
  create.AddFlag("--force", options->force,
                 "Replace a file that exists, also where an editor has it open; write under a name without .tvd");
}

void OfferConvertCommand(CommandOffers& offers) {
  auto options = std::make_shared<FileOptions>();
  Command convert = offers.Offer(
      "convert", "Write a setup of any version as one of the present version",
      [offers, options] { return ConvertCommand(options->in, options->file, options->force, offers.Output()); });
  convert.Add("IN", options->in, "The setup to read").Required();
  convert.Add("OUT", options->file, "The setup to write; when it is IN, the original is kept beside it").Required();
  convert.AddFlag("--force", options->force, "Replace another file that exists, also where an editor has it open");
}

}  // namespace tervane
