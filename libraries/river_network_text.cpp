// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Between the text of a network and its branches.
#include <algorithm>
#include <cmath>
#include <limits>
#include <map>

#include <fmt/format.h>

#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "libraries/kept_text.h"
#include "libraries/river_network.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::string_view kTarget = "FLUVANE_Network_editor";
constexpr std::string_view kPoints = "POINTS", kBranches = "BRANCHES", kArea = "DATA_AREA";
constexpr std::string_view kBranchPattern = "Branch_%d";
constexpr int kFormatVersion = 112;

std::string Values(const KvfNode& keyword) {
  std::string text = KvfValuesText(keyword);
  constexpr std::size_t kMost = 60;
  return text.size() > kMost ? text.substr(0, kMost) + "..." : text;
}

std::string AreaText(const Envelope& area) {
  KvfFile file;
  KvfSection& section = *file.AddSection(file.top, KvfKind::Section, kArea);
  AddCorners(file, section, area);
  return KvfNodeText(section, kInTarget);
}

}  // namespace

// ---- Reading

/// Takes a network apart so that the writer can put it together again with all that means nothing here.
class RiverNetworkReader {
 public:
  RiverNetworkReader(const KvfFile& file, CYbSimpleRiverData& network) : file_(file), network_(network) {}

  /// False when there is no target of a network.
  bool Read() {
    network_.header_ = file_.header;
    bool isFound = false;
    for (const KvfNode* node = file_.top.firstChild; node; node = node->next) {
      const KvfSection* target = AsSection(node);
      // Its last word is spelled with a capital as well.
      if (isFound || !target || !EqualIgnoringCase(target->Name(), kTarget)) {
        kept_.Keep(*node, kTop);
        continue;
      }
      isFound = true;
      kept_.KeepCommentsUntil(static_cast<int>(target->line), kTop);
      network_.beforeTarget_ = kept_.Take();
      ReadTarget(*target);
    }
    kept_.KeepCommentsUntil(KeptText::kEndOfFile, kTop);
    network_.behindTarget_ = kept_.Take();
    JoinPoints();
    return isFound;
  }

 private:
  using Section = CYbSimpleRiverData::Section;

  void ReadTarget(const KvfSection& target) {
    for (const KvfNode* node = target.firstChild; node; node = node->next) {
      const KvfSection* section = AsSection(node);
      if (section && section->Name() == kPoints) {
        ReadSection(*section, [this](const KvfNode& child) { return ReadPoint(child); });
      } else if (section && section->Name() == kBranches) {
        ReadSection(*section, [this](const KvfNode& child) { return ReadBranch(child); });
      } else {
        kept_.Keep(*node, kInTarget);
        network_.sections_.push_back(
            {section ? std::string(section->Name()) : std::string(), kept_.Take(), section && section->count == 0});
      }
    }
  }

  /// A section that comes again adds to the first of its name.
  template <class ReadChild>
  void ReadSection(const KvfSection& section, const ReadChild& readChild) {
    auto found = std::ranges::find(network_.sections_, section.Name(), &Section::name);
    if (found == network_.sections_.end())
      found = network_.sections_.insert(found, {std::string(section.Name()), {}, false});
    std::string& text = found->text;
    for (const KvfNode* node = section.firstChild; node; node = node->next)
      if (!readChild(*node)) {
        kept_.Keep(*node, kInSection);
        text += kept_.Take();
      }
    kept_.KeepCommentsUntil(KeptText::LastLineOf(section) + 1, kInSection);
    text += kept_.Take();
  }

  bool ReadPoint(const KvfNode& node) {
    if (node.Name() != "Point") return false;
    const bool isPoint = node.IsKeyword() && node.count == 4 && node.params[0].type == KvfType::Int &&
                         std::all_of(node.params + 1, node.params + 4, IsKvfNumber);
    const int line = static_cast<int>(node.line);
    if (!isPoint) {
      Refuse(line, fmt::format("Point{}: a whole number, x, y and a chainage were expected",
                               node.IsKeyword() ? " = " + Values(node) : std::string()));
      return false;
    }
    const auto number = [&](int place) { return KvfNumber(node.params[place]); };
    const RiverPoint point{node.params[0].asInt, {number(1), number(2)}, number(3), line};
    if (!std::isfinite(point.place.x) || !std::isfinite(point.place.y) || !std::isfinite(point.chainage)) {
      Refuse(line, fmt::format("point {} has a number that is not finite", point.number));
      return false;
    }
    if (const auto [known, isNew] = points_.try_emplace(point.number, KnownPoint{point, false}); !isNew) {
      Refuse(line,
             fmt::format("point {} is there twice; that of line {} is used", point.number, known->second.point.line));
      return false;
    }
    return true;
  }

  bool ReadBranch(const KvfNode& node) {
    if (node.IsKeyword() || !IsNumberedName(node.Name(), kBranchPattern)) return false;
    const KvfSection& section = *AsSection(&node);
    RiverBranch& branch = network_.branches.emplace_back();
    branch.line = static_cast<int>(section.line);
    // The comments in front of a branch stand in it from now on, so that they go where it goes.
    branch.others = IndentedLines(kInBranch, kept_.CommentsUntil(branch.line));
    for (const KvfNode* child = section.firstChild; child; child = child->next)
      if (!ReadPartOfBranch(*child, branch)) kept_.Keep(*child, kInBranch);
    kept_.KeepCommentsUntil(KeptText::LastLineOf(section) + 1, kInBranch);
    branch.others += kept_.Take();
    return true;
  }

  bool ReadPartOfBranch(const KvfNode& node, RiverBranch& branch) {
    if (!node.IsKeyword()) return false;
    const std::string_view key = node.Name();
    if (key == "Name") return TakeText(node, branch.name);
    if (key == "TopoID") return TakeText(node, branch.topoId);
    if (key == "Upstream") return TakeJunction(node, branch.upstream);
    if (key == "Downstream") return TakeJunction(node, branch.downstream);
    if (key == "Direction") {
      if (node.count != 1 || node.params[0].type != KvfType::Int) return RefusePart(node, "a whole number was");
      branch.direction = node.params[0].asInt;
      return true;
    }
    if (key == "Points") {
      const auto isWhole = [](const KvfParam& param) { return param.type == KvfType::Int; };
      if (!std::all_of(node.params, node.params + node.count, isWhole))
        return RefusePart(node, "numbers of points were");
      for (std::uint32_t i = 0; i < node.count; ++i)
        branch.points.push_back({node.params[i].asInt, {}, 0, static_cast<int>(node.line)});
      return true;
    }
    return false;
  }

  bool TakeText(const KvfNode& node, std::string& text) {
    if (node.count != 1 || node.params[0].type != KvfType::String) return RefusePart(node, "one text in quotes was");
    text = node.params[0].Text();
    return true;
  }

  bool TakeJunction(const KvfNode& node, RiverJunction& junction) {
    const bool isNone = node.count == 0 || (node.count == 1 && node.params[0].IsText() && node.params[0].length == 0);
    if (isNone) return true;
    if (node.count != 2 || node.params[0].type != KvfType::String || !IsKvfNumber(node.params[1]))
      return RefusePart(node, "the name of a branch and a chainage were");
    junction = {std::string(node.params[0].Text()), KvfNumber(node.params[1])};
    return true;
  }

  bool RefusePart(const KvfNode& node, std::string_view expected) {
    Refuse(static_cast<int>(node.line), fmt::format("{} = {}: {} expected", node.Name(), Values(node), expected));
    return false;
  }
  void Refuse(int line, std::string text) { network_.refused_.push_back({Severity::Error, line, std::move(text)}); }

  /// Gives the branches their points, when all are known.
  void JoinPoints() {
    for (RiverBranch& branch : network_.branches) {
      std::erase_if(branch.points, [&](RiverPoint& point) {
        const auto found = points_.find(point.number);
        if (found == points_.end()) {
          Refuse(point.line,
                 fmt::format("branch {}: point {} is in no section {}", branch.name, point.number, kPoints));
          return true;
        }
        found->second.isUsed = true;
        point = found->second.point;
        return false;
      });
    }
    for (const auto& [number, read] : points_)
      if (!read.isUsed) network_.loosePoints.push_back(read.point);
    std::ranges::sort(network_.loosePoints, {}, &RiverPoint::line);
  }

  struct KnownPoint {
    RiverPoint point;
    bool isUsed;
  };

  const KvfFile& file_;
  CYbSimpleRiverData& network_;
  KeptText kept_{file_};
  std::unordered_map<int, KnownPoint> points_;
};

std::string CYbSimpleRiverData::ParseNetwork(const FileContent& text, const std::string& path) {
  KvfFile file;
  if (!ParseKvf(text, file)) return fmt::format("{}:{}", path, file.syntaxError.message);
  CYbSimpleRiverData read;
  read.path_ = path;
  if (!RiverNetworkReader(file, read).Read())
    return fmt::format("{} is no river network: it has no target {}", path, kTarget);
  *this = std::move(read);
  return {};
}

// ---- Writing

namespace {

void AddNumber(KvfFile& file, double value) { file.AddParam(KvfType::Double).asDouble = value; }
void AddText(KvfFile& file, std::string_view value) { file.SetText(file.AddParam(KvfType::String), value); }

void AddJunction(KvfFile& file, KvfSection& section, std::string_view key, const RiverJunction& junction) {
  file.BeginKeyword(section, key);
  AddText(file, junction.branch);
  if (!junction.IsNone()) AddNumber(file, junction.chainage);
}

/// All points by number; those that several branches share stand once.
std::string PointsText(const CYbSimpleRiverData& network) {
  std::map<int, const RiverPoint*> points;
  for (const RiverBranch& branch : network.branches)
    for (const RiverPoint& point : branch.points) points.emplace(point.number, &point);
  for (const RiverPoint& point : network.loosePoints) points.emplace(point.number, &point);
  KvfFile file;
  for (const auto& [number, point] : points) {
    constexpr std::uint32_t kValues = 4;
    KvfNode* keyword = file.AddKeyword(file.top, "Point", kValues);
    for (std::uint32_t i = 0; i < kValues; ++i) new (&keyword->params[i]) KvfParam;
    keyword->count = kValues;
    keyword->params[0].asInt = number;
    const double values[] = {point->place.x, point->place.y, point->chainage};
    for (std::uint32_t i = 1; i < kValues; ++i) {
      keyword->params[i].type = KvfType::Double;
      keyword->params[i].asDouble = values[i - 1];
    }
  }
  std::string text;
  AppendKvfNodes(file.top, kInSection, text);
  return text;
}

std::string BranchText(const RiverBranch& branch, std::size_t number) {
  KvfFile file;
  KvfSection& section = *file.AddSection(file.top, KvfKind::Section, NumberedName(kBranchPattern, number));
  file.BeginKeyword(section, "Name");
  AddText(file, branch.name);
  file.BeginKeyword(section, "TopoID");
  AddText(file, branch.topoId);
  file.BeginKeyword(section, "Points");
  for (const RiverPoint& point : branch.points) file.AddParam(KvfType::Int).asInt = point.number;
  file.BeginKeyword(section, "Direction");
  file.AddParam(KvfType::Int).asInt = branch.direction;
  AddJunction(file, section, "Upstream", branch.upstream);
  AddJunction(file, section, "Downstream", branch.downstream);
  std::string text;
  AppendKvfNodes(section, kInBranch, text);
  return IndentedLine(kInSection, fmt::format("section {} {{\n", NumberedName(kBranchPattern, number))) +
         branch.others + text + IndentedLine(kInSection, "}\n");
}

}  // namespace

std::string CYbSimpleRiverData::NetworkText(std::string& error) const {
  error.clear();
  std::string text = header_ + beforeTarget_ + fmt::format("target {} {{\n", kTarget);
  for (const Section& section : sections_) {
    if (section.name != kPoints && section.name != kBranches) {
      text += section.text;
      continue;
    }
    text += IndentedLine(kInTarget, fmt::format("section {} {{\n", section.name)) + section.text;
    if (section.name == kPoints) text += PointsText(*this);
    if (section.name == kBranches)
      for (std::size_t i = 0; i < branches.size(); ++i) text += BranchText(branches[i], i + 1);
    text += IndentedLine(kInTarget, "}\n");
  }
  text += "}\n" + behindTarget_;
  // What a later reading would refuse must not take the place of a good file.
  KvfFile read;
  if (!ParseKvf(FileContent::Of(text), read)) error = read.syntaxError.message;
  return text;
}

// ---- Sections

CYbSimpleRiverData CYbSimpleRiverData::Empty(const Envelope& area) {
  // Those that an editor of networks expects.
  constexpr std::string_view kStructures[] = {"WEIR",
                                              "CULVERTS",
                                              "PUMPS",
                                              "REGULATING_STR",
                                              "CONTROL_STR",
                                              "DAMBREAK_STR",
                                              "CATCHMENT",
                                              {},
                                              "TERVANECOUPLING",
                                              "CHANNELROUTING",
                                              "FLOOD_QQ",
                                              "FLOOD_HQ",
                                              "FLOOD_ORIFICE",
                                              "DIVERSION",
                                              "ALIGNMENTLINE",
                                              "BRIDGE",
                                              "JUNCTION",
                                              "USER_DEFINED",
                                              "TABULATED",
                                              "ENERGYBALANCE",
                                              "FLUVANE_ROUTING",
                                              "VORA12_HYDRAU",
                                              "LAYER_FILES"};
  CYbSimpleRiverData network;
  KvfFile file;
  KvfSection& version = *file.AddSection(file.top, KvfKind::Section, "FORMAT_VERSION");
  file.BeginKeyword(version, "verno");
  file.AddParam(KvfType::Int).asInt = kFormatVersion;
  KvfSection& setup = *file.AddSection(file.top, KvfKind::Section, "COMPUTATIONAL_SETUP");
  file.BeginKeyword(setup, "SaveAllGridPoints");
  file.AddParam(KvfType::Bool).asBool = true;
  network.sections_.push_back({"FORMAT_VERSION", KvfNodeText(version, kInTarget), false});
  network.sections_.push_back({std::string(kArea), AreaText(area), false});
  network.sections_.push_back({std::string(kPoints), {}, false});
  network.sections_.push_back({std::string(kBranches), {}, false});
  for (const std::string_view name : kStructures) {
    if (name.empty())
      network.sections_.push_back({"COMPUTATIONAL_SETUP", KvfNodeText(setup, kInTarget), false});
    else
      network.sections_.push_back(
          {std::string(name), KvfNodeText(*file.AddSection(file.top, KvfKind::Section, name), kInTarget), true});
  }
  return network;
}

void CYbSimpleRiverData::TakeBranches(std::vector<RiverBranch> taken) {
  branches = std::move(taken);
  loosePoints.clear();
  int number = 0;
  for (RiverBranch& branch : branches)
    for (RiverPoint& point : branch.points) point.number = ++number;
  for (const std::string_view name : {kPoints, kBranches}) {
    const auto found = std::ranges::find(sections_, name, &Section::name);
    if (found == sections_.end()) sections_.push_back({std::string(name), {}, false});
  }
}

void CYbSimpleRiverData::SetArea(const Envelope& area) {
  const auto found = std::ranges::find(sections_, kArea, &Section::name);
  if (found == sections_.end())
    sections_.insert(sections_.begin(), {std::string(kArea), AreaText(area), false});
  else
    found->text = AreaText(area);
}

std::vector<std::string> CYbSimpleRiverData::KeptSections() const {
  const CYbSimpleRiverData usual = Empty({});
  std::vector<std::string> names;
  for (const Section& section : sections_) {
    if (section.isEmpty || section.name.empty() || section.name == kPoints || section.name == kBranches ||
        section.name == kArea)
      continue;
    const auto found = std::ranges::find(usual.sections_, section.name, &Section::name);
    if (found == usual.sections_.end() || found->isEmpty) names.push_back(section.name);
  }
  return names;
}

}  // namespace tervane
