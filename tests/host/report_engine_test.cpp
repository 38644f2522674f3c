#include <gtest/gtest.h>

#include <fstream>
#include <regex>

#include "host/automate/Edition_etat.h"
#include "host/report/Etat.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

using report::Alignement;
using report::Bande;
using report::Etat;
using report::Niveau;
using report::Partie;

std::string pdfTexte(const std::filesystem::path& pdf) {
  FILE* p = popen(("pdftotext -layout '" + pdf.string() + "' -").c_str(), "r");
  std::string out;
  char buf[4096];
  for (size_t n; p != nullptr && (n = fread(buf, 1, sizeof buf, p)) > 0;) out.append(buf, n);
  if (p != nullptr) pclose(p);
  out = std::regex_replace(out, std::regex("\xC2\xA0"), " ");
  return std::regex_replace(out, std::regex("[ ]+"), " ");
}

// A small layout: groups by "GRP", a heading per group computed by a handler, body lines,
// group totals and an overall total.
const report::EnregistrementEtat essai([] {
  Etat e;
  e.nom = "ESSAI";
  e.paysage = false;
  e.titre = "'Relevé d'essai'";
  e.sousTitre = "V_RESUME";
  e.pied = "'Société — Île-de-France'";
  Partie p;
  p.table = "M_ESSAI";
  p.tri = {"GRP", "NUM"};
  p.colonnes = {{"N°", 20}, {"Libellé", 110}, {"Montant", 30, Alignement::Droite}};
  Niveau n;
  n.rupture = "GRP";
  n.saut = "V_SAUT";
  Bande h;
  h.cellules = {"'Groupe ' & GRP & ' : ' & V_TITRE"};
  h.pleineLargeur = true;
  h.style.gras = true;
  n.debut = {h};
  Bande f;
  f.cellules = {"'Total ' & GRP", "+MONTANT"};
  f.colonnes = {2, 1};
  f.style.gras = true;
  n.fin = {f};
  p.niveaux = {n};
  Bande corps;
  corps.cellules = {"NUM", "LIB", "MONTANT"};
  corps.condition = "MONTANT!=0.00";
  corps.zerosMasques = true;
  p.corps = {corps};
  Bande total;
  total.cellules = {"'Total général'", "+MONTANT"};
  total.colonnes = {2, 1};
  p.total = {total};
  e.parties = {p};
  return e;
}());

struct Essai {
  test::TestSession t;
  std::filesystem::path pdf = t.dir() / "essai.pdf";
  Edition_etat::Destination to{t.session(), pdf};

  void ligne(const std::string& grp, int64_t num, const std::string& lib, int64_t cents) {
    Table m(nullptr, "VOVOVA", "M_ESSAI", "TEST");
    m.preparer();
    m.ecrire("GRP", Valeur::chaine(grp));
    m.ecrire("NUM", Valeur::entier(num));
    m.ecrire("LIB", Valeur::chaine(lib));
    m.ecrire("MONTANT", Valeur::monnaie(Monnaie::fromMicros(cents * 10000)));
    m.inserer();
  }

  // Prints "ESSAI"; returns the outcome, the labels raised go to `trace`.
  int imprimer(const std::string& saut, std::string& trace, int& pages) {
    Edition_etat a(nullptr);
    a.nomEtat("ESSAI");
    a.chaine("V_RESUME", "", "Sélection : tout, période de l'été");
    a.chaine("V_SAUT", "", saut);
    Field& titre = a.chaine("V_TITRE");
    Table m(&a, "VOVOVA", "M_ESSAI", "");
    a.addBranch("LST_DEBUT1", [&](Evt*) {
      titre.set("calculé pour " + m.valeur("GRP").toChaine());
      trace += "D" + m.valeur("GRP").toChaine() + " ";
    });
    a.addBranch("LST_FIN1_IMPRIME", [&](Evt*) { trace += "F" + m.valeur("NUM").toChaine() + " "; });
    a.executer(nullptr);
    pages = a.pagesImprimees();
    return a.outcome();
  }
};

TEST(ReportEngineTest, PrintsGroupsTotalsAndPageNumbers) {
  Essai e;
  e.ligne("B", 10, "Dernier du groupe B", 100);
  e.ligne("A", 2,
          "Fournitures électriques — câbles, gaines et boîtes de dérivation pour la "
          "rénovation complète des salles de classe du premier étage",
          123456);
  e.ligne("A", 1, "Premier", -5000);
  e.ligne("A", 3, "Ligne à zéro", 0);
  std::string trace;
  int pages = 0;
  ASSERT_EQ(e.imprimer("", trace, pages), 0);
  // Groups in sort order; the closing label sees the group's last row.
  EXPECT_EQ(trace, "DA F3 DB F10 ");
  EXPECT_EQ(pages, 1);
  std::string t = pdfTexte(e.pdf);
  EXPECT_NE(t.find("Relevé d'essai"), std::string::npos);
  EXPECT_NE(t.find("Sélection : tout, période de l'été"), std::string::npos);
  EXPECT_NE(t.find("Groupe A : calculé pour A"), std::string::npos);
  EXPECT_NE(t.find("1 Premier -50,00"), std::string::npos);
  EXPECT_NE(t.find("2 Fournitures électriques — câbles"), std::string::npos);
  EXPECT_NE(t.find("1 234,56"), std::string::npos);
  EXPECT_NE(t.find("premier étage"), std::string::npos);  // wrapped, not cut
  EXPECT_EQ(t.find("Ligne à zéro"), std::string::npos);   // its condition does not hold
  EXPECT_NE(t.find("Total A 1 184,56"), std::string::npos);
  EXPECT_NE(t.find("Total B 1,00"), std::string::npos);
  EXPECT_NE(t.find("Total général 1 185,56"), std::string::npos);
  EXPECT_NE(t.find("Société — Île-de-France"), std::string::npos);
  EXPECT_NE(t.find("Page 1 / 1"), std::string::npos);
  EXPECT_FALSE(std::filesystem::exists(e.pdf.string() + ".part"));
}

TEST(ReportEngineTest, BreaksPagesAndRepeatsHeadings) {
  Essai e;
  for (int i = 1; i <= 90; ++i) e.ligne(i <= 5 ? "A" : "B", i, "Ligne " + std::to_string(i), 100);
  std::string trace;
  int pages = 0;
  ASSERT_EQ(e.imprimer("1", trace, pages), 0);  // each group on a page of its own
  EXPECT_EQ(pages, 3);
  std::string t = pdfTexte(e.pdf);
  EXPECT_NE(t.find("Page 3 / 3"), std::string::npos);
  size_t heads = 0;
  for (size_t at = t.find("Libellé"); at != std::string::npos; at = t.find("Libellé", at + 1))
    ++heads;
  EXPECT_EQ(heads, 3u);
  EXPECT_NE(t.find("Ligne 90"), std::string::npos);
  EXPECT_NE(t.find("Total général 90,00"), std::string::npos);
}

TEST(ReportEngineTest, UnknownLayoutOrUnwritableFileFails) {
  test::TestSession t;
  {
    Edition_etat a(nullptr);
    a.nomEtat("INCONNU");
    a.executer(nullptr);
    EXPECT_EQ(a.outcome(), 1);
  }
  EXPECT_NE(t.ui().transcriptText().find("L'état INCONNU n'existe pas"), std::string::npos);
  std::ofstream(t.dir() / "plain").put('x');
  Edition_etat::Destination to(t.session(), t.dir() / "plain" / "x.pdf");
  Edition_etat a(nullptr);
  a.nomEtat("ESSAI");
  Table m(&a, "VOVOVA", "M_ESSAI", "");
  a.executer(nullptr);
  EXPECT_EQ(a.outcome(), 1);
  EXPECT_NE(t.ui().transcriptText().find("Impression impossible"), std::string::npos);
}

TEST(ReportEngineTest, AmountsPrintTheFrenchWay) {
  EXPECT_EQ(report::texteMontant(Monnaie(0)), "0,00");
  EXPECT_EQ(report::texteMontant(Monnaie::fromMicros(-315'000'000)), "-315,00");
  EXPECT_EQ(report::texteMontant(*Monnaie::parse("1234567.885")), "1\u00A0234\u00A0567,89");
  EXPECT_EQ(report::texteMontant(*Monnaie::parse("-1000")), "-1\u00A0000,00");
}

// The same group totals over "M_ESSAI", as a part with body bands (a sorted walk; its body
// never prints) or as a part of totals only (one pass over the table).
Etat totaux(const std::string& nom, bool corps) {
  Etat e;
  e.nom = nom;
  e.pied = "'pied'";
  Partie p;
  p.table = "M_ESSAI";
  p.tri = {"GRP", "NUM"};
  p.colonnes = {{"Libellé", 150}, {"Montant", 30, Alignement::Droite}};
  Niveau n;
  n.rupture = "GRP";
  Bande h;
  h.cellules = {"'Groupe ' & GRP & ' ouvert sur ' & LIB"};
  h.pleineLargeur = true;
  n.debut = {h};
  Bande f;
  f.cellules = {"'Total ' & GRP & ' fermé sur ' & LIB", "+MONTANT"};
  n.fin = {f};
  p.niveaux = {n};
  if (corps) {
    Bande jamais;
    jamais.cellules = {"LIB"};
    jamais.condition = "V_JAMAIS";
    p.corps = {jamais};
  }
  Bande total;
  total.cellules = {"'Total général'", "+MONTANT"};
  p.total = {total};
  e.parties = {p};
  return e;
}
const report::EnregistrementEtat parRangs(totaux("ESSAI_RANGS", true));
const report::EnregistrementEtat totauxSeuls(totaux("ESSAI_TOTAUX", false));

TEST(ReportEngineTest, APartOfTotalsOnlyPrintsWhatTheSortedWalkPrints) {
  Essai e;
  // Out of order, with ties on the sort: the first inserted of equal rows comes first.
  e.ligne("B", 7, "b-seul", 700);
  e.ligne("A", 2, "a-deux-premier", 200);
  e.ligne("A", 1, "a-un", 100);
  e.ligne("A", 2, "a-deux-second", 250);
  e.ligne("C", 3, "c-trois", -300);
  e.ligne("C", 3, "c-trois-bis", 5);
  auto imprimer = [&](const std::string& nom, std::string& trace) {
    Edition_etat a(nullptr);
    a.nomEtat(nom);
    a.chaine("V_JAMAIS", "", "");
    Table m(&a, "VOVOVA", "M_ESSAI", "");
    a.addBranch("LST_DEBUT1", [&](Evt*) { trace += "D" + m.valeur("LIB").toChaine() + " "; });
    a.addBranch("LST_FIN1_IMPRIME", [&](Evt*) { trace += "F" + m.valeur("LIB").toChaine() + " "; });
    a.executer(nullptr);
    return pdfTexte(e.pdf);
  };
  std::string traceRangs;
  std::string traceTotaux;
  std::string rangs = imprimer("ESSAI_RANGS", traceRangs);
  std::string seuls = imprimer("ESSAI_TOTAUX", traceTotaux);
  EXPECT_EQ(traceRangs, "Da-un Fa-deux-second Db-seul Fb-seul Dc-trois Fc-trois-bis ");
  EXPECT_EQ(traceTotaux, traceRangs);
  EXPECT_EQ(seuls, rangs);
  EXPECT_NE(seuls.find("Groupe A ouvert sur a-un"), std::string::npos);
  EXPECT_NE(seuls.find("Total A fermé sur a-deux-second 5,50"), std::string::npos);
  EXPECT_NE(seuls.find("Total C fermé sur c-trois-bis -2,95"), std::string::npos);
  EXPECT_NE(seuls.find("Total général 9,55"), std::string::npos);
}

}  // namespace
}  // namespace quarvo::host
