// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_screen.h"

#include <algorithm>

namespace vaelo {

PortableDocumentScreen::PortableDocumentScreen(const PreviewedDocument& document, DocumentViewEvents events)
    : document_(document),
      events_(std::move(events)),
      canvas_({[this](GtkSnapshot* snapshot, int page, const PageArea& area) { draw(snapshot, page, area); },
               [this] { moved(); }}),
      stack_(GTK_WIDGET(g_object_ref_sink(gtk_stack_new()))),
      scrolled_(gtk_scrolled_window_new()),
      gestures_(canvas_, scrolled_),
      indicator_([this](int page) {
        canvas_.showPage(page);
        gtk_widget_grab_focus(canvas_.widget());
      }),
      password_([this](const std::string& password) { load(password); }) {
  gtk_accessible_update_property(GTK_ACCESSIBLE(canvas_.widget()), GTK_ACCESSIBLE_PROPERTY_LABEL, document_.name.c_str(),
                                 -1);
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled_), canvas_.widget());
  GtkWidget* overlay = gtk_overlay_new();
  gtk_overlay_set_child(GTK_OVERLAY(overlay), scrolled_);
  gtk_overlay_add_overlay(GTK_OVERLAY(overlay), indicator_.widget());
  gtk_widget_set_vexpand(overlay, TRUE);
  gtk_stack_add_child(GTK_STACK(stack_), overlay);
  gtk_stack_add_child(GTK_STACK(stack_), password_.widget());
  GtkEventController* keys = gtk_event_controller_key_new();
  g_signal_connect(keys, "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state,
                                  PortableDocumentScreen* self) -> gboolean { return self->gestures_.key(key, state); }),
                   this);
  gtk_widget_add_controller(canvas_.widget(), keys);
  load("");
}

PortableDocumentScreen::~PortableDocumentScreen() { g_object_unref(stack_); }

void PortableDocumentScreen::load(const std::string& password) {
  if (!nextSource_) nextSource_ = std::make_unique<PortableDocumentSource>(document_.path);
  nextSource_->open(password, [this, password](const PortableDocumentSource::Opened& result) { opened(result, password); });
}

void PortableDocumentScreen::opened(const PortableDocumentSource::Opened& opened, const std::string& password) {
  if (opened.error == DecoderError::Locked) {
    gtk_stack_set_visible_child(GTK_STACK(stack_), password_.widget());
    if (!password.empty()) password_.refuse();
    return events_.shown();
  }
  if (!opened.error.empty()) return events_.failed(messageForDecoderError(opened.error));
  pictures_.reset();
  source_ = std::move(nextSource_);
  pictures_ = std::make_unique<PagesPictures>(*source_, [this] { pictureArrived(); });
  GtkWidget* page = gtk_widget_get_parent(stack_);
  if (page && gtk_widget_get_width(page) > 0) canvas_.expectWidth(gtk_widget_get_width(page));
  // A document that is read anew is shown where it was.
  const PagePlace top = canvas_.placeAt(0, 0);
  const bool isAnew = canvas_.layout().count() > 0;
  if (canvas_.layout().count() != opened.pages) canvas_.setCount(opened.pages);
  canvas_.setSizes(0, opened.sizes);
  if (isAnew) canvas_.showPage(top.page, top.y);
  gtk_stack_set_visible_child(GTK_STACK(stack_), gtk_widget_get_ancestor(scrolled_, GTK_TYPE_OVERLAY));
  askForSizes(opened.sizes.size());
}

// Page by page of them, between which what is looked at is rendered.
void PortableDocumentScreen::askForSizes(std::size_t known) {
  if (known >= static_cast<std::size_t>(canvas_.layout().count())) return;
  source_->ask("sizes " + std::to_string(known), [this, known](const DecoderProcess::Answer& answer) {
    const std::vector<PageSize> sizes = answer.error.empty() ? pageSizesIn(answer.text) : std::vector<PageSize>();
    if (sizes.empty()) return;
    canvas_.setSizes(static_cast<int>(known), sizes);
    askForSizes(known + sizes.size());
  });
}

void PortableDocumentScreen::moved() {
  if (!pictures_) return;
  const PagesLayout& layout = canvas_.layout();
  const auto [first, last] = canvas_.visiblePages();
  const int current = canvas_.currentPage();
  indicator_.show(current, layout.count());
  std::vector<PagesPictures::Wanted> wanted;
  for (int page = first; page <= last; ++page) {
    const PageArea area = canvas_.areaOf(page);
    const double zoom = canvas_.zoom();
    const double left = std::max(-area.x, 0.0) / zoom;
    const double top = std::max(-area.y, 0.0) / zoom;
    const double right = std::min(canvas_.width() - area.x, area.width) / zoom;
    const double bottom = std::min(canvas_.height() - area.y, area.height) / zoom;
    wanted.push_back(
        {page, layout.size(page), PageArea{left, top, std::max(right - left, 0.0), std::max(bottom - top, 0.0)}});
  }
  std::stable_sort(wanted.begin(), wanted.end(), [current](const auto& a, const auto& b) {
    return std::abs(a.page - current) < std::abs(b.page - current);
  });
  for (const int page : {last + 1, first - 1}) {
    if (page >= 0 && page < layout.count()) wanted.push_back({page, layout.size(page), std::nullopt});
  }
  pictures_->want(std::move(wanted), canvas_.zoom() * gtk_widget_get_scale_factor(stack_));
}

void PortableDocumentScreen::pictureArrived() {
  canvas_.redraw();
  if (shown_) return;
  shown_ = true;
  events_.shown();
}

void PortableDocumentScreen::draw(GtkSnapshot* snapshot, int page, const PageArea& area) {
  if (!pictures_) return;
  const std::string problem = pictures_->problemOf(page);
  if (!pictures_->draw(snapshot, page, area) && !problem.empty()) drawProblem(snapshot, problem, area);
}

void PortableDocumentScreen::drawProblem(GtkSnapshot* snapshot, const std::string& problem, const PageArea& area) {
  const bool slow = problem == DecoderError::TooSlow;
  const char* sentence = slow ? "Showing this page would take too long." : "This page is damaged and can’t be shown.";
  const GRef<PangoLayout> layout(gtk_widget_create_pango_layout(canvas_.widget(), sentence));
  const double margin = std::min(24.0, area.width / 8);
  pango_layout_set_width(layout.get(), static_cast<int>((area.width - 2 * margin) * PANGO_SCALE));
  pango_layout_set_alignment(layout.get(), PANGO_ALIGN_CENTER);
  pango_layout_set_wrap(layout.get(), PANGO_WRAP_WORD_CHAR);
  const graphene_point_t place = GRAPHENE_POINT_INIT(static_cast<float>(area.x + margin),
                                                     static_cast<float>(area.y + std::min(area.height / 3, 240.0)));
  const GdkRGBA grey = {0.3F, 0.3F, 0.3F, 1};
  gtk_snapshot_save(snapshot);
  gtk_snapshot_translate(snapshot, &place);
  gtk_snapshot_append_layout(snapshot, layout.get(), &grey);
  gtk_snapshot_restore(snapshot);
}

void PortableDocumentScreen::refresh() {
  nextSource_.reset();
  load("");
}

std::vector<GtkWidget*> PortableDocumentScreen::headerWidgets() { return {}; }

bool PortableDocumentScreen::toggleFind() { return false; }
bool PortableDocumentScreen::closeFind() { return false; }

}  // namespace vaelo
