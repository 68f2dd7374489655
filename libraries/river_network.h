// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// River networks: branches of points with chainages, in files of their own (.fvnwk) that project files (.fvproj) and
// simulation files (.fvsim) name. Sections that mean nothing here, such as weirs and bridges, are kept as text.
#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "core/node.h"
#include "geometry/grid.h"
#include "platform/files.h"

namespace tervane {

struct RiverPoint {
  int number = 0;  ///< Under which a network holds it, from 1.
  MapPoint place;
  double chainage = 0;  ///< In metres.
  int line = 0;         ///< Where it was read; 0 for a new one.
};

/// Where an end of a branch is joined to another one.
struct RiverJunction {
  std::string branch;  ///< Empty for none.
  double chainage = 0;

  bool IsNone() const { return branch.empty(); }
  bool operator==(const RiverJunction&) const = default;
};

struct RiverBranch {
  /// Where the water goes.
  enum Direction : int { kToHigherChainages = 0, kToLowerChainages = 1 };

  std::string name;
  std::string topoId = {};  ///< Tells several surveys of a branch apart; mostly empty.
  std::vector<RiverPoint> points = {};
  int direction = kToHigherChainages;
  RiverJunction upstream = {}, downstream = {};
  std::string others = {};  ///< What means nothing here, as it is written.
  int line = 0;             ///< Where it was read; 0 for a new one.

  /// The lowest and the highest chainage; nothing for a branch without points.
  std::optional<std::pair<double, double>> Chainages() const;
  double Length() const;
};

/// What is wrong with a network, and where.
struct RiverFinding {
  Severity severity = Severity::Error;
  int line = 0;  ///< In the file that was read; 0 where that says nothing.
  std::string text;
};

class CYbSimpleRiverData {
 public:
  std::vector<RiverBranch> branches;
  std::vector<RiverPoint> loosePoints;  ///< That no branch has.

  /// An empty network with the sections that one has.
  static CYbSimpleRiverData Empty(const Envelope& area);

  // ---- Files. What cannot be read leaves the network as it was.

  FileResult ReadNetworkFile(const std::string& path);
  /// The network that a project file names.
  FileResult ReadProjectFile(const std::string& path);
  /// The same of a text; `path` stands for its place in messages. Gives why it is no network.
  std::string ParseNetwork(const FileContent& text, const std::string& path);
  /// Writes it in one step; on any failure the old file stands. A network with errors is refused: what could not be
  /// read of it would be lost.
  FileResult WriteNetworkFile(const std::string& path) const;
  std::string NetworkText(std::string& error) const;

  /// The file from which it was read; empty for none.
  const std::string& Path() const { return path_; }

  // ---- What it is

  /// The first branch of that name; null for none.
  const RiverBranch* Find(std::string_view name) const;
  std::size_t PointCount() const;
  /// The rectangle around all branches; nothing where there are none.
  std::optional<Envelope> Extent() const;
  /// All that is wrong, in the order of the file.
  std::vector<RiverFinding> Findings() const;

  // ---- Changing it

  /// Takes other branches in the place of its own; the points get new numbers. Structures on the old ones stay.
  void TakeBranches(std::vector<RiverBranch> taken);
  /// The area that its editor shows.
  void SetArea(const Envelope& area);
  /// Sections that it keeps and that are not empty: "WEIR".
  std::vector<std::string> KeptSections() const;

 private:
  friend class RiverNetworkReader;

  /// A section of the target at its place. Of `POINTS` and `BRANCHES` the text is what means nothing in them.
  struct Section {
    std::string name;  ///< Empty for keywords.
    std::string text;
    bool isEmpty = false;
  };

  std::string path_;
  std::string header_, beforeTarget_, behindTarget_;
  std::vector<Section> sections_;
  std::vector<RiverFinding> refused_;
};

/// "rhone.fvnwk:12: branch Rhone: ...", for the command line and logs.
std::string FindingText(const std::string& path, const RiverFinding& finding);

// ---- Files that name a network

/// What a simulation or project file names; a problem where that is nothing.
struct NamedNetwork {
  std::string path;     ///< Absolute; empty for none.
  std::string problem;  ///< With the file and the place.
};
NamedNetwork NetworkOfSimulation(const std::string& path);
NamedNetwork NetworkOfProject(const std::string& path);

/// A network as it was read.
struct RiverReading {
  CYbSimpleRiverData network;
  std::string problem;  ///< Why there is none; empty when there is.
  std::vector<RiverFinding> findings;

  bool HasBranches() const { return !network.branches.empty(); }
  /// The branch of that name; null for none.
  const RiverBranch* Find(const std::string& name) const;

  std::unordered_map<std::string, std::size_t> places;  ///< Of the branches, by name.
};
/// What a file leads to: a network (.fvnwk), that of a project (.fvproj) or of a simulation (.fvsim), by its extension
/// in any case of letters; of other files nothing is read, and that is no problem. Read again only when a file has
/// changed. Any thread may ask; never null.
std::shared_ptr<const RiverReading> ReadRiverOnce(const std::string& path);

}  // namespace tervane
