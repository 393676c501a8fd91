// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_marks.h"

#include <fcntl.h>

#include <algorithm>
#include <utility>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr guint SavedAfter = 800;  // milliseconds; who draws lifts the pen between two lines
constexpr std::chrono::seconds SavingTakes(60);
constexpr gint64 FinishingTakes = 20 * G_TIME_SPAN_SECOND;

std::vector<PortableDocumentMarks*>& living() {
  static std::vector<PortableDocumentMarks*> all;
  return all;
}

std::string sentenceFor(const std::string& error) {
  if (error == DecoderError::TooBig) return _("This document is too large to be marked.");
  if (error == DecoderError::Unsupported) return _("Marks can’t be written into this document.");
  return _("The marks couldn’t be saved.");
}

}  // namespace

std::shared_ptr<PortableDocumentMarks> PortableDocumentMarks::make(Document document, Events events) {
  return std::shared_ptr<PortableDocumentMarks>(new PortableDocumentMarks(std::move(document), std::move(events)));
}

PortableDocumentMarks::PortableDocumentMarks(Document document, Events events)
    : document_(std::move(document)), events_(std::move(events)), version_(document_.version) {
  living().push_back(this);
}

PortableDocumentMarks::~PortableDocumentMarks() {
  g_clear_handle_id(&timer_, g_source_remove);
  living().erase(std::find(living().begin(), living().end(), this));
}

void PortableDocumentMarks::changed(State state) {
  state_ = state;
  if (events_.changed) events_.changed();
}

void PortableDocumentMarks::add(PageMark mark) {
  edits_.add(std::move(mark));
  saveSoon();
}

void PortableDocumentMarks::remove(const PageMark& mark) {
  edits_.remove(mark);
  saveSoon();
}

void PortableDocumentMarks::rewrite(const PageMark& mark, std::string text) {
  edits_.rewrite(mark, std::move(text));
  saveSoon();
}

bool PortableDocumentMarks::undo() {
  if (!edits_.undo()) return false;
  saveSoon();
  return true;
}

void PortableDocumentMarks::saveSoon() {
  unsaved_ = true;
  g_clear_handle_id(&timer_, g_source_remove);
  timer_ = g_timeout_add(
      SavedAfter,
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<PortableDocumentMarks*>(data);
        self->timer_ = 0;
        self->save();
        return G_SOURCE_REMOVE;
      },
      this);
  changed(state_ == State::Saving ? State::Saving : State::Unsaved);
}

void PortableDocumentMarks::save() {
  if (!unsaved_ || process_ || state_ == State::Saving) return;
  g_clear_handle_id(&timer_, g_source_remove);
  unsaved_ = false;
  sent_ = edits_.requests();
  if (sent_.empty() && !saved_) return changed(State::Unchanged);
  next_ = 0;
  process_ = std::make_unique<DecoderProcess>("document", document_.path,
                                              UniqueFd(::fcntl(document_.file.get(), F_DUPFD_CLOEXEC, 3)));
  process_->ask(
      "open " + document_.password,
      [self = shared_from_this()](const DecoderProcess::Answer& answer) { self->takeNext(answer); }, SavingTakes);
  changed(State::Saving);
}

// One after the other, since a decoder that hasn't read them yet would block whoever sends it many.
void PortableDocumentMarks::takeNext(const DecoderProcess::Answer& answer) {
  if (!answer.error.empty()) return fail(sentenceFor(answer.error));
  const auto self = shared_from_this();
  if (next_ < sent_.size()) {
    return process_->ask(
        "mark " + sent_[next_++], [self](const DecoderProcess::Answer& taken) { self->takeNext(taken); }, SavingTakes);
  }
  process_->ask(
      "save", [self](DecoderProcess::Answer saved) { self->write(std::move(saved)); }, SavingTakes);
}

void PortableDocumentMarks::write(DecoderProcess::Answer answer) {
  if (!answer.error.empty() || !answer.file) return fail(sentenceFor(answer.error));
  process_.reset();
  struct Job {
    std::shared_ptr<PortableDocumentMarks> marks;
    MarkedFile place;
    UniqueFd content;
    MarkedFile::Result result;
  };
  const int current = saved_ ? saved_.get() : document_.file.get();
  MarkedFile place(document_.path, current, version_, document_.file.get(), document_.coordination);
  auto* job = new Job{shared_from_this(), std::move(place), std::move(answer.file), MarkedFile::Result()};
  GTask* task = g_task_new(
      nullptr, nullptr,
      +[](GObject*, GAsyncResult* result, gpointer) {
        auto* done = static_cast<Job*>(g_task_get_task_data(G_TASK(result)));
        done->marks->written(std::move(done->result));
      },
      nullptr);
  g_task_set_task_data(
      task, job, +[](gpointer data) { delete static_cast<Job*>(data); });
  g_task_run_in_thread(
      task, +[](GTask* running, gpointer, gpointer data, GCancellable*) {
        auto* work = static_cast<Job*>(data);
        work->result = work->place.save(work->content.get());
        g_task_return_boolean(running, TRUE);
      });
  g_object_unref(task);
}

void PortableDocumentMarks::written(MarkedFile::Result result) {
  if (result.outcome == MarkedFile::Outcome::Failed) {
    return fail(result.reason.empty() ? _("The marks couldn’t be saved.")
                                      : filled(_("The marks couldn’t be saved: %s."), {translated(result.reason)}));
  }
  saved_ = std::move(result.file);
  version_ = result.version;
  if (result.outcome == MarkedFile::Outcome::Beside) {
    const std::string was = std::exchange(document_.name, takeString(g_filename_display_basename(result.path.c_str())));
    events_.told(filled(_("Another program changed “%s”. Your marks are in “%s”."), {was, document_.name}));
  }
  document_.path = result.path;
  state_ = State::Saved;
  unsaved_ ? save() : changed(State::Saved);
}

// What wasn't saved is tried again with the next mark, and when the view goes.
void PortableDocumentMarks::fail(const std::string& sentence) {
  process_.reset();
  unsaved_ = true;
  events_.told(sentence);
  changed(State::Failed);
}

void PortableDocumentMarks::leave() {
  events_.changed = nullptr;
  events_.ending = nullptr;
  save();
}

void PortableDocumentMarks::finishAll() {
  const auto isBusy = [] {
    const auto& all = living();
    return std::any_of(all.begin(), all.end(), [](const auto* marks) { return marks->state_ == State::Saving; });
  };
  for (PortableDocumentMarks* each : living()) {
    if (each->events_.ending) each->events_.ending();
    each->save();
  }
  const gint64 end = g_get_monotonic_time() + FinishingTakes;
  const guint awake = g_timeout_add_seconds(
      1, +[](gpointer) -> gboolean { return G_SOURCE_CONTINUE; }, nullptr);
  while (isBusy() && g_get_monotonic_time() < end) g_main_context_iteration(nullptr, TRUE);
  g_source_remove(awake);
}

}  // namespace vaelo
