// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/processed_pages.h"

#include <cstdlib>

#include <fmt/format.h>
#include <fmt/printf.h>

#include "platform/paths.h"

namespace tervane {

CPreprocessedDataEntity::CPreprocessedDataEntity(const PreprocessedKind& kind, PreprocessedPage page,
                                                 CYbSEKvfBase* parent)
    : CYbSEKvfBase(page.title, page.title, parent),
      pageClass_(kind.page),
      values_(std::move(page.values)),
      folder_(std::move(page.folder)) {
  SetClassName(kind.className);
  if (!page.abbreviatedTitle.empty()) SetAbbreviatedTitle(std::move(page.abbreviatedTitle));
}

const std::string& CPreprocessedDataEntity::GetValue(const std::string& key) const {
  static const std::string none;
  const auto found = values_.find(key);
  return found == values_.end() ? none : found->second;
}

int CPreprocessedDataEntity::GetNumber(const std::string& key) const { return std::atoi(GetValue(key).c_str()); }

std::string CPreprocessedDataEntity::GetFile() const { return ResolvedPath(GetValue("Filename"), *folder_); }

CPreprocessedHTML::CPreprocessedHTML(PreprocessedPage page, CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase(page.title, {}, parent), folder_(std::move(page.folder)) {
  if (!page.abbreviatedTitle.empty()) SetAbbreviatedTitle(std::move(page.abbreviatedTitle));
  SetHelp(page.values["Chm"], page.values["Html"]);
}

std::string CPreprocessedHTML::GetFile() const { return ResolvedPath(GetHtml(), *folder_); }

// ---- Building

namespace {

/// Of several contents in one page the first of this list counts.
constexpr PreprocessedKind kKinds[] = {
    {"BLANK", "CPreprocessedBlankKvf", &kPreprocessedBlankPage},
    {"NDS0_PLOT", "CPreprocessedNDS0_PLOTkvf", &kPreprocessedNds0Page},
    {"NDS1_PLOT", "CPreprocessedNDS1_PLOTkvf", &kPreprocessedNds1Page},
    {"NDS2_PLOT", "CPreprocessedNDS2_PLOTkvf", &kPreprocessedNds2Page},
    {"NDS3_PLOT", "CPreprocessedNDS3_PLOTkvf", &kPreprocessedNds3Page},
    {"TEXT", "CPreprocessedTEXTkvf", &kPreprocessedTextPage},
    {"TXT_FILE", "CPreprocessedTXT_FILEkvf", &kPreprocessedTextFilePage},
    {"HTML", "CPreprocessedHTML", &kHelpPage},
    {"SHAPE_PLOT", "CPreprocessedSHAPE_PLOTkvf", &kPreprocessedShapePage},
    // The links between river and grid: grids show them.
    {"RIVER_PLOT", "CPreprocessedRIVER_LINKS_PLOTkvf", nullptr},
};

CYbSEKvfBase& MakeNode(const PreprocessedKind& kind, PreprocessedPage page, CYbSEKvfBase& parent) {
  if (kind.page == &kHelpPage) return *parent.NewChild<CPreprocessedHTML>(std::move(page));
  return *parent.NewChild<CPreprocessedDataEntity>(kind, std::move(page));
}

std::string TextOf(KvfParam* param) {
  if (kvfIsFilename(param)) return kvfGetFilename(param);
  if (kvfIsString(param)) return kvfGetString(param);
  if (kvfIsFloat(param)) return fmt::sprintf("%f", kvfGetFloat(param));
  if (kvfIsDouble(param)) return fmt::sprintf("%g", kvfGetDouble(param));
  return std::to_string(kvfIsBool(param) ? static_cast<int>(kvfGetBool(param)) : kvfGetInt(param));
}

std::string TextOf(KvfNode* keyword) {
  std::string text;
  for (int n = 1; KvfParam* param = kvfParamByNum(keyword, n); ++n) text += (n > 1 ? "," : "") + TextOf(param);
  return text;
}

}  // namespace

int BuildPreprocessedPages(KvfNode* section, const std::shared_ptr<const std::string>& folder, CYbSEKvfBase& parent) {
  PreprocessedPage page;
  page.folder = folder;
  kvfGetParam(section, "TITLE", &page.title, 1, 1);
  kvfGetParam(section, "Abbrev", &page.abbreviatedTitle, 1, 1);
  const PreprocessedKind* kind = &kKinds[0];
  KvfNode* content = nullptr;
  for (const PreprocessedKind& each : kKinds) {
    content = kvfSectionByNameNum(section, each.section, 1);
    if (!content) continue;
    kind = &each;
    break;
  }
  // A keyword that stands twice keeps its last value.
  for (int n = 1; KvfNode* keyword = kvfKeywordByNum(content, n); ++n)
    page.values[kvfGetName(keyword)] = TextOf(keyword);
  CYbSEKvfBase& node = MakeNode(*kind, std::move(page), parent);
  int made = 1;
  for (int n = 1; KvfNode* below = kvfSectionByNameNum(section, "PAGE", n); ++n)
    made += BuildPreprocessedPages(below, folder, node);
  return made;
}

}  // namespace tervane
