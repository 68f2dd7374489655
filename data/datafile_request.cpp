// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_request.h"

#include <algorithm>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/text.h"

namespace tervane {

namespace {

std::string_view KindOf(int dimensions) {
  constexpr std::string_view kKinds[] = {"a time series", "a line", "a grid", "layers of grids"};
  return dimensions >= 0 && dimensions <= 3 ? kKinds[dimensions] : "of unknown dimensions";
}

std::string NameOfItemType(int code) {
  const ItemType* type = FindItemType(code);
  return type != nullptr ? std::string(type->name) : fmt::format("item type {}", code);
}

std::string WhyTypeIsWrong(int number, const DataItem& item, const std::vector<int>& allowed) {
  if (allowed.empty() || std::ranges::find(allowed, item.itemType) != allowed.end()) return {};
  std::string names;
  for (const int code : allowed) {
    const bool isLast = code == allowed.back();
    names += (names.empty() ? "" : isLast ? " or " : ", ") + NameOfItemType(code);
  }
  return fmt::format("item {} {}, {} was expected", number,
                     item.itemType == quantity::kUndefined ? "has no item type" : "is " + NameOfItemType(item.itemType),
                     names);
}

/// Why an item cannot be converted to its quantity, or stands on cells that no grid here has.
std::string WhyValuesAreUnfit(int number, const DataItem& item, const DataFileRequest& request) {
  const ItemType* type = request.itemTypes.empty() ? nullptr : FindItemType(item.itemType);
  if (type && type->code != quantity::kUndefined &&
      (!item.scale || item.scale->dimension != BaseUnit(*type).scale.dimension))
    return fmt::format("item {} is in \"{}\", which is no unit of {}", number, item.unitText, type->name);
  if (item.dimensions < 2) return {};
  GridGeometry grid;
  const std::string reason = ToModelGrid(item.geometry, grid);
  return reason.empty() ? "" : fmt::format("item {} has {}; resample the grid", number, reason);
}

std::string Plural(std::size_t count, std::string_view one, std::string_view many) {
  return fmt::format("{} {}", count == 1 ? "one" : std::to_string(count), count == 1 ? one : many);
}

}  // namespace

CYbDateTime StartOfValues(const DataItem& item, const TimeAxis& time) {
  const bool isOfSteps = item.valueType == ValueType::StepAccumulated || item.valueType == ValueType::MeanStep;
  return isOfSteps && time.begin ? *time.begin : time.Start();
}

std::string WhyNotCovered(const DataItem& item, const TimeAxis& time, const DataFileRequest::Period& period) {
  // What holds always covers everything.
  if (!item.hasTime) return {};
  if (time.stamps.empty()) return "the file has no dates";
  const CYbDateTime start = StartOfValues(item, time);
  const bool isLate = period.start < start, isShort = time.End() < period.end;
  if (!isLate && !isShort) return {};
  const std::string simulation =
      !isShort  ? fmt::format("starts at {}", DateInWords(period.start))
      : !isLate ? fmt::format("runs to {}", DateInWords(period.end))
                : fmt::format("runs from {} to {}", DateInWords(period.start), DateInWords(period.end));
  return fmt::format("the file covers {} to {}, the simulation {}", DateInWords(start), DateInWords(time.End()),
                     simulation);
}

std::string WhyNotMet(const DataFileFacts& file, std::span<const int> items, const DataFileRequest& request) {
  constexpr int kFirst[] = {1};
  if (items.empty()) items = kFirst;
  for (const int number : items) {
    if (std::string reason = file.WhyNoItem(number); !reason.empty()) return reason;
    const DataItem& item = *file.Item(number);
    if (request.dimensions && item.dimensions != *request.dimensions) {
      return fmt::format("item {} is {}, {} was expected", number, KindOf(item.dimensions),
                         KindOf(*request.dimensions));
    }
    if (std::string reason = WhyTypeIsWrong(number, item, request.itemTypes); !reason.empty()) return reason;
    if (std::string reason = WhyValuesAreUnfit(number, item, request); !reason.empty()) return reason;
    const std::size_t steps = item.hasTime ? file.time.steps : 1;
    if (request.steps && steps != *request.steps) {
      return fmt::format("the file has {}, {} expected", Plural(steps, "time step", "time steps"),
                         *request.steps == 1 ? "one was" : fmt::format("{} were", *request.steps));
    }
    if (steps == 0) return "the file has no time steps";
    if (!request.period) continue;
    if (std::string reason = WhyNotCovered(item, file.time, *request.period); !reason.empty()) return reason;
  }
  return {};
}

std::string WhyNotMet(const std::string& path, std::span<const int> items, const DataFileRequest& request) {
  const auto file = DataFileFactsOf(path);
  return file->error.empty() ? WhyNotMet(*file, items, request) : file->error;
}

std::string DateInWords(const CYbDateTime& date) {
  const bool isMidnight = date.Hour() == 0 && date.Minute() == 0 && date.Second() == 0;
  return date.Format(isMidnight ? "%Y-%m-%d" : date.Second() == 0 ? "%Y-%m-%d %H:%M" : "%Y-%m-%d %H:%M:%S");
}

}  // namespace tervane
