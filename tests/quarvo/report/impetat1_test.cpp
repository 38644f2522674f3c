#include <gtest/gtest.h>

#include <regex>

#include "host/automate/Edition_etat.h"
#include "host/session/Session.h"
#include "quarvo/report/ReportFixture.h"

namespace quarvo {
namespace {

using host::Automate;
using test::ReportFixture;

// The PDF's text as a reader sees it, spaces collapsed (no-break spaces included).
std::string texte(const std::filesystem::path& pdf) {
  std::string raw = ReportFixture::commande("pdftotext -layout '" + pdf.string() + "' -");
  raw = std::regex_replace(raw, std::regex("\xC2\xA0"), " ");
  raw = std::regex_replace(raw, std::regex("[ ]+"), " ");
  return raw;
}

size_t occurrences(const std::string& text, const std::string& part) {
  size_t n = 0;
  for (size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) ++n;
  return n;
}

struct Impression {
  ReportFixture f;
  std::filesystem::path pdf = f.t().dir() / "suivi.pdf";
  host::Edition_etat::Destination destination{f.t().session(), pdf};

  std::string imprimer(const std::string& folio, const std::string& corps,
                       const std::string& corps2, const std::string& classement = {},
                       const std::string& recap = "0") {
    Automate& w = f.preparer("");
    ReportFixture::poser(w, "VSORTIE", "1");
    ReportFixture::poser(w, "VCLASSEMENT", classement);
    f.lever(w, "VCLASSEMENT_LIB_FERME");
    ReportFixture::poser(w, "VFOLIO", folio);
    ReportFixture::poser(w, "VCORPS", corps);
    ReportFixture::poser(w, "VCORPS2", corps2);
    ReportFixture::poser(w, "VRECAP1", recap);
    ReportFixture::poser(w, "VRECAP2", recap);
    EXPECT_EQ(f.lever(w, "VALID"), 0);
    EXPECT_TRUE(std::filesystem::exists(pdf));
    return texte(pdf);
  }
};

TEST(Impetat1Test, PrintsProjectsBudgetsLinesPiecesTotalsAndRecapitulations) {
  Impression p;
  p.f.t().sql(
      R"(UPDATE "GAPECOM" SET "DESIG" = 'Reprise complète des murets de la cour de récréation, '
                 || 'des soubassements du préau et des bordures du jardin pédagogique, y compris '
                 || 'l''évacuation des gravats et la remise en état des abords après chantier'
                 WHERE "IDENT" = '0000000403')");
  std::string t = p.imprimer("1", "1", "1", "AFRPS1", "1");
  // Heading with the selection summary, page numbers over the whole document.
  EXPECT_NE(t.find("Suivi des achats par affaire"), std::string::npos);
  EXPECT_NE(t.find("Toutes les affaires, classées par Chargé d'affaires ; Budgets de tous états ; "
                   "Période du 01/04/2026 au 31/12/2026"),
            std::string::npos);
  EXPECT_NE(t.find("Page 1 / 6"), std::string::npos);
  EXPECT_NE(t.find("Page 6 / 6"), std::string::npos);
  // Criterion, project, budget with its origin caption; a budget entered by hand has none.
  EXPECT_NE(t.find("Chargé d'affaires CDUPRE — Dupré"), std::string::npos);
  EXPECT_NE(t.find("Affaire AFF002 — Réseau d'eau potable — hameau de Sainte-Hélène"),
            std::string::npos);
  EXPECT_NE(t.find("Origine : Commande client n° BU26-0001"), std::string::npos);
  EXPECT_NE(t.find("Origine : Devis client n° BU26-0003"), std::string::npos);
  EXPECT_NE(t.find("Budget MANUEL — Budget du réseau d'eau potable"), std::string::npos);
  EXPECT_EQ(occurrences(t, "Origine :"), 3u);
  // Budget lines with their chapter ("2)" and "2" both print "2) "), pieces, line totals.
  EXPECT_NE(t.find("Prestation 15/01/2026 2) SST-MACO - Sous-traitance maçonnerie 9 000,00"),
            std::string::npos);
  EXPECT_NE(t.find("Prestation 15/01/2026 2) LOC-ENG - Location de nacelle élévatrice 1 800,00"),
            std::string::npos);
  EXPECT_NE(t.find("BC CF26000003 05/05/2026 Reprise complète des murets"), std::string::npos);
  // The long label wraps inside its cell: every word is printed.
  for (const char* words : {"des soubassements", "bordures du jardin", "gravats", "chantier"}) {
    EXPECT_NE(t.find(words), std::string::npos) << words;
  }
  EXPECT_NE(t.find("A AV26000001 15/04/2026 Retour d'un tableau électrique -315,00"),
            std::string::npos);
  EXPECT_NE(t.find("AVANT 01/04/2026 1 350,00 1 350,00 1 350,00"), std::string::npos);
  EXPECT_NE(t.find("Total 2) SST-MACO 9 000,00 3 600,00 0,00 1 764,00"), std::string::npos);
  EXPECT_NE(t.find("Total du budget BU26-0001 23 500,00 7 450,00 1 350,00 6 129,00"),
            std::string::npos);
  EXPECT_NE(t.find("Total de l'affaire AFF001 27 750,00 7 450,00 1 350,00 6 129,00"),
            std::string::npos);
  EXPECT_NE(t.find("Total chargé MLEROY 44 260,00 950,00 0,00 0,00"), std::string::npos);
  // The two recapitulations repeat the overall total.
  EXPECT_NE(t.find("Récapitulatif par chargé\n"), std::string::npos);
  EXPECT_NE(t.find("Récapitulatif par chargé et par affaire"), std::string::npos);
  EXPECT_NE(t.find("CDUPRE Dupré 27 750,00 7 450,00 1 350,00 6 129,00"), std::string::npos);
  EXPECT_NE(t.find("AFF003 Étude de faisabilité énergétique de la médiathèque 14 860,00"),
            std::string::npos);
  EXPECT_EQ(occurrences(t, "Total général 72 010,00 8 400,00 1 350,00 6 129,00"), 3u);
  // The title line of a budget gives no row at all.
  EXPECT_EQ(t.find("Phase 1"), std::string::npos);
}

TEST(Impetat1Test, OptionsChooseThePartsPrinted) {
  Impression p;
  // "10000": a page per project with budget totals, no lines, no recapitulation, no copy.
  std::string t = p.imprimer("1", "0", "0");
  EXPECT_NE(t.find("Page 3 / 3"), std::string::npos);
  EXPECT_NE(t.find("Total du budget BU26-0001 23 500,00 7 450,00 1 350,00 6 129,00"),
            std::string::npos);
  EXPECT_EQ(t.find("Prestation"), std::string::npos);
  EXPECT_EQ(t.find("Total 1)"), std::string::npos);
  EXPECT_EQ(t.find("Récapitulatif"), std::string::npos);
  std::string code = p.f.t().session().fenetre("QUARVO-SELETAT1")->champ("CODE_PARTAGE")->text();
  EXPECT_EQ(p.f.t().session().memoire(code + "A").size(), 0u);
  EXPECT_EQ(p.f.t().session().memoire(code + "C").size(), 0u);

  // "11000": the budget lines as one "Prestation" line each, without their pieces.
  Impression q;
  t = q.imprimer("1", "1", "0");
  EXPECT_NE(
      t.find("Prestation 2) SST-MACO - Sous-traitance maçonnerie 9 000,00 3 600,00 0,00 1 764,00"),
      std::string::npos);
  EXPECT_EQ(t.find("CF26000003"), std::string::npos);
  EXPECT_EQ(t.find("Total 2)"), std::string::npos);
}

}  // namespace
}  // namespace quarvo
