// PlainControls: how many controls of each kind a window shows, and a plain window with as many.
#pragma once

#include <QAbstractSpinBox>
#include <QCheckBox>
#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QMainWindow>
#include <QMenu>
#include <QPushButton>
#include <QRadioButton>
#include <QSlider>
#include <QSpinBox>
#include <QString>
#include <QWidget>
#include <array>
#include <cstddef>
#include <type_traits>

namespace tendril {

// A control of Qt's own. The drawn servos and scales have no counterpart, nor has text in another type than the system's.
struct PlainKind {
  const char* name;
  bool (*is)(const QWidget& widget);
  QWidget* (*make)(const QString& text);
};

template <typename Control>
constexpr PlainKind PlainKindOf(const char* name) {
  return {name, [](const QWidget& widget) { return qobject_cast<const Control*>(&widget) != nullptr; },
          [](const QString& text) -> QWidget* {
            if constexpr (std::is_same_v<Control, QSlider>) {
              return new QSlider(Qt::Horizontal);
            } else if constexpr (std::is_constructible_v<Control, QString>) {
              return new Control(text);
            } else {
              auto* control = new Control;
              if constexpr (std::is_same_v<Control, QComboBox>) control->addItem(text);
              return control;
            }
          }};
}

inline constexpr std::array kPlainKinds{
    PlainKindOf<QLabel>("labels"),         PlainKindOf<QPushButton>("buttons"),
    PlainKindOf<QCheckBox>("check boxes"), PlainKindOf<QRadioButton>("radio buttons"),
    PlainKindOf<QSpinBox>("spin boxes"),   PlainKindOf<QComboBox>("lists"),
    PlainKindOf<QSlider>("sliders"),       PlainKindOf<QLineEdit>("text fields"),
    PlainKindOf<QGroupBox>("group boxes"),
};

// How many of each kind, then of menus, and of actions in them.
using PlainCounts = std::array<int, kPlainKinds.size() + 2>;

// Of what `window`, which is shown, has at this moment.
inline PlainCounts CountControls(const QMainWindow& window) {
  PlainCounts counts{};
  for (const auto* widget : window.findChildren<QWidget*>()) {
    // A spin box has a field of its own.
    if (!widget->isVisible() || qobject_cast<QAbstractSpinBox*>(widget->parent()) != nullptr) continue;
    for (std::size_t kind = 0; kind < kPlainKinds.size(); ++kind)
      counts[kind] += kPlainKinds[kind].is(*widget);
  }
  for (const auto* menu : window.findChildren<QMenu*>()) {
    ++counts[kPlainKinds.size()];
    for (const QAction* action : menu->actions()) counts.back() += action->menu() == nullptr;
  }
  return counts;
}

}  // namespace tendril
