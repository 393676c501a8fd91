// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/value.h"

namespace vaelo {

/// The platform's general file-error domain; the application makes errors in no other.
inline constexpr const char* FileErrorDomain = "VaeloFileErrorDomain";
/// The domain of errors that the cloud-documents service reports.
inline constexpr const char* CloudDocumentsErrorDomain = "VaeloCloudDocumentsErrorDomain";

/// Codes of FileErrorDomain.
namespace FileErrorCode {
inline constexpr int NoSuchFile = 4;
inline constexpr int ReadUnknown = 256;
inline constexpr int ReadNoPermission = 257;
inline constexpr int ReadNoSuchFile = 260;
inline constexpr int WriteUnknown = 512;
inline constexpr int WriteNoPermission = 513;
inline constexpr int WriteInvalidFileName = 514;
inline constexpr int WriteFileExists = 516;
inline constexpr int WriteOutOfSpace = 640;
inline constexpr int WriteVolumeReadOnly = 642;
inline constexpr int Formatting = 2048;
inline constexpr int UserCancelled = 3072;
inline constexpr int FeatureUnsupported = 3328;
}  // namespace FileErrorCode

/// What went wrong: a kind that code decides on (domain, code) and words for a person, each of which may be absent.
struct Error {
  std::string domain;
  int code = 0;
  Dictionary userInfo;
  std::optional<std::string> localizedDescription;
  std::optional<std::string> localizedFailureReason;

  /// "Error Domain=... Code=... "text"", for log lines.
  std::string description() const;
};

/// Key of Error::userInfo for a failed move: the full destination path, a string.
inline constexpr const char* DestinationFilePathErrorKey = "DestinationFilePath";
/// Key of Error::userInfo: the path that the failed operation was about, a string.
inline constexpr const char* FilePathErrorKey = "FilePath";

}  // namespace vaelo
