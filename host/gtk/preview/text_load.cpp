// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_load.h"

#include <algorithm>

#include "host/gtk/preview/text_languages.h"
#include "host/gtk/preview/text_widgets.h"

namespace vaelo {

namespace {

constexpr gint64 SliceMicroseconds = 6000;
constexpr std::size_t SliceBytes = 32 * 1024;
// Painting goes before, but laying out what is out of sight comes after.
constexpr int AppendPriority = GDK_PRIORITY_REDRAW + 2;
// Marks of syntax take several times the memory of the text.
constexpr std::uint64_t MostHighlighted = 8 * 1024 * 1024;
// A line is highlighted in one go, in a time that grows with the square of its length.
constexpr std::size_t LongestHighlighted = 300;

// The end of the whole characters in the next slice.
std::size_t sliceEnd(const std::string& text, std::size_t begin) {
  std::size_t end = std::min(begin + SliceBytes, text.size());
  while (end < text.size() && (static_cast<unsigned char>(text[end]) & 0xc0) == 0x80) --end;
  return end;
}

}  // namespace

TextLoad::TextLoad(const std::string& path, const std::string& name, const std::string& contentType, Events events)
    : name_(name), contentType_(contentType), events_(std::move(events)), reader_(path), buffer_(takeTextBuffer()) {
  inNextTurn(&TextLoad::guessLanguage);
  reader_.next([this](TextPiece piece) { received(std::move(piece)); });
}

TextLoad::~TextLoad() {
  g_clear_handle_id(&turn_, g_source_remove);
  g_clear_handle_id(&idle_, g_source_remove);
  endTextBuffer(std::move(buffer_));
}

// For what may hold the main loop for long. Not as an idle source, which would come after other documents' work.
void TextLoad::inNextTurn(Step step) {
  step_ = step;
  turn_ = g_idle_add_full(
      G_PRIORITY_DEFAULT,
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<TextLoad*>(data);
        self->turn_ = 0;
        (self->*self->step_)();
        return G_SOURCE_REMOVE;
      },
      this, nullptr);
}

// The library reads the heads of all grammars when it is asked for the first time, while the document is being read.
void TextLoad::guessLanguage() {
  language_ = gtk_source_language_manager_guess_language(textLanguages(), name_.c_str(), contentType_.c_str());
  if (begun_) inNextTurn(&TextLoad::begin);
}

// The library reads the grammar of the language.
void TextLoad::begin() {
  if (!language_) return fill();
  inNextTurn(&TextLoad::fill);
  applyLanguage();
}

void TextLoad::fill() {
  if (!append()) return events_.advanced();
  idle_ = g_idle_add_full(
      AppendPriority,
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<TextLoad*>(data);
        if (self->append()) return G_SOURCE_CONTINUE;
        self->idle_ = 0;
        self->events_.advanced();
        return G_SOURCE_REMOVE;
      },
      this, nullptr);
  events_.advanced();
}

// A buffer that has a language is analysed, even when nothing of that is shown.
void TextLoad::applyLanguage() {
  const bool isHighlighted = piece_.documentBytes <= MostHighlighted && piece_.longestLine <= LongestHighlighted;
  gtk_source_buffer_set_language(buffer_.get(), isHighlighted ? language_ : nullptr);
}

void TextLoad::received(TextPiece piece) {
  if (piece.error) {
    finished_ = true;
    const std::string error = piece.error;
    // A document that was shown stays as far as it was read.
    if (!begun_) return events_.failed(error);
    piece_.shortened = true;
    return events_.advanced();
  }
  piece_ = std::move(piece);
  appended_ = 0;
  if (begun_) {
    applyLanguage();
    return fill();
  }
  begun_ = true;
  if (!turn_) inNextTurn(&TextLoad::begin);
}

// True while there is more of the piece.
bool TextLoad::append() {
  const gint64 end = g_get_monotonic_time() + SliceMicroseconds;
  GtkTextBuffer* buffer = GTK_TEXT_BUFFER(buffer_.get());
  while (appended_ < piece_.text.size()) {
    if (g_get_monotonic_time() > end) return true;
    const std::size_t until = sliceEnd(piece_.text, appended_);
    GtkTextIter place;
    gtk_text_buffer_get_end_iter(buffer, &place);
    gtk_text_buffer_insert(buffer, &place, piece_.text.data() + appended_, static_cast<int>(until - appended_));
    appended_ = until;
  }
  piece_.text.clear();
  piece_.text.shrink_to_fit();
  finished_ = piece_.last;
  if (!finished_) reader_.next([this](TextPiece piece) { received(std::move(piece)); });
  return false;
}

}  // namespace vaelo
