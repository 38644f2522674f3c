#include "suite/TransformationPiece.h"

#include <algorithm>
#include <charconv>
#include <cstdio>

#include "host/session/Session.h"
#include "host/table/Database.h"
#include "suite/TableInterface.h"
#include "suite/Zumndoc.h"

namespace quarvo::suite {

using namespace host;

namespace {

// What a target line takes from its source line, besides the quantity.
constexpr const char* kColonnesCopiees[] = {"GCPARTIC_IDENT", "GCPARTIC_CODE", "DESIG",
                                            "PUHT",           "TAUX_REMISE",   "GCPDEPOT_IDENT",
                                            "SECAN_CODE",     "GCPTVA_IDENT",  "STYLE"};

// Quantities are floating: what is left of a line below this is nothing.
constexpr double kRien = 1e-9;

}  // namespace

TransformationPiece::TransformationPiece(Evt* evt, const SortePiece& sorte)
    : Traitmnt(evt),
      sorte_(sorte),
      typeCible_(entier("P_TYPE_CIBLE")),
      source_(chaine("P_IDENT")),
      codePartage_(chaine("V_CODE_PARTAGE")),
      cible_(chaine("V_CIBLE")) {
  lierParametres(evt, {{&typeCible_, 0}, {&source_, 0}});
  nomBase(sorte_.base);
  nomTable(sorte_.module);
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
}

bool TransformationPiece::appeler(const char* module, const char* label, Evt& evt) {
  appelerProcedure("*", module, "INTERFACE", label, &evt, -1);
  return erreurMethode() == 0;
}

void TransformationPiece::faire(Evt* evt) {
  erreurMethode(transformer() ? 0 : 1, evt);
}

bool TransformationPiece::transformer() {
  const SortePiece* cible = sorteDuType(typeCible_.entier());
  if (cible == nullptr || std::find(sorte_.cibles.begin(), sorte_.cibles.end(), cible->typePiece) ==
                              sorte_.cibles.end()) {
    return false;
  }
  Transaction tx(session().db());
  Table source(this, sorte_.base, sorte_.module, "SOURCE");
  source.verrouiller('E');
  if (source_.text().empty() || source.chercher(3, "IDENT", '=', source_.value()) != 0 ||
      toEntier(source.valeur("VALIDEE")) != 1) {
    return false;
  }
  Table lignes(this, sorte_.base, sorte_.lignes, "SOURCE");
  std::vector<LigneAReporter> aReporter;
  selectionnerLignes(lignes, source_.text());
  while (lignes.lire(1) == 0) {
    double reste = toDouble(lignes.valeur("QTE")) - toDouble(lignes.valeur("QTE_SOLDEE")) -
                   toDouble(lignes.valeur("QTT"));
    if (toEntier(lignes.valeur("STYLE")) == 2 || reste <= kRien) continue;
    aReporter.push_back({lignes.courantId(), rangLigne(lignes.valeur("NUMERO").toChaine()), reste});
  }
  if (aReporter.empty()) return false;

  EvtParamRef debut{ref(codePartage_), val("U")};
  if (!appeler(cible->module, "DEBUT_GENERATION", debut)) return false;
  bool fait = generer(*cible, source, lignes, aReporter);
  // The generation is closed whatever happened: its exchange record is the session's, which
  // the rollback does not reach.
  EvtParamVal fin;
  appeler(cible->module, "FIN_GENERATION", fin);
  if (!fait) return false;
  tx.commit();
  return true;
}

bool TransformationPiece::generer(const SortePiece& cible, Table& source, Table& lignes,
                                  const std::vector<LigneAReporter>& aReporter) {
  EvtParamRef piece{ref(cible_),
                    source.valeur("GCPFOUR_IDENT"),
                    Valeur::date(Date::today()),
                    source.valeur("GCPDEPOT_IDENT"),
                    val(""),
                    val(-1),
                    source.valeur("SECAN_CODE")};
  if (!appeler(cible.module, "DEBUT_PIECE_GENEREE", piece)) return false;
  if (!completerEntete(cible, source)) return false;

  Table genere(this, "", "M_GENERE", "TRANSFORMATION");
  if (genere.chercher(3, "INST", '=', codePartage_.value()) != 0) return false;
  Table chainage(this, "GESCOM", "CHAINAGE", "TRANSFORMATION");
  double reporte = 0;
  int64_t rang = 0;
  for (const LigneAReporter& l : aReporter) {
    if (lignes.aller(l.ligne) != 0) return false;
    for (const char* colonne : kColonnesCopiees) genere.ecrire(colonne, lignes.valeur(colonne));
    genere.ecrire("QTE", Valeur::dbl(l.reste));
    genere.modifier();
    EvtParamVal copie;
    if (!appeler(cible.module, "LIGNE_COPIEE", copie)) return false;
    ++rang;
    chainage.preparer();
    chainage.ecrire("CLE_SRC", Valeur::chaine(std::to_string(sorte_.typePiece) + "|" +
                                              source_.text() + "|" + l.rang));
    chainage.ecrire("TYPE_DST", Valeur::entier(cible.typePiece));
    chainage.ecrire("IDE_DST", cible_.value());
    chainage.ecrire("LIG_DST", Valeur::chaine(std::to_string(rang)));
    if (chainage.inserer() != 0) return false;
    lignes.ecrire("QTT", Valeur::dbl(toDouble(lignes.valeur("QTT")) + l.reste));
    if (lignes.modifier() != 0) return false;
    reporte += l.reste;
  }
  EvtParamVal totaux;
  if (!appeler(cible.module, "FIN_PIECE_GENEREE", totaux)) return false;
  EvtParamVal valide{cible_.value()};
  if (!appeler(cible.module, "VALIDE_DOCUMENT", valide)) return false;

  Table entete(this, cible.base, cible.module, "CIBLE");
  if (entete.chercher(3, "IDENT", '=', cible_.value()) != 0) return false;
  source.ecrire("QTT", Valeur::dbl(toDouble(source.valeur("QTT")) + reporte));
  source.ecrire("QTNT", Valeur::dbl(std::max(0.0, toDouble(source.valeur("QTNT")) - reporte)));
  source.ecrire("MTNT_HT", Valeur::monnaie(toMonnaie(source.valeur("MTNT_HT")) +
                                           toMonnaie(entete.valeur("HT"))));
  source.ecrire("MTNT_TTC", Valeur::monnaie(toMonnaie(source.valeur("MTNT_TTC")) +
                                            toMonnaie(entete.valeur("TTC"))));
  horodater(source);
  return source.modifier() == 0;
}

bool TransformationPiece::completerEntete(const SortePiece& cible, Table& source) {
  Table entete(this, cible.base, cible.module, "CIBLE");
  if (entete.chercher(3, "IDENT", '=', cible_.value()) != 0) return false;
  std::string numero = numeroDocument(cible);
  if (numero.empty()) return false;
  entete.ecrire("NUMERO_DOC", Valeur::chaine(numero));
  entete.ecrire("ORIGINE", source.valeur("NUMERO_DOC"));
  // The totals of the generation apply the header's discounts: they are there before them.
  for (const char* colonne : {"DESIG", "GAPAPPOR_IDENT", "TAUX_REMISE", "TAUX_ESCOMPTE"}) {
    entete.ecrire(colonne, source.valeur(colonne));
  }
  return entete.modifier() == 0;
}

std::string TransformationPiece::numeroDocument(const SortePiece& cible) {
  std::string prefixe = cible.prefixe;
  int64_t suivant = avancerCompteur(*this, cible.base, cible.module, "NUMERO_DOC", [&] {
    // Above every number the kind already has, whatever its year.
    int64_t premier = 1;
    Table pieces(this, cible.base, cible.module, "NUMERO_DOC");
    pieces.effacerCriteres();
    pieces.ajouterCritere("NUMERO_DOC", '/', Valeur::chaine(prefixe), 'R');
    pieces.ouvrir();
    while (pieces.lire(1) == 0) {
      std::string numero = pieces.valeur("NUMERO_DOC").toChaine();
      int64_t n = 0;
      const char* debut = numero.data() + std::min(numero.size(), prefixe.size() + 2);
      auto [fin, ec] = std::from_chars(debut, numero.data() + numero.size(), n);
      if (ec == std::errc() && fin == numero.data() + numero.size() && n >= premier) {
        premier = n + 1;
      }
    }
    return premier;
  });
  if (suivant == 0) return "";
  char numero[32];
  std::snprintf(numero, sizeof numero, "%s%02d%06lld", prefixe.c_str(), Date::today().year() % 100,
                static_cast<long long>(suivant));
  return numero;
}

}  // namespace quarvo::suite
