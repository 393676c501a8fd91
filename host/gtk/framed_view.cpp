// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/framed_view.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <vector>

#include "host/gtk/mirrored_text.h"
#include "host/gtk/style.h"
#include "platform/ui/button.h"
#include "platform/ui/label.h"

namespace vaelo {

namespace {

constexpr const char* MirrorKey = "vaelo-framed-view";
constexpr int LeastWidth = 40;
constexpr double TouchSide = 44;  // a finger needs more than a line of small text
// A model's button is its title with a little room around it; a theme's is higher than a toolbar's line may be.
constexpr const char* ButtonStyle =
    "button.vaelo-framed { min-height: 0; min-width: 0; padding: 5px 6px; border-radius: 9px; font-weight: normal; }";

GtkWidget* textOf(const Label& label) {
  GtkWidget* text = gtk_label_new(label.text().c_str());
  PangoAttrList* attributes = attributesOf(label.font());
  gtk_label_set_attributes(GTK_LABEL(text), attributes);
  pango_attr_list_unref(attributes);
  gtk_label_set_ellipsize(GTK_LABEL(text), PANGO_ELLIPSIZE_END);
  return text;
}

class FramedView : public ViewObserver {
 public:
  FramedView(ViewRef view, GtkWidget* box) : view_(std::move(view)), box_(box) {
    view_->setObserver(this);
    for (const ViewRef& part : view_->subviews()) add(part);
    // The buttons themselves come first; what is left are the presses beside them.
    GtkGesture* beside = gtk_gesture_click_new();
    g_signal_connect(beside, "released", G_CALLBACK(+[](GtkGesture*, int, double x, double y, FramedView* self) {
                       self->pressBeside({x, y});
                     }),
                     this);
    gtk_widget_add_controller(box_, GTK_EVENT_CONTROLLER(beside));
  }
  ~FramedView() override {
    if (view_->observer() == this) view_->setObserver(nullptr);
    for (const Part& part : parts_) {
      if (part.view->observer() == this) part.view->setObserver(nullptr);
    }
  }

  void viewChanged(View& view, ViewChange change) override {
    const auto part = std::find_if(parts_.begin(), parts_.end(), [&](const Part& each) { return each.view.get() == &view; });
    if (part != parts_.end() && change != ViewChange::Frame && change != ViewChange::Layout) update(*part);
    const bool moves = change == ViewChange::Content || change == ViewChange::Layout || change == ViewChange::Visibility;
    if (moves && !allocating_) gtk_widget_queue_resize(box_);
  }
  void animationWillBegin(View&, const Animation&) override {}
  void animationDidEnd(View&) override {}
  void viewWillBeDestroyed(View&) override {}

  void measure(GtkOrientation orientation, int* least, int* natural) const {
    const Size size = view_->intrinsicContentSize();
    const bool across = orientation == GTK_ORIENTATION_HORIZONTAL;
    *natural = static_cast<int>(std::ceil(std::max(0.0, across ? size.width : size.height)));
    *least = across ? std::min(*natural, LeastWidth) : *natural;
  }

  void allocate(int width, int height) {
    allocating_ = true;
    view_->applyLayoutFrame({0, 0, static_cast<double>(width), static_cast<double>(height)});
    view_->layoutIfNeeded();
    for (const Part& part : parts_) {
      if (gtk_widget_should_layout(part.widget)) place(part, width);
    }
    allocating_ = false;
  }

 private:
  struct Part {
    ViewRef view;
    GtkWidget* widget;
    GtkWidget* text;
  };

  void pressBeside(const Point& at) const {
    for (const Part& part : parts_) {
      const auto button = std::dynamic_pointer_cast<Button>(part.view);
      const Rect& frame = part.view->frame();
      const Rect around =
          frame.insetBy(std::min(0.0, (frame.width - TouchSide) / 2), std::min(0.0, frame.height - TouchSide));
      if (button && !button->hidden() && around.contains(at)) return button->sendActions(ControlEvent::TouchUpInside);
    }
  }

  void add(const ViewRef& view) {
    Part part{view, nullptr, nullptr};
    if (const auto label = std::dynamic_pointer_cast<Label>(view)) {
      part.widget = part.text = textOf(*label);
    } else if (const auto button = std::dynamic_pointer_cast<Button>(view)) {
      part.text = textOf(*button->titleLabel());
      part.widget = gtk_button_new();
      gtk_button_set_child(GTK_BUTTON(part.widget), part.text);
      gtk_widget_add_css_class(part.widget, "vaelo-framed");
      g_signal_connect(part.widget, "clicked",
                       G_CALLBACK(+[](GtkButton*, Button* pressed) { pressed->sendActions(ControlEvent::TouchUpInside); }),
                       button.get());
    } else {
      return;
    }
    gtk_box_append(GTK_BOX(box_), part.widget);
    view->setObserver(this);
    parts_.push_back(part);
    update(part);
  }

  static void update(const Part& part) {
    gtk_widget_set_visible(part.widget, !part.view->hidden());
    const auto* button = dynamic_cast<const Button*>(part.view.get());
    const Label& label = button ? *button->titleLabel() : static_cast<const Label&>(*part.view);
    gtk_label_set_text(GTK_LABEL(part.text), label.text().c_str());
    if (!button) return;
    gtk_widget_set_sensitive(part.widget, button->enabled());
    gtk_accessible_update_property(GTK_ACCESSIBLE(part.widget), GTK_ACCESSIBLE_PROPERTY_LABEL, label.text().c_str(), -1);
  }

  static void place(const Part& part, int width) {
    const Rect& frame = part.view->frame();
    const auto extent = [&part](GtkOrientation orientation, double wanted, int most) {
      int least = 0;
      gtk_widget_measure(part.widget, orientation, -1, &least, nullptr, nullptr, nullptr);
      return std::max(least, std::min(static_cast<int>(std::ceil(wanted)), most));
    };
    const int across = extent(GTK_ORIENTATION_HORIZONTAL, frame.width, width);
    const int down = extent(GTK_ORIENTATION_VERTICAL, frame.height, G_MAXINT);
    // What needs more than its frame keeps the middle of it.
    const GtkAllocation at = {std::max(0, static_cast<int>(std::floor(frame.center().x - across / 2.0))),
                              static_cast<int>(std::floor(frame.center().y - down / 2.0)), across, down};
    gtk_widget_size_allocate(part.widget, &at, -1);
  }

  ViewRef view_;
  GtkWidget* box_;
  std::vector<Part> parts_;
  bool allocating_ = false;
};

FramedView& mirrorOf(GtkWidget* box) { return *static_cast<FramedView*>(g_object_get_data(G_OBJECT(box), MirrorKey)); }

}  // namespace

GtkWidget* makeFramedView(const ViewRef& view) {
  addStyle(ButtonStyle);
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  g_object_set_data_full(G_OBJECT(box), MirrorKey, new FramedView(view, box),
                         [](gpointer mirror) { delete static_cast<FramedView*>(mirror); });
  gtk_widget_set_layout_manager(
      box, gtk_custom_layout_new(
               nullptr,
               +[](GtkWidget* widget, GtkOrientation orientation, int, int* least, int* natural, int*, int*) {
                 mirrorOf(widget).measure(orientation, least, natural);
               },
               +[](GtkWidget* widget, int width, int height, int) { mirrorOf(widget).allocate(width, height); }));
  return box;
}

}  // namespace vaelo
