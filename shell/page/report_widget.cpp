// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QFileInfo>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QStringDecoder>
#include <QTextBrowser>
#include <QUrl>
#include <QVBoxLayout>

#include "forms/report_file.h"
#include "platform/paths.h"
#include "shell/page/control_widgets.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

/// By what the page says of its letters, else as UTF-8.
QString Decoded(const std::string& html) {
  const QByteArrayView bytes(html.data(), static_cast<qsizetype>(html.size()));
  QStringDecoder decoder = QStringDecoder::decoderForHtml(bytes);
  return decoder.isValid() ? QString(decoder.decode(bytes)) : QString::fromUtf8(bytes);
}

/// A file in HTML: its text and pictures, and above it a button for the user's browser, which shows the rest.
class ReportWidget : public ControlWidget {
 public:
  ReportWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    auto* whole = new QWidget;
    auto* column = new QVBoxLayout(whole);
    column->setContentsMargins(0, 0, 0, 0);
    auto* row = new QHBoxLayout;
    back_ = new QPushButton(tr("Back to the Report"));
    remark_ = new QLabel;
    remark_->setWordWrap(true);
    remark_->setTextFormat(Qt::PlainText);
    open_ = new QPushButton(tr("Open in Browser"));
    row->addWidget(back_);
    row->addWidget(remark_, 1);
    row->addWidget(open_);
    column->addLayout(row);
    view_ = new QTextBrowser;
    view_->setOpenLinks(false);
    column->addWidget(view_, 1);
    MakeField(whole, true);
    connect(open_, &QPushButton::clicked, this, [this] { OpenOutside(QUrl::fromLocalFile(ToQt(shown_.path))); });
    connect(back_, &QPushButton::clicked, this, [this] { Show(ReadReport(Described().Text())); });
    connect(view_, &QTextBrowser::anchorClicked, this, &ReportWidget::Follow);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return view_; }

 protected:
  void SyncValue() override {
    const std::string path = Described().Text();
    const bool isFollowed = !followedFrom_.empty() && followedFrom_ == path;
    // What the user reads stays in its place while its file is the same.
    const std::string now = isFollowed ? shown_.path : path;
    if (isShown_ && now == shown_.path && StampOf(now) == shown_.stamp) return;
    if (!isFollowed) followedFrom_.clear();
    Show(ReadReport(now));
  }

 private:
  void Show(ReportFile report) {
    isShown_ = true;
    shown_ = std::move(report);
    if (shown_.path == Described().Text()) followedFrom_.clear();
    view_->setSearchPaths({ToQt(std::string(FolderOf(shown_.path)))});
    if (shown_.message.empty())
      view_->setHtml(Decoded(shown_.html));
    else
      view_->setPlainText(Translated(shown_.message));
    remark_->setText(Translated(shown_.remark));
    open_->setEnabled(shown_.MayBeOpened());
    back_->setVisible(!followedFrom_.empty());
  }

  void Follow(const QUrl& link) {
    if (link.isRelative() && link.path().isEmpty()) return view_->scrollToAnchor(link.fragment());
    const QUrl target = QUrl::fromLocalFile(ToQt(shown_.path)).resolved(link);
    const QFileInfo file(target.toLocalFile());
    const bool isPage = target.isLocalFile() && file.suffix().startsWith("htm", Qt::CaseInsensitive);
    if (!isPage) return OpenOutside(target);
    followedFrom_ = Described().Text();
    Show(ReadReport(FromQt(target.toLocalFile())));
    if (target.hasFragment()) view_->scrollToAnchor(target.fragment());
  }

  void OpenOutside(const QUrl& address) { Page().Outside().OpenBrowser(FromQt(address.toString(QUrl::FullyEncoded))); }

  QPushButton *back_, *open_;
  QLabel* remark_;
  QTextBrowser* view_;
  ReportFile shown_;
  bool isShown_ = false;
  std::string followedFrom_;  ///< The page's own report, while one that it links to is shown.
};

}  // namespace

std::unique_ptr<ControlWidget> MakeReportWidget(CYbSEDlgBase& page, Control& control) {
  if (control.kind != ControlKind::Report) return nullptr;
  return std::make_unique<ReportWidget>(page, control);
}

}  // namespace tervane
