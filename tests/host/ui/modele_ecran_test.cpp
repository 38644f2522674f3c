// The screen model as every driver uses it: actions played on a window, checked against its
// description, running its handlers; dialogs, modal windows and closing.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>

#include "host/automate/Fenetre_simple.h"
#include "host/automate/Registry.h"
#include "host/table/Database.h"
#include "host/table/Table.h"
#include "host/ui/Ecran.h"
#include "host/ui/ModeleEcran.h"
#include "support/Ecrans.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

namespace fs = std::filesystem;

// A window with one control of each kind. Its handlers say what they saw in "VJOURNAL".
class Essai : public Fenetre_simple {
 public:
  explicit Essai(Evt* evt)
      : Fenetre_simple(evt),
        vdate_(date("VDATE")),
        vnombre_(entier("VNOMBRE", "", 7)),
        vtexte_(chaine("VTEXTE")),
        vchoix_(chaine("VCHOIX", "", "A")),
        vp2_(chaine("VP2")),
        vjournal_(chaine("VJOURNAL")) {
    nomEcran("ESSAI");
    addBranch("VTEXTE", [this](Evt* e) {
      if (vtexte_.text() == "non") {
        BoiteDialogue("Attention", "Le texte « non » est refusé.", 0, {"$1~OK"});
        controler("VNOMBRE");
        rejeter(e);
      }
    });
    addBranch("OK", [this](Evt*) {
      int answer = BoiteDialogue("Question", "Continuer ?", 0, {"$1~Oui", "$2~Non"});
      journal("OK=" + std::to_string(answer));
    });
    addBranch("ENFANT", [this](Evt*) {
      EvtParamRef params{ref(vtexte_)};
      appelerModule("", "TEST", "TEST-ENFANT", &params);
      // The child has ended when the call returns: what it wrote is here.
      journal("après enfant VTEXTE=" + vtexte_.text());
    });
    addBranch("LANCER", [this](Evt*) {
      EvtParamRef params{ref(vtexte_)};
      lancerModule("", "TEST", "TEST-ENFANT", &params);
      journal("lancé");
    });
    // Told once when it opens, then again each time a window it launched has ended.
    addBranch("DEBUT_ACTIVATION", [this](Evt*) {
      if (active_) journal("réactivée");
      active_ = true;
    });
    addBranch("ECRIRE", [this](Evt*) {
      Transaction tx(session().db());
      Table t(this, "VOVOVA", "AFPARA", "ESSAI");
      t.preparer();
      t.ecrire("CODE", Valeur::chaine("ESSAI_ECRIT"));
      t.inserer();
      BoiteDialogue("Question", "Enregistrer ?", 0, {"$1~Oui", "$2~Non"});
      tx.commit();
    });
    addBranch("FICHIER", [this](Evt*) { journal("fichier=" + BoiteOuvrirFichier("*.txt")); });
    addBranch("CHOIX", [this](Evt*) {
      auto item = session().ui().choisir("Couleur", {"Rouge", "Vert"});
      journal("choix=" + (item ? std::to_string(*item) : std::string("aucun")));
    });
    addBranch("MAL", [this](Evt*) { interdire("VINCONNU"); });
    addBranch("P2", [this](Evt* e) {
      if (vchoix_.text() == "A") rejeter(e);
    });
    addBranch("P2_ENTREE", [this](Evt*) { journal("entrée P2"); });
    addBranch("C1", [this](Evt*) {
      const auto& l = ecran().liste("LST");
      journal("C1 ligne " + std::to_string(l.courante) + "=" + l.lignes[l.courante - 1][0]);
    });
  }

  bool saisirChamp(Field& field, const Valeur& value,
                   const std::vector<std::string>& labels) override {
    bool ok = Fenetre_simple::saisirChamp(field, value, labels);
    if (ok) ecran().setNonEnregistre(true);
    return ok;
  }

 private:
  void journal(const std::string& text) {
    vjournal_.set(vjournal_.text().empty() ? text : vjournal_.text() + "; " + text);
  }
  Field& vdate_;
  Field& vnombre_;
  Field& vtexte_;
  Field& vchoix_;
  Field& vp2_;
  Field& vjournal_;
  bool active_ = false;
};

// The window another opens: its result goes back through the parameter it was given.
class Enfant : public Fenetre_simple {
 public:
  explicit Enfant(Evt* evt) : Fenetre_simple(evt), vresultat_(chaine("VRESULTAT")) {
    nomEcran("ENFANT");
    lierParametres(evt, {{&vresultat_, 1}});
    addBranch("FIN", [this](Evt*) { sortir(); });
  }

 private:
  Field& vresultat_;
};

const Module kEssai("", "TEST-ESSAI", &fabriquer<Essai>, false, "");
const Module kEnfant("", "TEST-ENFANT", &fabriquer<Enfant>, false, "");

constexpr const char* kEcranEssai = R"({
  "screen": "ESSAI", "title": "Essai", "tab_control": "ONGLET",
  "tabs": [{"name": "P1", "label": "Un"}, {"name": "P2", "label": "Deux"}],
  "fields": [
    {"name": "VDATE", "label": "Date", "kind": "date"},
    {"name": "VNOMBRE", "label": "Nombre", "kind": "integer"},
    {"name": "VTEXTE", "label": "Texte"},
    {"name": "VCHOIX", "label": "Choix", "kind": "choice",
     "values": [{"value": "A", "label": "Premier"}, {"value": "B", "label": "Second"}]},
    {"name": "VP2", "label": "Sur P2", "tab": "P2"},
    {"name": "VJOURNAL", "editable": false}
  ],
  "buttons": [{"name": "OK", "label": "OK"}, {"name": "INACTIF", "enabled": false},
              {"name": "ENFANT"}, {"name": "LANCER"}, {"name": "ECRIRE"}, {"name": "FICHIER"},
              {"name": "CHOIX"}, {"name": "MAL"}],
  "lists": [{"name": "LST", "columns": [{"name": "C1", "header": "Un", "editable": true},
                                       {"name": "C2", "header": "Deux", "kind": "amount",
                                        "editable": true}]}]
})";

constexpr const char* kEcranEnfant = R"({
  "screen": "ENFANT", "title": "Enfant",
  "fields": [{"name": "VRESULTAT", "label": "Résultat"}],
  "buttons": [{"name": "FIN", "label": "Fin"}]
})";

class ModeleEcranTest : public ::testing::Test {
 protected:
  void SetUp() override {
    dir_ = t_.dir() / "donnees";
    fs::create_directories(dir_ / "screens");
    std::ofstream(dir_ / "screens" / "ESSAI.json") << kEcranEssai;
    std::ofstream(dir_ / "screens" / "ENFANT.json") << kEcranEnfant;
    t_.session().setDataDir(dir_);
    modele_ = std::make_unique<ModeleEcran>(t_.session());
    ASSERT_EQ(modele_->ouvrir("TEST-ESSAI"), ModeleEcran::Ouverture::Ouverte);
  }

  std::string jouer(const std::string& line) { return test::jouer(*modele_, line); }
  std::string champ(const std::string& name) const { return test::champ(*modele_, name); }
  std::vector<std::string> pile() const {
    std::vector<std::string> out;
    for (const auto& w : modele_->etat().fenetres) out.push_back(w.ecran);
    return out;
  }

  test::TestSession t_{true};
  fs::path dir_;
  std::unique_ptr<ModeleEcran> modele_;
};

TEST_F(ModeleEcranTest, TypedValuesAreConvertedCheckedAndRefusedWithoutChange) {
  EXPECT_EQ(jouer("set VDATE 15/03/2026"), "ok");
  EXPECT_EQ(jouer("set VDATE 32/13/2026"),
            "refused on VDATE: VDATE : « 32/13/2026 » n'est pas une date (jj/mm/aaaa).");
  EXPECT_EQ(champ("VDATE"), "15/03/2026");
  EXPECT_EQ(jouer("set VNOMBRE 12x"),
            "refused on VNOMBRE: VNOMBRE : « 12x » n'est pas un nombre entier.");
  EXPECT_EQ(champ("VNOMBRE"), "7");
  // A choice takes one of its values, or a value's label.
  EXPECT_EQ(jouer("set VCHOIX C"),
            "refused on VCHOIX: VCHOIX : « C » n'est pas une valeur permise (A, B).");
  EXPECT_EQ(jouer("set VCHOIX Second"), "ok");
  EXPECT_EQ(champ("VCHOIX"), "B");
  // Controls a person cannot act on.
  EXPECT_EQ(jouer("press INACTIF"), "refused on INACTIF: INACTIF est inactif.");
  EXPECT_EQ(jouer("set VJOURNAL x"), "refused on VJOURNAL: VJOURNAL ne se saisit pas.");
  EXPECT_EQ(jouer("set VP2 x"), "refused on VP2: VP2 est sur l'onglet P2.");
  EXPECT_EQ(jouer("press ABSENT"), "refused on ABSENT: L'écran ESSAI n'a pas de bouton ABSENT.");
  // The handler's own refusal: the value typed is undone, the focus and message say why.
  EXPECT_EQ(jouer("set VTEXTE oui"), "ok");
  EXPECT_EQ(jouer("set VTEXTE non"),
            "refused on VNOMBRE: Le texte « non » est refusé. | "
            "Le texte « non » est refusé.");
  EXPECT_EQ(champ("VTEXTE"), "oui");
  EXPECT_EQ(modele_->etat().fenetres.back().focus, "VNOMBRE");
  // The next accepted action clears the refusal.
  EXPECT_EQ(jouer("set VNOMBRE 8"), "ok");
  EXPECT_FALSE(modele_->etat().refus);
}

TEST_F(ModeleEcranTest, TabsAndListsRunTheirLabels) {
  EXPECT_EQ(jouer("tab P2"), "refused on P2: La fenêtre a refusé tab P2.");
  EXPECT_EQ(modele_->etat().fenetres.back().onglet, "P1");
  EXPECT_EQ(jouer("set VCHOIX B"), "ok");
  EXPECT_EQ(jouer("tab P2"), "ok");
  EXPECT_EQ(modele_->etat().fenetres.back().onglet, "P2");
  EXPECT_EQ(jouer("set VP2 ici"), "ok");
  EXPECT_EQ(jouer("new LST"), "ok");
  EXPECT_EQ(jouer("new LST"), "ok");
  EXPECT_EQ(jouer("cell LST 2 C1 deux"), "ok");
  EXPECT_EQ(jouer("cell LST 2 2 12,5"), "ok");  // an amount column: normalised
  EXPECT_EQ(jouer("cell LST 2 C2 douze"), "refused on C2: C2 : « douze » n'est pas un montant.");
  EXPECT_EQ(jouer("cell LST 3 C1 x"), "refused on LST: La liste LST n'a pas de ligne 3.");
  EXPECT_EQ(jouer("delete LST 1"), "ok");
  const EtatListe& l = modele_->etat().fenetres.back().listes.front();
  ASSERT_EQ(l.lignes.size(), 1u);
  EXPECT_EQ(l.lignes[0], (std::vector<std::string>{"deux", "12.50"}));
  EXPECT_EQ(l.courante, 1u);
  EXPECT_EQ(champ("VJOURNAL"), "entrée P2; C1 ligne 2=deux");
}

TEST_F(ModeleEcranTest, AQuestionWaitsForItsAnswerAndNothingElse) {
  EXPECT_EQ(jouer("press OK"), "ok | dialog Question: Oui Non");
  EXPECT_EQ(jouer("set VTEXTE x"),
            "refused: Une question attend sa réponse : « Question ». | dialog Question: Oui Non");
  EXPECT_EQ(jouer("answer peut-être"),
            "refused: « peut-être » ne répond pas à la question : 1 Oui, 2 Non. | dialog "
            "Question: Oui Non");
  EXPECT_TRUE(modele_->etat().dialogue);
  EXPECT_EQ(jouer("answer Non"), "ok");
  EXPECT_EQ(champ("VJOURNAL"), "OK=2");
  EXPECT_EQ(champ("VTEXTE"), "");
  EXPECT_EQ(jouer("answer 1"), "refused: Aucune question n'attend de réponse.");
  // A file chooser takes a path; a choice list an item's number or text, or nothing.
  EXPECT_EQ(jouer("press FICHIER"), "ok | dialog Sélection d'un fichier:");
  EXPECT_EQ(modele_->etat().dialogue->genre, EtatDialogue::Genre::Fichier);
  EXPECT_EQ(jouer("answer /tmp/pièces.txt"), "ok");
  EXPECT_EQ(jouer("press CHOIX"), "ok | dialog Couleur: Rouge Vert");
  EXPECT_EQ(jouer("answer Bleu"),
            "refused: « Bleu » n'est pas dans la liste : 1 Rouge, 2 Vert. | dialog Couleur: Rouge "
            "Vert");
  EXPECT_EQ(jouer("answer Vert"), "ok");
  EXPECT_EQ(champ("VJOURNAL"), "OK=2; fichier=/tmp/pièces.txt; choix=2");
}

TEST_F(ModeleEcranTest, NoQuestionWaitsInsideAWriteAndNoControlAppearsFromNowhere) {
  EXPECT_EQ(jouer("press ECRIRE"),
            "refused on ECRIRE: Incident : Erreur d'exécution dans TEST-ESSAI (ECRIRE) : a "
            "question waits for a person while a write transaction is open: Enregistrer ? | "
            "Incident : Erreur d'exécution dans TEST-ESSAI (ECRIRE) : a question waits for a "
            "person while a write transaction is open: Enregistrer ?");
  EXPECT_FALSE(modele_->etat().dialogue);
  EXPECT_EQ(t_.value("AFPARA", "CODE", "CODE", "ESSAI_ECRIT"), "<none>");  // rolled back
  EXPECT_EQ(jouer("press MAL").substr(0, 58),
            "refused on MAL: Incident : Erreur d'exécution dans TEST-E");
  EXPECT_NE(modele_->etat().messages.front().find("has no control VINCONNU"), std::string::npos);
}

TEST_F(ModeleEcranTest, AChildWindowRunsWhileItsCallerWaits) {
  EXPECT_EQ(jouer("press ENFANT"), "ok");
  EXPECT_EQ(pile(), (std::vector<std::string>{"ESSAI", "ENFANT"}));
  // Only the innermost window takes actions.
  EXPECT_EQ(jouer("set VTEXTE x"), "refused on VTEXTE: L'écran ENFANT n'a pas de champ VTEXTE.");
  Action a = *lireAction("press OK");
  a.fenetre = "ESSAI";
  EXPECT_FALSE(modele_->agir(a));
  EXPECT_EQ(modele_->etat().refus->texte, "La fenêtre ESSAI n'est pas la fenêtre active.");
  EXPECT_EQ(champ("VJOURNAL"), "(absent)");
  EXPECT_EQ(jouer("set VRESULTAT pièce relue"), "ok");
  EXPECT_EQ(jouer("press FIN"), "ok");
  EXPECT_EQ(pile(), (std::vector<std::string>{"ESSAI"}));
  EXPECT_EQ(champ("VJOURNAL"), "après enfant VTEXTE=pièce relue");
  // Launched rather than called: the launcher's handler goes on at once, and it is told when
  // the window it launched has ended.
  EXPECT_EQ(jouer("press LANCER"), "ok");
  EXPECT_EQ(pile(), (std::vector<std::string>{"ESSAI", "ENFANT"}));
  EXPECT_EQ(jouer("press FIN"), "ok");
  EXPECT_EQ(champ("VJOURNAL"), "après enfant VTEXTE=pièce relue; lancé; réactivée");
}

TEST_F(ModeleEcranTest, ClosingAsksForUnsavedChangesAndTheEndClosesEverything) {
  EXPECT_EQ(jouer("close"), "ok");  // nothing typed: it closes without a word
  EXPECT_TRUE(modele_->etat().fenetres.empty());
  ASSERT_EQ(modele_->ouvrir("TEST-ESSAI"), ModeleEcran::Ouverture::Ouverte);
  EXPECT_EQ(jouer("set VTEXTE brouillon"), "ok");
  EXPECT_TRUE(modele_->etat().fenetres.back().nonEnregistre);
  EXPECT_EQ(jouer("close"), "ok | dialog Fermeture: Oui Non");
  EXPECT_EQ(jouer("answer Non"), "ok");
  EXPECT_EQ(pile(), (std::vector<std::string>{"ESSAI"}));
  // At the end, a window with a question still pending and a child open: the question gets
  // its last button, the window that then stays open is ended all the same.
  EXPECT_EQ(jouer("press ENFANT"), "ok");
  modele_->fermerTout();
  EXPECT_TRUE(modele_->etat().fenetres.empty());
  EXPECT_FALSE(modele_->etat().dialogue);
  EXPECT_EQ(modele_->champsFermes().at("VTEXTE"), "brouillon");
}

TEST_F(ModeleEcranTest, TheStatePrintsAsTextAndAsJson) {
  jouer("set VCHOIX B");
  jouer("tab P2");
  jouer("new LST");
  jouer("press OK");
  const EtatEcrans& e = modele_->etat();
  std::string text = enTexte(e);
  EXPECT_NE(text.find("window ESSAI \"Essai\" tab P2 unsaved\n"), std::string::npos) << text;
  EXPECT_NE(text.find("  VDATE (Date) = \n"), std::string::npos);
  EXPECT_NE(text.find("  tabs: [P1 (Un)] [P2 (Deux) *]\n"), std::string::npos);
  EXPECT_NE(text.find("  buttons: [OK (OK)] [INACTIF [disabled]]"), std::string::npos);
  EXPECT_NE(text.find("  list LST: C1 (Un) [editable]; C2 (Deux) [editable]; 1 rows, current 1\n"
                      "    1* |  |  |\n"),
            std::string::npos)
      << text;
  EXPECT_NE(text.find("dialog message \"Question\": Continuer ? [1 Oui] [2 Non]\n"),
            std::string::npos);

  auto j = nlohmann::ordered_json::parse(enJson(e));
  std::vector<std::string> keys;
  for (const auto& [k, v] : j.items()) keys.push_back(k);
  EXPECT_EQ(keys, (std::vector<std::string>{"version", "windows", "refusal", "messages", "dialog",
                                            "progress"}));
  EXPECT_EQ(j["version"], 1);
  const auto& w = j["windows"][0];
  EXPECT_EQ(w["screen"], "ESSAI");
  EXPECT_EQ(w["tab"], "P2");
  EXPECT_EQ(w["fields"]["VNOMBRE"]["value"], "7");
  EXPECT_EQ(w["fields"]["VP2"]["enabled"], true);
  EXPECT_EQ(w["buttons"]["INACTIF"]["enabled"], false);
  EXPECT_EQ(w["tabs"]["P2"]["label"], "Deux");
  EXPECT_EQ(w["lists"]["LST"]["columns"][1]["header"], "Deux");
  EXPECT_EQ(w["lists"]["LST"]["rows"].size(), 1u);
  EXPECT_EQ(w["lists"]["LST"]["current"], 1);
  EXPECT_EQ(w["unsaved"], true);
  EXPECT_EQ(j["dialog"]["kind"], "message");
  EXPECT_EQ(j["dialog"]["buttons"], (nlohmann::ordered_json{"Oui", "Non"}));
  EXPECT_TRUE(j["refusal"].is_null());
  EXPECT_TRUE(j["progress"].is_null());
}

}  // namespace
}  // namespace quarvo::host
