// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/gtk/preview/document_view.h"

namespace vaelo {

/// What is in an archive. A row of the table of document views.
bool showsArchive(const std::string& contentType);
std::unique_ptr<DocumentView> makeArchiveView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
