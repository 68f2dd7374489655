// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/report_pdf.h"

#include <QImage>
#include <QPageLayout>
#include <QPageSize>
#include <QPainter>
#include <QPdfWriter>
#include <QSvgRenderer>
#include <QTextDocument>
#include <QUrl>
#include <algorithm>

#include <fmt/format.h>

#include "pages/report/report_html.h"
#include "pages/report/report_pictures.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr int kPaperWidth = 620;   ///< Of a page of A4 between its margins, in pixels at 96 for an inch.
constexpr int kPixelsForEach = 3;  ///< So that lines are sharp on paper.
constexpr int kLogoHeight = 60;

constexpr const char* kPageStyle =
    "body { font-family: 'DejaVu Sans'; font-size: 9pt; color: #202020; }"
    "h1 { font-size: 17pt; } h2 { font-size: 13pt; color: #1f4e79; margin-top: 22px; } h3 { font-size: 10pt; }"
    "th { text-align: left; font-weight: bold; } td, th { padding: 2px 10px 2px 0px; }"
    ".quiet, figcaption { color: #606060; font-size: 8pt; }";

QImage DrawnOnPaper(const QByteArray& svg, QSize size) {
  QSvgRenderer renderer(svg);
  QImage image(size * kPixelsForEach, QImage::Format_ARGB32_Premultiplied);
  image.fill(Qt::white);
  QPainter painter(&image);
  renderer.render(&painter);
  return image;
}

QString ReportPictureTag(QTextDocument& document, const QString& name, const QImage& image, QSize size) {
  document.addResource(QTextDocument::ImageResource, QUrl(name), image);
  return QString("<p><img src=\"%1\" width=\"%2\" height=\"%3\"></p>").arg(name).arg(size.width()).arg(size.height());
}

/// The tag of the logo; empty for none.
FileResult LogoTag(const Report& report, QTextDocument& document, QString& tag) {
  std::string checked;
  if (FileResult taken = LogoData(report, checked); !taken.Ok() || checked.empty()) return taken;
  QImage image;
  QSvgRenderer renderer;
  if (report.logo.ends_with(".svg") && renderer.load(ToQt(report.logo))) {
    const QSize size = renderer.defaultSize().scaled(4 * kLogoHeight, kLogoHeight, Qt::KeepAspectRatio);
    image = QImage(size * kPixelsForEach, QImage::Format_ARGB32_Premultiplied);
    image.fill(Qt::white);
    QPainter painter(&image);
    renderer.render(&painter);
  } else if (!image.load(ToQt(report.logo))) {
    return {report.logo + ": this is no picture that can be read", {}};
  }
  const QSize size = image.size().scaled(4 * kLogoHeight, kLogoHeight, Qt::KeepAspectRatio);
  tag = ReportPictureTag(document, "picture:logo", image, size);
  return {};
}

}  // namespace

FileResult WriteReportPdf(const std::string& path, const Report& report) {
  QTextDocument document;
  document.setDefaultStyleSheet(kPageStyle);
  QString logo;
  if (FileResult taken = LogoTag(report, document, logo); !taken.Ok()) return taken;
  const std::string body = ReportBody(report, [&](const ReportPicture& picture, std::size_t number) {
    QSize size(picture.width, picture.height);
    if (size.width() > kPaperWidth) size.scale(kPaperWidth, size.height(), Qt::KeepAspectRatio);
    return FromQt(ReportPictureTag(document, QString("picture:%1").arg(number),
                                   DrawnOnPaper(QByteArray::fromStdString(picture.svg), size), size));
  });
  document.setHtml("<body>" + logo +
                   ToQt(fmt::format("<h1>{}</h1><p class=\"quiet\">{}<br>{}</p>", XmlText(report.title),
                                    XmlText(report.file), XmlText(report.made)) +
                        body) +
                   "</body>");
  FileReplacement file;
  if (FileResult begun = file.Begin(path); !begun.Ok()) return begun;
  {
    QPdfWriter writer(ToQt(file.TemporaryPath()));
    writer.setPageSize(QPageSize(QPageSize::A4));
    writer.setTitle(ToQt(report.title));
    writer.setCreator(ToQt(report.made));
    // Pages, their margins and numbers are the document's.
    document.print(&writer);
  }
  return file.Commit();
}

}  // namespace tervane
