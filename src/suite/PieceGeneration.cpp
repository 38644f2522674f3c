#include "suite/PieceGeneration.h"

#include <atomic>
#include <chrono>
#include <ctime>

#include "host/session/Session.h"
#include "host/table/Table.h"
#include "suite/PurchasingServices.h"

namespace quarvo::suite {

using namespace host;

namespace {

constexpr const char* kEtat = "M_GENERATION";
constexpr const char* kErreurs = "M_GENERATION_ERREUR";

// Columns of the exchange record that describe one line.
constexpr const char* kColonnesLigne[] = {
    "GCPARTIC_IDENT", "GCPARTIC_CODE",  "DESIG",      "QTE",          "PUHT",
    "TAUX_REMISE",    "GCPDEPOT_IDENT", "SECAN_CODE", "GCPTVA_IDENT", "STYLE"};

}  // namespace

PieceGeneration::PieceGeneration(Evt* evt) : TableInterface(evt) {
  addBranch("DEBUT_GENERATION", [this](Evt* e) { debutGeneration(e); });
  addBranch("DEBUT_PIECE_GENEREE", [this](Evt* e) { debutPieceGeneree(e); });
  addBranch("LIGNE_COPIEE", [this](Evt* e) { ligneCopiee(e); });
  addBranch("FIN_PIECE_GENEREE", [this](Evt* e) { finPieceGeneree(e); });
  addBranch("FIN_GENERATION", [this](Evt* e) { finGeneration(e); });
  addBranch("TEXTE_ERREUR_GENERATION", [this](Evt* e) { texteErreur(e); });
  addBranch("VALIDE_DOCUMENT", [this](Evt* e) { valideDocument(e); });
}

std::string PieceGeneration::lignes() const {
  return "GAPL" + table().substr(4);
}

void PieceGeneration::duModule(Table& t) const {
  t.effacerCriteres();
  t.ajouterCritere("TABLE", '=', Valeur::chaine(table()));
}

void PieceGeneration::echec(Evt* evt, const std::string& text) {
  Table erreurs(this, "", kErreurs, "");
  duModule(erreurs);
  erreurs.supprimerTout();
  erreurs.preparer();
  erreurs.ecrire("TABLE", Valeur::chaine(table()));
  erreurs.ecrire("TEXTE", Valeur::chaine(text));
  erreurs.inserer();
  erreurMethode(1, evt);
}

void PieceGeneration::debutGeneration(Evt* evt) {
  static std::atomic<int64_t> compteur{0};
  Field& code = chaine("P_CODE_PARTAGE");
  evt->param(0, code, 1);
  std::string inst = table() + "-" + std::to_string(++compteur);

  Table etat(this, "", kEtat, "");
  duModule(etat);
  if (etat.lire(3) == 0) {
    Table ancien(this, "", "M_GENERE", "ANCIEN");
    ancien.effacerCriteres();
    ancien.ajouterCritere("INST", '=', etat.valeur("INST"));
    ancien.supprimerTout();
    etat.supprimer('N');
  }
  etat.preparer();
  etat.ecrire("TABLE", Valeur::chaine(table()));
  etat.ecrire("INST", Valeur::chaine(inst));
  etat.ecrire("PIECE_IDENT", Valeur::chaine(""));
  etat.ecrire("RANG", Valeur::entier(0));
  etat.inserer();

  Table genere(this, "", "M_GENERE", "M_GENERE2");
  genere.preparer();
  genere.ecrire("INST", Valeur::chaine(inst));
  for (const char* col : kColonnesLigne) genere.ecrire(col, Valeur::chaine(""));
  genere.inserer();
  code.set(inst);
  erreurMethode(0, evt);
}

void PieceGeneration::debutPieceGeneree(Evt* evt) {
  Field& ident = chaine("P_PIECE_IDENT");
  evt->param(0, ident, 1);
  ident.set("");
  Table etat(this, "", kEtat, "");
  duModule(etat);
  if (etat.lire(3) != 0) {
    echec(evt, "Aucune génération de pièces " + table() + " n'est en cours.");
    return;
  }
  Table four(this, "GESCOM", "GCPFOUR", "GENERATION");
  std::string fournisseur = evt->valeur(1).toChaine();
  if (fournisseur.empty() || four.chercher(3, "IDENT", '=', Valeur::chaine(fournisseur)) != 0) {
    echec(evt, fournisseur.empty()
                   ? std::string("La pièce n'a pas de fournisseur connu : elle n'est pas créée.")
                   : "Le fournisseur " + fournisseur + " n'existe pas : la pièce n'est pas créée.");
    return;
  }
  Date date = toDate(evt->valeur(2));
  if (date.empty()) {
    echec(evt, "La pièce n'a pas de date : elle n'est pas créée.");
    return;
  }
  std::string nouveau = numeroAchat(*this, table());
  if (nouveau.empty()) {
    echec(evt, "Aucun numéro n'a pu être attribué à la pièce " + table() + ".");
    return;
  }
  Table piece(this, "GESCOM", table(), "GENERATION");
  piece.preparer();
  piece.ecrire("IDENT", Valeur::chaine(nouveau));
  piece.ecrire("GCPFOUR_IDENT", Valeur::chaine(fournisseur));
  piece.ecrire("GCPREG_IDENT", four.valeur("GCPREG_IDENT"));
  piece.ecrire("GCPREGM_IDENT", four.valeur("GCPREGM_IDENT"));
  piece.ecrire("DATE_CREATION", Valeur::date(date));
  piece.ecrire("GCPDEPOT_IDENT", evt->valeur(3));
  if (evt->nbParams() > 6) piece.ecrire("SECAN_CODE", evt->valeur(6));
  if (table() == "GAPEFAC") {
    bool avoir = evt->nbParams() > 7 && toEntier(evt->valeur(7)) == 1;
    piece.ecrire("TYPE", Valeur::chaine(avoir ? "A" : "F"));
  }
  horodater(piece);
  piece.ecrire("VALIDEE", Valeur::entier(0));
  if (piece.inserer() != 0) {
    echec(evt, "La pièce " + nouveau + " n'a pas pu être enregistrée.");
    return;
  }
  etat.ecrire("PIECE_IDENT", Valeur::chaine(nouveau));
  etat.ecrire("RANG", Valeur::entier(0));
  etat.ecrire("REGIME", four.valeur("GCPREGM_IDENT"));
  etat.ecrire("BRUT", Valeur::monnaie(Monnaie()));
  etat.ecrire("TVA", Valeur::monnaie(Monnaie()));
  etat.ecrire("QTE", Valeur::dbl(0.0));
  etat.modifier();
  ident.set(nouveau);
  erreurMethode(0, evt);
}

void PieceGeneration::ligneCopiee(Evt* evt) {
  Table etat(this, "", kEtat, "");
  duModule(etat);
  if (etat.lire(3) != 0 || etat.valeur("PIECE_IDENT").toChaine().empty()) {
    echec(evt, "Aucune pièce " + table() + " n'est en cours de génération.");
    return;
  }
  Table genere(this, "", "M_GENERE", "M_GENERE2");
  if (genere.chercher(3, "INST", '=', etat.valeur("INST")) != 0) {
    echec(evt, "La zone d'échange de la génération est introuvable.");
    return;
  }
  std::string piece = etat.valeur("PIECE_IDENT").toChaine();
  int64_t rang = toEntier(etat.valeur("RANG")) + 1;
  std::string nouveau = numeroAchat(*this, lignes());
  if (nouveau.empty()) {
    echec(evt, "Aucun numéro n'a pu être attribué à la ligne de la pièce " + piece + ".");
    return;
  }
  Table ligne(this, "GESCOM", lignes(), "GENERATION");
  ligne.preparer();
  ligne.ecrire("IDENT", Valeur::chaine(nouveau));
  ligne.ecrire("NUMERO", Valeur::chaine(piece + "|" + std::to_string(rang)));
  bool commentaire = toEntier(genere.valeur("STYLE")) == 2;
  ligne.ecrire("STYLE", Valeur::entier(commentaire ? 2 : 0));
  for (const char* col : {"GCPARTIC_IDENT", "GCPARTIC_CODE", "DESIG", "GCPDEPOT_IDENT",
                          "SECAN_CODE", "GCPTVA_IDENT"}) {
    ligne.ecrire(col, Valeur::chaine(genere.valeur(col).toChaine()));
  }
  Monnaie ht;
  double qte = 0;
  if (!commentaire) {
    qte = toDouble(genere.valeur("QTE"));
    Monnaie puht = toMonnaie(genere.valeur("PUHT"));
    double remise = toDouble(genere.valeur("TAUX_REMISE"));
    Monnaie brut = valeurArrondie(puht * qte, 2, '=');
    ht = valeurArrondie(brut - brut * (remise / 100.0), 2, '=');
    ligne.ecrire("QTE", Valeur::dbl(qte));
    ligne.ecrire("PUHT", Valeur::monnaie(puht));
    ligne.ecrire("TAUX_REMISE", Valeur::dbl(remise));
    ligne.ecrire("BRUT", Valeur::monnaie(brut));
    ligne.ecrire("HT", Valeur::monnaie(ht));
  }
  if (ligne.inserer() != 0) {
    echec(evt, "La ligne " + std::to_string(rang) + " de la pièce " + piece +
                   " n'a pas pu être enregistrée.");
    return;
  }
  // The piece's running totals: the line's amount, its VAT at the rate of its code in the
  // piece's regime (to the cent), its quantity.
  Monnaie tva;
  std::string code = genere.valeur("GCPTVA_IDENT").toChaine();
  if (!commentaire && !code.empty()) {
    Table taux(this, "GESCOM", "GCPTXTVA", "TOTAUX");
    taux.effacerCriteres();
    taux.ajouterCritere("GCPREGM_IDENT", '=', etat.valeur("REGIME"));
    taux.ajouterCritere("GCPTVA_IDENT", '=', Valeur::chaine(code));
    if (taux.lire(3) == 0) {
      tva = valeurArrondie(ht * (toDouble(taux.valeur("TAUX")) / 100.0), 2, '=');
    }
  }
  etat.ecrire("BRUT", Valeur::monnaie(toMonnaie(etat.valeur("BRUT")) + ht));
  etat.ecrire("TVA", Valeur::monnaie(toMonnaie(etat.valeur("TVA")) + tva));
  etat.ecrire("QTE", Valeur::dbl(toDouble(etat.valeur("QTE")) + qte));
  etat.ecrire("RANG", Valeur::entier(rang));
  etat.modifier();
  erreurMethode(0, evt);
}

void PieceGeneration::finPieceGeneree(Evt* evt) {
  Table etat(this, "", kEtat, "");
  duModule(etat);
  std::string ident = etat.lire(3) == 0 ? etat.valeur("PIECE_IDENT").toChaine() : "";
  Table piece(this, "GESCOM", table(), "GENERATION");
  if (ident.empty() || piece.chercher(3, "IDENT", '=', Valeur::chaine(ident)) != 0) {
    echec(evt, "Aucune pièce " + table() + " n'est en cours de génération.");
    return;
  }
  Monnaie brut = toMonnaie(etat.valeur("BRUT"));
  Monnaie tva = toMonnaie(etat.valeur("TVA"));
  double quantite = toDouble(etat.valeur("QTE"));
  double remise = toDouble(piece.valeur("TAUX_REMISE"));
  double escompte = toDouble(piece.valeur("TAUX_ESCOMPTE"));
  Monnaie net = valeurArrondie(brut - brut * (remise / 100.0), 2, '=');
  net = valeurArrondie(net - net * (escompte / 100.0), 2, '=');
  Monnaie ht = net + toMonnaie(piece.valeur("PORT_HT")) + toMonnaie(piece.valeur("FRAIS_HT"));
  piece.ecrire("BRUT", Valeur::monnaie(brut));
  piece.ecrire("HT", Valeur::monnaie(ht));
  piece.ecrire("TTC", Valeur::monnaie(ht + tva));
  piece.ecrire("NET_A_PAYER", Valeur::monnaie(ht + tva));
  piece.ecrire("QTNT", Valeur::dbl(quantite));
  piece.ecrire("QTT", Valeur::dbl(0.0));
  if (piece.modifier() != 0) {
    echec(evt, "La pièce " + ident + " n'a pas pu être totalisée.");
    return;
  }
  etat.ecrire("PIECE_IDENT", Valeur::chaine(""));
  etat.modifier();
  erreurMethode(0, evt);
}

void PieceGeneration::finGeneration(Evt* evt) {
  Table etat(this, "", kEtat, "");
  duModule(etat);
  if (etat.lire(3) != 0) {
    echec(evt, "Aucune génération de pièces " + table() + " n'est en cours.");
    return;
  }
  Table genere(this, "", "M_GENERE", "FIN");
  genere.effacerCriteres();
  genere.ajouterCritere("INST", '=', etat.valeur("INST"));
  genere.supprimerTout();
  etat.supprimer('N');
  erreurMethode(0, evt);
}

void PieceGeneration::texteErreur(Evt* evt) {
  Field& texte = chaine("P_TEXTE");
  evt->param(0, texte, 1);
  Table erreurs(this, "", kErreurs, "");
  duModule(erreurs);
  texte.set(erreurs.lire(3) == 0 ? erreurs.valeur("TEXTE").toChaine()
                                 : "Erreur de génération des pièces " + table() + ".");
  erreurMethode(0, evt);
}

void PieceGeneration::valideDocument(Evt* evt) {
  Table piece(this, "GESCOM", table(), "VALIDATION");
  if (piece.chercher(3, "IDENT", '=', evt->valeur(0)) != 0) {
    echec(evt, "La pièce " + evt->valeur(0).toChaine() + " n'existe pas : elle n'est pas validée.");
    return;
  }
  piece.ecrire("VALIDEE", Valeur::entier(1));
  erreurMethode(piece.modifier(), evt);
}

}  // namespace quarvo::suite
