// SPDX-License-Identifier: GPL-3.0-or-later
// vaelo-preview-decoder KIND: reads documents for the previews, apart from the application. On standard input is a
// SOCK_SEQPACKET socket; the first message on it is the document's path, each further one a request.
#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>

#include "host/decoder/decoder.h"
#include "host/decoder/sandbox.h"
#include "host/support/decoder_error.h"

namespace {

using vaelo::DecoderMessage;
using vaelo::UniqueFd;

DecoderMessage error(const char* reason) { return {std::string("error ") + reason, UniqueFd()}; }

// A pipe or a device would be waited for without end, so the document is opened as if it could block.
UniqueFd openDocument(const std::string& path, const char*& problem) {
  UniqueFd file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY));
  struct stat status = {};
  if (!file) {
    problem = errno == ENOENT ? vaelo::DecoderError::Gone : vaelo::DecoderError::Unreadable;
  } else if (::fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode)) {
    problem = vaelo::DecoderError::Unsupported;
  }
  return file;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) return 2;
  constexpr int socket = 0;
  vaelo::enterSandbox();
  const std::optional<DecoderMessage> path = vaelo::receiveDecoderMessage(socket);
  if (!path) return 0;
  const char* problem = nullptr;
  UniqueFd document = openDocument(path->text, problem);
  std::unique_ptr<vaelo::Decoder> decoder = problem ? nullptr : vaelo::makeDecoder(argv[1], std::move(document));
  if (!problem && !decoder) problem = vaelo::DecoderError::Unsupported;
  while (const std::optional<DecoderMessage> request = vaelo::receiveDecoderMessage(socket)) {
    const DecoderMessage answer = problem ? error(problem) : decoder->answer(request->text);
    if (!vaelo::sendDecoderMessage(socket, answer)) break;
  }
  return 0;
}
