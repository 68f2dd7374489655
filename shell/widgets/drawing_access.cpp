// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/drawing_access.h"

#include <QAccessibleWidget>
#include <QWidget>
#include <utility>

namespace tervane {

namespace {

/// Marks a widget as a drawing, and lives as long as it.
class DrawingText : public QObject {
 public:
  DrawingText(QWidget& widget, std::function<QString()> text, QAccessible::Role role)
      : QObject(&widget), text_(std::move(text)), role_(role) {}
  QAccessible::Role Role() const { return role_; }
  QString Text() const { return text_ ? text_() : QString(); }

  static const DrawingText* Of(const QObject& widget) {
    for (const QObject* child : widget.children())
      if (const auto* text = dynamic_cast<const DrawingText*>(child)) return text;
    return nullptr;
  }

 private:
  std::function<QString()> text_;
  QAccessible::Role role_;
};

class AccessibleDrawing : public QAccessibleWidget {
 public:
  AccessibleDrawing(QWidget& widget, QAccessible::Role role) : QAccessibleWidget(&widget, role) {}

  QString text(QAccessible::Text kind) const override {
    const DrawingText* drawn = kind == QAccessible::Description ? DrawingText::Of(*object()) : nullptr;
    const QString text = drawn ? drawn->Text() : QString();
    return text.isEmpty() ? QAccessibleWidget::text(kind) : text;
  }
};

QAccessibleInterface* MakeDrawing(const QString& /*className*/, QObject* object) {
  auto* widget = qobject_cast<QWidget*>(object);
  const DrawingText* drawn = widget ? DrawingText::Of(*widget) : nullptr;
  return drawn ? new AccessibleDrawing(*widget, drawn->Role()) : nullptr;
}

}  // namespace

void DescribeDrawing(QWidget& widget, std::function<QString()> description, QAccessible::Role role) {
  static const bool isKnown = (QAccessible::installFactory(MakeDrawing), true);
  Q_UNUSED(isKnown)
  new DrawingText(widget, std::move(description), role);
  // Whoever has asked for it already was given a plain widget.
  if (QAccessibleInterface* known = QAccessible::queryAccessibleInterface(&widget))
    QAccessible::deleteAccessibleInterface(QAccessible::uniqueId(known));
}

void TellDrawing(QWidget& widget) {
  if (!QAccessible::isActive() || !DrawingText::Of(widget)) return;
  QAccessibleEvent changed(&widget, QAccessible::DescriptionChanged);
  QAccessible::updateAccessibility(&changed);
}

void Announce(QWidget& line, const QString& text) {
  line.setAccessibleName(text);
  if (!QAccessible::isActive() || text.isEmpty()) return;
  QAccessibleEvent alert(&line, QAccessible::Alert);
  QAccessible::updateAccessibility(&alert);
}

}  // namespace tervane
