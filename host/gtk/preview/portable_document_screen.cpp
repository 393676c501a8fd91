// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_screen.h"

#include <fcntl.h>

#include <algorithm>
#include <utility>

#include "host/decoder/document_words.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr GdkRGBA SelectionColour = {0.21F, 0.52F, 0.89F, 0.35F};
constexpr GdkRGBA FoundColour = {1, 0.85F, 0, 0.45F};
constexpr GdkRGBA CurrentColour = {1, 0.45F, 0, 0.6F};
constexpr double TouchReach = 8;  // pixels around the place that is touched

}  // namespace

PortableDocumentScreen::PortableDocumentScreen(const PreviewedDocument& document, DocumentViewEvents events,
                                               FileCoordination* coordination)
    : document_(document),
      events_(std::move(events)),
      coordination_(coordination),
      canvas_({[this](GtkSnapshot* snapshot, int page, const PageArea& area) { draw(snapshot, page, area); },
               [this] { moved(); }}),
      stack_(GTK_WIDGET(g_object_ref_sink(gtk_stack_new()))),
      pages_(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)),
      scrolled_(gtk_scrolled_window_new()),
      notice_(stack_.get()),
      gestures_(canvas_, scrolled_),
      findBar_(canvas_.widget(), {[this](const std::string& text) { find_.search(text, canvas_.currentPage()); },
                                  [this](bool forward) { find_.step(forward); }}),
      find_({[this] { showFound(); },
             [this](int page, const PageRect& place) {
               canvas_.reveal(page, place.left, place.top, place.right, place.bottom);
             }}),
      selecting_(canvas_, pages_,
                 {[this](int page) { return texts_ ? texts_->of(page) : nullptr; }, [this] { return markup_.mayMark(); },
                  [this](int page, std::vector<PageRect> lines) { markup_.highlight(page, std::move(lines)); }}),
      markup_(
          canvas_, pages_,
          {[this] { return events_.shouldSave(); }, notice_.teller(), [this] { toolChosen(); }, [this] { marksChanged(); },
           [this] {
             if (std::exchange(refreshWhenSaved_, false)) refresh();
           }}),
      linkPopover_(pages_, canvas_.widget()),
      buttons_(markup_.bar(), G_CALLBACK(+[](PortableDocumentScreen* self) { self->toggleFind(); }), this),
      pointer_(
          canvas_,
          {[this](bool finger) { return source_ && (!finger || markup_.tool() != MarkTool::None); },
           [this](double x, double y, int presses) { press(x, y, presses); }, [this](double x, double y) { drag(x, y); },
           [this](bool cancelled) { release(cancelled); }, [this](double x, double y) { longPress(x, y); },
           [this](double x, double y) { selecting_.showMenu(x, y); }, [this](double x, double y) { click(x, y); },
           [this] { return markup_.tool() == MarkTool::None || markup_.tool() == MarkTool::Highlight; }}),
      indicator_([this](int page) {
        canvas_.showPage(page);
        gtk_widget_grab_focus(canvas_.widget());
      }),
      password_([this](const std::string& password) { load(password); }),
      reading_(canvas_, [this](int page) { return texts_ ? texts_->of(page) : nullptr; }) {
  gtk_stack_set_hhomogeneous(GTK_STACK(stack_.get()), FALSE);  // what doesn't show asks for no room
  gtk_stack_add_child(GTK_STACK(stack_.get()), pages_);
  showName();
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled_), canvas_.widget());
  GtkWidget* overlay = gtk_overlay_new();
  gtk_overlay_set_child(GTK_OVERLAY(overlay), scrolled_);
  gtk_overlay_add_overlay(GTK_OVERLAY(overlay), indicator_.widget());
  gtk_widget_set_vexpand(overlay, TRUE);
  for (GtkWidget* child : {findBar_.widget(), markup_.bar().widget(), overlay}) gtk_box_append(GTK_BOX(pages_), child);
  gtk_stack_add_child(GTK_STACK(stack_.get()), password_.widget());
  GtkEventController* keys = gtk_event_controller_key_new();
  g_signal_connect(keys, "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state,
                                  PortableDocumentScreen* self) -> gboolean { return self->key(key, state); }),
                   this);
  gtk_widget_add_controller(canvas_.widget(), keys);
  load("");
}

PortableDocumentScreen::~PortableDocumentScreen() = default;

void PortableDocumentScreen::load(const std::string& password) {
  if (!nextSource_) nextSource_ = std::make_unique<PortableDocumentSource>(document_.path, document_.patience);
  nextSource_->open(password, [this, password](const PortableDocumentSource::Opened& result) { opened(result, password); });
}

void PortableDocumentScreen::opened(const PortableDocumentSource::Opened& opened, const std::string& password) {
  if (opened.error == DecoderError::Locked) {
    gtk_stack_set_visible_child(GTK_STACK(stack_.get()), password_.widget());
    if (!password.empty()) password_.refuse();
    return events_.shown();
  }
  if (!opened.error.empty()) return events_.failed(messageForDecoderError(opened.error));
  pictures_.reset();
  texts_.reset();
  links_.reset();
  find_.setSource(nullptr, 0);
  selecting_.clear();
  source_ = std::move(nextSource_);
  texts_ = std::make_unique<PagesTexts>(*source_, [this] {
    selecting_.textRead();
    reading_.update();
  });
  links_ = std::make_unique<PagesLinks>(*source_);
  pictures_ = std::make_unique<PagesPictures>(*source_, [this] { pictureArrived(); });
  GtkWidget* page = gtk_widget_get_parent(stack_.get());
  if (page && gtk_widget_get_width(page) > 0) {
    canvas_.expectWidth(gtk_widget_get_width(page));
    buttons_.fit(gtk_widget_get_width(page));  // before they are shown, or the window would be made wider for them
  }
  // A document that is read anew is shown where it was.
  const PagePlace top = canvas_.placeAt(0, 0);
  const bool isAnew = canvas_.layout().count() > 0;
  if (canvas_.layout().count() != opened.pages) canvas_.setCount(opened.pages);
  canvas_.setSizes(0, opened.sizes);
  if (isAnew) canvas_.showPage(top.page, top.y);
  gtk_stack_set_visible_child(GTK_STACK(stack_.get()), pages_);
  beginMarkup(opened.mayBeMarked);
  find_.setSource(source_.get(), opened.pages);
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
  buttons_.fit(static_cast<int>(canvas_.width()));
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
  pictures_->want(std::move(wanted), canvas_.zoom() * gtk_widget_get_scale_factor(stack_.get()));
  reading_.update();
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
  const PageOverlay overlay(snapshot, area, canvas_.zoom());
  markup_.draw(overlay, page);
  overlay.fill(selecting_.selection().rectsOn(page), SelectionColour);
  const std::vector<PageRect>& found = find_.placesOn(page);
  for (std::size_t i = 0; i < found.size(); ++i) {
    overlay.fill({found[i]}, find_.isCurrent(page, i) ? CurrentColour : FoundColour);
  }
}

void PortableDocumentScreen::drawProblem(GtkSnapshot* snapshot, const std::string& problem, const PageArea& area) {
  const bool slow = problem == DecoderError::TooSlow;
  const char* sentence = slow ? _("Showing this page would take too long.") : _("This page is damaged and can’t be shown.");
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

// What was saved here is on the screen already. While it is being saved it can't be told from what others write, and what
// could not be saved is nowhere else.
void PortableDocumentScreen::refresh() {
  refreshWhenSaved_ = markup_.isSaving() || markup_.isUnsaved();
  if (refreshWhenSaved_ || markup_.wrote(document_.path)) return;
  nextSource_.reset();
  load("");
}

bool PortableDocumentScreen::follow(const std::string& path, const std::string& name) {
  if (nextSource_) return false;
  document_.path = path;
  document_.name = name;
  showName();
  return true;
}

void PortableDocumentScreen::showName() {
  gtk_accessible_update_property(GTK_ACCESSIBLE(canvas_.widget()), GTK_ACCESSIBLE_PROPERTY_LABEL, document_.name.c_str(),
                                 -1);
}

void PortableDocumentScreen::beginMarkup(bool mayBeMarked) {
  UniqueFd file(source_->file() ? ::fcntl(source_->file().get(), F_DUPFD_CLOEXEC, 3) : -1);
  if (!document_.mayBeEdited || !mayBeMarked || !file) return markup_.end();
  markup_.begin({document_.path, document_.name, source_->password(), std::move(file), source_->version(), coordination_});
}

std::vector<GtkWidget*> PortableDocumentScreen::headerWidgets() {
  if (document_.mayBeEdited) return {buttons_.make()};
  return {makeFindButton(G_CALLBACK(+[](PortableDocumentScreen* self) { self->toggleFind(); }), this)};
}

bool PortableDocumentScreen::toggleFind() {
  if (!source_) return false;
  findBar_.toggle();
  return true;
}

bool PortableDocumentScreen::closeFind() {
  if (findBar_.close()) return true;
  if (markup_.tool() != MarkTool::None) {
    markup_.bar().putToolAway();
    return true;
  }
  if (markup_.bar().isOpen()) {
    markup_.bar().open(false);
    return true;
  }
  return selecting_.clear();
}

void PortableDocumentScreen::showFound() {
  canvas_.redraw();
  const int count = find_.count();
  const bool nothing = count == 0 && !find_.isSearching() && !find_.text().empty();
  std::string text = nothing ? _("Not found") : "";
  if (find_.isSearching() && count == 0) text = _("Searching…");
  if (count > 0) {
    // TRANSLATORS: the number of a place where the text was found, and of how many; with "…" there may be more.
    text = filled(find_.isSearching() ? _("%s of %s…") : _("%s of %s"), {numberText(find_.position()), numberText(count)});
  }
  findBar_.showCount(text, nothing);
}

bool PortableDocumentScreen::key(guint key, GdkModifierType state) {
  if (!source_) return false;
  if ((state & GDK_CONTROL_MASK) && key == GDK_KEY_z && markup_.undo()) return true;
  const bool isEnter = key == GDK_KEY_Return || key == GDK_KEY_KP_Enter || key == GDK_KEY_space;
  if (isEnter && markup_.tool() == MarkTool::Note) {
    markup_.askForNote(canvas_.width() / 2, canvas_.height() / 3);
    return true;
  }
  return selecting_.key(key, state) || gestures_.key(key, state);
}

void PortableDocumentScreen::toolChosen() {
  const MarkTool tool = markup_.tool();
  // One finger draws then instead of scrolling; two fingers still zoom.
  gtk_scrolled_window_set_kinetic_scrolling(GTK_SCROLLED_WINDOW(scrolled_), tool == MarkTool::None);
  const char* cursor = tool == MarkTool::Ink ? "crosshair" : tool == MarkTool::Note ? "cell" : "text";
  gtk_widget_set_cursor_from_name(canvas_.widget(), tool == MarkTool::None ? nullptr : cursor);
  if (tool == MarkTool::Highlight) return selecting_.highlight();
  if (tool != MarkTool::None) selecting_.clear();
}

void PortableDocumentScreen::press(double x, double y, int presses) {
  longPressed_ = false;
  if (markup_.tool() == MarkTool::Ink) return markup_.press(x, y);
  if (markup_.tool() == MarkTool::Note) return markup_.askForNote(x, y);
  selecting_.begin(x, y, presses);
}

void PortableDocumentScreen::drag(double x, double y) {
  if (markup_.tool() == MarkTool::Ink) return markup_.drag(x, y);
  if (markup_.tool() != MarkTool::Note) selecting_.extend(x, y);
}

void PortableDocumentScreen::release(bool cancelled) {
  if (markup_.tool() == MarkTool::Ink) return markup_.release(cancelled);
  if (markup_.tool() == MarkTool::Highlight && !cancelled) selecting_.highlight();
  if (!longPressed_ || cancelled) return;
  longPressed_ = false;
  selecting_.showMenu(lastX_, lastY_);
}

// A finger has no other button: the menu comes when it is lifted.
void PortableDocumentScreen::longPress(double x, double y) {
  if (!source_) return;
  selecting_.begin(x, y, 2);
  longPressed_ = true;
  lastX_ = x;
  lastY_ = y;
}

void PortableDocumentScreen::click(double x, double y) {
  if (!links_ || markup_.tool() != MarkTool::None || canvas_.layout().count() == 0) return;
  double left = 0;
  double top = 0;
  gtk_widget_translate_coordinates(canvas_.widget(), pages_, x, y, &left, &top);
  const GdkRectangle pointed = {static_cast<int>(left), static_cast<int>(top), 1, 1};
  const PagePlace place = canvas_.placeAt(x, y);
  ++clicks_;
  const auto made = [this, place] { return markup_.markAt(place, TouchReach / canvas_.zoom()); };
  if (made() && made()->kind == PageMark::Kind::Note) return markup_.offer(*made(), pointed);
  links_->at(place, [this, place, pointed, made](const PageLink* link) {
    // What is highlighted may be a link all the same.
    if (link && link->kind != PageLink::Kind::Note) return follow(*link, pointed);
    if (made()) return markup_.offer(*made(), pointed);
    if (markup_.mayMark()) return askForMark(place, pointed);
    if (link) follow(*link, pointed);
  });
}

void PortableDocumentScreen::follow(const PageLink& link, const GdkRectangle& place) {
  if (link.kind == PageLink::Kind::Page) {
    canvas_.showPage(link.page, link.top);
  } else if (link.kind == PageLink::Kind::Address) {
    linkPopover_.showAddress(place, link.text);
  } else {
    linkPopover_.showNote(place, link.text);
  }
}

// Of the marks that the file has.
void PortableDocumentScreen::askForMark(const PagePlace& place, const GdkRectangle& pointed) {
  std::string request = "touched " + std::to_string(place.page);
  for (const double number : {place.x, place.y, TouchReach / canvas_.zoom()}) appendNumber(request, number);
  source_->ask(std::move(request),
               [this, page = place.page, pointed, click = clicks_](const DecoderProcess::Answer& answer) {
                 const std::optional<TouchedMark> touched = touchedMarkIn(page, answer.text);
                 // Whoever went on meanwhile has something else in mind.
                 if (!touched || click != clicks_ || markup_.tool() != MarkTool::None) return;
                 if (touched->mayBeChanged) return markup_.offer(touched->mark, pointed);
                 if (touched->mark.kind == PageMark::Kind::Note) linkPopover_.showNote(pointed, touched->mark.text);
               });
}

void PortableDocumentScreen::marksChanged() {
  if (pictures_ && markup_.marks()) pictures_->hide(markup_.marks()->edits().removed());
}

}  // namespace vaelo
