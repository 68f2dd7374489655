// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/summary.h"

#include <algorithm>
#include <chrono>
#include <ctime>
#include <optional>
#include <vector>

#include <fmt/chrono.h>
#include <fmt/format.h>
#include <fmt/ranges.h>

#include "data/datafile_request.h"
#include "execution/processed_data.h"
#include "execution/run_state.h"
#include "geometry/cart.h"
#include "pages/findings.h"
#include "pages/parts/plot_content.h"
#include "pages/place_names.h"
#include "pages/tree_entries.h"
#include "platform/text.h"
#include "simspec/basic_parameters.h"
#include "simspec/periods.h"
#include "simspec/titles.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

/// The latest run of a setup, of this or another program; nothing where none was ever started.
std::optional<RunState> LatestRun(const CYbSEDocument& document) {
  if (document.PathName().empty()) return std::nullopt;
  std::string problem;
  return ReadRunState(RunFilesOf(document.getResultFolder(), document.PathName()).state, problem);
}

/// Whether the file was saved after the run had begun; file systems may count in steps of 2 s.
bool IsSavedSince(const CYbSEDocument& document, const RunState& run) {
  const FileStamp stamp = StampOf(document.PathName());
  const auto saved = std::chrono::file_clock::to_sys(stamp.time).time_since_epoch();
  return stamp.exists && std::chrono::duration_cast<std::chrono::milliseconds>(saved).count() > run.begun + 2000;
}

std::string Counted(std::ptrdiff_t number, const char* what) {
  return fmt::format("{} {}{}", number, what, number == 1 ? "" : "s");
}

/// The components that are on, with their methods, as a form of them shows.
void AddComponents(PageForm& form, std::vector<std::string>& components) {
  bool isOn = false;
  for (const auto& control : form.Controls()) {
    if (control->kind == ControlKind::SubForms) {
      const int current = control->currentSubForm();
      if (current >= 0 && current < static_cast<int>(control->subForms.size()))
        AddComponents(*control->subForms[static_cast<std::size_t>(current)], components);
    } else if (control->kind == ControlKind::Check) {
      isOn = control->IsShown() && control->IsEnabled() && control->Text() == "1";
      if (isOn) components.push_back(SpokenLabel(control->label));
    } else if (control->kind == ControlKind::Choice && control->beside && isOn) {
      const std::vector<std::string> options = control->Options();
      const int chosen = control->Option();
      if (chosen >= 0 && !components.empty())
        components.back() += ": " + SpokenLabel(options[static_cast<std::size_t>(chosen)]);
    }
  }
}

}  // namespace

SetupSummary::SetupSummary(const CYbSEDlgBase& page) : page_(page) {
  if (CYbSEKvfBase* basics = Root().Important(kBasicParameters)) {
    components_ = MakePageToRead(*PageClassOf(*basics), *basics, {page.Context().document, page.Outside(), {}});
  }
}

SetupSummary::~SetupSummary() = default;

CYbSEKvfBase& SetupSummary::Root() const { return page_.Context().document.Root(); }

std::string SetupSummary::TitleText() const {
  const auto* basics = Root().Important(kBasicParameters);
  const auto* title = basics ? basics->Child<CSimTitleKvf>() : nullptr;
  return title && !title->Title.empty() ? title->Title : "none";
}

std::string SetupSummary::PeriodText() const {
  const auto* period = Root().Important(kSimulationPeriod);
  if (!period) return {};
  const CYbDateTime start = period->GetSimStartDate(), end = period->SIMEND;
  if (!start.IsValid() || !end.IsValid()) return "its start or end is no date";
  const auto seconds = end.SecondsSinceEpoch() - start.SecondsSinceEpoch();
  if (seconds <= 0) return fmt::format("{} to {}: it ends before it starts", DateInWords(start), DateInWords(end));
  constexpr std::int64_t kDay = 24 * 60 * 60;
  return fmt::format("{} to {} ({})", DateInWords(start), DateInWords(end),
                     seconds < kDay ? Counted(seconds / 3600, "hour") : Counted(seconds / kDay, "day"));
}

std::string SetupSummary::DomainText() const {
  const auto* domain = Root().Important(kDomain);
  if (!domain || !domain->HasGeometry()) return "no file that can be read tells it yet";
  const GridGeometry grid = domain->GetModelGeometry();
  const std::string projection = CYbMapProjection(grid.projection).Name();
  return fmt::format("{} x {} cells of {} m{}{}", grid.nx, grid.ny, ShortestNumber(grid.cellSize),
                     projection.empty() ? "" : ", ", projection);
}

std::string SetupSummary::ComponentsText() {
  std::vector<std::string> components;
  if (components_) AddComponents(components_->Form(), components);
  return components.empty() ? "nothing" : fmt::format("{}", fmt::join(components, "\n"));
}

std::string SetupSummary::FindingsText() const {
  const std::vector<SetupFinding> findings = FindingsOf(page_.Context().document);
  const auto count = [&](SetupFinding::Kind kind) { return std::ranges::count(findings, kind, &SetupFinding::kind); };
  const auto errors = count(SetupFinding::Kind::Error), warnings = count(SetupFinding::Kind::Warning);
  if (errors == 0 && warnings == 0) return "none";
  if (warnings == 0) return Counted(errors, "error");
  return errors == 0 ? Counted(warnings, "warning")
                     : fmt::format("{}, {}", Counted(errors, "error"), Counted(warnings, "warning"));
}

std::string SetupSummary::RunText() const {
  const CYbSEDocument& document = page_.Context().document;
  const std::optional<RunState> run = LatestRun(document);
  if (!run) return "none yet";
  const std::string begun =
      fmt::format("{:%Y-%m-%d %H:%M}", fmt::localtime(static_cast<std::time_t>(run->begun / 1000)));
  const std::string end = OutcomeOf(*run) == RunOutcome::GoingOn ? "It goes on." : OutcomeSentence(*run);
  return fmt::format("{}: {}{}", begun, end, IsSavedSince(document, *run) ? "\nThe setup was saved since." : "");
}

SetupSummary::Step SetupSummary::Next() const {
  CYbSEDocument& document = page_.Context().document;
  const std::vector<SetupFinding> findings = FindingsOf(document);
  const auto error = std::ranges::find(findings, SetupFinding::Kind::Error, &SetupFinding::kind);
  if (error != findings.end()) {
    CYbSEKvfBase* node = FindNode(Root(), ParseSetupPath(error->path).steps);
    const std::string place = node ? PlaceNames(document).Of(*node, error->path, error->key) : error->path;
    return {fmt::format("Mend the first error. {}: {}", place, Replaced(error->text, "\n", " ")), error->serial};
  }
  if (document.PathName().empty()) return {"Save the setup, so that it can be run.", 0};
  const std::optional<RunState> run = LatestRun(document);
  if (!run) return {"Run the preprocessor, and look at what the model has made of the data.", 0};
  switch (OutcomeOf(*run)) {
    case RunOutcome::GoingOn:
      return {"Wait for the run to end.", 0};
    case RunOutcome::Done:
      break;
    default:
      return {"Look in the execution log why the run did not come to its end.", 0};
  }
  if (IsSavedSince(document, *run)) return {"Run it again, since the setup is another one now.", 0};
  const auto* processed = Root().Important(kProcessedData);
  return {"Look at the processed data.", processed ? processed->Serial() : 0};
}

MapContent SetupSummary::Map() const {
  const auto* domain = Root().Important(kDomain);
  if (!domain) return {};
  MapContent map = domain->Type == CCatchmentKvf::kGridFile ? FileMap(domain->GridFile())
                                                            : ShapeFileMap(domain->ShapeFile(), domain->ShapeAxisUnit);
  for (GridLayer& grid : map.grids) grid.withLegend = false;
  return map;
}

void SetupSummary::Describe(PageForm& form) {
  PageForm& group = form.Group("This setup");
  group.Shown("Title:", [this] { return TitleText(); });
  group.Shown("Simulation:", [this] { return PeriodText(); });
  group.Shown("Model domain:", [this] { return DomainText(); });
  group.Shown("Switched on:", [this] { return ComponentsText(); });
  group.Shown("Findings:", [this] { return FindingsText(); });
  group.Shown("Last run:", [this] { return RunText(); });
  group.Shown("Next step:", [this] { return Next().text; });
  group
      .Button("Go There",
              [this] {
                const std::uint64_t serial = Next().serial;
                WalkNodes(Root(), [&](const NodePlace& place) {
                  if (place.node.Serial() == serial && page_.Context().selectNode)
                    page_.Context().selectNode(place.node);
                });
              })
      .ShownWhen(Sentence("the next step is done on a page", [this] { return Next().serial != 0; }));
  form.Map([this] { return Map(); }).ShownWhen(Sentence("the model domain has a file", [this] {
    const auto* domain = Root().Important(kDomain);
    return domain && domain->HasGeometry();
  }));
}

}  // namespace tervane
