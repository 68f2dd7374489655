// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/page_table.h"

#include "pages/document/document_pages.h"
#include "pages/document/overlay_pages.h"
#include "pages/execution/processed_pages.h"
#include "pages/results/detailed_series_pages.h"
#include "pages/results/geo_scene_pages.h"
#include "pages/results/statistics_pages.h"
#include "pages/results/storing_pages.h"
#include "pages/results/viewer_pages.h"
#include "pages/simspec/components_pages.h"
#include "pages/simspec/control_pages.h"
#include "pages/simspec/modflow_pages.h"
#include "pages/simspec/period_pages.h"
#include "pages/simspec/stress_period_pages.h"
#include "pages/spatial/data2d_pages.h"
#include "pages/spatial/domain_pages.h"
#include "pages/spatial/station_pages.h"
#include "pages/spatial/zone_pages.h"
#include "pages/species_pages.h"
#include "pages/subsurface/computational_layer_pages.h"
#include "pages/subsurface/drainage_pages.h"
#include "pages/subsurface/geology_pages.h"
#include "pages/subsurface/internal_boundary_pages.h"
#include "pages/subsurface/outer_boundary_pages.h"
#include "pages/subsurface/reservoir_pages.h"
#include "pages/subsurface/saturated_zone_pages.h"
#include "pages/subsurface/soil_pages.h"
#include "pages/subsurface/unsaturated_zone_pages.h"
#include "pages/subsurface/well_pages.h"
#include "pages/surface/climate_pages.h"
#include "pages/surface/irrigation_pages.h"
#include "pages/surface/land_use_pages.h"
#include "pages/surface/overland_pages.h"
#include "pages/surface/river_pages.h"
#include "pages/surface/stress_period_grid_pages.h"
#include "pages/surface/vegetation_pages.h"
#include "pages/whole_pages.h"
#include "pages/wqpt/kinetra_pages.h"
#include "pages/wqpt/particle_pages.h"
#include "pages/wqpt/process_pages.h"
#include "pages/wqpt/source_pages.h"
#include "pages/wqpt/water_quality_layer_pages.h"

namespace tervane {

namespace {

/// A file of pages is one row here.
struct PageFile {
  std::string_view folder;
  std::span<const PageRow> (*rows)();
};
constexpr PageFile kFiles[] = {
    {"document", WholePages},
    {"document", DocumentPages},
    {"document", OverlayPages},
    {"simspec", ComponentsPages},
    {"simspec", ControlPages},
    {"simspec", PeriodPages},
    {"simspec", StressPeriodPages},
    {"simspec", ModflowPages},
    {"spatial", Data2DPages},
    {"spatial", DomainPages},
    {"spatial", StationPages},
    {"spatial", ZonePages},
    {"surface", ClimatePages},
    {"surface", LandUsePages},
    {"surface", VegetationPages},
    {"surface", OverlandPages},
    {"surface", IrrigationPages},
    {"surface", RiverPages},
    {"surface", StressPeriodGridPages},
    {"subsurface", UnsaturatedZonePages},
    {"subsurface", SoilPages},
    {"subsurface", SaturatedZonePages},
    {"subsurface", GeologyPages},
    {"subsurface", ComputationalLayerPages},
    {"subsurface", OuterBoundaryPages},
    {"subsurface", DrainagePages},
    {"subsurface", WellPages},
    {"subsurface", ReservoirPages},
    {"subsurface", InternalBoundaryPages},
    {"wqpt", SpeciesPages},
    {"wqpt", ProcessPages},
    {"wqpt", WaterQualityLayerPages},
    {"wqpt", SourcePages},
    {"wqpt", KinetraPages},
    {"wqpt", ParticlePages},
    {"execution", ProcessedPages},
    {"results", StoringPages},
    {"results", GeoScenePages},
    {"results", DetailedSeriesPages},
    {"results", ViewerPages},
    {"results", StatisticsPages},
};

std::unique_ptr<CYbSEDlgBase> Construct(const PageClass& page, CYbSEKvfBase& node, const PageContext& context) {
  for (const PageFile& file : kFiles)
    for (const PageRow& row : file.rows())
      if (row.page.name == page.name) return row.make(node, context);
  return nullptr;
}

}  // namespace

std::string_view PageFamilyOf(const PageClass& page) {
  for (const PageFile& file : kFiles)
    for (const PageRow& row : file.rows())
      if (row.page.name == page.name) return file.folder;
  return {};
}

std::unique_ptr<CYbSEDlgBase> MakePage(const PageClass& page, CYbSEKvfBase& node, const PageContext& context) {
  std::unique_ptr<CYbSEDlgBase> made = Construct(page, node, context);
  if (made) made->Initialize();
  return made;
}

std::unique_ptr<CYbSEDlgBase> MakePageToRead(const PageClass& page, CYbSEKvfBase& node, const PageContext& context) {
  std::unique_ptr<CYbSEDlgBase> made = Construct(page, node, context);
  if (made) made->MakeForm();
  return made;
}

}  // namespace tervane
