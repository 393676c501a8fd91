// SPDX-License-Identifier: GPL-3.0-or-later
// vaelo-preview-decoder: reads documents for the previews, apart from the application. On standard input is a SOCK_SEQPACKET
// socket; the first message on it is the kind of document, a blank and its path, and the open document when it may be
// another one by now; each further one is a request.
#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <string>

#include "host/decoder/decoder.h"
#include "host/decoder/sandbox.h"
#include "host/support/decoder_error.h"

namespace {

using vaelo::DecoderMessage;
using vaelo::UniqueFd;

DecoderMessage error(const char* reason) { return {std::string("error ") + reason, UniqueFd()}; }

// A pipe or a device would be waited for without end, so the document is opened as if it could block.
UniqueFd openDocument(DecoderMessage named, const char*& problem) {
  UniqueFd file = std::move(named.file);
  if (!file) file = UniqueFd(::open(named.text.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY));
  struct stat status = {};
  if (!file) {
    problem = errno == ENOENT ? vaelo::DecoderError::Gone : vaelo::DecoderError::Unreadable;
  } else if (::fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode)) {
    problem = vaelo::DecoderError::Unsupported;
  }
  return file;
}

}  // namespace

int main() {
  constexpr int socket = 0;
  vaelo::enterSandbox();
  std::optional<DecoderMessage> named = vaelo::receiveDecoderMessage(socket);
  if (!named) return 0;
  const std::size_t blank = std::min(named->text.find(' '), named->text.size());
  const std::string kind = named->text.substr(0, blank);
  named->text.erase(0, blank + 1);
  const char* problem = nullptr;
  UniqueFd document = openDocument(std::move(*named), problem);
  std::unique_ptr<vaelo::Decoder> decoder = problem ? nullptr : vaelo::makeDecoder(kind, std::move(document));
  if (!problem && !decoder) problem = vaelo::DecoderError::Unsupported;
  while (const std::optional<DecoderMessage> request = vaelo::receiveDecoderMessage(socket)) {
    const DecoderMessage answer = problem ? error(problem) : decoder->answer(request->text);
    if (!vaelo::sendDecoderMessage(socket, answer)) break;
  }
  return 0;
}
