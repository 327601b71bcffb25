// A window of Qt's own controls, to measure a start against: what a window with so many controls costs in any case. Its
// arguments say how many of each kind; "first_window --count" prints those of the program.
#include <QApplication>
#include <QGridLayout>
#include <QMenuBar>
#include <QScrollArea>
#include <QStatusBar>
#include <QVBoxLayout>
#include <cstddef>
#include <cstdlib>
#include <vector>

#include "first_paint.h"
#include "plain_controls.h"

namespace tendril {
namespace {

constexpr std::size_t kBoxesInRow = 4;

void AddMenus(QMenuBar& bar, int menus, int actions) {
  for (int menu = 0; menu < menus; ++menu) {
    QMenu* const added = bar.addMenu(QStringLiteral("Menu %1").arg(menu));
    for (int action = menu; action < actions; action += menus)
      added->addAction(QStringLiteral("Action %1").arg(action));
  }
}

// Deals the controls to the group boxes, which are the last kind.
QWidget* MakeContent(const PlainCounts& counts) {
  auto* content = new QWidget;
  auto* grid = new QGridLayout(content);
  constexpr std::size_t kBoxes = kPlainKinds.size() - 1;
  std::vector<QVBoxLayout*> boxes;
  for (std::size_t index = 0; index < static_cast<std::size_t>(counts[kBoxes]); ++index) {
    QWidget* const box = kPlainKinds[kBoxes].make(QStringLiteral("Box %1").arg(index));
    boxes.push_back(new QVBoxLayout(box));
    grid->addWidget(box, static_cast<int>(index / kBoxesInRow), static_cast<int>(index % kBoxesInRow));
  }
  std::size_t dealt = 0;
  for (std::size_t kind = 0; kind < kBoxes; ++kind) {
    for (int index = 0; index < counts[kind]; ++index, ++dealt) {
      boxes.at(dealt % boxes.size())
          ->addWidget(kPlainKinds[kind].make(QStringLiteral("Control %1").arg(dealt)));
    }
  }
  return content;
}

int Run(int argc, char** argv) {
  QApplication application(argc, argv);
  PlainCounts counts{};
  if (argc != static_cast<int>(counts.size()) + 1) return EXIT_FAILURE;
  for (std::size_t index = 0; index < counts.size(); ++index) counts[index] = std::atoi(argv[index + 1]);
  QMainWindow window;
  AddMenus(*window.menuBar(), counts[kPlainKinds.size()], counts.back());
  window.statusBar();
  auto* scroll = new QScrollArea;
  scroll->setWidgetResizable(true);
  window.setCentralWidget(scroll);
  scroll->setWidget(MakeContent(counts));
  window.resize(1280, 800);
  const FirstPaint first_paint;
  window.show();
  return QApplication::exec();
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::Run(argc, argv); }
