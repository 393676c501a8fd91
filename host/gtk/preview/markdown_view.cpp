// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/markdown_view.h"

#include <adwaita.h>
#include <gtksourceview/gtksource.h>

#include <algorithm>
#include <cmath>

#include "host/gtk/preview/markdown_links.h"
#include "host/gtk/preview/markdown_load.h"
#include "host/gtk/preview/text_find_bar.h"
#include "host/gtk/preview/text_note.h"
#include "host/gtk/preview/text_view.h"
#include "host/gtk/preview/text_widgets.h"
#include "host/gtk/preview/text_zoom.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr int LeastMargin = 18;
constexpr int WidestText = 720;

class MarkdownView : public DocumentView {
 public:
  MarkdownView(const PreviewedDocument& document, DocumentViewEvents events)
      : document_(document),
        events_(std::move(events)),
        view_(makeTextWidget()),
        scrolled_(gtk_scrolled_window_new()),
        page_(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)),
        stack_(GTK_WIDGET(g_object_ref_sink(gtk_stack_new()))),
        note_(makePreviewNote()),
        find_(GTK_TEXT_VIEW(view_)),
        zoom_(view_),
        links_(
            GTK_TEXT_VIEW(view_),
            [this]() -> const std::vector<MarkdownLink>& { return current_ ? current_->links() : none_; },
            [this](const std::string& address) { open(address); }) {
    GtkTextView* text = GTK_TEXT_VIEW(view_);
    gtk_text_view_set_editable(text, FALSE);
    gtk_text_view_set_accepts_tab(text, FALSE);  // or the keyboard never leaves it
    gtk_text_view_set_cursor_visible(text, FALSE);
    gtk_text_view_set_wrap_mode(text, GTK_WRAP_WORD_CHAR);
    gtk_text_view_set_pixels_above_lines(text, 5);
    gtk_text_view_set_pixels_below_lines(text, 5);
    gtk_text_view_set_pixels_inside_wrap(text, 3);
    gtk_text_view_set_top_margin(text, LeastMargin);
    gtk_text_view_set_bottom_margin(text, LeastMargin);
    setMargins(0);
    showName();
    g_signal_connect(view_, "map", G_CALLBACK(+[](GtkWidget* view, gpointer) { gtk_widget_grab_focus(view); }), nullptr);
    gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled_), view_);
    gtk_widget_set_vexpand(scrolled_, TRUE);
    for (GtkWidget* child : {find_.widget(), scrolled_, note_}) gtk_box_append(GTK_BOX(page_), child);
    gtk_stack_add_child(GTK_STACK(stack_), page_);
    width_ = gtk_scrolled_window_get_hadjustment(GTK_SCROLLED_WINDOW(scrolled_));
    g_signal_connect_swapped(width_, "changed", G_CALLBACK(+[](MarkdownView* self) { self->widthChanged(); }), this);
    styleChange_ = g_signal_connect_swapped(adw_style_manager_get_default(), "notify::dark",
                                            G_CALLBACK(+[](MarkdownView* self) { self->applyStyle(); }), this);
    load();
  }

  ~MarkdownView() override {
    g_signal_handlers_disconnect_by_data(width_, this);
    g_clear_handle_id(&marginsIdle_, g_source_remove);
    g_signal_handler_disconnect(adw_style_manager_get_default(), styleChange_);
    // A source text's view leaves the stack before it goes.
    if (source_) gtk_stack_remove(GTK_STACK(stack_), source_->widget());
    gtk_text_view_set_buffer(GTK_TEXT_VIEW(view_), nullptr);  // the toolkit may keep the view for a while
    g_object_unref(stack_);
  }

  GtkWidget* widget() override { return stack_; }

  void refresh() override {
    if (source_) source_->refresh();
    if (!isSourceOnly_) load();
  }

  bool follow(const std::string& path, const std::string& name) override {
    if (next_ || (source_ && !source_->follow(path, name))) return false;
    document_.path = path;
    document_.name = name;
    showName();
    return true;
  }

  std::vector<GtkWidget*> headerWidgets() override {
    GtkWidget* find = gtk_button_new_from_icon_name("edit-find-symbolic");
    gtk_widget_set_tooltip_text(find, _("Find in This Document"));
    gtk_accessible_update_property(GTK_ACCESSIBLE(find), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Find in This Document"), -1);
    g_signal_connect_swapped(find, "clicked", G_CALLBACK(+[](MarkdownView* self) { self->toggleFind(); }), this);
    if (isSourceOnly_) return {find};
    GtkWidget* source = gtk_toggle_button_new();
    gtk_button_set_icon_name(GTK_BUTTON(source), "text-x-generic-symbolic");
    gtk_widget_set_tooltip_text(source, _("Show Source Text"));
    gtk_accessible_update_property(GTK_ACCESSIBLE(source), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Show Source Text"), -1);
    gtk_toggle_button_set_active(GTK_TOGGLE_BUTTON(source), showsSource());
    g_signal_connect(source, "toggled", G_CALLBACK(+[](GtkToggleButton* button, MarkdownView* self) {
                       self->showSource(gtk_toggle_button_get_active(button));
                     }),
                     this);
    return {find, source};
  }

  bool toggleFind() override {
    if (showsSource()) return source_->toggleFind();
    find_.toggle();
    return true;
  }
  bool closeFind() override { return showsSource() ? source_->closeFind() : find_.close(); }

 private:
  void showName() {
    gtk_accessible_update_property(GTK_ACCESSIBLE(view_), GTK_ACCESSIBLE_PROPERTY_LABEL, document_.name.c_str(), -1);
  }

  bool showsSource() const { return source_ && gtk_stack_get_visible_child(GTK_STACK(stack_)) == source_->widget(); }

  void load() {
    next_ = std::make_unique<MarkdownLoad>(
        document_.path, MarkdownLoad::Events{[this] { showNext(); }, [this](const std::string& error) { fail(error); }});
  }

  void showNext() {
    const int line = current_ ? firstVisibleLine() : 0;
    current_ = std::move(next_);
    applyStyle();
    GtkTextBuffer* buffer = GTK_TEXT_BUFFER(current_->buffer());
    find_.setBuffer(current_->buffer());
    gtk_text_view_set_buffer(GTK_TEXT_VIEW(view_), buffer);
    GtkTextIter place;
    gtk_text_buffer_get_iter_at_line(buffer, &place, line);
    gtk_text_buffer_place_cursor(buffer, &place);
    if (line > 0) gtk_text_view_scroll_to_mark(GTK_TEXT_VIEW(view_), gtk_text_buffer_get_insert(buffer), 0, TRUE, 0, 0);
    setPreviewNote(note_, current_->isEmpty() ? _("This document is empty.") : "");
    events_.shown();
  }

  int firstVisibleLine() const {
    GdkRectangle visible;
    gtk_text_view_get_visible_rect(GTK_TEXT_VIEW(view_), &visible);
    GtkTextIter place;
    gtk_text_view_get_line_at_y(GTK_TEXT_VIEW(view_), &place, visible.y, nullptr);
    return gtk_text_iter_get_line(&place);
  }

  // What is too long or too involved to be shown as it is meant, is text nevertheless.
  void fail(const std::string& error) {
    next_.reset();
    if (error == DecoderError::Gone || error == DecoderError::Unreadable)
      return events_.failed(messageForDecoderError(error));
    isSourceOnly_ = true;
    showSource(true);
  }

  void showSource(bool shows) {
    if (!shows) return gtk_stack_set_visible_child(GTK_STACK(stack_), page_);
    if (!source_) {
      DocumentViewEvents events;
      events.shown = [this] { events_.shown(); };
      events.failed = [this](const std::string& sentence) { events_.failed(sentence); };
      events.progress = [](const std::string&) {};
      events.shouldSave = [] { return false; };
      source_ = makeTextView(document_, std::move(events));
      gtk_stack_add_child(GTK_STACK(stack_), source_->widget());
    }
    gtk_stack_set_visible_child(GTK_STACK(stack_), source_->widget());
  }

  void open(const std::string& address) {
    GtkWindow* window = GTK_WINDOW(gtk_widget_get_ancestor(view_, GTK_TYPE_WINDOW));
    gtk_show_uri_full(
        window, address.c_str(), GDK_CURRENT_TIME, nullptr,
        +[](GObject* source, GAsyncResult* result, gpointer) {
          GError* error = nullptr;
          if (gtk_show_uri_full_finish(GTK_WINDOW(source), result, &error)) return;
          const GErrorPtr owned(error);
          GtkWidget* dialog = adw_message_dialog_new(GTK_WINDOW(source), _("The link couldn’t be opened."), error->message);
          adw_message_dialog_add_response(ADW_MESSAGE_DIALOG(dialog), "ok", _("OK"));
          gtk_window_present(GTK_WINDOW(dialog));
        },
        nullptr);
  }

  void applyStyle() {
    const bool isDark = adw_style_manager_get_dark(adw_style_manager_get_default());
    if (current_) current_->setDark(isDark);
    if (!current_) return;
    GtkSourceStyleSchemeManager* schemes = gtk_source_style_scheme_manager_get_default();
    gtk_source_buffer_set_style_scheme(
        current_->buffer(), gtk_source_style_scheme_manager_get_scheme(schemes, isDark ? "Adwaita-dark" : "Adwaita"));
  }

  // Margins can't change while the view is given its size.
  void widthChanged() {
    if (marginsIdle_) return;
    marginsIdle_ = g_idle_add_full(
        G_PRIORITY_HIGH_IDLE,
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<MarkdownView*>(data);
          self->marginsIdle_ = 0;
          self->setMargins(static_cast<int>(std::lround(gtk_adjustment_get_page_size(self->width_))));
          return G_SOURCE_REMOVE;
        },
        this, nullptr);
  }

  // Long lines are hard to read.
  void setMargins(int width) {
    const int margin = std::max(LeastMargin, (width - WidestText) / 2);
    gtk_text_view_set_left_margin(GTK_TEXT_VIEW(view_), margin);
    gtk_text_view_set_right_margin(GTK_TEXT_VIEW(view_), margin);
  }

  PreviewedDocument document_;
  DocumentViewEvents events_;
  GtkWidget* view_;
  GtkWidget* scrolled_;
  GtkWidget* page_;
  GtkWidget* stack_;
  GtkWidget* note_;
  TextFindBar find_;
  TextZoom zoom_;
  MarkdownLinks links_;
  const std::vector<MarkdownLink> none_;
  std::unique_ptr<MarkdownLoad> current_;
  std::unique_ptr<MarkdownLoad> next_;  // until its first screen is there
  std::unique_ptr<DocumentView> source_;
  bool isSourceOnly_ = false;
  GtkAdjustment* width_;
  guint marginsIdle_ = 0;
  gulong styleChange_ = 0;
};

}  // namespace

bool showsMarkdown(const std::string& contentType) {
  return contentType == "text/markdown" || contentType == "text/x-markdown";
}

std::unique_ptr<DocumentView> makeMarkdownView(const PreviewedDocument& document, DocumentViewEvents events) {
  return std::make_unique<MarkdownView>(document, std::move(events));
}

}  // namespace vaelo
