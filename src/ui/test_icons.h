// The icons of the test buttons.
#pragma once

#include <QAbstractButton>
#include <QIcon>
#include <QSize>

namespace tendril {

enum class TestIcon {
  kStep,         // the servo moves once
  kSweep,        // it moves to and fro
  kDangerSweep,  // it moves to and fro as far as it can
};

// The size of the icons beside text in the font of `button`.
QSize TestIconSize(const QAbstractButton& button);

// An icon in the colour that the text of `button` has at each time. For `button` alone: no copy may outlive it.
QIcon MakeTestIcon(TestIcon kind, const QAbstractButton& button);

}  // namespace tendril
