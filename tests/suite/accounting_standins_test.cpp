// The sibling-module services the accounting analysis relies on: accounting-link configuration,
// parameter records, purchase accounts, the section control and text replacement.
#include <gtest/gtest.h>

#include "host/Execute.h"
#include "host/automate/Automate.h"
#include "support/TestSession.h"

namespace quarvo::suite {
namespace {

using namespace host;

Field text(const std::string& name, const std::string& value = "stale") {
  return Field(name, "", "", 4, Kind::Chaine, Valeur::chaine(value), nullptr);
}

std::string record(Session& s, const std::string& table, const std::string& column) {
  MemoryStore& r = s.memoire("I_" + table);
  auto i = r.schema().index(column);
  if (r.size() == 0 || !i) return "<empty>";
  return r.firstRow().values[*i].toChaine();
}

TEST(AccountingStandinsTest, ConfigurationAndParameterRecords) {
  test::TestSession t(true);
  Session& s = t.session();
  Field result = text("R");
  EvtParamRef journal{val("J"), val("ACHAT"), ref(result)};
  EXPECT_EQ(s.appelerProcedure("GCPCOMPT", "LECTURE_SIMPLE", &journal), 0);
  EXPECT_EQ(result.text(), "HA");
  // Each configuration answers from its own table; a key not configured empties the result.
  t.sql(R"(UPDATE "GCPTCFG" SET "VALEUR" = '2' WHERE "CLE" = 'MACHAT')");
  EvtParamRef mode{val("*"), val("MACHAT"), ref(result)};
  EXPECT_EQ(s.appelerProcedure("GCPTCFG", "LECTURE_SIMPLE", &mode), 0);
  EXPECT_EQ(result.text(), "2");
  EvtParamRef wrongKind{val("C"), val("ACHAT"), ref(result)};
  EXPECT_EQ(s.appelerProcedure("GCPCOMPT", "LECTURE_SIMPLE", &wrongKind), 1);
  EXPECT_EQ(result.text(), "");

  // Parameter records: the single row without a parameter, a given row by identifier.
  EXPECT_EQ(s.appelerProcedure("GCPPARAM", "LECTURE", nullptr), 0);
  EXPECT_EQ(record(s, "GCPPARAM", "SAISIE_ANA_A"), "2");
  EvtParamVal byIdent{val("0000000009")};
  EXPECT_EQ(s.appelerProcedure("GCPPARAM", "LECTURE", &byIdent), 0);
  EvtParamVal unknown{val("0000000404")};
  EXPECT_EQ(s.appelerProcedure("GCPPARAM", "LECTURE", &unknown), 1);
  EXPECT_EQ(record(s, "GCPPARAM", "SAISIE_ANA_A"), "<empty>");
  EXPECT_EQ(s.appelerProcedure("CPPARAM", "LECTURE", nullptr), 0);
  EXPECT_EQ(record(s, "CPPARAM", "JOURNAL_ACHAT"), "HA");
  t.sql(R"(DELETE FROM "CPPARAM")");
  EXPECT_EQ(s.appelerProcedure("CPPARAM", "LECTURE", nullptr), 1);  // accounting not set up
  EXPECT_EQ(s.appelerProcedure("GCPTVA", "INIT_TRANSFERT_ASCII", nullptr), 0);
}

std::string compteAchat(Session& s, const std::string& critere, const std::string& regime,
                        const std::string& tva, const std::string& date) {
  Field account = text("CPT");
  EvtParamRef evt{val(critere), val(regime), val(tva), Valeur::date(*Date::parse(date)),
                  ref(account)};
  int rc = s.appelerProcedure("GCPTVA", "COMPTE_ACHAT", &evt);
  return account.text() + (rc == 0 ? "" : " (failed)");
}

TEST(AccountingStandinsTest, PurchaseAccountMostPreciseValidRowWins) {
  test::TestSession t;
  t.sql(R"(INSERT INTO "GCPCPTACH" ("IDENT", "CRITERE_IDENT", "GCPREGM_IDENT", "GCPTVA_IDENT",
             "DATE_DEBUT", "DATE_FIN", "COMPTE") VALUES
             ('01', NULL, NULL, NULL, NULL, NULL, '607'),
             ('02', 'C1', NULL, NULL, NULL, NULL, '601'),
             ('03', 'C1', 'FR', NULL, NULL, NULL, '6011'),
             ('04', 'C1', 'FR', 'N20', NULL, NULL, '60111'),
             ('05', 'C1', 'FR', 'N20', '2026-01-01', '2026-06-30', '60112'),
             ('06', NULL, 'UE', NULL, NULL, NULL, '6070'))");
  Session& s = t.session();
  EXPECT_EQ(compteAchat(s, "C1", "FR", "N20", "2026-03-01"), "60112");  // dated row in force
  EXPECT_EQ(compteAchat(s, "C1", "FR", "N20", "2026-07-01"), "60111");  // out of its dates
  EXPECT_EQ(compteAchat(s, "C1", "FR", "R10", "2026-03-01"), "6011");
  EXPECT_EQ(compteAchat(s, "C1", "UE", "N20", "2026-03-01"), "601");  // criterion over regime
  EXPECT_EQ(compteAchat(s, "C2", "UE", "N20", "2026-03-01"), "6070");
  EXPECT_EQ(compteAchat(s, "", "FR", "N20", "2026-03-01"), "607");  // empty criterion
  t.sql(R"(DELETE FROM "GCPCPTACH" WHERE "IDENT" = '01')");
  EXPECT_EQ(compteAchat(s, "C2", "FR", "N20", "2026-03-01"), " (failed)");
}

TEST(AccountingStandinsTest, SectionControlSaysWhyAProjectRefusesAPiece) {
  test::TestSession t(true);
  t.sql(R"(INSERT INTO "AFAFFA" ("IDENT", "CODE", "DATE_DEBUT", "DATE_FIN", "DATE_CLOTURE")
           VALUES ('0000000019', 'AFF009', '2026-01-01', NULL, '2026-06-30'))");
  auto control = [&](const std::string& section, const std::string& date) {
    Field m1 = text("M1");
    Field m2 = text("M2");
    EvtParamRef evt{val("GAPECOM"),
                    val("CF26000001"),
                    Valeur::date(*Date::parse(date)),
                    val(section),
                    val("1"),
                    val(""),
                    ref(m1),
                    ref(m2)};
    int rc = t.session().appelerProcedure("AFAFFA", "CONTROLER_SECAN", &evt);
    return std::to_string(rc) + " " + m1.text() + " / " + m2.text();
  };
  EXPECT_EQ(control("AFF001", "2026-03-02"), "0  / ");
  EXPECT_EQ(control("AFF001", ""), "0  / ");  // no date, nothing to compare
  EXPECT_EQ(control("AFF404", "2026-03-02"),
            "1 Pièce CF26000001 : section analytique AFF404 / Aucune affaire ne porte le code "
            "<AFF404> !");
  EXPECT_EQ(control("AFF009", "2026-03-02"),
            "1 Pièce CF26000001 : section analytique AFF009 / L'affaire <AFF009> est clôturée "
            "depuis le 30/06/2026 !");
  EXPECT_EQ(control("AFF002", "2026-01-31"),
            "1 Pièce CF26000001 : section analytique AFF002 / La date de la pièce (31/01/2026) "
            "précède le début de l'affaire <AFF002> (01/02/2026) !");
  EXPECT_EQ(control("AFF003", "2026-10-01"),
            "1 Pièce CF26000001 : section analytique AFF003 / La date de la pièce (01/10/2026) "
            "dépasse la fin de l'affaire <AFF003> (30/09/2026) !");
  // The generic project reads still answer.
  EvtParamVal code{val("AFF002")};
  EXPECT_EQ(t.session().appelerProcedure("AFAFFA", "LECTURE_CODE", &code), 0);
  EXPECT_EQ(record(t.session(), "AFAFFA", "IDENT"), "0000000012");
}

TEST(AccountingStandinsTest, ReplaceEveryOccurrenceOnce) {
  test::TestSession t;
  auto replace = [&](const std::string& in, const std::string& pattern, const std::string& by) {
    Field textField = text("T", in);
    EvtParamRef evt{ref(textField), val(pattern), val(by)};
    EXPECT_EQ(t.session().appelerProcedure("SYSASCII", "REMPLACER", &evt), 0);
    return textField.text();
  };
  EXPECT_EQ(replace("Commande fournisseur n° $1", "$1", "CF26000001"),
            "Commande fournisseur n° CF26000001");
  EXPECT_EQ(replace("$1-$1-$", "$1", "x"), "x-x-$");
  EXPECT_EQ(replace("aa", "a", "aa"), "aaaa");  // what was put in is not scanned again
  EXPECT_EQ(replace("inchangé", "", "x"), "inchangé");
}

}  // namespace
}  // namespace quarvo::suite
