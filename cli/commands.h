// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <string>

namespace tervane {

/// Where a command writes: results to one, messages to the other.
struct Streams {
  std::ostream& out;
  std::ostream& err;
};

// Each gives an `ExitStatus`.

int NewCommand(const std::string& file, bool force, Streams streams);
int ConvertCommand(const std::string& in, const std::string& out, bool force, Streams streams);

int CheckCommand(const std::string& file, bool json, Streams streams);

enum class TreeForm { Text, Paths, Json };
int TreeCommand(const std::string& file, bool all, TreeForm form, Streams streams);
int ShowCommand(const std::string& file, const std::string& path, Streams streams);

/// The page of a node as text.
int PageCommand(const std::string& file, const std::string& path, Streams streams);

int GetCommand(const std::string& file, const std::string& path, Streams streams);
int SetCommand(const std::string& file, const std::string& path, const std::string& value, bool force, Streams streams);

int DiffCommand(const std::string& from, const std::string& to, bool json, Streams streams);
int KeysCommand(bool markdown, Streams streams);

}  // namespace tervane
