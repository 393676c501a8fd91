// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/gtk_application_loop.h"

#include "host/desktop/recent_documents.h"
#include "host/drive/drive_user_activities.h"
#include "host/drive/promise_file.h"
#include "host/gtk/accounts_page.h"
#include "host/gtk/continue_banner.h"
#include "host/gtk/drive_application.h"
#include "host/gtk/gtk_screens.h"
#include "host/gtk/gtk_window.h"
#include "host/gtk/preview/decoder_starter.h"
#include "host/gtk/preview/portable_document_marks.h"
#include "host/gtk/scrolled_windows.h"
#include "host/gtk/shortcuts_window.h"
#include "host/support/glib_ptr.h"
#include "host/support/message_catalogue.h"
#include "host/support/own_folder.h"
#include "host/support/texts.h"
#include "items/url_additions.h"
#include "platform/archive.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

constexpr const char* OwnIcon = "com.marrow.VaeloDrive";

constexpr unsigned IdleServiceEnds = 30000;  // milliseconds without a call from the desktop

bool hasOption(GApplicationCommandLine* line, const char* name) {
  return g_variant_dict_contains(g_application_command_line_get_options_dict(line), name);
}

}  // namespace

GtkApplicationLoop::GtkApplicationLoop(GtkScreens& screens, LocalCloudDocuments& drive, NotificationCenter& notifications,
                                       DriveUserActivities& activities, RestorationStore restoration)
    : screens_(screens),
      drive_(drive),
      searchProvider_(drive, {[this](const std::string& id, std::uint32_t time) { openSearchResult(id, time); },
                              [this](const std::string& query, std::uint32_t time) { continueSearch(query, time); }}),
      notifications_(notifications),
      activities_(activities),
      restoration_(std::move(restoration)),
      application_(nullptr) {}

GtkApplicationLoop::~GtkApplicationLoop() {
  if (application_) g_object_unref(application_);
}

int GtkApplicationLoop::run(int argc, char** argv, std::function<std::shared_ptr<ApplicationDelegate>()> makeDelegate) {
  makeDelegate_ = std::move(makeDelegate);
  constexpr auto flags = static_cast<GApplicationFlags>(G_APPLICATION_HANDLES_COMMAND_LINE | G_APPLICATION_HANDLES_OPEN |
                                                        G_APPLICATION_CAN_OVERRIDE_APP_ID);
  application_ = makeDriveApplication("com.marrow.VaeloDrive", flags,
                                      {[this](GDBusConnection* bus, const std::string& path, GError** error) {
                                         return searchProvider_.exportOn(bus, path + "/SearchProvider", error);
                                       },
                                       [this] { searchProvider_.unexport(); }});
  screens_.setApplication(GTK_APPLICATION(application_));
  g_application_set_option_context_parameter_string(G_APPLICATION(application_), _("[LINK...]"));
  g_application_set_option_context_summary(G_APPLICATION(application_),
                                           _("Browse and manage the documents of your cloud drive.\n"
                                             "LINK is one of the vaelodriveapp: scheme and opens that item."));
  const GOptionEntry options[] = {
      {"search", 0, 0, G_OPTION_ARG_NONE, nullptr, _("Search in the drive"), nullptr},
      {"recent-document", 0, 0, G_OPTION_ARG_NONE, nullptr, _("Open the document used last"), nullptr},
      {nullptr, 0, 0, G_OPTION_ARG_NONE, nullptr, nullptr, nullptr}};
  g_application_add_main_option_entries(G_APPLICATION(application_), options);
  // The toolkit goes by its own translations, which need not be installed.
  g_signal_connect(application_, "startup", G_CALLBACK(+[](GApplication*, gpointer) {
                     mendScrolledWindows();
                     gtk_widget_set_default_direction(messagesAreRightToLeft() ? GTK_TEXT_DIR_RTL : GTK_TEXT_DIR_LTR);
                     gtk_icon_theme_add_search_path(
                         gtk_icon_theme_get_for_display(gdk_display_get_default()),
                         ownFolder("icons", "share/icons", "hicolor/scalable/apps/com.marrow.VaeloDrive.svg").c_str());
                   }),
                   nullptr);
  g_signal_connect_swapped(application_, "startup", G_CALLBACK(+[](GtkApplicationLoop* self) { self->beginService(); }),
                           this);
  g_signal_connect_swapped(application_, "activate", G_CALLBACK(+[](GtkApplicationLoop* self) {
                             const bool first = !self->delegate_;
                             self->activate();
                             if (first) self->restore();
                           }),
                           this);
  g_signal_connect(application_, "command-line",
                   G_CALLBACK(+[](GApplication*, GApplicationCommandLine* line, GtkApplicationLoop* self) -> int {
                     return self->commandLine(line);
                   }),
                   this);
  g_signal_connect(application_, "open",
                   G_CALLBACK(+[](GApplication*, GFile** files, int count, const char*, GtkApplicationLoop* self) {
                     self->activate();
                     for (int i = 0; i < count; ++i) self->openLink(takeString(g_file_get_uri(files[i])));
                   }),
                   this);
  static const GActionEntry entries[] = {
      {"search",
       [](GSimpleAction*, GVariant*, gpointer self) {
         static_cast<GtkApplicationLoop*>(self)->performShortcut({SearchShortcutType, {}});
       },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"recent-document",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<GtkApplicationLoop*>(self)->openRecentDocument(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"about",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<GtkApplicationLoop*>(self)->showAbout(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"accounts",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<GtkApplicationLoop*>(self)->showAccounts(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"shortcuts",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<GtkApplicationLoop*>(self)->showShortcuts(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"quit",
       [](GSimpleAction*, GVariant*, gpointer self) {
         g_application_quit(G_APPLICATION(static_cast<GtkApplicationLoop*>(self)->application_));
       },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}}};
  g_action_map_add_action_entries(G_ACTION_MAP(application_), entries, G_N_ELEMENTS(entries), this);
  const char* quitKeys[] = {"<Control>q", nullptr};
  gtk_application_set_accels_for_action(GTK_APPLICATION(application_), "app.quit", quitKeys);
  const char* shortcutsKeys[] = {"<Control>question", nullptr};
  gtk_application_set_accels_for_action(GTK_APPLICATION(application_), "app.shortcuts", shortcutsKeys);
  const int status = g_application_run(G_APPLICATION(application_), argc, argv);
  focus_.reset();
  PortableDocumentMarks::finishAll();
  if (delegate_) {
    saveState();
    delegate_.reset();
  }
  return status;
}

void GtkApplicationLoop::beginService() {
  GApplication* application = G_APPLICATION(application_);
  if (!(g_application_get_flags(application) & G_APPLICATION_IS_SERVICE)) return;
  // The desktop started us for a question, and the next one may follow soon.
  g_application_set_inactivity_timeout(application, IdleServiceEnds);
  // A window that the user closed is not to be brought back from the dead.
  g_signal_connect(application_, "window-removed", G_CALLBACK(+[](GtkApplication* self, GtkWindow*) {
                     if (!gtk_application_get_windows(self)) g_application_quit(G_APPLICATION(self));
                   }),
                   nullptr);
}

void GtkApplicationLoop::activate(std::uint32_t timestamp) {
  if (!delegate_) launch({});
  present(timestamp);
  startDecoderAhead();
}

void GtkApplicationLoop::present(std::uint32_t timestamp) {
  if (const auto window = screens_.window()) gtk_window_present_with_time(window->widget(), timestamp);
}

void GtkApplicationLoop::performShortcut(const ShortcutItem& item) {
  if (delegate_) {
    delegate_->applicationPerformActionForShortcutItemCompletionHandler(item, [](bool) {});
  } else {
    launch({item});
  }
  present(GDK_CURRENT_TIME);
}

void GtkApplicationLoop::openRecentDocument() {
  const std::optional<URL> document = latestRecentDocument([this](const URL& url) {
    return drive_.URLIsInDriveMirror(url) && !drive_.URLIsInDriveTrash(url) && physicalPathOf(url.path());
  });
  if (document) return performShortcut({RecentDocumentShortcutType, {{RecentDocumentURLKey, archiveURL(*document)}}});
  activate();
  if (const auto window = screens_.window()) window->showToast(_("No document of this drive was used recently."));
}

void GtkApplicationLoop::continueSearch(const std::string& query, std::uint32_t timestamp) {
  activate(timestamp);
  const auto activity = activities_.makeActivity(SearchContinuationActivityType);
  activity->setUserInfo({{SearchQueryStringKey, query}});
  continueActivity(activity);
}

void GtkApplicationLoop::openSearchResult(const std::string& documentID, std::uint32_t timestamp) {
  activate(timestamp);
  const auto activity = activities_.makeActivity(SearchResultActivityType);
  activity->setUserInfo({{SearchResultIdentifierKey, documentID}});
  continueActivity(activity);
  const auto window = screens_.window();
  if (window && !vlo_URLFromDocumentID(documentID)) window->showToast(_("This search result is no longer in the drive."));
}

void GtkApplicationLoop::launch(const LaunchOptions& options) {
  delegate_ = makeDelegate_();
  delegate_->applicationWillFinishLaunchingWithOptions(options);
  delegate_->applicationDidFinishLaunchingWithOptions(options);
  const auto window = screens_.window();
  if (!window) return;
  offerToContinue();
  focus_.emplace([this](bool focused) { focusChanged(focused); });
  tellOfDamage();
  rebuiltToken_ = notifications_.addObserver(DocumentIndexRebuiltNotification, [this](const Notification&) {
    if (const auto shown = screens_.window()) {
      shown->showToast(_("The drive’s index was damaged. It has been rebuilt, and the old one kept."), true);
    }
  });
}

void GtkApplicationLoop::tellOfDamage() {
  if (!drive_.accountWasDamaged()) return;
  screens_.window()->showToast(
      _("The file of your account was damaged. It was kept aside, and a new one made for the documents on this device."),
      true);
}

void GtkApplicationLoop::offerToContinue() {
  Platform& platform = Platform::current();
  const auto nameOf = [&platform](const URL& document) {
    const Result<ResourceMap> values =
        platform.resourceValues.promisedItemResourceValues(document, {ResourceKey::LocalizedName});
    const auto name = values.value ? values.value->find(ResourceKey::LocalizedName) : ResourceMap::const_iterator();
    const std::string* text = values.value && name != values.value->end() ? name->second.get<std::string>() : nullptr;
    return text ? *text : document.lastPathComponent();
  };
  continueOffer_ =
      std::make_shared<ContinueOffer>(platform.fileProvider, platform.queues, nameOf,
                                      [this](const std::shared_ptr<UserActivity>& activity) { continueActivity(activity); });
  screens_.window()->setPageBanner([offer = continueOffer_] { return makeContinueBanner(offer); });
  activities_.watchOthers([weak = std::weak_ptr(continueOffer_)](const std::optional<OfferedActivity>& offered) {
    if (const auto offer = weak.lock()) offer->setActivity(offered);
  });
}

void GtkApplicationLoop::continueActivity(const std::shared_ptr<UserActivity>& activity) {
  if (!delegate_->applicationWillContinueUserActivityWithType(activity->activityType())) return;
  delegate_->applicationContinueUserActivityRestorationHandler(activity, [] {});
}

int GtkApplicationLoop::commandLine(GApplicationCommandLine* line) {
  int count = 0;
  char** arguments = g_application_command_line_get_arguments(line, &count);
  const bool first = !delegate_;
  const bool search = hasOption(line, "search");
  const bool recent = hasOption(line, "recent-document");
  if (search) performShortcut({SearchShortcutType, {}});
  if (recent) openRecentDocument();
  activate();
  int status = 0;
  for (int i = 1; i < count; ++i) {
    if (openLink(arguments[i])) continue;
    // It goes to the other process as text, which an argument need not be.
    const std::string shown = takeString(g_utf8_make_valid(arguments[i], -1));
    const std::string problem = filled(_("vaelo-drive: “%s” leads to nothing in the drive."), {shown});
    g_application_command_line_printerr(line, "%s\n", problem.c_str());
    status = 1;
  }
  if (first && count == 1 && !search && !recent) restore();
  g_strfreev(arguments);
  return status;
}

bool GtkApplicationLoop::openLink(const std::string& link) {
  // Other programs' lists of recent documents name files.
  const std::optional<URL> file = URL::fromFileURLString(link);
  if (file && drive_.URLIsInDriveMirror(*file) && physicalPathOf(file->path())) {
    performShortcut({RecentDocumentShortcutType, {{RecentDocumentURLKey, archiveURL(*file)}}});
    return true;
  }
  if (delegate_->applicationOpenURLOptions(link, {})) return true;
  if (const auto window = screens_.window()) window->showToast(_("The link leads to nothing in this drive."));
  return false;
}

void GtkApplicationLoop::focusChanged(bool focused) {
  if (focused) {
    notifications_.post({DidBecomeActiveNotification, {}});
    continueOffer_->lookAgain();
  } else {
    delegate_->applicationWillResignActive();
    notifications_.post({WillResignActiveNotification, {}});
    saveState();
  }
}

void GtkApplicationLoop::restore() {
  if (!delegate_->applicationShouldRestoreApplicationState()) return;
  const auto window = screens_.window();
  const ViewControllerRef root = window ? window->rootViewController() : nullptr;
  if (!root) return;
  const Dictionary kept = restoration_.load();
  const auto place = kept.find("url");
  const URL* document = place == kept.end() ? nullptr : place->second.get<URL>();
  // What was shown may be another account's.
  if (document && !drive_.URLIsInDriveMirror(*document)) return;
  root->decodeRestorableStateWithCoder(DictionaryRestorationCoder(kept));
}

void GtkApplicationLoop::saveState() {
  const auto window = screens_.window();
  const ViewControllerRef root = window ? window->rootViewController() : nullptr;
  if (!root || !delegate_->applicationShouldSaveApplicationState()) return;
  DictionaryRestorationCoder coder;
  root->encodeRestorableStateWithCoder(coder);
  if (const auto error = restoration_.save(coder.values())) {
    Platform::current().log.write(LogType::Error, "State can't be saved: " + error->description());
  }
}

void GtkApplicationLoop::showAccounts() {
  if (const auto window = screens_.window()) showAccountsPage(window->widget(), drive_.layout(), notifications_);
}

void GtkApplicationLoop::showShortcuts() {
  if (const auto window = screens_.window()) showShortcutsWindow(window->widget());
}

void GtkApplicationLoop::showAbout() {
  const auto window = screens_.window();
  if (!window) return;
  adw_show_about_window(window->widget(), "application-name", "Vaelo Drive", "application-icon", OwnIcon, "version",
                        VAELO_VERSION, "license-type", GTK_LICENSE_GPL_3_0, "comments",
                        _("Browse and manage the documents of your cloud drive."), "translator-credits",
                        // TRANSLATORS: your name and address, a line each; they are shown in the About window.
                        _("translator-credits"), nullptr);
}

std::string GtkApplicationLoop::description() {
  const char* id = application_ ? g_application_get_application_id(G_APPLICATION(application_)) : nullptr;
  return id ? id : "";
}

}  // namespace vaelo
