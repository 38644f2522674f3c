// The text-file loader of the shared import service ("COMMUN" "IMPORT_CHARGER_TXT") and the
// error list of the purchase import ("IMPORT_CONSULTER_ERREURS", "IMPORT_SAUVER_ERREURS").
//
// Rule: a file of format "EXCEL1" is tab-separated text, read by the exchange format's rule
// (host/TexteTabule.h: quoted cells may hold tabs and line breaks; blanks around cells are not
// part of them). Its first record names staging columns (any order, names compared in upper
// case; "IDENT" and "LIGNE_FICHIER" are the loader's own). "NUMERO_DOC" is required, and a file
// of purchase pieces ("IMM_PIECE_...") must also name what a piece cannot be generated without:
// "DATE_CREATION", "FOURNISSEUR", "ARTICLE", "QTE" and "PUHT" (a missing one refuses the file,
// naming it; a file without "QTE" would otherwise import every quantity as 0). Each
// further record is one row, numbered by the line it starts on. Lines end in LF or CRLF; each
// line is read as UTF-8 when it is valid UTF-8 and as Windows-1252 otherwise; a leading
// byte-order mark is dropped; blank lines are skipped. Dates are "dd/mm/yyyy" (ISO is read too),
// numbers take a decimal comma or point.
//
// A load is whole or nothing: the staging table is emptied and refilled in one transaction that
// commits only when every line was sound. Otherwise nothing changes in the staging table and one
// error row per fault is written into "IMM_ERREUR" ("COMPOSANT" the staging table, "CODE" the
// line's piece number when it could be read, "DESIG" the file and line, "CMT" the column, the
// value and what is wrong). The file is streamed line by line and lines longer than
// kLigneMax are refused, so memory stays bounded; after kErreursMax faults reading stops.
// Only tables whose name starts with "IMM_" can be loaded.
//
// "IMPORT_CHARGER_TXT" (table, path, mode, error flag by reference): the flag becomes 0 when
// the file was loaded, 1 otherwise; the mode ("M" in unattended runs) changes nothing here, as
// the loader never asks anything. "IMPORT_CONSULTER_ERREURS" (empty, "ach") shows every row of
// "IMM_ERREUR" in one message box, as an aligned table under its heading (the first kAfficheMax
// rows, then their count).
// "IMPORT_SAUVER_ERREURS" (path, option) writes the rows, by the same rule with a header line, to
// the file, creating its folder; option "O" appends to an existing file (several runs of one
// day share one report), anything else replaces it. It fails when the file cannot be written.
#pragma once

#include <cstddef>
#include <filesystem>
#include <istream>
#include <string>
#include <vector>

#include "host/automate/Automate.h"
#include "host/session/Session.h"

namespace quarvo::suite {

// Splits a stream into the cells of its records, in UTF-8. Holds one record at a time.
class LecteurTexte {
 public:
  static constexpr size_t kLigneMax = 64 * 1024;

  explicit LecteurTexte(std::istream& in) : in_(in) {}
  // The next non-blank record: true with its cells, or false at the end of the stream. A line
  // that cannot be read gives true with `defaut` set (and no cells).
  bool suivante(std::vector<std::string>& cellules, std::string& defaut);
  // Number of the line the record last returned starts on (1-based).
  size_t ligne() const { return ligne_; }
  // True when the stream turned out to be binary data (reading then stops).
  bool binaire() const { return binaire_; }

 private:
  std::istream& in_;
  size_t ligne_ = 0;
  size_t lues_ = 0;  // lines read so far
  bool binaire_ = false;
};

// Windows-1252 text as UTF-8; `valideUtf8` tells whether a text already is UTF-8.
bool valideUtf8(const std::string& text);
std::string depuisWindows1252(const std::string& text);

struct ErreurChargement {
  size_t ligne = 0;  // 0: the file as a whole
  std::string colonne;
  std::string valeur;
  std::string motif;
  std::string piece;  // the line's "NUMERO_DOC" when known
};

struct ResultatChargement {
  bool charge = false;
  size_t lignes = 0;  // rows staged (0 when refused)
  std::vector<ErreurChargement> erreurs;
};

class ImportTexte {
 public:
  static constexpr size_t kErreursMax = 100;
  static constexpr size_t kAfficheMax = 50;

  // Loads `fichier` into staging table `table`; writes the error rows when refused.
  static ResultatChargement charger(host::Session& session, const std::string& table,
                                    const std::filesystem::path& fichier);

  // The "COMMUN" labels, bound by Commun on itself.
  static void chargerTxt(host::Automate& commun, host::Evt* evt);
  static void consulterErreurs(host::Automate& commun, host::Evt* evt);
  static void sauverErreurs(host::Automate& commun, host::Evt* evt);

  // Next free error number (after the highest "IDENT" of "IMM_ERREUR"), as ten digits.
  static std::string prochainNumeroErreur(host::Session& session);
};

}  // namespace quarvo::suite
