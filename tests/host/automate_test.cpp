#include "host/automate/Automate.h"

#include <gtest/gtest.h>

#include <stdexcept>

#include "host/automate/Interface2.h"
#include "host/automate/Parcours.h"
#include "host/automate/Registry.h"
#include "host/automate/Traitmnt.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

// A small automaton that records what ran, with a parameter of each kind.
class Probe : public Traitmnt {
 public:
  explicit Probe(Evt* evt)
      : Traitmnt(evt), count_(entier("COUNT", "", 11)), result_(chaine("RESULT")) {
    lierParametres(evt, {{&count_, 0}, {&result_, 1}});
    addBranch("DEBUT", [this](Evt* e) { debut(e); });
    addBranch("FAIRE", [this](Evt* e) { faire(e); });
    addBranch("TRANSFORMER(3,4)",
              [this](Evt* e) { log += "T" + std::to_string(e->numero()) + ";"; });
    addBranch("VALIDER_PIECE", [](Evt*) { throw UException("disk full"); });
    addBranch("CALCULER", [](Evt*) { throw std::overflow_error("amount out of range"); });
    addBranch("ECRIRE", [](Evt*) { throw BaseIndisponible("the database cannot be written"); });
    addBranch("ECHOUER", [this](Evt* e) { erreurMethode(1, e); });
    addBranch("APPELS", [this](Evt* e) {
      appelerProcedure("", "", "", "ECHOUER", nullptr, 0);
      log += "own=" + std::to_string(erreurMethode()) + ";";
      appelerProcedure("", "", "", "TRANSFORMER3", nullptr, 0);
      log += "own=" + std::to_string(erreurMethode()) + ";";
      appelerProcedure("", "", "", "INCONNU", nullptr, 0);
      log += "unknown=" + std::to_string(erreurMethode()) + ";";
      erreurMethode(0, e);
    });
  }
  void debut(Evt*) override { log += "base-debut;"; }
  void faire(Evt* e) override {
    log += "faire;";
    result_.set(count_.entier() * 2);
    erreurMethode(0, e);
  }
  void exception(Evt* e) override {
    log += "exception:" + e->adresseC()->label() + ":" + e->adresseC()->what() + ";";
    Traitmnt::exception(e);
  }
  std::string log;
  Field& count_;
  Field& result_;
};

class Derived : public Probe {
 public:
  using Probe::Probe;
  void debut(Evt*) override { log += "derived-debut;"; }
};

class Throwing : public Traitmnt {
 public:
  explicit Throwing(Evt* evt) : Traitmnt(evt) { throw UException("cannot build"); }
};

TEST(AutomateTest, ParametersBindInOrderAndReferencesComeBack) {
  test::TestSession t;
  Field caller("R", "", "", 4, Kind::Entier, Valeur::entier(0), nullptr);
  EvtParamRef evt{val("21"), ref(caller)};
  Probe p(&evt);
  p.executer(&evt);
  EXPECT_EQ(p.log, "base-debut;faire;");
  EXPECT_EQ(caller.entier(), 42);
  EXPECT_TRUE(p.termine());
  EXPECT_EQ(p.outcome(), 0);

  // No parameters, or no event at all: fields keep their declared initial values.
  EvtParamVal none;
  Probe q(&none);
  Probe r(nullptr);
  EXPECT_EQ(q.champ("COUNT")->entier(), 11);
  EXPECT_EQ(r.champ("COUNT")->entier(), 11);
}

TEST(AutomateTest, DispatchRunsOverridesNumberedLabelsAndGuardsExceptions) {
  test::TestSession t;
  Derived d(nullptr);
  EvtParamVal e;
  d.raise("DEBUT", &e);
  EXPECT_EQ(d.log, "derived-debut;");
  d.log.clear();
  d.raise("TRANSFORMER4", &e);
  d.raise("TRANSFORMER3", &e);
  EXPECT_EQ(d.log, "T4;T3;");
  EXPECT_EQ(d.numeroBranche(), 3);
  EXPECT_FALSE(d.raise("TRANSFORMER5", &e));

  d.log.clear();
  EvtParamVal piece;
  EXPECT_TRUE(d.raise("VALIDER_PIECE", &piece));
  EXPECT_EQ(d.log, "exception:VALIDER_PIECE:disk full;");
  EXPECT_EQ(piece.erreur(), 1);  // a handler cut short by a fault is not a success
  EXPECT_EQ(piece.adresseC(), nullptr);
  d.log.clear();
  d.raise("VALIDER_PIECE", nullptr);  // no event: a temporary one carries the exception
  EXPECT_EQ(d.log, "exception:VALIDER_PIECE:disk full;");
  EXPECT_FALSE(d.termine());  // the automaton stays alive
  EXPECT_NE(t.ui().transcriptText().find("INCIDENT"), std::string::npos);
  // Any exception a handler lets out is the runtime's fault, reported with the label; one that
  // says the database cannot be written goes through to the command.
  d.log.clear();
  EvtParamVal calcul;
  EXPECT_TRUE(d.raise("CALCULER", &calcul));
  EXPECT_EQ(d.log, "exception:CALCULER:amount out of range;");
  EXPECT_EQ(calcul.erreur(), 1);
  EXPECT_THROW(d.raise("ECRIRE", &calcul), BaseIndisponible);
}

TEST(AutomateTest, OwnProcedureOutcomesAreReadAfterTheCall) {
  test::TestSession t;
  Probe p(nullptr);
  EvtParamVal e;
  p.raise("APPELS", &e);
  EXPECT_EQ(p.log, "own=1;T3;own=0;unknown=1;");
}

TEST(AutomateTest, FactoriesCreateOnlyRegisteredNamesAndGiveStorageBack) {
  test::TestSession t;
  const Module probe("", "TEST-PROBE", &fabriquer<Probe>, false, "");
  EXPECT_NE(Registry::instance().find("TEST-PROBE"), nullptr);
  EvtParamVal evt{val("5")};
  AutomatePtr a = t.session().creer("TEST-PROBE", &evt);
  ASSERT_TRUE(a);
  EXPECT_EQ(a->nomAutomate(), "TEST-PROBE");
  EXPECT_EQ(t.session().creer("TEST-UNKNOWN", nullptr), nullptr);
  EXPECT_THROW(fabriquer<Throwing>(nullptr), UException);
  EXPECT_EQ(t.session().appelerModule("TEST-UNKNOWN", nullptr), 1);
}

TEST(AutomateTest, ModuleRegistersInOrderWithTheCrashFlagFirst) {
  const auto& records = Registry::instance().records();
  ASSERT_FALSE(records.empty());
  auto flag = std::find_if(records.begin(), records.end(),
                           [](const RecordEntry& r) { return r.first == "$$|VCODECRASHFLAG"; });
  ASSERT_NE(flag, records.end());
  EXPECT_EQ(flag->second, "CRASHFLAG");
  Field* crash = Registry::instance().global("$$|VCODECRASHFLAG");
  ASSERT_NE(crash, nullptr);
  EXPECT_EQ(crash->access(), 2);
  // After the flag: units A to F under "COMMUN", the interface unit G under "QUARVO".
  std::vector<std::string> providers;
  for (auto it = flag + 1; it != records.end() && providers.size() < 7; ++it) {
    if (it->kind == "Global") providers.push_back(it->first + "/" + it->second);
  }
  std::vector<std::string> expected(6, "COMMUN/QUARVO");
  expected.push_back("QUARVO/QUARVO");
  EXPECT_EQ(providers, expected);
}

class GroupWalk : public Parcours {
 public:
  explicit GroupWalk(Evt* evt, const char* table = "M_WALK") : Parcours(evt) {
    nomTable(table);
    plan({"GROUP", "N"}, "GROUP");
    addBranch("DEBUT1", [this](Evt*) { log += "["; });
    addBranch("FIN1", [this](Evt*) { log += "]"; });
    addBranch("POUR_TOUT", [this](Evt*) {
      log += courant().valeur("GROUP").toChaine() + courant().valeur("N").toChaine();
    });
    addBranch("FIN", [this](Evt*) { log += "."; });
  }
  std::string log;
};

TEST(AutomateTest, TraversalFollowsTheSortPlanWithLevelOneBreaks) {
  test::TestSession t;
  Table m(nullptr, "MEM:", "M_WALK", "");
  for (auto [g, n] :
       std::vector<std::pair<const char*, int>>{{"b", 2}, {"a", 3}, {"b", 1}, {"a", 1}}) {
    m.preparer();
    m.ecrire("GROUP", Valeur::chaine(g));
    m.ecrire("N", Valeur::entier(n));
    m.inserer();
  }
  GroupWalk w(nullptr);
  w.executer(nullptr);
  EXPECT_EQ(w.log, "[a1a3][b1b2].");

  // On a persistent table the database orders the walk; numbers order as numbers.
  t.sql(R"(CREATE TABLE "T_WALK" ("IDENT" TEXT PRIMARY KEY, "GROUP" TEXT, "N" INTEGER);
            INSERT INTO "T_WALK" VALUES ('1', 'b', 10), ('2', 'a', 3), ('3', 'b', 9),
                                        ('4', 'a', 1);)");
  GroupWalk p(nullptr, "T_WALK");
  p.executer(nullptr);
  EXPECT_EQ(p.log, "[a1a3][b9b10].");
}

// An interface automaton the session keeps between calls: each call must find it as made.
class Compteur : public Interface2 {
 public:
  explicit Compteur(Evt* evt) : Interface2(evt), appels_(entier("APPELS")) {
    ++construits;
    addBranch("COMPTER", [this](Evt* e) {
      Field& sortie = chaine("P_SORTIE");  // bound to the caller's field for this call only
      e->param(0, sortie, 1);
      appels_.set(appels_.entier() + 1);
      journal +=
          champ("P_VU") == nullptr && tableParContexte("LOCALE") == nullptr ? "frais;" : "reste;";
      chaine("P_VU").set("x");
      Table locale(this, "", "M_COMPTEUR", "LOCALE");
      sortie.set(appels_.entier());
      erreurMethode(nomTable().empty() ? 0 : 1, e);
      nomTable("M_AUTRE");
    });
    addBranch("IMBRIQUER", [this](Evt* e) {
      Field& dedans = chaine("P_DEDANS");
      EvtParamRef appel{ref(dedans)};
      session().appelerProcedure("TEST", "COMPTER", &appel);
      erreurMethode(0, e);
    });
    addBranch("FINIR", [this](Evt* e) {
      erreurMethode(1, e);
      sortir(e);
    });
  }
  bool reutilisable() const override { return true; }
  static inline int construits = 0;
  static inline std::string journal;
  Field& appels_;
};

TEST(AutomateTest, KeptInterfacesStartEachCallAsMade) {
  test::TestSession t;
  const Module compteur("", "TEST-INTERFACE", &fabriquer<Compteur>, false, "");
  Compteur::construits = 0;
  Compteur::journal.clear();
  Field premier("A", "", "", 0, Kind::Chaine, Valeur::chaine(""), nullptr);
  Field second("B", "", "", 0, Kind::Chaine, Valeur::chaine(""), nullptr);
  EvtParamRef un{ref(premier)};
  EXPECT_EQ(t.session().appelerProcedure("TEST", "COMPTER", &un), 0);
  EvtParamRef deux{ref(second)};
  EXPECT_EQ(t.session().appelerProcedure("TEST", "COMPTER", &deux), 0);
  // Same instance, as made each time: counter from its initial value, no field or table left
  // from the call before, the earlier caller's field no longer written.
  EXPECT_EQ(Compteur::construits, 1);
  EXPECT_EQ(Compteur::journal, "frais;frais;");
  EXPECT_EQ(premier.text(), "1");
  EXPECT_EQ(second.text(), "1");
  // A call made while the kept one runs gets its own instance; both are kept afterwards.
  EvtParamVal rien;
  EXPECT_EQ(t.session().appelerProcedure("TEST", "IMBRIQUER", &rien), 0);
  EXPECT_EQ(Compteur::construits, 2);
  // One that ends itself is not kept: the other one serves, then a new one is made.
  EXPECT_EQ(t.session().appelerProcedure("TEST", "FINIR", &rien), 1);
  EXPECT_EQ(t.session().appelerProcedure("TEST", "COMPTER", &un), 0);
  EXPECT_EQ(Compteur::construits, 2);
  EXPECT_EQ(t.session().appelerProcedure("TEST", "FINIR", &rien), 1);
  EXPECT_EQ(t.session().appelerProcedure("TEST", "COMPTER", &un), 0);
  EXPECT_EQ(Compteur::construits, 3);
  EXPECT_EQ(Compteur::journal, "frais;frais;frais;frais;frais;");
}

}  // namespace
}  // namespace quarvo::host
