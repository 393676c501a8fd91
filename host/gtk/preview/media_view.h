// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/preview/document_view.h"

namespace vaelo {

/// Sound and film. A row of the table of document views.
bool showsMedia(const std::string& contentType);
std::unique_ptr<DocumentView> makeMediaView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
