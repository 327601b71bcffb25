// What the program runs on, for support.
#pragma once

#include <QString>

namespace tendril {

// "Debian GNU/Linux 12 (bookworm), linux 6.1.0, x86_64".
QString DescribeSystem();
// "6.4.2, built with 6.4.2".
QString DescribeQt();

}  // namespace tendril
