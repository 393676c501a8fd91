// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include "host/support/glib_ptr.h"
#include "host/support/unique_fd.h"

namespace vaelo {

/// A process that waits to be told a document, and our end of the socket to it; no process when it could not be started.
struct StartedDecoder {
  UniqueFd socket;
  GRef<GSubprocess> process;
};

/// Starts the processes that decode documents, one ahead: to start one takes longer than to decode most first screens. The
/// one ahead is started when there has been nothing to do for a moment. Main thread.
StartedDecoder takeStartedDecoder();
/// So that the first document finds one as well.
void startDecoderAhead();

}  // namespace vaelo
