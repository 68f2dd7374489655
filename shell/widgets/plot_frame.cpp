// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/plot_frame.h"

#include <QApplication>
#include <QBuffer>
#include <QClipboard>
#include <QFocusEvent>
#include <QHBoxLayout>
#include <QLabel>
#include <QPainter>
#include <QToolButton>
#include <QVBoxLayout>
#include <utility>

#include "platform/files.h"
#include "shell/widgets/drawing_access.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"
#include "shell/widgets/wait_panel.h"

namespace tervane {

namespace {

constexpr double kZoomStep = 1.5;
constexpr int kNarrow = 460;       ///< In pixels at zoom 1: below, the line breaks into two.
constexpr int kMoment = 25;        ///< In milliseconds: what takes no longer appears at once.
constexpr double kPaperRatio = 2;  ///< Pixels of a picture for one of the screen.

/// A text in one line that gives way where there is no room.
class StatusLabel : public QLabel {
 public:
  StatusLabel() {
    setTextFormat(Qt::PlainText);
    setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    setTextInteractionFlags(Qt::NoTextInteraction);
  }
  QSize minimumSizeHint() const override { return {0, QLabel::minimumSizeHint().height()}; }
};

/// A frame around a plot that the keyboard has come to.
class FocusRing : public QWidget {
 public:
  explicit FocusRing(QWidget& plot) : QWidget(&plot) {
    setObjectName("FocusRing");
    setAttribute(Qt::WA_TransparentForMouseEvents);
    setFocusPolicy(Qt::NoFocus);
    hide();
    plot.installEventFilter(this);
  }

 protected:
  void paintEvent(QPaintEvent* /*event*/) override {
    QPainter painter(this);
    const int width = Theme::Get().Scaled(2);
    painter.setPen(QPen(palette().color(QPalette::Highlight), width, Qt::SolidLine, Qt::SquareCap, Qt::MiterJoin));
    painter.drawRect(QRectF(rect()).adjusted(width / 2.0, width / 2.0, -width / 2.0, -width / 2.0));
  }
  bool eventFilter(QObject* watched, QEvent* event) override {
    if (event->type() == QEvent::FocusIn) {
      const Qt::FocusReason reason = static_cast<QFocusEvent*>(event)->reason();
      // Who has clicked knows where he is.
      if (reason == Qt::TabFocusReason || reason == Qt::BacktabFocusReason || reason == Qt::ShortcutFocusReason) {
        setGeometry(parentWidget()->rect());
        raise();
        show();
      }
    }
    if (event->type() == QEvent::FocusOut || event->type() == QEvent::MouseButtonPress) hide();
    if (event->type() == QEvent::Resize) setGeometry(parentWidget()->rect());
    return QWidget::eventFilter(watched, event);
  }
};

}  // namespace

PlotFrame::PlotFrame(Host& host, QWidget* parent) : QWidget(parent), host_(host), status_(new StatusLabel) {
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
}

void PlotFrame::Hold(Plot plot) {
  plot_ = std::move(plot);
  // West is left, and so is what was before, in every language.
  plot_.widget->setLayoutDirection(Qt::LeftToRight);
  DescribeDrawing(*plot_.widget, [this] { return Description(); });
  new FocusRing(*plot_.widget);
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(2);
  auto* plotRow = new QHBoxLayout;
  plotRow->setSpacing(0);
  plotRow->addWidget(plot_.widget, 1);
  if (plot_.beside) plotRow->addWidget(plot_.beside);
  column->addLayout(plotRow, 1);
  row_ = new QHBoxLayout;
  row_->setSpacing(2);
  row_->addSpacing(Theme::Get().Scaled(4));
  row_->addWidget(status_, 1);
  const auto add = [&](const QString& icon, const QString& tip, std::function<void()> command) {
    auto* button = new QToolButton;
    button->setAutoRaise(true);
    button->setToolTip(tip);
    button->setAccessibleName(tip);
    if (command) connect(button, &QToolButton::clicked, this, std::move(command));
    row_->addWidget(button);
    buttons_.emplace_back(button, icon);
  };
  add("insert", tr("Zoom in (+)"), [this] { plot_.zoom(kZoomStep); });
  add("zoom_out", tr("Zoom out (-)"), [this] { plot_.zoom(1 / kZoomStep); });
  add("fit", tr("Show everything (Home)"), [this] { plot_.fit(); });
  // All that the context menu offers, where it is looked for.
  add("more", tr("Copy, export and more"), {});
  more_ = buttons_.back().first;
  more_->setPopupMode(QToolButton::InstantPopup);
  column->addLayout(row_);
  plot_.widget->setContextMenuPolicy(Qt::ActionsContextMenu);
  AddCommand(tr("&Fit"), [this] { plot_.fit(); });
  AddCommand(tr("&Copy picture"), [this] { QApplication::clipboard()->setImage(plot_.picture(kPaperRatio)); });
  AddCommand(tr("&Export as PNG..."), [this] { ExportPicture(); });
  if (plot_.values) {
    AddCommand(tr("Copy &values"), [this] { QApplication::clipboard()->setText(plot_.values()); });
    AddCommand(tr("Export va&lues..."), [this] { ExportValues(); });
  }
  connect(&Theme::Get(), &Theme::Changed, this, &PlotFrame::FollowTheme);
  FollowTheme();
  panel_ = new WaitPanel(background_, *plot_.widget);
  connect(&background_, &Background::Ended, this, [this] {
    panel_->Sync();
    // A page that was left is hidden first, and what it speaks of may be gone.
    isAgainDue_ = !isVisible();
    if (isVisible()) AskAgain();
  });
}

void PlotFrame::AskAgain() {
  // What is asked may await something else, and then takes another one's place while it still runs.
  const std::function<void()> again = again_;
  again();
}

bool PlotFrame::IsThereInAMoment(const Awaited& awaited, const std::function<void()>& again) {
  again_ = again;
  isAgainDue_ = false;
  const bool isThere = background_.Await(awaited) && background_.IsDoneWithin(kMoment);
  if (!isThere) panel_->Sync();
  return isThere;
}

void PlotFrame::StopWaiting() {
  background_.StopWaiting();
  isAgainDue_ = false;
  panel_->Sync();
}

void PlotFrame::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  if (std::exchange(isAgainDue_, false)) AskAgain();
}

void PlotFrame::AddToRow(QWidget* tool) {
  constexpr int kBehindStatus = 2;
  row_->insertWidget(kBehindStatus, tool);
  // The Tab key goes from left to right.
  QWidget* before = plot_.widget;
  for (int place = kBehindStatus; place < row_->count(); ++place) {
    QWidget* next = row_->itemAt(place)->widget();
    if (!next) continue;
    setTabOrder(before, next);
    before = next;
  }
}

QAction* PlotFrame::AddCommand(const QString& text, std::function<void()> command) {
  auto* action = new QAction(text, plot_.widget);
  connect(action, &QAction::triggered, this, std::move(command));
  plot_.widget->addAction(action);
  more_->addAction(action);
  return action;
}

void PlotFrame::SetStatus(const QString& text) {
  if (text == status_->text()) return;
  status_->setText(text);
  TellDrawing(*plot_.widget);
}

QString PlotFrame::Status() const { return status_->text(); }

void PlotFrame::FollowTheme() {
  const int size = Theme::Get().Scaled(16);
  for (const auto& [button, icon] : buttons_) {
    button->setIcon(Theme::Get().Icon(icon));
    button->setIconSize({size, size});
  }
  ArrangeStatus();
}

/// The line keeps its height whatever it says, since the plot would change its size with it.
void PlotFrame::ArrangeStatus() {
  const bool isNarrow = width() < Theme::Get().Scaled(kNarrow);
  status_->setWordWrap(isNarrow);
  status_->setAlignment(Qt::AlignLeft | (isNarrow ? Qt::AlignTop : Qt::AlignVCenter));
  status_->setFixedHeight((isNarrow ? 2 : 1) * status_->fontMetrics().lineSpacing() + 4);
}

void PlotFrame::resizeEvent(QResizeEvent* /*event*/) { ArrangeStatus(); }

void PlotFrame::ExportPicture() {
  QByteArray bytes;
  QBuffer buffer(&bytes);
  buffer.open(QIODevice::WriteOnly);
  plot_.picture(kPaperRatio).save(&buffer, "PNG");
  ExportAs(tr("Export as PNG"), "PNG picture (*.png)|*.png||", "png", bytes);
}

void PlotFrame::ExportValues() {
  ExportAs(tr("Export values"), "Text with tabs (*.txt)|*.txt|All Files (*.*)|*.*||", "txt", plot_.values().toUtf8());
}

void PlotFrame::ExportAs(const QString& title, const std::string& filter, const std::string& extension,
                         const QByteArray& bytes) {
  const auto path = host_.AskFileToSave({FromQt(title), filter, extension, {}});
  if (!path) return;
  const FileResult result =
      WriteFileAtomically(*path, std::string_view(bytes.constData(), static_cast<std::size_t>(bytes.size())));
  if (!result.Ok()) host_.ShowMessage(result.error, Host::Icon::Error);
}

}  // namespace tervane
