// SPDX-License-Identifier: GPL-3.0-or-later
// What people read goes through the string table, also where it is chosen among several texts.
#include "fileops/filename_prompt.h"
#include "fileops/ui_utils.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

class TranslatedTextsTest : public AppFixture {
 protected:
  void translate(const std::string& key, const std::string& text) { memory.formatting.translations[key] = text; }
  /// Each of the texts reads "<text>" from now on.
  void translateAll(std::initializer_list<const char*> keys) {
    for (const char* key : keys) translate(key, "<" + std::string(key) + ">");
  }
  std::shared_ptr<AlertController> alert() {
    const auto shown = presentedAlert();
    nav->dismissViewControllerAnimated(false);
    return shown;
  }
  static Error failed(std::optional<std::string> description, std::optional<std::string> reason) {
    return {FileErrorDomain, FileErrorCode::WriteUnknown, {}, std::move(description), std::move(reason)};
  }
};

TEST_F(TranslatedTextsTest, AReasonIsReadInThePersonsLanguage) {
  translate("there is no such item", "das gibt es nicht");
  EXPECT_EQ(UIUtils::bestMessage(failed({}, "there is no such item")), "das gibt es nicht");
  EXPECT_EQ(UIUtils::bestMessage(failed({}, "Kein Platz")), "Kein Platz") << "the system has translated it already";
  EXPECT_EQ(UIUtils::bestMessage(failed("“a” can’t be used.", "there is no such item")), "“a” can’t be used.");
}

TEST_F(TranslatedTextsTest, TheEditButtonsAre) {
  translate("New Folder", "Neuer Ordner");
  translate("Move", "Verschieben");
  translate("Delete", "Löschen");
  loadNav();
  nav->beginEditMode(nullptr);
  std::vector<std::string> titles;
  for (const BarButtonItemRef& item : topList()->toolbarItems()) {
    if (const auto* button = dynamic_cast<const Button*>(item->customView().get())) titles.push_back(button->title());
  }
  EXPECT_EQ(titles, (std::vector<std::string>{"Neuer Ordner", "Verschieben", "Löschen"}));
}

TEST_F(TranslatedTextsTest, TheQuestionBeforeADeletionIsOneForDocumentsAndOneForLibraries) {
  translate("\"%@\" will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone.",
            "„%@“ geht");
  const URL document = addFile("Plan.txt");
  EXPECT_EQ(UIUtils::messageForDeletePrompt({document}), "„Plan.txt“ geht");
}

TEST_F(TranslatedTextsTest, TheSheetBeforeADeletionIs) {
  translateAll(
      {"%@ will be permanently deleted from Vaelo Drive on all your devices. This action cannot be undone.",
       "The %@ app library, and all its documents, will be permanently deleted from Vaelo Drive on all your devices. "
       "This action cannot be undone.",
       "Delete from Vaelo Drive", "Cancel"});
  loadNav();
  const auto ask = [this](const std::vector<URL>& urls) {
    nav->showWarningAndDeleteURLsUsingViewWithDocumentListControllerFinishedCompletion(urls, nullptr, nullptr, nullptr);
    return alert();
  };
  const auto many = ask({addFile("a.txt"), addFile("b.txt")});
  EXPECT_TRUE(many->message().starts_with("<items: 2 will"));
  EXPECT_EQ(many->actions().at(0)->title(), "<Delete from Vaelo Drive>");
  EXPECT_EQ(many->actions().at(1)->title(), "<Cancel>");
  const auto library = memory.cloud.addContainer("org~example~Notes", "Notes");
  EXPECT_TRUE(ask({*library->documentsFolderURL()})->message().starts_with("<The Notes app library"));
}

TEST_F(TranslatedTextsTest, ThePromptsAre) {
  translateAll({"Cancel", "Done", "Create", "Move", "New Folder", "Enter a name for this folder.", "Folder Name",
                "Rename Item", "Enter a new name for this item.", "Choose a different name.",
                "Character not allowed in filename"});
  loadNav();
  nav->showRenamePrompt(addFile("a.txt"));
  const auto rename = nav->folderPromptAlert();
  EXPECT_EQ(rename->alert()->title(), "<Rename Item>");
  EXPECT_EQ(rename->alert()->message(), "<Enter a new name for this item.>");
  EXPECT_EQ(rename->alert()->actions().at(0)->title(), "<Cancel>");
  EXPECT_EQ(rename->defaultAction()->title(), "<Done>");
  rename->textField()->userSetText(".hidden");
  EXPECT_EQ(rename->errMsgViewController()->messageLabel()->text(), "<Choose a different name.>");
  rename->textField()->userSetText("a/b");
  EXPECT_EQ(rename->errMsgViewController()->messageLabel()->text(), "<Character not allowed in filename>");
  nav->dismissViewControllerAnimated(false);
  nav->showNewFolderPromptDuringMoveItemsToMove(Drive, {});
  EXPECT_EQ(nav->folderPromptAlert()->alert()->title(), "<New Folder>");
  EXPECT_EQ(nav->folderPromptAlert()->alert()->message(), "<Enter a name for this folder.>");
  EXPECT_EQ(nav->folderPromptAlert()->textField()->placeholder(), "<Folder Name>");
  EXPECT_EQ(nav->folderPromptAlert()->defaultAction()->title(), "<Create>");
  nav->dismissViewControllerAnimated(false);
  nav->showNewFolderPromptDuringMoveItemsToMove(Drive, {addFile("a.txt")});
  EXPECT_EQ(nav->folderPromptAlert()->defaultAction()->title(), "<Move>");
  const auto plain = FilenamePrompt::newWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
      std::nullopt, std::nullopt, std::nullopt, std::nullopt, std::nullopt, nullptr);
  EXPECT_EQ(plain->defaultAction()->title(), "<Done>");
}

TEST_F(TranslatedTextsTest, TheAlertsAre) {
  translateAll({"OK", "Error exception", "An item named “%@” already exists in the new location.",
                "The name “%@” is already taken.", "The name “%1$@” with extension “.%2$@” is already taken.",
                "Choose a different name.", "This can’t be done with this item.", "Name is already taken",
                "The name “%@” can’t be used. Try using a name with fewer characters, or with no punctuation marks.",
                "Character not allowed in filename"});
  loadNav();
  const Error taken{FileErrorDomain, FileErrorCode::WriteFileExists, {}, {}, {}};
  const Error invalid{FileErrorDomain, FileErrorCode::WriteInvalidFileName, {}, {}, {}};
  UIUtils::showErrorParentViewController(std::nullopt, nav);
  const auto plain = alert();
  EXPECT_EQ(plain->title(), "<Error exception>");
  EXPECT_EQ(plain->actions().at(0)->title(), "<OK>");
  UIUtils::showUnsupportedError(nav);
  EXPECT_EQ(alert()->title(), "<This can’t be done with this item.>");
  UIUtils::showItemExistsAlertMovingToDirParentViewController("a.txt", true, nav);
  EXPECT_EQ(alert()->title(), "<An item named “a.txt” already exists in the new location.>");
  UIUtils::showFriendlyRenameErrorBasenameParentViewController(taken, "a.txt", nav);
  const auto exists = alert();
  EXPECT_EQ(exists->title(), "<The name “a” with extension “.txt” is already taken.>");
  EXPECT_EQ(exists->message(), "<Choose a different name.>");
  UIUtils::showFriendlyRenameErrorBasenameParentViewController(taken, "a", nav);
  EXPECT_EQ(alert()->title(), "<The name “a” is already taken.>");
  UIUtils::showFriendlyRenameErrorBasenameParentViewController(invalid, "a", nav);
  EXPECT_TRUE(alert()->message().starts_with("<The name “a” can’t be used."));
  EXPECT_EQ(UIUtils::bestMessage(taken), "<Name is already taken>");
  EXPECT_EQ(UIUtils::bestMessage(invalid), "<Character not allowed in filename>");
}

TEST_F(TranslatedTextsTest, TheBarsAre) {
  translateAll({"Select", "Select Items"});
  loadNav();
  EXPECT_EQ(topList()->navigationItem().rightBarButtonItem()->title(), "<Select>");
  nav->beginEditMode(nullptr);
  EXPECT_EQ(topList()->navigationItem().title(), "<Select Items>");
  topList()->itemsLoaded({});
  EXPECT_EQ(topList()->navigationItem().title(), "<Select Items>") << "also when the list reports";
}

}  // namespace
}  // namespace vaelo
