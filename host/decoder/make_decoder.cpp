// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/archive_decoder.h"
#include "host/decoder/decoder.h"
#include "host/decoder/document_decoder.h"
#include "host/decoder/markdown_decoder.h"
#include "host/decoder/picture_decoder.h"

namespace vaelo {

std::unique_ptr<Decoder> makeDecoder(const std::string& kind, UniqueFd document) {
  if (kind == "picture") return std::make_unique<PictureDecoder>(std::move(document));
  if (kind == "document") return std::make_unique<DocumentDecoder>(std::move(document));
  if (kind == "archive") return std::make_unique<ArchiveDecoder>(std::move(document));
  if (kind == "markdown") return std::make_unique<MarkdownDecoder>(std::move(document));
  return nullptr;
}

}  // namespace vaelo
