// A window of Qt's own controls, as many of each kind as the program's window shows at first, to measure a start
// against: what a window with so many controls costs in any case. The drawn servos have no counterpart in it, nor has
// any text another type than the system's.
#include <QApplication>
#include <QCheckBox>
#include <QComboBox>
#include <QGridLayout>
#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <QRadioButton>
#include <QScrollArea>
#include <QSlider>
#include <QSpinBox>
#include <QVBoxLayout>
#include <array>
#include <cstddef>
#include <functional>

#include "first_paint.h"

namespace {

constexpr int kBoxesInRow = 4;

struct Kind {
  int count;
  std::function<QWidget*(const QString& text)> make;
};

template <typename Control>
QWidget* WithText(const QString& text) {
  return new Control(text);
}

QWidget* MakeComboBox(const QString& text) {
  auto* box = new QComboBox;
  box->addItem(text);
  return box;
}

}  // namespace

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  QScrollArea window;
  window.setWidgetResizable(true);
  auto* content = new QWidget;
  auto* grid = new QGridLayout(content);
  std::array<QVBoxLayout*, 11> boxes{};
  for (std::size_t index = 0; index < boxes.size(); ++index) {
    auto* box = new QGroupBox(QStringLiteral("Box %1").arg(index));
    boxes[index] = new QVBoxLayout(box);
    grid->addWidget(box, static_cast<int>(index) / kBoxesInRow, static_cast<int>(index) % kBoxesInRow);
  }
  std::size_t dealt = 0;
  for (const Kind& kind :
       {Kind{35, WithText<QLabel>}, Kind{11, WithText<QPushButton>}, Kind{10, WithText<QCheckBox>},
        Kind{10, WithText<QRadioButton>}, Kind{6, [](const QString&) { return new QSpinBox; }},
        Kind{4, MakeComboBox}, Kind{1, [](const QString&) { return new QSlider(Qt::Horizontal); }}}) {
    for (int index = 0; index < kind.count; ++index, ++dealt) {
      boxes[dealt % boxes.size()]->addWidget(kind.make(QStringLiteral("Control %1").arg(dealt)));
    }
  }
  window.setWidget(content);
  window.resize(1280, 800);
  const tendril::FirstPaint first_paint;
  window.show();
  return QApplication::exec();
}
