// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/bar_button_item.h"

#include "platform/ui/control.h"

namespace vaelo {

BarButtonItemRef BarButtonItem::withTitle(std::string title, BarButtonStyle style, Action action) {
  BarButtonItemRef item(new BarButtonItem);
  item->title_ = std::move(title);
  item->style_ = style;
  item->action_ = std::move(action);
  return item;
}

BarButtonItemRef BarButtonItem::system(SystemItem kind, Action action) {
  BarButtonItemRef item(new BarButtonItem);
  item->systemItem_ = kind;
  if (kind == SystemItem::Done) item->style_ = BarButtonStyle::Done;
  item->action_ = std::move(action);
  return item;
}

BarButtonItemRef BarButtonItem::withCustomView(ViewRef view) {
  BarButtonItemRef item(new BarButtonItem);
  item->customView_ = std::move(view);
  return item;
}

void BarButtonItem::setTitle(std::string title) {
  if (title_ == title) return;
  title_ = std::move(title);
  changed_.emit(*this);
}

void BarButtonItem::setEnabled(bool enabled) {
  if (enabled_ == enabled) return;
  enabled_ = enabled;
  if (auto* control = dynamic_cast<Control*>(customView_.get())) control->setEnabled(enabled);
  changed_.emit(*this);
}

void BarButtonItem::press() {
  if (!enabled_) return;
  const BarButtonItemRef self = shared_from_this();
  if (auto* control = dynamic_cast<Control*>(customView_.get())) {
    control->sendActions(ControlEvent::TouchUpInside);
  } else if (const Action action = action_) {
    action(self);
  }
}

}  // namespace vaelo
