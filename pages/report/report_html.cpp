// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/report/report_html.h"

#include <fmt/format.h>

#include "pages/report/png.h"
#include "pages/report/report_pictures.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::size_t kMostLogo = 5'000'000;

constexpr std::string_view kStyle = R"(
body { font-family: "DejaVu Sans", Helvetica, Arial, sans-serif; font-size: 14px; line-height: 1.45; color: #202020;
  max-width: 1000px; margin: 32px auto; padding: 0 24px; }
header { display: flex; justify-content: space-between; align-items: flex-start; border-bottom: 2px solid #2b6fb0;
  padding-bottom: 12px; }
header img { max-height: 72px; max-width: 240px; }
h1 { font-size: 26px; margin: 0 0 6px; }
h2 { font-size: 20px; margin: 36px 0 10px; border-bottom: 1px solid #c8d4e0; padding-bottom: 4px; }
h3 { font-size: 15px; margin: 22px 0 6px; }
nav ol { columns: 2; }
nav a { color: #1f4e79; }
table { border-collapse: collapse; margin: 8px 0 14px; }
th, td { text-align: left; vertical-align: top; padding: 3px 14px 3px 0; border-bottom: 1px solid #e2e2e2; }
th { border-bottom: 1px solid #909090; }
td { overflow-wrap: anywhere; }
td:first-child { overflow-wrap: normal; min-width: 90px; }
figure { margin: 8px 0 18px; }
figure svg { max-width: 100%; height: auto; }
figcaption, .quiet { color: #606060; font-size: 12px; }
p { white-space: pre-line; }
@media print { body { margin: 0; max-width: none; font-size: 11px; } h2, h3 { break-after: avoid; }
  figure, tr { break-inside: avoid; } nav { display: none; } }
)";

struct BlockWriter {
  std::string& html;
  const PictureInHtml& picture;
  std::size_t& pictures;

  void operator()(const ReportHeading& heading) const { html += fmt::format("<h3>{}</h3>\n", XmlText(heading.text)); }
  void operator()(const ReportText& text) const {
    html += fmt::format("<p{}>{}</p>\n", text.isQuiet ? " class=\"quiet\"" : "", XmlText(text.text));
  }
  void operator()(const ReportTable& table) const {
    html += "<table>\n";
    if (!table.heads.empty()) AddRow(table.heads, "th");
    for (const auto& row : table.rows) AddRow(row, "td");
    html += "</table>\n";
  }
  void operator()(const ReportPicture& drawn) const {
    html += "<figure>\n" + picture(drawn, pictures++);
    if (!drawn.caption.empty()) html += fmt::format("<figcaption>{}</figcaption>\n", XmlText(drawn.caption));
    html += "</figure>\n";
  }

  void AddRow(const std::vector<std::string>& cells, const char* tag) const {
    html += "<tr>";
    for (const std::string& cell : cells)
      html += fmt::format("<{0}>{1}</{0}>", tag, Replaced(XmlText(cell), "\n", "<br>"));
    html += "</tr>\n";
  }
};

std::string_view TypeOfImage(std::string_view path) {
  const std::string extension = LowerCase(ExtensionOf(path));
  if (extension == ".png") return "image/png";
  if (extension == ".jpg" || extension == ".jpeg") return "image/jpeg";
  if (extension == ".gif") return "image/gif";
  return extension == ".svg" ? "image/svg+xml" : "";
}

}  // namespace

std::string ReportBlockInHtml(const ReportBlock& block, const PictureInHtml& picture, std::size_t number) {
  std::string html;
  std::visit(BlockWriter{html, picture, number}, block);
  return html;
}

std::string ReportBody(const Report& report, const PictureInHtml& picture) {
  std::string html;
  std::size_t pictures = 0;
  const BlockWriter write{html, picture, pictures};
  for (const ReportSection& section : report.sections) {
    html += fmt::format("<h2 id=\"{}\">{}</h2>\n", section.name, XmlText(section.title));
    for (const ReportBlock& block : section.blocks) std::visit(write, block);
  }
  return html;
}

FileResult LogoData(const Report& report, std::string& data) {
  data.clear();
  if (report.logo.empty()) return {};
  const std::string_view type = TypeOfImage(report.logo);
  if (type.empty()) return {report.logo + ": a logo is a .png, .jpg, .gif or .svg", {}};
  FileContent bytes;
  if (FileResult read = ReadWholeFile(report.logo, bytes); !read.Ok()) return read;
  if (bytes.size > kMostLogo) return {report.logo + ": a logo has at most 5 MB", {}};
  data = fmt::format("data:{};base64,{}", type, Base64(bytes.Text()));
  return {};
}

FileResult WriteReportHtml(const std::string& path, const Report& report) {
  std::string logo;
  if (FileResult taken = LogoData(report, logo); !taken.Ok()) return taken;
  std::string contents;
  for (const ReportSection& section : report.sections)
    contents += fmt::format("<li><a href=\"#{}\">{}</a></li>\n", section.name, XmlText(section.title));
  const std::string head = fmt::format(
      "<!DOCTYPE html>\n<html lang=\"{6}\">\n<head>\n<meta charset=\"utf-8\">\n<title>{0}</title>\n<style>{1}</style>\n"
      "</head>\n<body>\n<header><div><h1>{0}</h1>\n<p class=\"quiet\">{2}\n{3}</p></div>{4}</header>\n"
      "<nav><ol>\n{5}</ol></nav>\n",
      XmlText(report.title), kStyle, XmlText(report.file), XmlText(report.made),
      logo.empty() ? std::string() : fmt::format("<img alt=\"\" src=\"{}\">", logo), contents, report.language);
  return WriteFileAtomically(path, head + ReportBody(report, [](const ReportPicture& drawn, std::size_t) {
                                     return drawn.svg;
                                   }) + "</body>\n</html>\n");
}

}  // namespace tervane
