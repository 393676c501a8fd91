// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/support/decoder_message.h"

#include <sys/socket.h>

#include <cerrno>
#include <cstring>

namespace vaelo {

bool sendDecoderMessage(int socket, const DecoderMessage& message) {
  if (message.text.size() > DecoderMessage::MaximumText) return false;
  iovec data = {const_cast<char*>(message.text.data()), message.text.size()};
  msghdr header = {};
  header.msg_iov = &data;
  header.msg_iovlen = 1;
  alignas(cmsghdr) char control[CMSG_SPACE(sizeof(int))] = {};
  if (message.file) {
    header.msg_control = control;
    header.msg_controllen = sizeof control;
    cmsghdr* rights = CMSG_FIRSTHDR(&header);
    rights->cmsg_level = SOL_SOCKET;
    rights->cmsg_type = SCM_RIGHTS;
    rights->cmsg_len = CMSG_LEN(sizeof(int));
    const int file = message.file.get();
    std::memcpy(CMSG_DATA(rights), &file, sizeof file);
  }
  ssize_t sent = 0;
  do {
    sent = ::sendmsg(socket, &header, MSG_NOSIGNAL);
  } while (sent < 0 && errno == EINTR);
  return sent == static_cast<ssize_t>(message.text.size());
}

std::optional<DecoderMessage> receiveDecoderMessage(int socket) {
  DecoderMessage message;
  message.text.resize(DecoderMessage::MaximumText);
  iovec data = {message.text.data(), message.text.size()};
  alignas(cmsghdr) char control[CMSG_SPACE(sizeof(int))] = {};
  msghdr header = {};
  header.msg_iov = &data;
  header.msg_iovlen = 1;
  header.msg_control = control;
  header.msg_controllen = sizeof control;
  ssize_t length = 0;
  do {
    length = ::recvmsg(socket, &header, MSG_CMSG_CLOEXEC);
  } while (length < 0 && errno == EINTR);
  if (length <= 0) return std::nullopt;
  message.text.resize(static_cast<std::size_t>(length));
  const cmsghdr* rights = CMSG_FIRSTHDR(&header);
  if (rights && rights->cmsg_level == SOL_SOCKET && rights->cmsg_type == SCM_RIGHTS) {
    int file = -1;
    std::memcpy(&file, CMSG_DATA(rights), sizeof file);
    message.file = UniqueFd(file);
  }
  return message;
}

}  // namespace vaelo
