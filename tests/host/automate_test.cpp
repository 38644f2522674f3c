#include "host/automate/Automate.h"

#include <gtest/gtest.h>

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
    addBranch("TRANSFORMER(3,4)", [this](Evt* e) { log += "T" + std::to_string(e->numero()) + ";"; });
    addBranch("VALIDER_PIECE", [](Evt*) { throw UException("disk full"); });
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
  explicit GroupWalk(Evt* evt) : Parcours(evt) {
    nomTable("M_WALK");
    plan({"GROUP", "N"}, "GROUP");
    addBranch("DEBUT1", [this](Evt*) { log += "["; });
    addBranch("FIN1", [this](Evt*) { log += "]"; });
    addBranch("POUR_TOUT", [this](Evt*) { log += courant().valeur("GROUP").toChaine() + courant().valeur("N").toChaine(); });
    addBranch("FIN", [this](Evt*) { log += "."; });
  }
  std::string log;
};

TEST(AutomateTest, TraversalFollowsTheSortPlanWithLevelOneBreaks) {
  test::TestSession t;
  Table m(nullptr, "MEM:", "M_WALK", "");
  for (auto [g, n] : std::vector<std::pair<const char*, int>>{{"b", 2}, {"a", 3}, {"b", 1}, {"a", 1}}) {
    m.preparer();
    m.ecrire("GROUP", Valeur::chaine(g));
    m.ecrire("N", Valeur::entier(n));
    m.inserer();
  }
  GroupWalk w(nullptr);
  w.executer(nullptr);
  EXPECT_EQ(w.log, "[a1a3][b1b2].");
}

}  // namespace
}  // namespace quarvo::host
