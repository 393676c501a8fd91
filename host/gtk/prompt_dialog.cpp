// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/prompt_dialog.h"

#include <adwaita.h>

#include <algorithm>
#include <vector>

#include "host/gtk/mirrored_field.h"
#include "host/gtk/mirrored_text.h"
#include "host/gtk/pango_graphics.h"
#include "platform/platform.h"
#include "platform/ui/keyboard_notice.h"

namespace vaelo {

namespace {

/// The widgets of one prompt, kept in step with its model.
class PromptDialog : public ViewObserver {
 public:
  PromptDialog(std::shared_ptr<AlertController> alert, GtkWindow* over)
      : alert_(std::move(alert)), window_(adw_window_new()) {
    gtk_window_set_transient_for(GTK_WINDOW(window_), over);
    gtk_window_set_modal(GTK_WINDOW(window_), TRUE);
    gtk_window_set_resizable(GTK_WINDOW(window_), FALSE);
    gtk_window_set_title(GTK_WINDOW(window_), alert_->title().c_str());
    gtk_widget_set_size_request(window_, 320, -1);
    build();
    g_signal_connect_swapped(window_, "close-request", G_CALLBACK(+[](PromptDialog* self) -> gboolean {
                               const auto kept = self->alert_;
                               kept->cancel();
                               return TRUE;
                             }),
                             this);
    g_object_set_data_full(G_OBJECT(window_), "vaelo-prompt", this,
                           [](gpointer self) { delete static_cast<PromptDialog*>(self); });
  }

  ~PromptDialog() override {
    for (const std::shared_ptr<TextField>& field : alert_->textFields()) field->setObserver(nullptr);
    for (const ViewRef& view : observed_) view->setObserver(nullptr);
  }

  GtkWindow* window() const { return GTK_WINDOW(window_); }

  void viewChanged(View&, ViewChange) override { show(); }
  void animationWillBegin(View&, const Animation&) override {}
  void animationDidEnd(View&) override {}
  void viewWillBeDestroyed(View&) override {}

 private:
  void build() {
    GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 12);
    for (void (*margin)(GtkWidget*, int) :
         {gtk_widget_set_margin_top, gtk_widget_set_margin_bottom, gtk_widget_set_margin_start, gtk_widget_set_margin_end}) {
      margin(box, 24);
    }
    addText(box, alert_->title(), "title-2");
    addText(box, alert_->message(), nullptr);
    for (const std::shared_ptr<TextField>& field : alert_->textFields()) {
      fields_.push_back(std::make_unique<MirroredField>(*field));
      field->setObserver(this);
      // What a field is for is written above it, where a screen reader doesn't look.
      if (field->accessibilityLabel().empty()) {
        gtk_accessible_update_property(GTK_ACCESSIBLE(fields_.back()->widget()), GTK_ACCESSIBLE_PROPERTY_LABEL,
                                       alert_->message().empty() ? alert_->title().c_str() : alert_->message().c_str(), -1);
      }
      gtk_box_append(GTK_BOX(box), fields_.back()->widget());
    }
    if (const ViewControllerRef& content = alert_->contentViewController()) addContent(box, content->view());
    addActions(box);
    GtkWidget* handle = gtk_window_handle_new();
    gtk_window_handle_set_child(GTK_WINDOW_HANDLE(handle), box);
    adw_window_set_content(ADW_WINDOW(window_), handle);
    GtkEventController* keys = gtk_event_controller_key_new();
    g_signal_connect(keys, "key-pressed",
                     G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType, GtkWindow* window) {
                       if (key == GDK_KEY_Escape) gtk_window_close(window);
                       return static_cast<gboolean>(key == GDK_KEY_Escape);
                     }),
                     window_);
    gtk_widget_add_controller(window_, keys);
    show();
  }

  static void addText(GtkWidget* box, const std::string& text, const char* style) {
    if (text.empty()) return;
    GtkWidget* label = gtk_label_new(text.c_str());
    gtk_label_set_wrap(GTK_LABEL(label), TRUE);
    gtk_label_set_justify(GTK_LABEL(label), GTK_JUSTIFY_CENTER);
    constexpr double phoneWidth = 32;  // characters of the usual size
    gtk_label_set_max_width_chars(GTK_LABEL(label), static_cast<int>(phoneWidth / std::max(textScale(), 1.0)));
    if (style) gtk_widget_add_css_class(label, style);
    gtk_box_append(GTK_BOX(box), label);
  }

  // Of a screen in a prompt the texts are shown, below each other.
  void addContent(GtkWidget* box, const ViewRef& view) {
    content_ = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
    contentView_ = view;
    observe(view);
    for (const ViewRef& subview : view->subviews()) {
      auto* label = dynamic_cast<Label*>(subview.get());
      if (!label) continue;
      observe(subview);
      texts_.push_back(std::make_unique<MirroredText>(*label));
      gtk_box_append(GTK_BOX(content_), texts_.back()->widget());
    }
    gtk_box_append(GTK_BOX(box), content_);
  }

  void observe(const ViewRef& view) {
    view->setObserver(this);
    observed_.push_back(view);
  }

  void addActions(GtkWidget* box) {
    GtkWidget* row = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 12);
    gtk_box_set_homogeneous(GTK_BOX(row), TRUE);
    for (const AlertActionRef& action : alert_->actions()) {
      GtkWidget* button = gtk_button_new_with_label(action->title().c_str());
      if (action->style() == AlertActionStyle::Default) gtk_widget_add_css_class(button, "suggested-action");
      if (action->style() == AlertActionStyle::Destructive) gtk_widget_add_css_class(button, "destructive-action");
      g_object_set_data(G_OBJECT(button), "vaelo-action", action.get());
      g_signal_connect_swapped(button, "clicked", G_CALLBACK(+[](PromptDialog* self, GtkButton* pressed) {
                                 self->pressed(g_object_get_data(G_OBJECT(pressed), "vaelo-action"));
                               }),
                               this);
      gtk_box_append(GTK_BOX(row), button);
      buttons_.push_back(button);
      tokens_.push_back(action->changed().connect([this](AlertAction&) { show(); }));
    }
    gtk_widget_set_margin_top(row, 12);
    gtk_box_append(GTK_BOX(box), row);
  }

  void pressed(gconstpointer action) {
    const auto kept = alert_;
    const std::vector<AlertActionRef> actions = kept->actions();
    for (const AlertActionRef& candidate : actions) {
      if (candidate.get() == action) kept->performAction(candidate);
    }
  }

  void show() {
    for (const auto& field : fields_) field->update();
    for (const auto& text : texts_) text->update();
    if (content_) gtk_widget_set_visible(content_, !contentView_->hidden());
    for (std::size_t i = 0; i < buttons_.size(); ++i) {
      gtk_widget_set_sensitive(buttons_[i], alert_->actions()[i]->enabled());
    }
  }

  std::shared_ptr<AlertController> alert_;
  GtkWidget* window_;
  GtkWidget* content_ = nullptr;
  ViewRef contentView_;
  std::vector<std::unique_ptr<MirroredField>> fields_;
  std::vector<std::unique_ptr<MirroredText>> texts_;
  std::vector<GtkWidget*> buttons_;
  std::vector<ViewRef> observed_;
  std::vector<std::shared_ptr<void>> tokens_;
};

}  // namespace

GtkWindow* showPromptDialog(const std::shared_ptr<AlertController>& alert, GtkWindow* over, std::function<void()> shown) {
  alert->view();
  auto* dialog = new PromptDialog(alert, over);
  gtk_window_present(dialog->window());
  alert->textFields().front()->becomeFirstResponder();
  // Whether a keyboard lies on the screen or on the table: its return key begins as enabled as the action it stands for.
  Platform::current().notifications.post({KeyboardWillShowNotification, KeyboardNotice().userInfo()});
  if (shown) shown();
  return dialog->window();
}

}  // namespace vaelo
