// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_markup.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "host/support/texts.h"

namespace vaelo {

namespace {
constexpr double PenWidth = 2.5;      // points
constexpr double ShortestMove = 0.7;  // pixels; less adds nothing to a line
}  // namespace

PortableDocumentMarkup::PortableDocumentMarkup(PagesCanvas& canvas, GtkWidget* host, Events events)
    : canvas_(canvas),
      host_(host),
      events_(std::move(events)),
      bar_({[this](MarkTool) { events_.toolChosen(); }, [this] { undo(); },
            [this](bool open) {
              note_.finish();
              if (marks_ && !open) marks_->save();
              if (!open) gtk_widget_grab_focus(canvas_.widget());
            }}),
      note_(host, canvas.widget()),
      popover_(host, canvas.widget()) {}

PortableDocumentMarkup::~PortableDocumentMarkup() { end(); }

void PortableDocumentMarkup::begin(PortableDocumentMarks::Document document) {
  popover_.close();
  // What is being written is meant for the place that it was asked for, which is still on the page.
  if (marks_) std::exchange(marks_, nullptr)->leave();
  stroke_.reset();
  marks_ =
      PortableDocumentMarks::make(std::move(document), {[this] { changed(); }, events_.tell, [this] { note_.finish(); }});
  bar_.offer(true);
  bar_.show(marks_->state(), false);
}

void PortableDocumentMarkup::end() {
  popover_.close();
  note_.finish();
  stroke_.reset();
  if (marks_) std::exchange(marks_, nullptr)->leave();
  bar_.offer(false);
}

void PortableDocumentMarkup::changed() {
  bar_.show(marks_->state(), !marks_->edits().empty());
  canvas_.redraw();
  events_.changed();
  if (!isSaving() && !isUnsaved()) events_.settled();
}

bool PortableDocumentMarkup::maySave() {
  if (!marks_) return false;
  if (events_.shouldSave()) return true;
  events_.tell(_("This document can’t be changed."));
  return false;
}

bool PortableDocumentMarkup::add(std::vector<PageMark> marks) {
  if (marks.empty() || !maySave()) return false;
  for (PageMark& mark : marks) marks_->add(std::move(mark));
  return true;
}

bool PortableDocumentMarkup::highlight(int page, std::vector<PageRect> lines) {
  if (lines.empty()) return false;
  PageMark mark;
  mark.page = page;
  constexpr std::size_t mostLines = 1500;  // of a request
  lines.resize(std::min(lines.size(), mostLines));
  mark.lines = std::move(lines);
  return add({std::move(mark)});
}

std::array<double, 2> PortableDocumentMarkup::placeOn(int page, double x, double y) const {
  const PageArea area = canvas_.areaOf(page);
  const PageSize& size = canvas_.layout().size(page);
  return {std::clamp((x - area.x) / canvas_.zoom(), 0.0, size.width),
          std::clamp((y - area.y) / canvas_.zoom(), 0.0, size.height)};
}

void PortableDocumentMarkup::press(double x, double y) {
  if (canvas_.layout().count() == 0) return;
  stroke_.emplace();
  stroke_->kind = PageMark::Kind::Ink;
  stroke_->page = canvas_.placeAt(x, y).page;
  stroke_->width = PenWidth;
  stroke_->points = {placeOn(stroke_->page, x, y)};
  stroke_->colour = PageMark::InkColour;
  canvas_.redraw();
}

void PortableDocumentMarkup::drag(double x, double y) {
  if (!stroke_) return;
  const std::array<double, 2> place = placeOn(stroke_->page, x, y);
  const std::array<double, 2>& last = stroke_->points.back();
  if (std::hypot(place[0] - last[0], place[1] - last[1]) * canvas_.zoom() < ShortestMove) return;
  stroke_->points.push_back(place);
  canvas_.redraw();
}

void PortableDocumentMarkup::release(bool cancelled) {
  const std::optional<PageMark> drawn = std::exchange(stroke_, std::nullopt);
  if (drawn && !cancelled) add(inkOf(drawn->page, drawn->points, drawn->width));
  canvas_.redraw();
}

void PortableDocumentMarkup::askForNote(double x, double y) {
  if (!marks_ || canvas_.layout().count() == 0) return;
  const int page = canvas_.placeAt(x, y).page;
  std::array<double, 2> place = placeOn(page, x, y);
  // The whole note is on the page.
  const PageSize& size = canvas_.layout().size(page);
  place[0] = std::clamp(place[0], 0.0, std::max(size.width - PageMark::NoteSide, 0.0));
  place[1] = std::clamp(place[1], 0.0, std::max(size.height - PageMark::NoteSide, 0.0));
  double hostX = 0;
  double hostY = 0;
  gtk_widget_translate_coordinates(canvas_.widget(), host_, x, y, &hostX, &hostY);
  const GdkRectangle pointed = {static_cast<int>(hostX), static_cast<int>(hostY), 1, 1};
  note_.ask(pointed, [this, page, place](const std::string& text) { add({noteOf(page, place[0], place[1], text)}); });
}

bool PortableDocumentMarkup::undo() {
  if (!marks_ || marks_->edits().empty() || !maySave()) return false;
  return marks_->undo();
}

void PortableDocumentMarkup::draw(const PageOverlay& overlay, int page) const {
  if (marks_) {
    for (const PageMark& mark : marks_->edits().marks()) {
      if (mark.page == page) overlay.draw(mark, canvas_.width(), canvas_.height());
    }
  }
  if (stroke_ && stroke_->page == page) overlay.draw(*stroke_, canvas_.width(), canvas_.height());
}

bool PortableDocumentMarkup::isUnsaved() const {
  using State = PortableDocumentMarks::State;
  return marks_ && (marks_->state() == State::Unsaved || marks_->state() == State::Failed);
}

const PageMark* PortableDocumentMarkup::markAt(const PagePlace& place, double reach) const {
  if (!marks_) return nullptr;
  const std::vector<PageMark>& all = marks_->edits().marks();
  const auto hit = std::find_if(all.rbegin(), all.rend(), [&](const PageMark& mark) {
    return mark.page == place.page && isMarkAt(mark, place.x, place.y, reach);
  });
  return hit == all.rend() ? nullptr : &*hit;
}

void PortableDocumentMarkup::offer(PageMark mark, const GdkRectangle& pointed) {
  if (!marks_) return;
  const auto& changed = marks_->edits().changed();
  const auto now = std::find_if(changed.begin(), changed.end(), [&](const auto& each) { return each.mark.isSame(mark); });
  if (now != changed.end() && now->removed) return;
  if (now != changed.end()) mark.text = now->mark.text;
  MarkPopover::Events events;
  events.remove = [this, mark] {
    if (maySave()) marks_->remove(mark);
  };
  if (mark.text.size() <= PageMark::LongestNote) events.edit = [this, mark, pointed] { rewrite(mark, pointed); };
  popover_.show(pointed, mark, std::move(events));
}

void PortableDocumentMarkup::rewrite(const PageMark& mark, const GdkRectangle& pointed) {
  note_.ask(
      pointed,
      [this, mark](const std::string& text) {
        if (text != mark.text && maySave()) marks_->rewrite(mark, noteText(text));
      },
      mark.text);
}

}  // namespace vaelo
