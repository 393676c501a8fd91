// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/preview/document_view.h"

namespace vaelo {

/// Pictures of every kind that a loader is installed for. A row of the table of document views.
bool showsPicture(const std::string& contentType);
std::unique_ptr<DocumentView> makePictureView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
