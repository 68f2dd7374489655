// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/report_pdf.h"

#include <QAbstractTextDocumentLayout>
#include <QHash>
#include <QImage>
#include <QPageSize>
#include <QPainter>
#include <QPdfWriter>
#include <QSvgRenderer>
#include <QTextDocument>
#include <QUrl>
#include <algorithm>
#include <memory>

#include <fmt/format.h>

#include "pages/report/report_html.h"
#include "pages/report/report_pictures.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr int kPaperWidth = 642;   ///< Of a page of A4 between its margins, in pixels at 96 for an inch.
constexpr int kPixelsForEach = 3;  ///< So that lines are sharp on paper.
constexpr int kLogoHeight = 60;
constexpr QSizeF kPaper(794, 1123);  ///< A4 in these pixels.
constexpr double kPaperMargin = 76, kGap = 10;

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

QString ReportPictureTag(const QString& name, QSize size) {
  return QString("<p><img src=\"%1\" width=\"%2\" height=\"%3\"></p>").arg(name).arg(size.width()).arg(size.height());
}

/// The tag of the logo; empty for none.
FileResult LogoTag(const Report& report, QHash<QString, QImage>& images, QString& tag) {
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
  images["picture:logo"] = image;
  tag = ReportPictureTag("picture:logo", size);
  return {};
}

/// Pages that are filled from the top, piece by piece; no piece is cut.
class ReportPages {
 public:
  explicit ReportPages(QPdfWriter& writer) : writer_(writer), painter_(&writer) {
    const double scale = writer.resolution() / 96.0;
    painter_.scale(scale, scale);
    DrawNumber();
  }

  /// Puts a piece behind the last one, on a new page where it does not fit.
  void Add(const QString& html, const QHash<QString, QImage>& images = {}) {
    const auto piece = Made(html, images);
    if (piece->size().height() > Left() && !IsFresh()) BeginPage();
    Draw(*piece);
  }
  /// Puts a table with what stands above it, as many rows on each page as fit; its heads stand on each.
  void Add(const QString& above, const ReportTable& table) {
    QString head = above;
    for (std::size_t first = 0; first < table.rows.size();) {
      std::size_t count = table.rows.size() - first;
      std::unique_ptr<QTextDocument> piece;
      const auto make = [&](std::size_t rows) {
        const auto begin = table.rows.begin() + static_cast<std::ptrdiff_t>(first);
        const ReportTable part{table.heads, {begin, begin + static_cast<std::ptrdiff_t>(rows)}};
        piece = Made(head + ToQt(ReportBlockInHtml(part, {}, 0)), {});
        return piece->size().height() <= Left();
      };
      if (!make(count)) {
        std::size_t most = count;  // It is known that so many do not fit.
        for (count = 0; count + 1 < most;) {
          const std::size_t middle = (count + most) / 2;
          (make(middle) ? count : most) = middle;
        }
        // A head with a row or two below it is better kept together on the next page.
        constexpr std::size_t kFewest = 2;
        if (count < kFewest && !IsFresh()) {
          BeginPage();
          continue;
        }
        // A row that is higher than a page is cut off there.
        count = std::max<std::size_t>(count, 1);
        make(count);
      }
      Draw(*piece);
      first += count;
      head.clear();
    }
  }

 private:
  static std::unique_ptr<QTextDocument> Made(const QString& html, const QHash<QString, QImage>& images) {
    auto document = std::make_unique<QTextDocument>();
    document->setDocumentMargin(0);
    document->setDefaultStyleSheet(kPageStyle);
    for (auto image = images.begin(); image != images.end(); ++image)
      document->addResource(QTextDocument::ImageResource, QUrl(image.key()), image.value());
    document->setHtml("<body>" + html + "</body>");
    document->setTextWidth(kPaperWidth);
    return document;
  }
  double Left() const { return kPaper.height() - kPaperMargin - y_; }
  bool IsFresh() const { return y_ <= kPaperMargin; }
  void BeginPage() {
    writer_.newPage();
    y_ = kPaperMargin;
    ++page_;
    DrawNumber();
  }
  void Draw(QTextDocument& piece) {
    painter_.save();
    painter_.translate(kPaperMargin, y_);
    QAbstractTextDocumentLayout::PaintContext context;
    context.palette.setColor(QPalette::Text, QColor(0x20, 0x20, 0x20));
    piece.documentLayout()->draw(&painter_, context);
    painter_.restore();
    y_ += piece.size().height() + kGap;
  }
  void DrawNumber() {
    QFont font("DejaVu Sans");
    font.setPixelSize(11);
    painter_.setFont(font);
    painter_.drawText(QRectF(0, kPaper.height() - kPaperMargin, kPaper.width() - kPaperMargin, kPaperMargin * 0.7),
                      Qt::AlignRight | Qt::AlignVCenter, QString::number(page_));
  }

  QPdfWriter& writer_;
  QPainter painter_;
  double y_ = kPaperMargin;
  int page_ = 1;
};

}  // namespace

FileResult WriteReportPdf(const std::string& path, const Report& report) {
  QString logo;
  QHash<QString, QImage> images;
  if (FileResult taken = LogoTag(report, images, logo); !taken.Ok()) return taken;
  FileReplacement file;
  if (FileResult begun = file.Begin(path); !begun.Ok()) return begun;
  {
    QPdfWriter writer(ToQt(file.TemporaryPath()));
    writer.setPageSize(QPageSize(QPageSize::A4));
    writer.setPageMargins(QMarginsF());
    writer.setTitle(ToQt(report.title));
    writer.setCreator(ToQt(report.made));
    ReportPages pages(writer);
    pages.Add(logo + ToQt(fmt::format("<h1>{}</h1><p class=\"quiet\">{}<br>{}</p>", XmlText(report.title),
                                      XmlText(report.file), XmlText(report.made))),
              images);
    std::size_t number = 0;
    for (const ReportSection& section : report.sections) {
      // Headings stay with what they head.
      QString above = ToQt(fmt::format("<h2>{}</h2>", XmlText(section.title)));
      for (const ReportBlock& block : section.blocks) {
        if (const auto* table = std::get_if<ReportTable>(&block)) {
          pages.Add(above, *table);
          above.clear();
          continue;
        }
        images.clear();
        const std::string html = ReportBlockInHtml(
            block,
            [&](const ReportPicture& picture, std::size_t each) {
              QSize size(picture.width, picture.height);
              if (size.width() > kPaperWidth) size.scale(kPaperWidth, size.height(), Qt::KeepAspectRatio);
              const QString name = QString("picture:%1").arg(each);
              images[name] = DrawnOnPaper(QByteArray::fromStdString(picture.svg), size);
              return FromQt(ReportPictureTag(name, size));
            },
            number++);
        above += ToQt(html);
        if (std::holds_alternative<ReportHeading>(block)) continue;
        pages.Add(above, images);
        above.clear();
      }
    }
  }
  return file.Commit();
}

}  // namespace tervane
