// SPDX-License-Identifier: GPL-3.0-or-later
// What people read goes through the string table, also where it is chosen among several texts.
#include "fileops/ui_utils.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

class TranslatedTextsTest : public AppFixture {
 protected:
  void translate(const std::string& key, const std::string& text) { memory.formatting.translations[key] = text; }
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

}  // namespace
}  // namespace vaelo
