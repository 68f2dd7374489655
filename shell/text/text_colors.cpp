// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/text/text_colors.h"

namespace tervane {

TextColors TextColors::Of(bool isDark) {
  if (isDark) return {"#8ab8f0", "#93cf98", "#e3b27a", "#9aa5ad", "#9aa0a6"};
  return {"#1f4f99", "#1d6b34", "#8a4200", "#5c666e", "#63686d"};
}

QList<QTextLayout::FormatRange> FormatsOf(const QString& line, const TextColors& colors) {
  QList<QTextLayout::FormatRange> formats;
  const auto add = [&](qsizetype from, qsizetype to, const QColor& color, bool isBold = false) {
    QTextCharFormat format;
    format.setForeground(color);
    if (isBold) format.setFontWeight(QFont::DemiBold);
    formats.push_back({static_cast<int>(from), static_cast<int>(to - from), format});
  };
  qsizetype at = 0;
  while (at < line.size() && line[at].isSpace()) ++at;
  const QStringView text = QStringView(line).mid(at);
  if (text.startsWith(u"section ") || text.startsWith(u"target ")) {
    add(at, line.size(), colors.section, true);
    return formats;
  }
  const qsizetype equals = line.indexOf('=', at);
  // What every save makes anew stands back.
  if (equals > 0 && (text.startsWith(u"Touched ") || text.startsWith(u"IsDataUsedInSetup ") ||
                     text.startsWith(u"YbSEKvfListItemCount "))) {
    add(at, line.size(), colors.quiet);
    return formats;
  }
  for (qsizetype i = equals < 0 ? at : equals + 1; i < line.size();) {
    const qsizetype begin = i;
    if (line[i] == '#') {
      add(i, line.size(), colors.comment);
      break;
    }
    if (line[i] == '"') {
      for (++i; i < line.size() && line[i] != '"'; ++i)
        if (line[i] == '\\') ++i;
      i = std::min(i + 1, line.size());
      add(begin, i, colors.text);
    } else if (equals >= 0 && (line[i].isDigit() || line[i] == '-')) {
      while (i < line.size() && line[i] != ',' && line[i] != '#' && !line[i].isSpace()) ++i;
      add(begin, i, colors.number);
    } else {
      ++i;
    }
  }
  return formats;
}

}  // namespace tervane
