// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/font.h"

namespace vaelo {

double Font::defaultPointSize(TextStyle style) {
  switch (style) {
    case TextStyle::LargeTitle:
      return 34;
    case TextStyle::Title1:
      return 28;
    case TextStyle::Title2:
      return 22;
    case TextStyle::Title3:
      return 20;
    case TextStyle::Headline:
      return 17;
    case TextStyle::Subheadline:
      return 15;
    case TextStyle::Body:
      return 17;
    case TextStyle::Callout:
      return 16;
    case TextStyle::Footnote:
      return 13;
    case TextStyle::Caption1:
      return 12;
    case TextStyle::Caption2:
      return 11;
  }
  return 17;
}

}  // namespace vaelo
