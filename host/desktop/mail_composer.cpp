// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/mail_composer.h"

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "platform/url.h"

namespace vaelo {

namespace {

GRef<GAppInfo> mailProgram() { return GRef<GAppInfo>(g_app_info_get_default_for_type("x-scheme-handler/mailto", FALSE)); }

std::string subjectFor(const std::string& path) { return takeString(g_filename_display_basename(path.c_str())); }

/// What the program takes beside its own words; nothing for one that takes mailto: links alone.
std::vector<std::string> composeArguments(const std::string& commandLine, const std::string& attachment) {
  const std::string folded = takeString(g_ascii_strdown(commandLine.c_str(), -1));
  const auto names = [&](const char* name) { return folded.find(name) != std::string::npos; };
  if (names("thunderbird") || names("icedove") || names("betterbird")) {
    // Its fields are parted by commas and quoted by apostrophes, which an encoded URL has none of.
    return {"-compose", "attachment='" + URL(attachment).absoluteString() + "'"};
  }
  if (names("kmail")) return {"--composer", "--attach", attachment, "--subject", subjectFor(attachment)};
  return {};
}

}  // namespace

bool MailComposer::isAvailable() { return mailProgram() != nullptr; }

std::vector<std::string> MailComposer::ownCommand(const std::string& commandLine, const std::string& attachment) {
  const std::vector<std::string> more = composeArguments(commandLine, attachment);
  int count = 0;
  char** words = nullptr;
  if (more.empty() || !g_shell_parse_argv(commandLine.c_str(), &count, &words, nullptr)) return {};
  std::vector<std::string> command;
  bool placed = false;
  for (int i = 0; i < count; ++i) {
    const std::string word = words[i];
    if (word == "%u" || word == "%U" || word == "%f" || word == "%F") {
      if (!placed) command.insert(command.end(), more.begin(), more.end());
      placed = true;
    } else if (word.size() != 2 || word[0] != '%') {
      command.push_back(word);
    }
  }
  g_strfreev(words);
  if (!placed) command.insert(command.end(), more.begin(), more.end());
  return command;
}

std::string MailComposer::mailtoLink(const std::string& attachment) {
  return "mailto:?subject=" + percentEncoded(subjectFor(attachment), "") + "&attach=" + percentEncoded(attachment, "/");
}

bool MailComposer::compose(const std::string& path, GAppLaunchContext* context, LaunchFailed failed) {
  const GRef<GAppInfo> program = mailProgram();
  if (!program) {
    failed(_("No mail program is installed."));
    return false;
  }
  const char* line = g_app_info_get_commandline(program.get());
  const std::vector<std::string> own = ownCommand(line ? line : "", path);
  if (own.empty()) return launchApplication(program.get(), {mailtoLink(path)}, context, std::move(failed));
  return launchProgram(own, g_app_info_get_display_name(program.get()), context, std::move(failed));
}

}  // namespace vaelo
