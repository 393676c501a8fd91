// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_view.h"

#include <adwaita.h>
#include <gtksourceview/gtksource.h>

#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/text_find_bar.h"
#include "host/gtk/preview/text_load.h"
#include "host/gtk/preview/text_note.h"
#include "host/gtk/preview/text_widgets.h"
#include "host/gtk/preview/text_zoom.h"
#include "host/support/texts.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

std::string noteFor(const TextPiece& piece) {
  std::string note;
  if (piece.documentBytes == 0 && piece.last) note = _("This document is empty.");
  if (piece.shortened) {
    Formatting& formatting = Platform::current().formatting;
    note =
        filled(_("Only the first %s of %s are shown."), {formatting.byteCount(piece.bytesRead, ByteCountStyle::File),
                                                         formatting.byteCount(piece.documentBytes, ByteCountStyle::File)});
  }
  if (!piece.brokeLines) return note;
  const char* broken = _("Lines that are too long go on in the next line.");
  return note.empty() ? broken : sentences(note, broken);
}

std::string sentenceFor(const std::string& error) {
  if (error == DecoderError::Unsupported) return _("This document’s name says text, but its content isn’t.");
  return messageForDecoderError(error);
}

class TextView : public DocumentView {
 public:
  TextView(const PreviewedDocument& document, DocumentViewEvents events)
      : document_(document),
        events_(std::move(events)),
        view_(makeTextWidget()),
        scrolled_(gtk_scrolled_window_new()),
        box_(GTK_WIDGET(g_object_ref_sink(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)))),
        note_(makePreviewNote()),
        find_(GTK_TEXT_VIEW(view_)),
        zoom_(view_) {
    GtkTextView* text = GTK_TEXT_VIEW(view_);
    gtk_text_view_set_editable(text, FALSE);
    gtk_text_view_set_accepts_tab(text, FALSE);  // or the keyboard never leaves it
    gtk_text_view_set_cursor_visible(text, FALSE);
    gtk_text_view_set_monospace(text, TRUE);
    gtk_text_view_set_wrap_mode(text, GTK_WRAP_WORD_CHAR);
    gtk_text_view_set_left_margin(text, 12);
    gtk_text_view_set_right_margin(text, 12);
    gtk_text_view_set_top_margin(text, 12);
    gtk_text_view_set_bottom_margin(text, 12);
    showName();
    gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled_), view_);
    gtk_widget_set_vexpand(scrolled_, TRUE);
    for (GtkWidget* child : {find_.widget(), scrolled_, note_}) gtk_box_append(GTK_BOX(box_), child);
    styleChange_ = g_signal_connect_swapped(adw_style_manager_get_default(), "notify::dark",
                                            G_CALLBACK(+[](TextView* self) { self->applyStyle(); }), this);
    refresh();
  }

  ~TextView() override {
    g_signal_handler_disconnect(adw_style_manager_get_default(), styleChange_);
    gtk_text_view_set_buffer(GTK_TEXT_VIEW(view_), nullptr);  // the toolkit may keep the view for a while
    gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled_), nullptr);
    dropLineNumbers();
    g_object_unref(box_);
  }

  GtkWidget* widget() override { return box_; }

  void refresh() override {
    next_ = std::make_unique<TextLoad>(
        document_.path, document_.name, document_.contentType,
        TextLoad::Events{[this] { next_ ? showNext() : showNote(); }, [this](const std::string& error) { fail(error); }});
  }

  bool follow(const std::string& path, const std::string& name) override {
    if (next_) return false;
    document_.path = path;
    document_.name = name;
    showName();
    return true;
  }

  std::vector<GtkWidget*> headerWidgets() override {
    return {makeFindButton(G_CALLBACK(+[](TextView* self) { self->toggleFind(); }), this)};
  }

  bool toggleFind() override {
    find_.toggle();
    return true;
  }
  bool closeFind() override { return find_.close(); }

 private:
  void showName() {
    gtk_accessible_update_property(GTK_ACCESSIBLE(view_), GTK_ACCESSIBLE_PROPERTY_LABEL, document_.name.c_str(), -1);
  }

  // What counts the lines keeps the view, which keeps it: neither would ever go by itself. So does what it knew of the lines
  // when it was painted last, of which it lets go when it is painted with nothing to be painted.
  void dropLineNumbers() {
    GtkSourceGutter* gutter = gtk_source_view_get_gutter(GTK_SOURCE_VIEW(view_), GTK_TEXT_WINDOW_LEFT);
    GtkWidget* next = nullptr;
    for (GtkWidget* each = gtk_widget_get_first_child(GTK_WIDGET(gutter)); each; each = next) {
      next = gtk_widget_get_next_sibling(each);
      if (GTK_SOURCE_IS_GUTTER_RENDERER(each)) gtk_source_gutter_remove(gutter, GTK_SOURCE_GUTTER_RENDERER(each));
    }
    const GRef<GtkSnapshot> nothing(gtk_snapshot_new());
    GTK_WIDGET_GET_CLASS(gutter)->snapshot(GTK_WIDGET(gutter), nothing.get());
  }

  // A document read anew takes the old one's place when what the user looks at is there.
  void showNext() {
    GtkTextBuffer* buffer = GTK_TEXT_BUFFER(next_->buffer());
    const int line = current_ ? firstVisibleLine() : 0;
    const int lines = gtk_text_buffer_get_line_count(buffer);
    constexpr int screen = 200;
    if (!next_->finished() && current_ && lines < line + screen) return;
    current_ = std::move(next_);
    applyStyle();
    find_.setBuffer(current_->buffer());
    gtk_text_view_set_buffer(GTK_TEXT_VIEW(view_), buffer);
    gtk_source_view_set_show_line_numbers(GTK_SOURCE_VIEW(view_), current_->isSource() && !current_->progress().brokeLines);
    GtkTextIter place;
    gtk_text_buffer_get_iter_at_line(buffer, &place, line);
    gtk_text_buffer_place_cursor(buffer, &place);
    if (line > 0) gtk_text_view_scroll_to_mark(GTK_TEXT_VIEW(view_), gtk_text_buffer_get_insert(buffer), 0, TRUE, 0, 0);
    showNote();
    events_.shown();
  }

  int firstVisibleLine() const {
    GdkRectangle visible;
    gtk_text_view_get_visible_rect(GTK_TEXT_VIEW(view_), &visible);
    GtkTextIter place;
    gtk_text_view_get_line_at_y(GTK_TEXT_VIEW(view_), &place, visible.y, nullptr);
    return gtk_text_iter_get_line(&place);
  }

  void showNote() {
    const TextPiece& progress = current_->progress();
    setPreviewNote(note_, noteFor(progress));
    // The numbers of broken lines would be wrong.
    if (progress.brokeLines) gtk_source_view_set_show_line_numbers(GTK_SOURCE_VIEW(view_), FALSE);
  }

  void fail(const std::string& error) {
    const std::unique_ptr<TextLoad> failed = std::move(next_);
    events_.failed(sentenceFor(error));
  }

  void applyStyle() {
    if (!current_) return;
    const char* name = adw_style_manager_get_dark(adw_style_manager_get_default()) ? "Adwaita-dark" : "Adwaita";
    GtkSourceStyleSchemeManager* schemes = gtk_source_style_scheme_manager_get_default();
    gtk_source_buffer_set_style_scheme(current_->buffer(), gtk_source_style_scheme_manager_get_scheme(schemes, name));
  }

  PreviewedDocument document_;
  DocumentViewEvents events_;
  GtkWidget* view_;
  GtkWidget* scrolled_;
  GtkWidget* box_;
  GtkWidget* note_;
  TextFindBar find_;
  TextZoom zoom_;
  std::unique_ptr<TextLoad> current_;
  std::unique_ptr<TextLoad> next_;  // until it takes the other's place
  gulong styleChange_ = 0;
};

}  // namespace

bool showsText(const std::string& contentType) {
  return contentType.starts_with("text/") || contentType == "application/x-zerosize" ||
         g_content_type_is_a(contentType.c_str(), "text/plain");
}

std::unique_ptr<DocumentView> makeTextView(const PreviewedDocument& document, DocumentViewEvents events) {
  return std::make_unique<TextView>(document, std::move(events));
}

}  // namespace vaelo
