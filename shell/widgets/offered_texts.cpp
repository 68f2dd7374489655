// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/offered_texts.h"

#include <QAbstractItemView>
#include <QAction>
#include <QCompleter>
#include <QCoreApplication>
#include <QLineEdit>
#include <QShortcut>
#include <QStringListModel>

#include "shell/widgets/theme.h"

namespace tervane {

void OfferTexts(QLineEdit& edit, std::function<QStringList()> texts, std::function<void()> chosen) {
  auto* model = new QStringListModel(&edit);
  auto* completer = new QCompleter(model, &edit);
  completer->setCaseSensitivity(Qt::CaseInsensitive);
  completer->setFilterMode(Qt::MatchContains);
  edit.setCompleter(completer);
  const auto ask = [model, texts = std::move(texts)] {
    if (const QStringList now = texts(); now != model->stringList()) model->setStringList(now);
    return model->rowCount() > 0;
  };
  QObject::connect(&edit, &QLineEdit::textEdited, completer, ask);
  QAction* all = edit.addAction(Theme::Get().Icon("down"), QLineEdit::TrailingPosition);
  all->setToolTip(QCoreApplication::translate("OfferedTexts", "Show what is offered"));
  const auto showAll = [completer, ask] {
    if (!ask()) return;
    completer->setCompletionPrefix({});
    completer->complete();
  };
  QObject::connect(all, &QAction::triggered, completer, showAll);
  auto* key = new QShortcut(QKeySequence(Qt::ALT | Qt::Key_Down), &edit, nullptr, nullptr, Qt::WidgetShortcut);
  QObject::connect(key, &QShortcut::activated, completer, showAll);
  // The first letter is to find something already.
  ask();
  QObject::connect(completer, qOverload<const QString&>(&QCompleter::activated), &edit,
                   [&edit, chosen = std::move(chosen)](const QString& text) {
                     edit.setText(text);
                     chosen();
                   });
}

}  // namespace tervane
