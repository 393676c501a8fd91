// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/decoder_process.h"

#include <gio/gio.h>
#include <glib-unix.h>

#include <algorithm>
#include <deque>

#include "host/gtk/preview/decoder_starter.h"
#include "host/support/texts.h"

namespace vaelo {

struct DecoderProcess::State : std::enable_shared_from_this<DecoderProcess::State> {
  struct Request {
    Done done;
    std::chrono::milliseconds limit;
  };

  UniqueFd socket;
  GRef<GSubprocess> process;
  std::deque<Request> waiting;
  std::string failure;  // why there is no process any more
  guint watch = 0;
  guint timer = 0;

  void start(const std::string& kind, const std::string& path, UniqueFd document) {
    StartedDecoder started = takeStartedDecoder();
    socket = std::move(started.socket);
    process = std::move(started.process);
    if (!process || !sendDecoderMessage(socket.get(), {kind + " " + path, std::move(document)})) {
      return end(DecoderError::Crashed);
    }
    watch = g_unix_fd_add(
        socket.get(), static_cast<GIOCondition>(G_IO_IN | G_IO_HUP),
        +[](int, GIOCondition, gpointer self) -> gboolean { return static_cast<State*>(self)->answered(); }, this);
  }

  gboolean answered() {
    const auto keep = shared_from_this();
    std::optional<DecoderMessage> message = receiveDecoderMessage(socket.get());
    if (!message || waiting.empty()) {
      watch = 0;
      end(DecoderError::Crashed);
      return G_SOURCE_REMOVE;
    }
    const Request request = std::move(waiting.front());
    waiting.pop_front();
    startTimer();
    const std::size_t blank = std::min(message->text.find(' '), message->text.size());
    const bool ok = message->text.compare(0, blank, "ok") == 0;
    std::string rest = message->text.substr(std::min(blank + 1, message->text.size()));
    request.done({ok ? "" : rest, ok ? rest : "", std::move(message->file)});
    return watch ? G_SOURCE_CONTINUE : G_SOURCE_REMOVE;
  }

  void startTimer() {
    g_clear_handle_id(&timer, g_source_remove);
    if (waiting.empty()) return;
    timer = g_timeout_add(
        static_cast<guint>(waiting.front().limit.count()),
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<State*>(data);
          self->timer = 0;
          self->end(DecoderError::TooSlow);
          return G_SOURCE_REMOVE;
        },
        this);
  }

  void stop() {
    g_clear_handle_id(&watch, g_source_remove);
    g_clear_handle_id(&timer, g_source_remove);
    if (process) g_subprocess_force_exit(process.get());
  }

  void end(const std::string& reason) {
    const auto keep = weak_from_this().lock();
    failure = reason;
    stop();
    std::deque<Request> left;
    left.swap(waiting);
    for (const Request& request : left) failLater(request.done);
  }

  // Never from within ask().
  void failLater(Done done) {
    struct Failure {
      std::weak_ptr<State> state;
      Done done;
    };
    g_idle_add_full(
        G_PRIORITY_DEFAULT,
        +[](gpointer data) -> gboolean {
          const auto* pending = static_cast<Failure*>(data);
          if (const auto state = pending->state.lock()) pending->done({state->failure, "", UniqueFd()});
          return G_SOURCE_REMOVE;
        },
        new Failure{weak_from_this(), std::move(done)}, +[](gpointer data) { delete static_cast<Failure*>(data); });
  }
};

DecoderProcess::DecoderProcess(const std::string& kind, const std::string& path, UniqueFd document)
    : state_(std::make_shared<State>()) {
  state_->start(kind, path, std::move(document));
}

DecoderProcess::~DecoderProcess() {
  state_->waiting.clear();
  state_->stop();
}

void DecoderProcess::ask(std::string request, Done done, std::chrono::milliseconds limit) {
  if (!state_->failure.empty()) return state_->failLater(std::move(done));
  const bool first = state_->waiting.empty();
  state_->waiting.push_back({std::move(done), limit});
  if (!sendDecoderMessage(state_->socket.get(), {std::move(request), UniqueFd()})) return state_->end(DecoderError::Crashed);
  if (first) state_->startTimer();
}

std::string messageForDecoderError(const std::string& error) {
  if (error == DecoderError::TooBig) return _("This document is too large for a preview.");
  if (error == DecoderError::Locked) return _("This document is protected by a password.");
  if (error == DecoderError::Unsupported) return _("There is no preview for this kind of document.");
  if (error == DecoderError::Gone) return _("This document is no longer there.");
  if (error == DecoderError::Unreadable) return _("You have no permission to read this document.");
  if (error == DecoderError::TooSlow) return _("Showing this document would take too long. It may be damaged.");
  return _("This document is damaged and can’t be shown.");
}

}  // namespace vaelo
