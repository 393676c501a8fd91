// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/markdown_load.h"

#include <algorithm>
#include <array>
#include <charconv>

#include "host/gtk/preview/shared_bytes.h"
#include "host/gtk/preview/text_widgets.h"

namespace vaelo {

namespace {

constexpr std::chrono::seconds RenderingTakes(5);
constexpr gint64 SliceMicroseconds = 6000;
constexpr std::size_t SliceBytes = 16 * 1024;
// Painting goes before, but laying out what is out of sight comes after.
constexpr int FillPriority = GDK_PRIORITY_REDRAW + 2;

template <typename Number>
bool isNumber(std::string_view word, Number& number) {
  const auto [end, problem] = std::from_chars(word.data(), word.data() + word.size(), number);
  return problem == std::errc() && end == word.data() + word.size();
}

std::string_view takeUntil(std::string_view& text, char sign) {
  const std::size_t end = std::min(text.find(sign), text.size());
  const std::string_view taken = text.substr(0, end);
  text.remove_prefix(std::min(end + 1, text.size()));
  return taken;
}

struct Form {
  std::string_view name;
  int begin = 0;
  int end = 0;
  std::string_view word;
};

bool readForm(std::string_view line, Form& form) {
  form.name = takeUntil(line, '\t');
  const bool isRead = isNumber(takeUntil(line, '\t'), form.begin) && isNumber(takeUntil(line, '\t'), form.end);
  form.word = line;
  return isRead && form.begin >= 0 && form.begin < form.end;
}

}  // namespace

MarkdownLoad::MarkdownLoad(const std::string& path, Events events)
    : events_(std::move(events)),
      buffer_(takeTextBuffer()),
      forms_(GTK_TEXT_BUFFER(buffer_.get())),
      process_(std::make_unique<DecoderProcess>("markdown", path)) {
  process_->ask(
      "render", [this](DecoderProcess::Answer answer) { received(std::move(answer)); }, RenderingTakes);
}

MarkdownLoad::~MarkdownLoad() {
  g_clear_handle_id(&idle_, g_source_remove);
  endTextBuffer(std::move(buffer_));
}

void MarkdownLoad::received(DecoderProcess::Answer answer) {
  if (!answer.error.empty()) return events_.failed(answer.error);
  std::size_t bytes = 0;
  std::string_view words = answer.text;
  if (!isNumber(takeUntil(words, ' '), bytes)) return events_.failed(DecoderError::Damaged);
  content_.reset(takeSharedBytes(std::move(answer.file), std::max<std::size_t>(bytes, 1)), [](GBytes* content) {
    if (content) g_bytes_unref(content);
  });
  if (!content_ && bytes > 0) return events_.failed(DecoderError::Damaged);
  if (content_) {
    gsize size = 0;
    const auto* data = static_cast<const char*>(g_bytes_get_data(content_.get(), &size));
    text_ = left_ = {data, bytes};
    leftForms_ = {data + bytes, size - bytes};
    if (!g_utf8_validate(data, static_cast<gssize>(bytes), nullptr)) return events_.failed(DecoderError::Damaged);
  }
  process_.reset();
  if (fill()) {
    idle_ = g_idle_add_full(
        FillPriority,
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<MarkdownLoad*>(data);
          if (self->fill()) return G_SOURCE_CONTINUE;
          self->idle_ = 0;
          return G_SOURCE_REMOVE;
        },
        this, nullptr);
  }
  events_.begun();
}

void MarkdownLoad::insertSome() {
  std::size_t length = std::min(left_.size(), SliceBytes);
  while (length < left_.size() && (static_cast<unsigned char>(left_[length]) & 0xc0) == 0x80) --length;
  GtkTextIter place;
  gtk_text_buffer_get_end_iter(GTK_TEXT_BUFFER(buffer_.get()), &place);
  gtk_text_buffer_insert(GTK_TEXT_BUFFER(buffer_.get()), &place, left_.data(), static_cast<int>(length));
  left_.remove_prefix(length);
  characters_ = gtk_text_buffer_get_char_count(GTK_TEXT_BUFFER(buffer_.get()));
}

// Forms follow the text at once, so that what is seen of it stands as it stays. True while there is more.
bool MarkdownLoad::fill() {
  const gint64 end = g_get_monotonic_time() + SliceMicroseconds;
  while (g_get_monotonic_time() < end) {
    std::string_view rest = leftForms_;
    Form form;
    const bool isForm = readForm(takeUntil(rest, '\n'), form);
    if (!leftForms_.empty() && (!isForm || form.end <= characters_ || left_.empty())) {
      leftForms_ = rest;
      if (!isForm || form.end > characters_) continue;
      forms_.apply(form.name, form.begin, form.end, form.word);
      if (form.name == "link" && g_utf8_validate(form.word.data(), static_cast<gssize>(form.word.size()), nullptr)) {
        links_.push_back({form.begin, form.end, std::string(form.word)});
      }
    } else if (!left_.empty()) {
      insertSome();
    } else {
      finished_ = true;
      return false;
    }
  }
  return true;
}

}  // namespace vaelo
