// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Zones, stations and the like: children of a node that stand for the codes of a grid or the values of a polygon
// attribute, and are kept in step with what the file holds.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "core/node.h"
#include "platform/progress.h"

namespace tervane {

class CData2DShpFile;
class DataFileNode;

/// A child that stands for one code or value.
class CFMSEKvfGroupBase : public CYbSEKvfGroupBase {
 public:
  using CYbSEKvfGroupBase::CYbSEKvfGroupBase;

  virtual void SetStationName(const std::string& name) = 0;
  virtual std::string GetStationName() const = 0;
  /// The identity as a whole number, held as its digits.
  virtual void SetStationCode(int code) { SetStationId(std::to_string(code)); }
  virtual void SetStationId(const std::string& id) = 0;
  virtual std::string GetStationId() const = 0;
  virtual void SetRemoveMark(int mark) { removeMark_ = mark; }
  virtual int GetRemoveMark() const { return removeMark_; }
  /// The identity's whole number; 0 when it is none.
  int StationCode() const;

 private:
  int removeMark_ = 0;  ///< Used only while the children are brought in step.
};

/// A node whose children stand for codes or values.
class CFMSEKvfBase : public CTvnKvfBase {
 public:
  using CTvnKvfBase::CTvnKvfBase;

  /// A child as it begins, with this node as its parent; not added. Null for a node that has none.
  virtual std::shared_ptr<CFMSEKvfGroupBase> CreateStationItem() = 0;
  /// The same for a code or value that a file was found to hold.
  virtual std::shared_ptr<CFMSEKvfGroupBase> CreateFoundItem() { return CreateStationItem(); }
};

/// What happened to the children, as pages turn it into hints.
enum SyncResult : int { kNothing = 0, kAdded = 1, kRemoved = 2, kAddedAndRemoved = 3, kReordered = 4 };

/// The codes or values that a file holds, in the order in which they were found, each once.
struct FoundZones {
  std::vector<std::string> ids;
  bool areCodes = true;  ///< Whole numbers of a grid, else values of an attribute.
  bool sortAsText = false;
  /// Why the file could not be read; then nothing is known and nothing must change.
  std::string unreadable;
  /// Something to tell the user, with which nothing changes.
  std::string message;

  static constexpr const char* kNoValuesInGrid = "Could not find any values i grid file.";
};

/// The distinct codes of a grid. `noValues` is what a grid without any is told with.
FoundZones FindGridCodes(const std::string& file, int item, ProgressPart progress = {},
                         const char* noValues = FoundZones::kNoValuesInGrid);
/// The distinct values of an attribute, formatted with "%f" or "%d" where they are numbers.
FoundZones FindPolygonValues(const std::string& file, const std::string& attribute, int axisUnit,
                             ProgressPart progress = {});
/// Looks into a file for them; it asks no node, so that another thread may do it.
using ZoneFinder = std::function<FoundZones(ProgressPart progress)>;
ZoneFinder CodeFinder(const DataFileNode& file, const char* noValues = FoundZones::kNoValuesInGrid);
ZoneFinder PolygonFinder(const CData2DShpFile& file, int axisUnit);

/// What a synchronisation would do to the children.
struct SyncPlan {
  std::vector<std::string> added;  ///< Identities.
  std::vector<CFMSEKvfGroupBase*> removed;
  /// Of those, what a user has worked on: they differ from a child as it begins.
  std::vector<CFMSEKvfGroupBase*> editedRemoved;
};
SyncPlan PlanSync(CFMSEKvfBase& owner, const FoundZones& found);
SyncPlan PlanGlobalItem(CFMSEKvfBase& owner);

/// Brings the children in step: those that are matched by their identity stay as they are, new ones are added, others
/// removed, and all are sorted.
SyncResult SyncItems(CFMSEKvfBase& owner, const FoundZones& found);
/// Removes all children that stand for codes or values, and adds the one for the whole area, "Global".
SyncResult MakeGlobalItem(CFMSEKvfBase& owner);

/// The identity of the child of that name; empty when there is none.
std::string IdOfItem(const CFMSEKvfBase& owner, const std::string& name);

/// The children that stand for codes or values, in their order.
std::vector<CFMSEKvfGroupBase*> ZoneItems(const CFMSEKvfBase& owner);
std::vector<std::string> ZoneItemTitles(const CFMSEKvfBase& owner);

}  // namespace tervane
