// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Makes the data files that other programs are then asked about, in the folder that the command line names.
#include <string>
#include <vector>

#include <fmt/format.h>

#include "data/datafile_writer.h"

namespace {

using namespace tervane;

/// A grid whose cells hold their numbers, 0, 1, 2, ... from the lower left; false, with a message, when it failed.
bool Make(const std::string& path, NewDataFile content) {
  content.geometry.nx = 5;
  content.geometry.ny = 3;
  content.geometry.cellSize = 50;
  content.items = {{"Rain", 100182, 2004, ValueType::MeanStep}};
  content.begin = CYbDateTime(2001, 1, 1);
  std::vector<float> values(static_cast<std::size_t>(15 * content.geometry.nz));
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = static_cast<float>(i);
  DataFileWriter writer;
  std::string error = writer.Create(path, content);
  for (const int day : {2, 3}) {
    if (day == 3 && !content.hasTime) break;
    if (error.empty() && content.hasTime) error = writer.AddStep({2001, 1, day});
    if (error.empty()) error = writer.Put(1, values);
  }
  if (error.empty()) error = writer.Finish().error;
  if (!error.empty()) fmt::print(stderr, "{}\n", error);
  return error.empty();
}

constexpr const char* kUtm =
    R"wkt(PROJCS["WGS 84 / UTM zone 32N",GEOGCS["WGS 84",DATUM["WGS_1984",SPHEROID["WGS 84",6378137,298.257223563]],)wkt"
    R"wkt(PRIMEM["Greenwich",0],UNIT["degree",0.0174532925199433]],PROJECTION["Transverse_Mercator"],)wkt"
    R"wkt(PARAMETER["latitude_of_origin",0],PARAMETER["central_meridian",9],PARAMETER["scale_factor",0.9996],)wkt"
    R"wkt(PARAMETER["false_easting",500000],PARAMETER["false_northing",0],UNIT["metre",1]])wkt";

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) return 2;
  const std::string folder = std::string(argv[1]) + "/";
  NewDataFile straight;
  straight.hasTime = false;
  straight.geometry.x0 = 500000;
  straight.geometry.y0 = 6000000;
  straight.geometry.projection = kUtm;
  NewDataFile packed = straight;
  packed.isCompressed = true;
  NewDataFile turned;
  turned.hasTime = false;
  turned.geometry.x0 = 1000;
  turned.geometry.y0 = 2000;
  turned.geometry.rotation = 30;
  NewDataFile layers = straight;
  layers.hasTime = true;
  layers.dimensions = 3;
  layers.geometry.nz = 2;
  const bool done = Make(folder + "straight.nds2", straight) && Make(folder + "packed.nds2", packed) &&
                    Make(folder + "turned.nds2", turned) && Make(folder + "layers.nds3", layers);
  return done ? 0 : 1;
}
