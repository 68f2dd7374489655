// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/processed_pages.h"

#include <array>
#include <cstdlib>
#include <string_view>

#include <fmt/format.h>
#include <fmt/printf.h>

#include "platform/paths.h"

namespace tervane {

CPreprocessedDataEntity::CPreprocessedDataEntity(const PageClass* pageClass, PreprocessedPage page,
                                                 CYbSEKvfBase* parent)
    : CYbSEKvfBase(page.title, page.title, parent),
      pageClass_(pageClass),
      values_(std::move(page.values)),
      folder_(std::move(page.folder)) {
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

/// A kind of page: the section that holds its content, and its node.
struct PageKind {
  std::string_view section;
  CYbSEKvfBase* (*make)(PreprocessedPage page, CYbSEKvfBase& parent);
};

template <class Node>
CYbSEKvfBase* Make(PreprocessedPage page, CYbSEKvfBase& parent) {
  return parent.NewChild<Node>(std::move(page));
}

/// Of several contents in one page the first of this list counts.
constexpr std::array kKinds{
    PageKind{"BLANK", Make<CPreprocessedBlankKvf>},
    PageKind{"NDS0_PLOT", Make<CPreprocessedNDS0_PLOTkvf>},
    PageKind{"NDS1_PLOT", Make<CPreprocessedNDS1_PLOTkvf>},
    PageKind{"NDS2_PLOT", Make<CPreprocessedNDS2_PLOTkvf>},
    PageKind{"NDS3_PLOT", Make<CPreprocessedNDS3_PLOTkvf>},
    PageKind{"TEXT", Make<CPreprocessedTEXTkvf>},
    PageKind{"TXT_FILE", Make<CPreprocessedTXT_FILEkvf>},
    PageKind{"HTML", Make<CPreprocessedHTML>},
    PageKind{"SHAPE_PLOT", Make<CPreprocessedSHAPE_PLOTkvf>},
    PageKind{"RIVER_PLOT", Make<CPreprocessedRIVER_LINKS_PLOTkvf>},
};

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
  const PageKind* kind = &kKinds.front();
  KvfNode* content = nullptr;
  for (const PageKind& each : kKinds) {
    content = kvfSectionByNameNum(section, each.section, 1);
    if (!content) continue;
    kind = &each;
    break;
  }
  // A keyword that stands twice keeps its last value.
  for (int n = 1; KvfNode* keyword = kvfKeywordByNum(content, n); ++n)
    page.values[kvfGetName(keyword)] = TextOf(keyword);
  CYbSEKvfBase& node = *kind->make(std::move(page), parent);
  int made = 1;
  for (int n = 1; KvfNode* below = kvfSectionByNameNum(section, "PAGE", n); ++n)
    made += BuildPreprocessedPages(below, folder, node);
  return made;
}

}  // namespace tervane
