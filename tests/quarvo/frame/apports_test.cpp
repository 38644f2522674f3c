// One rule for what a piece books, whichever path links it: pieces linked by the import are
// linked exactly as the pointing and the imputation link them, with the same budget figures,
// whether or not the company books goods received.
#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "quarvo/import/ImportSupport.h"

namespace quarvo {
namespace {

using namespace host;
using test::ligne;
using test::requete;

// Orders: a line whose net price rounds differently from its discounted gross amount (3 × 0.335
// less 10 % is 0.90, while 1.01 less 10 % is 0.91), two lines of one service, a 25 % discount,
// and an order the file settles.
std::string commandes() {
  return test::enteteAutre() +
         ligne({"CF26500001", "05/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                "3", "0,335", "10", "20", "", "", "", "0"}) +
         ligne({"CF26500001", "05/12/2026", "ELECDIS", "AFF001", "BU26-0001", "TABLEAU-ELEC", "",
                "1", "350", "10", "20", "", "", "", "0"}) +
         ligne({"CF26500002", "06/12/2026", "HYDROSAN", "AFF002", "MANUEL", "ROBINET-EQ", "", "4",
                "100", "25", "20", "", "", "", "0"}) +
         ligne({"CF26500003", "07/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                "2", "180", "0", "20", "", "", "", "1"});
}

std::string receptions() {
  return test::enteteAutre() +
         ligne({"BR26500001", "08/12/2026", "LOCAPRO", "AFF001", "BU26-0001", "NACELLE-JOUR", "",
                "2", "180", "5", "20", "", "", "", "0"}) +
         ligne({"BR26500002", "08/12/2026", "HYDROSAN", "AFF002", "MANUEL", "ROBINET-EQ", "", "5",
                "12,5", "0", "20", "", "", "", "1"});
}

std::string factures() {
  return test::enteteFf() +
         ligne({"FA26500001", "09/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                "2", "180", "0", "20", "", "", "", "EDC-1", "F", "1"}) +
         ligne({"FA26500001", "09/12/2026", "ELECDIS", "AFF001", "BU26-0001", "TABLEAU-ELEC", "",
                "1", "350", "10", "20", "", "", "", "EDC-1", "F", "1"}) +
         ligne({"FA26500001", "09/12/2026", "ELECDIS", "AFF001", "", "", "Livré", "0", "0", "0",
                "0", "", "", "", "EDC-1", "F", "1"}) +
         ligne({"AV26500002", "10/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                "1", "180", "0", "20", "", "", "", "EDC-A", "A", "1"});
}

struct Piece {
  const char* kind;   // pointing kind letter
  const char* table;  // header table
  const char* number;
};
const Piece kPieces[] = {{"C", "GAPECOM", "CF26500001"}, {"C", "GAPECOM", "CF26500002"},
                         {"C", "GAPECOM", "CF26500003"}, {"B", "GAPEBL", "BR26500001"},
                         {"B", "GAPEBL", "BR26500002"},  {"F", "GAPEFAC", "FA26500001"},
                         {"F", "GAPEFAC", "AV26500002"}};

class OneBookingRuleTest : public ::testing::TestWithParam<const char*> {
 protected:
  OneBookingRuleTest() : t_(true) {
    t_.sql(std::string("UPDATE \"AFSOCI\" SET \"OPTION9\" = '") + GetParam() + "'");
  }
  void importer(const std::string& kind, const std::string& file) {
    auto path = test::ecrireFichier(t_, kind + ".txt", file);
    ASSERT_EQ(test::charger(t_, "IMM_PIECE_" + kind, path.string()), 0);
    ASSERT_EQ(test::lancer(t_, "IMPORT_CONTROLER_" + kind), 0) << t_.ui().transcriptText();
    ASSERT_EQ(test::lancer(t_, "IMPORT_GENERER_" + kind), 0) << t_.ui().transcriptText();
  }
  void point(const Piece& p) {
    for (const char* work : {"M_EAPPR", "M_LAPPR", "M_VAPPR"}) t_.session().memoire(work).clear();
    EvtParamVal evt{val(""),       val("31/12/2026"), val(p.kind), val(0),
                    val(p.number), val(p.number),     val("")};
    t_.session().appelerModule("QUARVO-POINTER_PIECES", &evt);
  }
  // The allocations the pointing proposes with a quantity: "budget line quantity amount".
  std::string proposal() {
    Table t(nullptr, "VOVOVA", "M_VAPPR", "T");
    t.ouvrir();
    std::string out;
    while (t.lire(1) == 0) {
      if (toDouble(t.valeur("QTE")) == 0) continue;
      out += t.valeur("AFLBUD_IDENT").toChaine() + " " + t.valeur("QTE").toChaine() + " " +
             t.valeur("HT").toChaine() + "; ";
    }
    return out;
  }
  std::string ident(const Piece& p) { return t_.value(p.table, "IDENT", "NUMERO_DOC", p.number); }
  // Every link row but its identifier and update stamp, and every budget line's figures.
  std::string state() {
    return requete(t_, R"(SELECT CLE_COMPO, CLE_COMPO2, AFEBUD_IDENT, AFAFFA_IDENT, AFAFFA_CODE,
                                 AFLBUD_IDENT, COMPOSANT, COMPOSANT_IDENT, PIECE, DATE_PIECE,
                                 QTE, QTT, HT
                            FROM "QUARVO" ORDER BY CLE_COMPO)") +
           requete(t_, R"(SELECT IDENT, VENG, VREA, VRAF, HRAF, round(AVT, 6) FROM "AFLBUD"
                          ORDER BY IDENT)");
  }
  test::TestSession t_;
};

TEST_P(OneBookingRuleTest, ImportedPiecesAreLinkedAsThePointingLinksThem) {
  importer("CF", commandes());
  importer("BF", receptions());
  importer("FF", factures());
  const std::string imported = state();
  // Net amounts; the settled order and receipt are linked to nothing.
  EXPECT_EQ(requete(t_, R"(SELECT PIECE, AFLBUD_IDENT, QTE, HT FROM "QUARVO" ORDER BY PIECE)"),
            "AV26500002|0000000211|-1.0|-180.00\n"
            "BR26500001|0000000214|2.0|342.00\n"
            "CF26500001|0000000211|4.0|315.90\n"
            "CF26500002|0000000221|4.0|300.00\n"
            "FA26500001|0000000211|3.0|675.00\n");
  bool receipts = std::string(GetParam()) == "O";
  EXPECT_EQ(requete(t_, R"(SELECT VREA FROM "AFLBUD" WHERE IDENT = '0000000214')"),
            receipts ? "342.00;342.00;342.00\n" : "0.00;0.00;0.00\n");

  for (const Piece& p : kPieces) {
    SCOPED_TRACE(p.number);
    // Linked as the pointing would link it: pointing it again proposes nothing.
    point(p);
    EXPECT_EQ(proposal(), "");
    // Unlinked, pointed and imputed again: the same links, the same figures.
    EvtParamVal cancel{val(p.table), val(ident(p))};
    ASSERT_EQ(t_.session().appelerModule("QUARVO-ANNULER1", &cancel), 0);
    point(p);
    t_.session().appelerModule("QUARVO-IMPUTER_PIECES", nullptr);
    EXPECT_EQ(state(), imported);
  }
}

INSTANTIATE_TEST_SUITE_P(ReceiptsBookedOrNot, OneBookingRuleTest, ::testing::Values("O", "N"));

}  // namespace
}  // namespace quarvo
