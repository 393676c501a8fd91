// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/mark_edits.h"
#include "host/gtk/preview/marked_file.h"

namespace vaelo {

/// What a person does to the marks of a document while it is shown. It is saved into it a moment later, all of it anew each
/// time into the document as it was at first, so that the last thing can always be taken back. What is not saved yet when
/// the view goes is saved all the same: the object lives until then. Main thread; the disk is written from another one.
class PortableDocumentMarks : public std::enable_shared_from_this<PortableDocumentMarks> {
 public:
  struct Document {
    std::string path;
    std::string name;  ///< for a person
    std::string password;
    UniqueFd file;  ///< the open document without marks
    FileVersion version;
    FileCoordination* coordination = nullptr;  ///< outlives all use; null does without
  };
  struct Events {
    std::function<void()> changed;                          ///< marks, or how far they are saved; not after leave()
    std::function<void(const std::string& sentence)> told;  ///< what a person must know of, also after leave()
    std::function<void()> ending;                           ///< what is being written is to be added now; not after leave()
  };
  enum class State { Unchanged, Unsaved, Saving, Saved, Failed };

  static std::shared_ptr<PortableDocumentMarks> make(Document document, Events events);
  ~PortableDocumentMarks();

  const MarkEdits& edits() const { return edits_; }
  State state() const { return state_; }
  void add(PageMark mark);
  void remove(const PageMark& mark);
  void rewrite(const PageMark& mark, std::string text);
  /// False when there is nothing of this time.
  bool undo();
  /// Saves what isn't saved, now.
  void save();
  /// The view goes: saves what isn't saved.
  void leave();
  /// True when what stands at the path was saved here.
  bool wrote(const std::string& path) const { return saved_ && versionOf(path) == version_; }

  /// Saves all marks of all documents; to be called before the program ends. Blocks, running the main loop.
  static void finishAll();

 private:
  PortableDocumentMarks(Document document, Events events);
  void changed(State state);
  void saveSoon();
  void takeNext(const DecoderProcess::Answer& answer);
  void write(DecoderProcess::Answer answer);
  void written(MarkedFile::Result result);
  void fail(const std::string& sentence);

  Document document_;
  Events events_;
  MarkEdits edits_;
  State state_ = State::Unchanged;
  bool unsaved_ = false;           // there are changes that no saving has begun with
  UniqueFd saved_;                 // the open document as it was saved last
  FileVersion version_;            // of it, or of the original
  std::vector<std::string> sent_;  // what is being saved
  std::size_t next_ = 0;           // of it
  std::unique_ptr<DecoderProcess> process_;
  guint timer_ = 0;
};

}  // namespace vaelo
