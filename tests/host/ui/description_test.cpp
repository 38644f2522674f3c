// Screen descriptions: what a file may say, and what a fault in one says back.
#include "host/ui/Description.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "host/UException.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

namespace fs = std::filesystem;

class DescriptionTest : public ::testing::Test {
 protected:
  void SetUp() override {
    dir_ = fs::temp_directory_path() /
           ("quarvo-ecrans-" + std::to_string(::getpid()) + "-" +
            ::testing::UnitTest::GetInstance()->current_test_info()->name());
    fs::create_directories(dir_ / "screens");
  }
  void TearDown() override { fs::remove_all(dir_); }
  void ecrire(const std::string& screen, const std::string& text) {
    std::ofstream(dir_ / "screens" / (screen + ".json")) << text;
  }
  // The fault a description gives, without the file's path.
  std::string faute(const std::string& screen) {
    try {
      DescriptionEcran::de(dir_, screen);
    } catch (const UException& e) {
      std::string what = e.what();
      return what.substr(what.find("/screens/") + 9);
    }
    return "(no fault)";
  }
  fs::path dir_;
};

TEST_F(DescriptionTest, AScreenExtendsAnotherReplacingWhatItDescribesAgain) {
  ecrire("BASE", R"({"screen": "BASE", "title": "Base",
    "fields": [{"name": "VDATE", "label": "Date", "kind": "date"}, {"name": "VCODE"}],
    "buttons": [{"name": "VALID", "label": "OK"}]})");
  ecrire("FILLE", R"({"screen": "FILLE", "extends": "BASE",
    "fields": [{"name": "VCODE", "label": "Code", "enabled": false}, {"name": "VCASE", "kind": "check"}]})");
  auto d = DescriptionEcran::de(dir_, "FILLE");
  EXPECT_EQ(d->titre, "Base");
  ASSERT_EQ(d->champs.size(), 3u);
  EXPECT_EQ(d->champs[1].nom + "/" + d->champs[1].libelle, "VCODE/Code");
  EXPECT_FALSE(d->champs[1].actif);
  EXPECT_EQ(d->champs[2].valeurs.size(), 2u);  // a box is "0" or "1" unless told
  EXPECT_EQ(d->champs[0].evenements, std::vector<std::string>{"VDATE"});
  EXPECT_TRUE(d->declare("VALID"));
  EXPECT_FALSE(d->declare("VAUTRE"));
  EXPECT_EQ(DescriptionEcran::de(dir_, "FILLE"), d);  // read once
}

TEST_F(DescriptionTest, FaultsNameTheFileAndWhat) {
  ecrire("CLE", R"({"screen": "CLE", "fields": [{"name": "V", "lable": "x"}]})");
  EXPECT_EQ(faute("CLE"), "CLE.json: field 1: unknown key \"lable\"");
  ecrire("DOUBLE",
         R"({"screen": "DOUBLE", "fields": [{"name": "V"}], "buttons": [{"name": "V"}]})");
  EXPECT_EQ(faute("DOUBLE"), "DOUBLE.json: \"V\" is declared twice");
  ecrire("GENRE", R"({"screen": "GENRE", "fields": [{"name": "V", "kind": "colour"}]})");
  EXPECT_EQ(faute("GENRE"), "GENRE.json: field 1: unknown kind \"colour\"");
  ecrire("ONGLET", R"({"screen": "ONGLET", "tab_control": "T", "tabs": [{"name": "P1"}],
    "fields": [{"name": "V", "tab": "P2"}]})");
  EXPECT_EQ(faute("ONGLET"), "ONGLET.json: field V is on tab P2, not declared");
  ecrire("A", R"({"screen": "A", "extends": "B"})");
  ecrire("B", R"({"screen": "B", "extends": "A"})");
  EXPECT_NE(faute("A").find(".json: screens extend one another in a circle"), std::string::npos);
  ecrire("NOM", R"({"screen": "AUTRE"})");
  EXPECT_EQ(faute("NOM"), "NOM.json: describes screen AUTRE, not NOM");
  EXPECT_EQ(faute("ABSENT"), "ABSENT.json cannot be read");
}

}  // namespace
}  // namespace quarvo::host
