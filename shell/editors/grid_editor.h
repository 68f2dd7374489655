// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "edits/grid_edit.h"
#include "forms/plots.h"
#include "platform/units.h"
#include "shell/editors/edit_tab.h"

class QActionGroup;
class QComboBox;
class QLabel;
class QLineEdit;
class QSpinBox;
class QSplitter;

namespace tervane {

class EditPanel;
class EditTable;
class MapView;
struct MapDrag;

/// The grids of a data file, to be painted and counted with: the map with its tools, the cells as a table below, and
/// what is done to a selection beside both. Values are in the unit of the file.
class GridEditor : public EditTab {
  Q_OBJECT

 public:
  GridEditor(const std::string& path, Host& host);
  ~GridEditor() override;

  EditedFile& File() override { return edit_; }
  GridEdit& Grid() { return edit_; }
  void Commit() override;
  Host::FileQuestion NameQuestion() const override;
  /// What is put over the map, such as where a model lies.
  void PutOverMaps(std::function<void(MapContent& map)> put);
  /// Layers below and over the map that are kept while the file is edited. Grids are not seen at first: they are
  /// switched on in the menu of the map's layers.
  void KeepBackdrop(std::vector<BackdropLayer> layers);

  /// What the mouse does on the map.
  enum class Tool { Move, Brush, Line, Polygon, Fill, SelectRectangle, SelectPolygon };
  void SetTool(Tool tool);

 protected:
  void Sync() override;
  void Reread() override;

 private:
  QWidget* BuildTools();
  EditPanel* BuildPanel();
  EditTable* BuildTable();
  void FillItems();
  void ShowItem();
  void ShowSlice();
  void ShowMap();
  MapContent Content();
  /// The first grid with colours for all its values.
  GridLayer Layer();
  /// Where the values go beyond the colours that there are, these are made anew. True when they were.
  bool Recolour();
  /// The user has changed cells: what shows them follows.
  void Follow();
  void ShowStatistics();
  /// At once, but for large grids.
  void CountSoon();
  void Tell(const std::string& why);
  /// The value that tools paint: none with an empty field; nothing, and it is told, where no number stands there.
  std::optional<float> Value();
  std::optional<float> ValueIn(const QLineEdit& field);
  MapRequest Request(MapRequest::Kind kind, const char* prompt,
                     std::function<void(const std::vector<MapPoint>&)> taken);
  MapDrag BrushDrag();
  MapDrag RectangleDrag();
  void Paint(MapPoint from, MapPoint to);
  SelectionMode Mode() const;
  QString Burn();
  QString CellText(float value) const;
  /// The picture of the grid is in the making and must not see it change.
  void WaitForPicture();

  GridEdit edit_;
  DisplayUnits units_;
  std::function<void(MapContent& map)> put_;
  std::vector<BackdropLayer> kept_;
  Tool tool_ = Tool::Move;
  std::optional<std::pair<float, float>> range_;                ///< Of the colours.
  std::vector<unsigned> codes_;                                 ///< The same of codes.
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> coloured_;  ///< The grid for which they are.
  QComboBox *items_, *layers_;
  QSpinBox *step_, *width_;
  QLabel *layerLabel_, *stepLabel_, *date_, *unit_, *statistics_, *widthLabel_;
  QLineEdit* value_;
  QActionGroup* tools_;
  QComboBox* mode_ = nullptr;
  MapView* map_;
  EditTable* table_;
  EditPanel* panel_;
  QTimer count_;
};

}  // namespace tervane
