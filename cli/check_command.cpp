// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <optional>
#include <unordered_map>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/check_fixes.h"
#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "languages/languages.h"
#include "pages/findings.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct CheckOptions {
  std::string file, language = "en";
  bool json = false, coverage = false, each = false, fix = false;
  FixOptions fixes;
};

std::string_view KindName(KvfUnread::Kind kind) {
  switch (kind) {
    case KvfUnread::Kind::Target:
      return "target";
    case KvfUnread::Kind::Section:
      return "section";
    case KvfUnread::Kind::Keyword:
      return "key";
    case KvfUnread::Kind::Parameter:
      return "value";
    case KvfUnread::Kind::Comment:
      return "comment";
  }
  return {};
}

/// The nodes below by their serials.
void CollectNodes(const CYbSEKvfBase& node, std::unordered_map<std::uint64_t, const CYbSEKvfBase*>& nodes) {
  nodes.emplace(node.Serial(), &node);
  for (const CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    CollectNodes(*child, nodes);
}

std::string MendsJson(const CYbSEKvfBase& node, const SetupFinding& finding) {
  std::vector<std::string> mends;
  for (const Mend& mend : MendsOf(node, finding))
    mends.push_back(JsonObject({{"text", JsonQuoted(mend.text)},
                                {"path", JsonQuoted(fmt::format("{}:{}", finding.path, mend.key))},
                                {"value", JsonQuoted(mend.value)}}));
  return mends.empty() ? std::string() : JsonArray(mends);
}

/// `fixed` is what was fixed, as JSON; empty where nothing was to be.
void WriteJson(const CYbSEDocument& document, const std::vector<SetupFinding>& findings, const std::string& fixed,
               std::ostream& out) {
  std::unordered_map<std::uint64_t, const CYbSEKvfBase*> nodes;
  if (!findings.empty()) CollectNodes(document.Root(), nodes);
  const auto mends = [&](const SetupFinding& finding) {
    const auto node = nodes.find(finding.serial);
    return node == nodes.end() ? std::string() : MendsJson(*node->second, finding);
  };

  const auto optional = [](const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); };
  std::vector<std::string> found, notRead;
  for (const SetupFinding& finding : findings) {
    if (finding.kind == SetupFinding::Kind::Unread)
      notRead.push_back(JsonObject({{"path", JsonQuoted(finding.path)},
                                    {"kind", JsonQuoted(KindName(finding.unread))},
                                    {"text", JsonQuoted(finding.text)},
                                    {"line", std::to_string(finding.line)}}));
    else
      found.push_back(JsonObject({{"path", JsonQuoted(finding.path)},
                                  {"severity", JsonQuoted(KindName(finding.kind))},
                                  {"text", JsonQuoted(finding.text)},
                                  {"key", optional(finding.key)},
                                  {"detail", optional(finding.detail)},
                                  {"line", finding.line > 0 ? std::to_string(finding.line) : std::string()},
                                  {"mends", mends(finding)}}));
  }
  fmt::print(out, "{}\n",
             JsonObject({{"fixed", fixed}, {"findings", JsonArray(found)}, {"unread", JsonArray(notRead)}}));
}

void WriteFinding(const std::string& file, const SetupFinding& finding, const Translations& told, std::ostream& out) {
  const std::string line = finding.line > 0 ? fmt::format("{}:", finding.line) : std::string();
  const std::string key = finding.key.empty() ? std::string() : ":" + finding.key;
  const std::string place = OneLine(finding.path + key);
  // What belongs to no node, as a comment, has no place; a remark on the whole file keeps its colon.
  const bool hasPlace = !place.empty() || finding.kind != SetupFinding::Kind::Unread;
  fmt::print(out, "{}:{} {}: {}{}{}{}\n", file, line, InLanguage(told, std::string(KindName(finding.kind))), place,
             hasPlace ? ": " : "", OneLine(InLanguage(told, finding.text)),
             finding.detail.empty() ? std::string() : fmt::format(" ({})", OneLine(InLanguage(told, finding.detail))));
}

void WriteText(const std::vector<SetupFinding>& findings, const CheckOptions& options, std::ostream& out) {
  const std::string& file = options.file;
  const Translations& told = CatalogueOf(options.language);
  // A few are better told one by one.
  constexpr std::size_t kFewest = 4;
  for (const FindingGroup& group : GroupFindings(findings)) {
    if (!options.each && group.findings.size() >= kFewest) {
      fmt::print(out, "{}: {}: {}: {}\n", file, InLanguage(told, std::string(KindName(group.First().kind))),
                 OneLine(group.Place()), OneLine(InLanguage(told, group.Text())));
      continue;
    }
    for (const SetupFinding& finding : group.findings) WriteFinding(file, finding, told, out);
  }
  if (findings.empty()) fmt::print(out, "{}: {}\n", file, InLanguage(told, "no findings"));
}

int CheckCommand(const CheckOptions& options, Streams streams) {
  const std::string& file = options.file;
  SetupLock lock;
  if (options.fix && !options.fixes.isDry && !HoldSetup(lock, file, options.fixes.force, streams)) return kCouldNot;
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  std::string fixed;
  FixOptions fixes = options.fixes;
  fixes.each = options.each;
  // What is found is found in the file, which a dry run leaves as it is.
  std::optional<CFlowModelDoc> trial;
  if (options.fix && fixes.isDry && !OpenSetup(trial.emplace(), file, streams)) return kCouldNot;
  if (options.fix && !FixAndSave(trial ? *trial : document, file, fixes, options.json ? &fixed : nullptr, streams))
    return kCouldNot;
  const std::vector<SetupFinding> findings = FindingsOf(document);
  if (options.json)
    WriteJson(document, findings, fixed, streams.out);
  else
    WriteText(findings, options, streams.out);
  return std::ranges::any_of(findings, NeedsAttention) ? kFindings : kDone;
}

}  // namespace

void OfferCheckCommand(CommandOffers& offers) {
  auto options = std::make_shared<CheckOptions>();
  Command check = offers.Offer(
      "check", "List errors, warnings, notes and what the file holds that nothing reads", [offers, options] {
        if (options->coverage && options->fix)
          return Refuse(offers.Output(), "--coverage tells of the data and mends nothing: leave --fix out");
        return options->coverage ? CoverageCommand(options->file, options->json, offers.Output())
                                 : CheckCommand(*options, offers.Output());
      });
  AddSetup(check, options->file);
  check.AddFlag("--json", options->json, "As JSON");
  check.AddTaken(
      "--language",
      [options](const std::string& typed) {
        if (!IsLanguage(typed)) return fmt::format("{} is none of the languages: {}", typed, LanguageCodes());
        options->language = typed;
        return std::string();
      },
      "The language of the findings, en or de; JSON is English");
  check.AddFlag("--each", options->each, "Each finding on a line, also where many have one cause");
  check.AddFlag("--fix", options->fix, "Mend what can be mended, tell each value that changes, and save the setup");
  check.Add("--only", options->fixes.only, "One kind of fix alone; see FIXES").Needs("--fix");
  check.Add("--search", options->fixes.folder, "The folder below which moved files are searched: the setup's")
      .Needs("--fix");
  check.AddFlag("--dry-run", options->fixes.isDry, "Tell what --fix would change, and write nothing").Needs("--fix");
  check.AddFlag("--force", options->fixes.force, "Save it also where an editor has the setup open").Needs("--fix");
  check.Footer(kFixesFooter);
  check.AddFlag("--coverage", options->coverage,
                "Instead, how the data cover simulation and domain, and what the forcings come to each year");
}

}  // namespace tervane
