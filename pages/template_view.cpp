// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/template_view.h"

#include <algorithm>

#include <fmt/format.h>

#include "forms/table_of.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

using Item = CKinetraSolverItem;
using Kind = KinetraItemKind;

const KinetraSection& SectionOf(Kind kind) {
  return *std::ranges::find(KinetraSections(), kind, &KinetraSection::kind);
}

bool IsValue(Kind kind) { return kind == Kind::StateVariable || IsGiven(kind); }

/// A number of a variable, constant or forcing; a cell of any other kind is empty.
CellValue NumberOf(const Item& item, double value, bool isThere = true) {
  return IsValue(item.kind) && isThere ? CellValue(value) : CellValue(std::string());
}

std::string SourceText(const Item& item) {
  if (!IsGiven(item.kind)) return {};
  return item.IsModelParameter() ? "Tervane parameter" : "user";
}

}  // namespace

bool IsNamedAsTemplate(const std::string& path) { return LowerCase(ExtensionOf(path)) == ".kinetra"; }

/// Stands for the template where pages speak of a node: it bears what is odd.
class TemplateView::Node : public CTvnKvfBase {
 public:
  explicit Node(const TemplateView& view) : CTvnKvfBase("Process Template", "Template", nullptr), view_(view) {}

  int ValidateData() override {
    if (!view_.Problem().empty()) AddError(view_.Problem());
    for (const std::string& odd : view_.content_->Oddities()) AddWarning(odd);
    return view_.Problem().empty() ? 1 : 0;
  }

 private:
  const TemplateView& view_;
};

class TemplateView::Page : public CYbSEDlgBase {
 public:
  Page(TemplateView& view, const PageContext& context) : CYbSEDlgBase(*view.node_, context), view_(view) {}

 protected:
  void Describe(PageForm& form) override {
    std::vector<std::string> options{fmt::format("All ({})", view_.items_.size())};
    for (const KinetraSection& section : KinetraSections())
      options.push_back(fmt::format("{} ({})", section.names, (view_.content_.get()->*section.items).size()));
    form.Choice(
            "Declarations", [this] { return view_.shown_; }, [this](int shown) { view_.shown_ = shown; }, options)
        .Hint(kViewOnly)
        .Then([this] {
          if (Context().syncSoon) Context().syncSoon();
          return 0;
        });
    DescribeTable(form);
  }

 private:
  bool IsShown(Kind kind) const {
    return view_.shown_ == 0 || KinetraSections()[static_cast<std::size_t>(view_.shown_) - 1].kind == kind;
  }
  /// The same for what stands back while all are shown, so that names and expressions have room.
  std::function<bool()> WhenAlone(std::vector<Kind> kinds) const {
    return [this, rule = When(std::move(kinds))] { return view_.shown_ != 0 && rule(); };
  }
  /// A rule of a column that those kinds have.
  std::function<bool()> When(std::vector<Kind> kinds) const {
    return [this, kinds = std::move(kinds)] {
      return std::ranges::any_of(kinds, [this](Kind kind) { return IsShown(kind); });
    };
  }
  std::vector<Item*> Shown() {
    std::vector<Item*> shown;
    for (Item& item : view_.items_)
      if (IsShown(item.kind)) shown.push_back(&item);
    return shown;
  }

  void DescribeTable(PageForm& form) {
    auto table = std::make_shared<TableOf<Item>>(std::make_shared<ArrangedRows<Item>>([this] { return Shown(); }));
    table->ShowOnly();
    table->Value("Kind", [](const Item& item) { return std::string(SectionOf(item.kind).name); })
        .Width(115)
        .ShownWhen([this] { return view_.shown_ == 0; });
    table->Value("Symbol", [](const Item& item) { return item.symbol; })
        .Width(120)
        .ToolTipOf([](Item& item) {
          return item.onlineHelp + (item.onlineHelp.empty() || item.documentation.empty() ? "" : "\n") +
                 item.documentation;
        })
        .ShownWhen(When({Kind::StateVariable, Kind::Constant, Kind::Forcing, Kind::Auxiliary, Kind::Process}));
    table->Value("Description", [](const Item& item) { return item.description; }).Width(230).ToolTipOf([](Item& item) {
      return item.description;
    });
    table->Value("Unit", [](const Item& item) { return item.unitText; }).Width(70);
    const std::vector<Kind> values{Kind::StateVariable, Kind::Constant, Kind::Forcing};
    const auto hasValue = When(values), hasRange = WhenAlone(values);
    table->Value("Default", [](const Item& item) { return NumberOf(item, item.defaultValue); })
        .Width(70)
        .Format("%.6g")
        .ShownWhen(hasValue);
    table->Value("Minimum", [](const Item& item) { return NumberOf(item, item.minimum, item.minimum <= item.maximum); })
        .Width(70)
        .Format("%.6g")
        .ShownWhen(hasRange);
    table->Value("Maximum", [](const Item& item) { return NumberOf(item, item.maximum, item.minimum <= item.maximum); })
        .Width(70)
        .Format("%.6g")
        .ShownWhen(hasRange);
    table->Value("Expression", [](const Item& item) { return item.expression; })
        .Width(320)
        .ToolTip("Of a state variable: how fast it changes")
        .ToolTipOf([](Item& item) { return item.expression; })
        .ShownWhen(When({Kind::StateVariable, Kind::Auxiliary, Kind::Process, Kind::DerivedOutput}));
    table->Value("Given by", [](const Item& item) { return SourceText(item); })
        .Width(125)
        .ShownWhen(When({Kind::Constant, Kind::Forcing}));
    table->Value("Type", [](const Item& item) { return item.typeText; })
        .Width(170)
        .ToolTip("How a state variable is transported, the type of a process, the format of an output")
        .ShownWhen(WhenAlone({Kind::StateVariable, Kind::Process, Kind::DerivedOutput}));
    const auto isOneKind = [this] { return view_.shown_ != 0; };
    table->Value("Stored", [](const Item& item) { return std::string(item.isOutput ? "yes" : ""); })
        .Width(60)
        .ShownWhen(isOneKind);
    table->Value("Scope", [](const Item& item) { return item.scope; }).Width(60).ShownWhen(isOneKind);
    form.Table(table);
  }

  TemplateView& view_;
};

TemplateView::TemplateView(std::string path)
    : path_(std::move(path)),
      document_(std::make_unique<CYbSEKvfGlobalBase>("KINETRA_SETUP")),
      node_(std::make_unique<Node>(*this)) {
  Take(ReadKinetraTemplate(path_));
}

TemplateView::~TemplateView() = default;

void TemplateView::Take(std::shared_ptr<const KinetraTemplate> content) {
  content_ = std::move(content);
  items_.clear();
  for (const KinetraSection& section : KinetraSections()) {
    const auto& items = content_.get()->*section.items;
    items_.insert(items_.end(), items.begin(), items.end());
  }
  node_->Validate();
}

bool TemplateView::Reopen() {
  if (!content_->IsOtherOnDisk()) return false;
  Take(ReadKinetraTemplate(path_));
  return true;
}

std::unique_ptr<CYbSEDlgBase> TemplateView::MakePage(Host& host, std::function<void()> soon) {
  // Nothing can be changed, so that there is no document to tell.
  PageContext context{document_, host, [](int, const std::string&, const void*) {}};
  context.syncSoon = std::move(soon);
  auto page = std::make_unique<Page>(*this, context);
  page->Initialize();
  return page;
}

}  // namespace tervane
