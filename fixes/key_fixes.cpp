// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "fixes/key_fixes.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <optional>

#include <fmt/format.h>

#include "core/mends.h"
#include "platform/file_search.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// What is declared of a finding's key, with the value that its node holds as the default.
std::optional<KeyInfo> HeldKey(const FoundAt& found) {
  if (found.key.empty()) return std::nullopt;
  std::vector<KeyInfo> keys;
  found.node->DescribeKeys(keys);
  for (KeyInfo& key : keys)
    if (key.key == found.key && key.written && key.section.empty()) return std::move(key);
  return std::nullopt;
}

// ---- Files

const FileName* HeldFile(const FoundAt& found) {
  const std::optional<KeyInfo> key = HeldKey(found);
  return key && key->type == "filename" ? static_cast<const FileName*>(key->member) : nullptr;
}

void PlanMovedFile(SetupKeys& keys, const FoundAt& found, const FixContext& context, FixPlan& plan) {
  const auto leave = [&](std::string why) { plan.left.push_back({found.node, found.key, std::move(why)}); };
  const FileName* file = HeldFile(found);
  if (!file) return;
  const std::string name(FileNameOf(file->Absolute()));
  if (!context.files) return leave("no folder was searched");
  const std::vector<std::string>& places = context.files->Of(name);
  if (places.empty()) return leave(fmt::format("there is no {} below {}", name, context.folder));
  if (places.size() > 1)
    return leave(fmt::format("{} files are called {}, among them {} and {}: choose one on the page", places.size(),
                             name, places[0], places[1]));
  const std::string folder = found.node->GetRoot() ? found.node->GetRoot()->SetupFolder() : std::string();
  const std::string after = StoredPath(places[0], folder);
  plan.values.push_back(
      {found.node, found.key, file->Text(), after, [&keys, node = found.node, key = found.key, after] {
         const PlainValue value = after;
         return keys.Set(*node, {key}, std::span(&value, 1));
       }});
}

// ---- Numbers

/// A number as a file holds it: behind one of single precision stands an f.
std::optional<double> AsNumber(std::string_view text) {
  if (text.ends_with('f')) text.remove_suffix(1);
  double number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

struct Clamped {
  std::string before, after;
};

/// The nearest value that the key allows; nothing where it has no range, the value is in it, or no value is nearest.
std::optional<Clamped> NearestInRange(const KeyInfo& key) {
  const bool isWhole = key.type == "int";
  if ((!isWhole && key.type != "float" && key.type != "double") || !key.facts.HasRange()) return std::nullopt;
  const std::optional<double> inFile = AsNumber(key.defaultValue);
  if (!inFile || std::isnan(*inFile)) return std::nullopt;
  const double value = *inFile - key.inFile;
  if (WhyStray(key.facts, value).empty()) return std::nullopt;
  double nearest = std::min(std::max(value, key.facts.least), key.facts.greatest);
  if (isWhole) {
    nearest = value < key.facts.least ? std::ceil(nearest) : std::floor(nearest);
    // Above 0 begins with 1.
    if (key.facts.isLeastOutside && nearest <= key.facts.least) nearest += 1;
  }
  if (!std::isfinite(nearest) || !WhyStray(key.facts, nearest).empty()) return std::nullopt;
  return Clamped{ShortestNumber(*inFile), ShortestNumber(nearest + key.inFile)};
}

std::optional<Clamped> ClampedAt(const FoundAt& found) {
  const std::optional<KeyInfo> key = HeldKey(found);
  return key ? NearestInRange(*key) : std::nullopt;
}

// ---- Offers

std::optional<Mend> SoleOffer(const FoundAt& found) {
  const auto* offers = dynamic_cast<const OffersMends*>(found.node);
  if (!offers || found.key.empty()) return std::nullopt;
  for (const Finding& own : found.node->Findings()) {
    if (own.key != found.key || own.text != found.text || own.detail != found.detail) continue;
    std::vector<Mend> mends = offers->MendsOf(own);
    if (mends.size() == 1) return std::move(mends.front());
  }
  return std::nullopt;
}

}  // namespace

std::string MissedFile(const FoundAt& found) {
  const FileName* file = HeldFile(found);
  if (!file || file->IsEmpty() || EndsInSeparator(file->Text())) return {};
  std::string path = file->Absolute();
  return FileExists(path) ? std::string() : path;
}

FixKind MovedFiles(SetupKeys& keys) {
  return {kMovedFile, "Find the File by Its Name", [](const FoundAt& found) { return !MissedFile(found).empty(); },
          [&keys](std::span<const FoundAt> found, const FixContext& context, FixPlan& plan) {
            for (const FoundAt& finding : found) PlanMovedFile(keys, finding, context, plan);
          }};
}

FixKind NumberInRange(SetupKeys& keys) {
  return {"range", "Take the Nearest Number That Is Allowed",
          [](const FoundAt& found) { return ClampedAt(found).has_value(); },
          [&keys](std::span<const FoundAt> found, const FixContext&, FixPlan& plan) {
            for (const FoundAt& finding : found)
              if (const auto clamped = ClampedAt(finding))
                plan.values.push_back({finding.node, finding.key, clamped->before, clamped->after,
                                       [&keys, node = finding.node, key = finding.key, after = clamped->after] {
                                         return keys.Set(*node, {key}, std::string_view(after));
                                       }});
          }};
}

FixKind OnlyOffer() {
  return {kSoleOffer, "Take What Is Offered", [](const FoundAt& found) { return SoleOffer(found).has_value(); },
          [](std::span<const FoundAt> found, const FixContext&, FixPlan& plan) {
            for (const FoundAt& finding : found) {
              const std::optional<Mend> mend = SoleOffer(finding);
              if (!mend) continue;
              FoundAt mended = finding;
              mended.key = mend->key;
              const std::optional<KeyInfo> key = HeldKey(mended);
              plan.values.push_back({finding.node, mend->key, key ? key->defaultValue : std::string(), mend->value,
                                     [node = finding.node, mend = *mend] {
                                       dynamic_cast<OffersMends&>(*node).TakeMend(mend);
                                       return std::string();
                                     }});
            }
          }};
}

}  // namespace tervane
