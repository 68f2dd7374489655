// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_export.h"

#include <QBuffer>

#include <fmt/format.h>

#include "data/datafile.h"
#include "data/file_geometry.h"
#include "data/raster_file.h"
#include "platform/paths.h"

namespace tervane {

std::string WorldFileText(const Envelope& area, QSize pixels) {
  const double width = (area.xMax - area.xMin) / pixels.width(), height = (area.yMax - area.yMin) / pixels.height();
  return fmt::format("{:.12g}\n0\n0\n{:.12g}\n{:.12g}\n{:.12g}\n", width, -height, area.xMin + width / 2,
                     area.yMax - height / 2);
}

FileResult WritePlacedPicture(const std::string& path, const QImage& picture, const Envelope& area) {
  const std::string place = WorldFileText(area, picture.size());
  const std::string stem = path.substr(0, path.size() - ExtensionOf(path).size());
  for (const char* extension : {".pgw", ".pnw"})
    if (FileResult written = WriteFileAtomically(stem + extension, place); !written.Ok()) return written;
  QByteArray bytes;
  QBuffer buffer(&bytes);
  buffer.open(QIODevice::WriteOnly);
  picture.save(&buffer, "PNG");
  return WriteFileAtomically(path, std::string_view(bytes.constData(), static_cast<std::size_t>(bytes.size())));
}

FileResult WriteValues(const std::string& path, const CTvn2DOrthoRotatedGridData& grid) {
  std::vector<float> values = grid.Values();
  for (float& value : values)
    if (grid.IsEmptyValue(value)) value = kDeleteValue;
  return WriteGeoTiff(path, {FileGeometryOf(grid.Geometry()), grid.ItemName(), grid.ItemType(), grid.ItemUnit(), {}},
                      values);
}

}  // namespace tervane
