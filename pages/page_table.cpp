// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <array>

#include "document/overview.h"
#include "document/pages.h"
#include "execution/pages.h"
#include "forms/page.h"
#include "overlays/overlays.h"
#include "overlays/pages.h"
#include "pages/document/coverage_page.h"
#include "pages/document/document_pages.h"
#include "pages/execution/processed_pages.h"
#include "pages/simspec/components_pages.h"
#include "pages/simspec/control_pages.h"
#include "pages/simspec/period_pages.h"
#include "pages/spatial/data2d_pages.h"
#include "pages/spatial/domain_pages.h"
#include "pages/spatial/station_pages.h"
#include "pages/spatial/zone_pages.h"
#include "pages/surface/climate_pages.h"
#include "simspec/pages.h"
#include "spatial/pages.h"
#include "surface/pages.h"

namespace tervane {

namespace {

struct PageRow {
  const PageClass& page;
  std::unique_ptr<CYbSEDlgBase> (*make)(CYbSEKvfBase& node, PageContext context);
};

template <class Page, class Node>
std::unique_ptr<CYbSEDlgBase> Make(CYbSEKvfBase& node, PageContext context) {
  if constexpr (!std::is_same_v<Node, CYbSEKvfBase>)
    if (!dynamic_cast<Node*>(&node)) return nullptr;
  return std::make_unique<Page>(node, std::move(context));
}

const std::array kPages{
    PageRow{kHelpPage, Make<CTvnHelpView, CYbSEKvfBase>},
    PageRow{kOverviewPage, Make<COverviewDlg, COverviewKvf>},
    PageRow{kCoveragePage, Make<CCoverageDlg, CCoverageKvf>},
    PageRow{kDisplayPage, Make<CDisplayDlg, COverlaysKvf>},
    PageRow{kCatchmentPage, Make<CCatchmentDlg, CCatchmentKvf>},
    PageRow{kData2DPage, Make<CData2DDlg, CData2DKvf>},
    PageRow{kSubcatchmentPage, Make<CSubcatchmentDlg, CodedZonesKvf>},
    PageRow{kSubcatchmentPropPage, Make<CSubcatchmentPropDlg, CSubcatchmentPropKvf>},
    PageRow{kRiverLinksPage, Make<CSubcatchmentRiverLinksDlg, CSubcatchmentRiverlinksListKvf>},
    PageRow{kStationBasedDataPage, Make<C2DStationBasedDataDlg, C2DStationBasedDataKvf>},
    PageRow{kStationPage, Make<C2DStationBaseDataTimeSeriesDlg, C2DStationBasedDataTimeSeriesKvf>},
    PageRow{kClimatePage, Make<CPrecipitationRelatedDlg, CPrecipitationRelatedKvf>},
    PageRow{kPrecipitationPage, Make<C2DStationBasedDataDlg, C2DStationBasedDataKvf>},
    PageRow{kPrecipitationStationPage, Make<C2DStationBaseDataTimeSeriesDlg, C2DStationBasedDataTimeSeriesKvf>},
    PageRow{kPotEvapTransPage, Make<C2DStationBasedDataDlg, C2DStationBasedDataKvf>},
    PageRow{kPotEvapTransStationPage, Make<C2DStationBaseDataTimeSeriesDlg, C2DStationBasedDataTimeSeriesKvf>},
    PageRow{kAirTemperaturePage, Make<C2DStationBasedDataDlg, C2DStationBasedDataKvf>},
    PageRow{kAirTemperatureStationPage, Make<C2DStationBaseDataTimeSeriesDlg, C2DStationBasedDataTimeSeriesKvf>},
    PageRow{kSnowMeltPage, Make<CSnowmeltConstDlg, CSnowmeltConstKvf>},
    PageRow{kTimeseriesConstPage, Make<CTimeseriesConstDlg, CTimeseriesConstKvf>},
    PageRow{kBasicParaPage, Make<CBasicParaDlg, CBasicParaKvf>},
    PageRow{kModelCompWQPage, Make<CModelCompWQDlg, CModelCompWQKvf>},
    PageRow{kModelCompPTPage, Make<CModelCompPTDlg, CModelCompPTKvf>},
    PageRow{kSimTitlePage, Make<CSimTitleDlg, CSimTitleBase>},
    PageRow{kSimTitleWQPage, Make<CSimTitleDlg, CSimTitleBase>},
    PageRow{kSimTitlePTPage, Make<CSimTitleDlg, CSimTitleBase>},
    PageRow{kSimPeriodPage, Make<CSimPeriodDlg, CSimPeriodKvf>},
    PageRow{kSimPeriodWQPage, Make<CSimPeriodOnFlowDlg, CSimPeriodOnFlowBase>},
    PageRow{kSimPeriodPTPage, Make<CSimPeriodOnFlowDlg, CSimPeriodOnFlowBase>},
    PageRow{kAirFlowModPage, Make<CAirFlowModDlg, CAirFlowModKvf>},
    PageRow{kExtraParamsPage, Make<CExtraParamsDlg, CExtraParamsKvf>},
    PageRow{kTimeStepPage, Make<CCompControlParaTimeStepDlg, CCompControlParaTimeStepKvf>},
    PageRow{kTimeStepWQPage, Make<CCompControlParaTimeStepWQDlg, CCompControlParaTimeStepWQKvf>},
    PageRow{kColloidWQPage, Make<CCompControlParaColloidWQDlg, CCompControlParaColloidWQKvf>},
    PageRow{kControlPTPage, Make<CCompControlParaPTDlg, CCompControlParaPTKvf>},
    PageRow{kControlOLPage, Make<CCompControlParaOLDlg, CCompControlParaOLKvf>},
    PageRow{kControlUZPage, Make<CCompControlParaUZDlg, CCompControlParaUZKvf>},
    PageRow{kControlSZPage, Make<CCompControlParaSZDlg, CCompControlParaSZKvf>},
    PageRow{kProcDataPage, Make<CProcDataDlg, CProcDataKvf>},
    PageRow{kPreprocessedBlankPage, Make<CPreprocessedBlankDlg, CPreprocessedDataEntity>},
    PageRow{kPreprocessedNds0Page, Make<CPreprocessedNDS0_PLOTDlg, CPreprocessedDataEntity>},
    PageRow{kPreprocessedNds1Page, Make<CPreProcessedNDS1_PLOTDlg, CPreprocessedDataEntity>},
    PageRow{kPreprocessedNds2Page, Make<CPreprocessedNDS2_PLOT, CPreprocessedDataEntity>},
    PageRow{kPreprocessedNds3Page, Make<CPreprocessedNDS3_PLOTDlg, CPreprocessedDataEntity>},
    PageRow{kPreprocessedTextPage, Make<CPreprocessedTextDlg, CPreprocessedDataEntity>},
    PageRow{kPreprocessedTextFilePage, Make<CPreprocessedTXTFILEDlg, CPreprocessedDataEntity>},
    PageRow{kPreprocessedShapePage, Make<CPreprocessedSHAPE_PLOTDlg, CPreprocessedDataEntity>},
};

std::unique_ptr<CYbSEDlgBase> Construct(const PageClass& page, CYbSEKvfBase& node, PageContext context) {
  for (const PageRow& row : kPages)
    if (row.page.name == page.name) return row.make(node, std::move(context));
  return nullptr;
}

}  // namespace

std::unique_ptr<CYbSEDlgBase> MakePage(const PageClass& page, CYbSEKvfBase& node, PageContext context) {
  std::unique_ptr<CYbSEDlgBase> made = Construct(page, node, std::move(context));
  if (made) made->Initialize();
  return made;
}

std::unique_ptr<CYbSEDlgBase> MakePageToRead(const PageClass& page, CYbSEKvfBase& node, PageContext context) {
  std::unique_ptr<CYbSEDlgBase> made = Construct(page, node, std::move(context));
  if (made) made->MakeForm();
  return made;
}

}  // namespace tervane
