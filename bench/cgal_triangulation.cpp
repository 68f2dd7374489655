// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "bench/cgal_triangulation.h"

#include <utility>

#include <CGAL/Delaunay_triangulation_2.h>
#include <CGAL/Exact_predicates_inexact_constructions_kernel.h>
#include <CGAL/Triangulation_vertex_base_with_info_2.h>

namespace tervane::bench {

namespace {

using Kernel = CGAL::Exact_predicates_inexact_constructions_kernel;
using Vertices = CGAL::Triangulation_vertex_base_with_info_2<double, Kernel>;
using Triangulation = CGAL::Delaunay_triangulation_2<Kernel, CGAL::Triangulation_data_structure_2<Vertices>>;

double LinearAt(const Triangulation::Face_handle& face, const Kernel::Point_2& place) {
  double height = 0, area = 0;
  for (int corner = 0; corner < 3; ++corner) {
    const double share = CGAL::area(place, face->vertex(Triangulation::ccw(corner))->point(),
                                    face->vertex(Triangulation::cw(corner))->point());
    height += share * face->vertex(corner)->info();
    area += share;
  }
  return height / area;
}

}  // namespace

std::vector<float> CgalLinear(const std::vector<double>& x, const std::vector<double>& y, const std::vector<double>& z,
                              int side, float empty) {
  std::vector<std::pair<Kernel::Point_2, double>> points;
  for (std::size_t k = 0; k < x.size(); ++k) points.emplace_back(Kernel::Point_2(x[k], y[k]), z[k]);
  const Triangulation triangulation(points.begin(), points.end());
  std::vector<float> values;
  values.reserve(static_cast<std::size_t>(side) * static_cast<std::size_t>(side));
  // The walk to a cell begins at the triangle of the one before.
  Triangulation::Face_handle face;
  for (int j = 0; j < side; ++j)
    for (int i = 0; i < side; ++i) {
      const Kernel::Point_2 place(i + 0.5, j + 0.5);
      face = triangulation.locate(place, face);
      values.push_back(triangulation.is_infinite(face) ? empty : static_cast<float>(LinearAt(face, place)));
    }
  return values;
}

}  // namespace tervane::bench
