// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QApplication>
#include <QDeadlineTimer>
#include <QDir>
#include <QImage>
#include <QTemporaryDir>
#include <QTimer>
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <new>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

#include <CLI/CLI.hpp>

#include "languages/languages.h"
#include "platform/os.h"
#include "platform/version.h"
#include "shell/document_frame.h"
#include "shell/main_window.h"
#include "shell/maps/map_view.h"
#include "shell/program.h"
#include "shell/relief/relief_canvas.h"
#include "shell/relief/relief_window.h"
#include "shell/report_pdf.h"
#include "shell/widgets/plot_frame.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_language.h"
#include "shell/widgets/theme.h"

namespace {

using namespace tervane;

struct Typed {
  std::vector<std::string> files;
  bool text = false;
  std::string page, below, size, screenshot, appearance, dialog, relief, report, language;
  ReportOptions reported;
  std::vector<std::string> answers;
  double zoom = 0;
  int delay = -1, slice = 0;
  bool isEdit = false;
};

/// "1280x800"
QSize ParseSize(const std::string& text) {
  int width = 0, height = 0;
  char rest = 0;
  const bool isSize = std::sscanf(text.c_str(), "%dx%d%c", &width, &height, &rest) == 2;
  return isSize && width > 0 && height > 0 && width <= 20000 && height <= 20000 ? QSize(width, height) : QSize();
}

/// The image in 256 colours, which packs to half: shades at the edges of letters give way to those close to them that
/// it has more of.
QImage WithFewColors(const QImage& image) {
  std::unordered_map<QRgb, int> counts;
  for (int y = 0; y < image.height(); ++y)
    for (int x = 0; x < image.width(); ++x) ++counts[image.pixel(x, y)];
  std::vector<std::pair<int, QRgb>> colors;
  for (const auto& [color, count] : counts) colors.emplace_back(count, color);
  std::ranges::sort(colors, std::greater());
  constexpr qsizetype kMost = 256;
  QList<QRgb> table;
  for (int distance = 0; distance == 0 || table.size() > kMost; ++distance) {
    table.clear();
    for (const auto& [count, color] : colors) {
      const auto isClose = [&, color = color](QRgb other) {
        return std::abs(qRed(color) - qRed(other)) <= distance && std::abs(qGreen(color) - qGreen(other)) <= distance &&
               std::abs(qBlue(color) - qBlue(other)) <= distance;
      };
      if (std::ranges::none_of(table, isClose)) table << color;
      if (table.size() > kMost) break;
    }
  }
  return image.convertToFormat(QImage::Format_Indexed8, table, Qt::ThresholdDither | Qt::AvoidDither);
}

bool SavePicture(QWidget& widget, const std::string& path) {
  if (WithFewColors(widget.grab().toImage()).save(ToQt(path))) return true;
  std::fprintf(stderr, "quarzel: %s cannot be written\n", path.c_str());
  return false;
}

/// Presses a button of the page, draws the dialog that it opens, and gives that up.
int DrawDialog(MainWindow& window, const Typed& typed) {
  int status = 2;
  QTimer::singleShot(0, &window, [&] {
    QWidget* const dialog = QApplication::activeModalWidget();
    if (!dialog) return;
    for (int i = 0; i < 3; ++i) QApplication::processEvents();
    if (SavePicture(*dialog, typed.screenshot)) status = 0;
    dialog->close();
  });
  const bool isPressed = window.Frame() && window.Frame()->PressButton(typed.dialog);
  if (!isPressed) std::fprintf(stderr, "quarzel: %s: the page has no such button\n", typed.dialog.c_str());
  return status;
}

/// Draws the 3D view of the ground of the setup, or of the map that is shown.
int DrawRelief(MainWindow& window, const Typed& typed) {
  ReliefWindow* relief = nullptr;
  if (typed.relief == "ground" && window.Frame()) {
    relief = window.ShowGround(*window.Frame());
  } else if (typed.relief == "map") {
    for (MapView* map : window.findChildren<MapView*>())
      if (map->isVisible()) relief = map->OpenRelief();
  }
  if (!relief) {
    std::fprintf(stderr, "quarzel: there is nothing to show in 3D\n");
    return 2;
  }
  while (relief->View().IsBusy()) QApplication::processEvents(QEventLoop::WaitForMoreEvents);
  if (typed.slice > 0) relief->Slice(1, typed.slice / 100.0);
  for (int i = 0; i < 3; ++i) QApplication::processEvents();
  relief->View().Canvas().WaitUntilFine();
  return SavePicture(*relief, typed.screenshot) ? 0 : 2;
}

/// Memory that is refused is told, and the program goes on with what it has.
class Application : public QApplication {
 public:
  using QApplication::QApplication;

  bool notify(QObject* receiver, QEvent* event) override {
    try {
      return QApplication::notify(receiver, event);
    } catch (const std::bad_alloc&) {
      std::fprintf(stderr, "quarzel: there is not enough memory for this\n");
      return false;
    }
  }
};

/// Draws the report of a setup for paper, without a window.
int DrawReport(const Typed& typed) {
  CFlowModelDoc document;
  if (typed.files.size() != 1 || !document.OnOpenDocument(typed.files.front())) {
    std::fprintf(stderr, "%s\n", typed.files.size() != 1 ? "--report goes with one setup" : document.Error().c_str());
    return 2;
  }
  const FileResult written = WriteReportPdf(typed.report, MakeReport(document, typed.reported));
  if (!written.Ok()) std::fprintf(stderr, "%s\n", written.error.c_str());
  return written.Ok() ? 0 : 2;
}

int Run(const Typed& typed, QApplication& application) {
  // A picture shows the program as it is for everybody, and leaves nothing in the user's settings.
  const bool isPicture = !typed.screenshot.empty();
  QTemporaryDir pictureFolder;
  Program program(isPicture ? pictureFolder.filePath("settings.ini") : QString());
  // A picture is English unless it is told otherwise.
  const ShownLanguage language(LanguageToShow(!typed.language.empty() ? ToQt(typed.language)
                                              : isPicture             ? "en"
                                                                      : program.Language()));
  Theme theme;
  if (const int appearance = program.Settings().value("Appearance", 0).toInt(); appearance > 0 && appearance <= 2)
    theme.SetAppearance(static_cast<Theme::Appearance>(appearance));
  if (!typed.appearance.empty())
    theme.SetAppearance(typed.appearance == "dark" ? Theme::Appearance::Dark : Theme::Appearance::Light);
  theme.SetZoom(typed.zoom > 0 ? typed.zoom : program.Settings().value("Zoom", 1.0).toDouble());

  MainWindow window(program);
  if (isPicture) window.SetUnattended();
  if (!typed.size.empty()) window.resize(ParseSize(typed.size));
  window.show();
  for (const std::string& file : typed.files)
    if (!(typed.isEdit && !file.ends_with(".tvd") ? window.EditDataFile(ToQt(file)) : window.OpenFile(ToQt(file))) &&
        isPicture)
      return 2;
  if (!typed.page.empty() && (!window.Frame() || !window.Frame()->GoToPath(typed.page))) {
    std::fprintf(stderr, "quarzel: %s: there is no page of that path\n", typed.page.c_str());
    if (isPicture) return 2;
  }
  for (const std::string& answer : typed.answers)
    if (!window.Frame() || !window.Frame()->AnswerOnMap(answer)) {
      std::fprintf(stderr, "quarzel: %s: the page has no button that asks for these points on its map\n",
                   answer.c_str());
      if (isPicture) return 2;
    }
  if (typed.text && window.Frame()) window.Frame()->ShowText(true);
  if (!typed.below.empty() && window.Frame() && !window.Frame()->ShowBelow(ToQt(typed.below))) {
    std::fprintf(stderr, "quarzel: %s: there is no list of that title below the page\n", typed.below.c_str());
    if (isPicture) return 2;
  }
  if (!isPicture) {
    QTimer::singleShot(0, &window, [&window] { window.OfferRecoveries(); });
    return QApplication::exec();
  }
  if (window.Frame()) window.Frame()->Settle();
  // Layouts settle when events have run, and maps when they are computed.
  const auto settle = [&application] {
    for (int i = 0; i < 3; ++i) application.processEvents();
  };
  settle();
  const auto isBusy = [&window] {
    return std::ranges::any_of(window.findChildren<PlotFrame*>(), [](const auto* plot) { return plot->IsBusy(); });
  };
  const QDeadlineTimer deadline(typed.delay < 0 ? QDeadlineTimer::Forever : QDeadlineTimer(typed.delay));
  QTimer tick;
  tick.start(10);
  while (isBusy() && !deadline.hasExpired()) application.processEvents(QEventLoop::WaitForMoreEvents);
  settle();
  if (!typed.dialog.empty()) return DrawDialog(window, typed);
  if (!typed.relief.empty()) return DrawRelief(window, typed);
  return SavePicture(window, typed.screenshot) ? 0 : 2;
}

}  // namespace

int main(int argc, char** argv) {
  os::PrepareProcess();
  CLI::App commandLine{"The setup editor of the integrated catchment model Tervane.", "quarzel"};
  Typed typed;
  commandLine.add_option("FILE", typed.files, "Setups (.tvd), libraries (.etv) and data files to open");
  commandLine.add_flag("--edit", typed.isEdit, "Opens data files to be changed, not only to be looked at");
  commandLine.add_option("--page", typed.page, "The node to show, as Climate/PrecipitationRate");
  commandLine.add_flag("--text", typed.text, "Shows the text of the setup, at that node");
  commandLine.add_option("--below", typed.below, "The list to show below the page, as Journal");
  commandLine
      .add_option(
          "--answer", typed.answers,
          "A button of the page and the points to be taken as clicked on the map, as \"Draw Section=0,0 100,50\"")
      ->allow_extra_args(false);
  commandLine.add_option("--zoom", typed.zoom, "The size of everything, 1.5 for half as large again")
      ->check(CLI::Range(0.5, 3.0));
  commandLine.add_option("--size", typed.size, "The size of the window, as 1280x800")
      ->check([](const std::string& text) {
        return ParseSize(text).isValid() ? std::string() : "a size as 1280x800 was expected";
      });
  commandLine.add_option("--appearance", typed.appearance, "light or dark")->check(CLI::IsMember({"light", "dark"}));
  commandLine
      .add_option("--language", typed.language,
                  "The language of menus, pages and findings: " + LanguageCodes() + ", or system for the system's")
      ->check([](const std::string& text) {
        return text == kSystemLanguage || IsLanguage(text) ? std::string()
                                                           : LanguageCodes() + " or system was expected";
      });
  commandLine.add_option("--screenshot", typed.screenshot, "Draw the window into this picture and end");
  commandLine.add_option("--dialog", typed.dialog, "Draw the dialog that this button of the page opens");
  commandLine
      .add_option("--view3d", typed.relief, "Draw the 3D view of the setup's ground, or of the map that is shown")
      ->check(CLI::IsMember({"ground", "map"}));
  commandLine.add_option("--slice", typed.slice, "Of the 3D view: cut it from the south, by so many percent")
      ->check(CLI::Range(0, 100));
  commandLine
      .add_option("--delay", typed.delay, "Draw it after so many milliseconds, whatever is still being computed")
      ->check(CLI::NonNegativeNumber);
  commandLine.add_option("--report", typed.report, "Write the report of the setup as this PDF and end");
  commandLine.add_option("--report-logo", typed.reported.logo, "A picture at the head of the report");
  const auto takenBy = [&typed](std::string (*take)(std::string_view, ReportOptions&)) {
    return [&typed, take](const CLI::results_t& words) {
      const std::string why = take(words.front(), typed.reported);
      if (!why.empty()) throw CLI::ValidationError(why);
      return true;
    };
  };
  commandLine.add_option("--report-sections", takenBy(TakeReportSections), "Some of its sections alone");
  commandLine.add_option("--report-dates", takenBy(TakeReportDates), "How it writes dates: iso, en, de or fr");
  commandLine.set_version_flag("--version", "quarzel " + ProgramBuild());
  CLI11_PARSE(commandLine, argc, argv);

  // A report needs no display.
  if (!typed.report.empty() && !qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  if (IsLanguage(typed.language)) typed.reported.language = typed.language;
  Application application(argc, argv);
  QApplication::setApplicationName("Quarzel");
  QApplication::setApplicationVersion(kProgramVersion);
  try {
    return typed.report.empty() ? Run(typed, application) : DrawReport(typed);
  } catch (const std::bad_alloc&) {
    std::fprintf(stderr, "quarzel: there is not enough memory for this\n");
    return 2;
  }
}
