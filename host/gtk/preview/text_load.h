// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtksourceview/gtksource.h>

#include <functional>
#include <string>

#include "host/gtk/preview/text_reader.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Fills a text buffer with a document: the first screen at once, the rest in slices of some milliseconds whenever the main
/// loop has nothing better to do. Main thread.
class TextLoad {
 public:
  /// Called on the main thread, not by the constructor, and no more after the object is gone; each may end the object.
  struct Events {
    std::function<void()> advanced;                        ///< there is more in the buffer: at least a first screen
    std::function<void(const std::string& error)> failed;  ///< nothing was read; a word of DecoderError
  };

  TextLoad(const std::string& path, const std::string& name, const std::string& contentType, Events events);
  ~TextLoad();
  TextLoad(const TextLoad&) = delete;
  TextLoad& operator=(const TextLoad&) = delete;

  GtkSourceBuffer* buffer() const { return buffer_.get(); }
  /// True when it is in a language of programs, even when it is too large to be highlighted.
  bool isSource() const { return language_ != nullptr; }
  bool finished() const { return finished_; }
  /// What was read so far, without its text.
  const TextPiece& progress() const { return piece_; }

 private:
  using Step = void (TextLoad::*)();
  void inNextTurn(Step step);
  void guessLanguage();
  void begin();
  void fill();
  void received(TextPiece piece);
  bool append();
  void applyLanguage();

  std::string name_;
  std::string contentType_;
  Events events_;
  TextReader reader_;
  GRef<GtkSourceBuffer> buffer_;
  GtkSourceLanguage* language_ = nullptr;  // of the manager's
  TextPiece piece_;
  std::size_t appended_ = 0;  // of the piece
  bool begun_ = false;
  bool finished_ = false;
  Step step_ = nullptr;
  guint turn_ = 0;  // in which the step is done
  guint idle_ = 0;
};

}  // namespace vaelo
