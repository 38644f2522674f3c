#include "suite/ImportTexte.h"

#include <algorithm>
#include <charconv>
#include <fstream>
#include <set>

#include "host/Texte.h"
#include "host/TexteTabule.h"
#include "host/table/Table.h"
#include "host/value/Identifiant.h"

namespace quarvo::suite {

using namespace host;
namespace fs = std::filesystem;

// ---------------------------------------------------------------------------------------------
// Text decoding

bool valideUtf8(const std::string& text) {
  const auto* s = reinterpret_cast<const unsigned char*>(text.data());
  size_t n = text.size();
  size_t i = 0;
  while (i < n) {
    unsigned char c = s[i];
    if (c < 0x80) {
      ++i;
      continue;
    }
    size_t len = 0;
    uint32_t cp = 0;
    if ((c & 0xE0) == 0xC0) {
      len = 2;
      cp = c & 0x1F;
    } else if ((c & 0xF0) == 0xE0) {
      len = 3;
      cp = c & 0x0F;
    } else if ((c & 0xF8) == 0xF0) {
      len = 4;
      cp = c & 0x07;
    } else {
      return false;
    }
    if (i + len > n) return false;
    for (size_t k = 1; k < len; ++k) {
      if ((s[i + k] & 0xC0) != 0x80) return false;
      cp = (cp << 6) | (s[i + k] & 0x3F);
    }
    // Overlong forms, surrogates and code points past U+10FFFF are not UTF-8.
    if ((len == 2 && cp < 0x80) || (len == 3 && cp < 0x800) || (len == 4 && cp < 0x10000) ||
        (cp >= 0xD800 && cp <= 0xDFFF) || cp > 0x10FFFF) {
      return false;
    }
    i += len;
  }
  return true;
}

namespace {

void ajouterUtf8(std::string& out, uint32_t cp) {
  if (cp < 0x80) {
    out += static_cast<char>(cp);
  } else if (cp < 0x800) {
    out += static_cast<char>(0xC0 | (cp >> 6));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  } else {
    out += static_cast<char>(0xE0 | (cp >> 12));
    out += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  }
}

// Code points of Windows-1252 bytes 0x80..0x9F (0xFFFD where the code page has none).
constexpr uint32_t kCp1252[32] = {0x20AC, 0xFFFD, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
                                  0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0xFFFD, 0x017D, 0xFFFD,
                                  0xFFFD, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
                                  0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0xFFFD, 0x017E, 0x0178};

}  // namespace

std::string depuisWindows1252(const std::string& text) {
  std::string out;
  out.reserve(text.size() + text.size() / 4);
  for (char ch : text) {
    auto c = static_cast<unsigned char>(ch);
    if (c < 0x80) {
      out += ch;
    } else if (c < 0xA0) {
      ajouterUtf8(out, kCp1252[c - 0x80]);
    } else {
      ajouterUtf8(out, c);
    }
  }
  return out;
}

// ---------------------------------------------------------------------------------------------
// Line reader

bool LecteurTexte::suivante(std::vector<std::string>& cellules, std::string& defaut) {
  cellules.clear();
  defaut.clear();
  std::string enregistrement;  // a record spans several lines while a quoted cell is open
  size_t debut = 0;
  while (!binaire_) {
    std::string line;
    bool tropLongue = false;
    bool lu = false;
    std::streambuf* buf = in_.rdbuf();
    while (true) {
      int c = buf->sbumpc();
      if (c == std::char_traits<char>::eof()) break;
      lu = true;
      if (c == '\n') break;
      if (line.size() < kLigneMax) {
        line += static_cast<char>(c);
      } else {
        tropLongue = true;  // the rest of the line is read and dropped
      }
    }
    if (!lu) {
      if (debut == 0) return false;
      // The file ends inside a quoted cell: the record is what was read.
      decouperTsv(enregistrement, cellules);
      ligne_ = debut;
      return true;
    }
    ++lues_;
    if (!line.empty() && line.back() == '\r') line.pop_back();
    if (lues_ == 1 && line.rfind("\xEF\xBB\xBF", 0) == 0) line.erase(0, 3);
    if (tropLongue || enregistrement.size() + line.size() > kLigneMax) {
      ligne_ = debut != 0 ? debut : lues_;
      defaut = "ligne de plus de " + std::to_string(kLigneMax) + " caractères";
      return true;
    }
    for (char ch : line) {
      auto c = static_cast<unsigned char>(ch);
      if (c < 0x20 && ch != '\t') {
        binaire_ = true;
        ligne_ = lues_;
        defaut = "contenu binaire (caractère de contrôle " + std::to_string(c) +
                 ") : ce n'est pas un fichier texte";
        return true;
      }
    }
    if (!valideUtf8(line)) line = depuisWindows1252(line);
    if (debut == 0) {
      if (sansBlancs(line).empty()) continue;
      debut = lues_;
      enregistrement = std::move(line);
    } else {
      enregistrement += '\n';
      enregistrement += line;
    }
    if (decouperTsv(enregistrement, cellules)) {
      ligne_ = debut;
      return true;
    }
  }
  return false;
}

// ---------------------------------------------------------------------------------------------
// Loading

namespace {

std::string majuscules(std::string s) {
  for (char& c : s) {
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
  }
  return s;
}

std::string apercu(const std::string& value) {
  return host::apercu(value, 40);
}

// The columns without which a piece cannot be generated: its number, date and supplier, and
// each line's article, quantity and price. Only the purchase staging tables have any.
std::vector<const char*> colonnesRequises(const std::string& table) {
  if (table.rfind("IMM_PIECE_", 0) != 0) return {"NUMERO_DOC"};
  return {"NUMERO_DOC", "DATE_CREATION", "FOURNISSEUR", "ARTICLE", "QTE", "PUHT"};
}

std::string attendu(ColKind kind) {
  switch (kind) {
    case ColKind::Date:
      return "date jj/mm/aaaa attendue";
    case ColKind::Integer:
      return "nombre entier attendu";
    case ColKind::Real:
    case ColKind::Decimal:
      return "nombre attendu (virgule ou point décimal)";
    default:
      return "valeur refusée";
  }
}

void ecrireErreurs(Session& session, const std::string& table, const fs::path& fichier,
                   const std::vector<ErreurChargement>& erreurs) {
  Transaction tx(session.db());
  Table err(nullptr, "VOVOVA", "IMM_ERREUR", "ERREURS");
  std::string next = ImportTexte::prochainNumeroErreur(session);
  int64_t n = 0;
  std::from_chars(next.data(), next.data() + next.size(), n);
  std::string nom = fichier.filename().string();
  if (nom.empty()) nom = fichier.string();
  for (const auto& e : erreurs) {
    err.preparer();
    err.ecrire("IDENT", Valeur::chaine(identifiant(n++)));
    err.ecrire("COMPOSANT", Valeur::chaine(table));
    err.ecrire("CODE", Valeur::chaine(e.piece));
    err.ecrire("DESIG", Valeur::chaine(e.ligne == 0 ? "Fichier " + nom
                                                    : "Fichier " + nom + ", ligne " +
                                                          std::to_string(e.ligne)));
    std::string cmt;
    if (!e.colonne.empty()) cmt = "colonne " + e.colonne;
    if (!e.valeur.empty() || !e.colonne.empty()) {
      cmt += (cmt.empty() ? "" : ", ") + std::string("valeur \"") + apercu(e.valeur) + "\"";
    }
    cmt += (cmt.empty() ? "" : " : ") + e.motif;
    err.ecrire("CMT", Valeur::chaine(cmt));
    err.inserer();
  }
  tx.commit();
}

}  // namespace

std::string ImportTexte::prochainNumeroErreur(Session& session) {
  Table err(nullptr, "VOVOVA", "IMM_ERREUR", "ERREURS_NUMERO");
  err.effacerCriteres();
  int64_t last = 0;
  if (err.lire(4) == 0) {
    std::string ident = err.valeur("IDENT").toChaine();
    std::from_chars(ident.data(), ident.data() + ident.size(), last);
  }
  (void)session;
  return identifiant(last + 1);
}

ResultatChargement ImportTexte::charger(Session& session, const std::string& table,
                                        const fs::path& fichier) {
  ResultatChargement r;
  auto refuser = [&](ErreurChargement e) {
    r.erreurs.push_back(std::move(e));
    r.charge = false;
    r.lignes = 0;
    ecrireErreurs(session, table, fichier, r.erreurs);
    return r;
  };

  TableStore* store = table.rfind("IMM_", 0) == 0 && !Session::isMemoryName(table)
                          ? session.db().store(table)
                          : nullptr;
  if (store == nullptr) {
    return refuser({0, "", table, "table d'import inconnue", ""});
  }
  std::error_code ec;
  if (fichier.empty() || !fs::exists(fichier, ec)) {
    return refuser({0, "", fichier.string(), "fichier introuvable", ""});
  }
  if (!fs::is_regular_file(fichier, ec)) {
    return refuser({0, "", fichier.string(), "ce n'est pas un fichier", ""});
  }
  std::ifstream in(fichier, std::ios::binary);
  if (!in) return refuser({0, "", fichier.string(), "fichier illisible", ""});

  LecteurTexte lecteur(in);
  std::vector<std::string> cells;
  std::string defaut;
  if (!lecteur.suivante(cells, defaut)) {
    return refuser({0, "", "", "fichier vide : la première ligne doit nommer les colonnes", ""});
  }
  if (!defaut.empty()) return refuser({lecteur.ligne(), "", "", defaut, ""});

  // Header: staging column names.
  const TableSchema& schema = store->schema();
  std::vector<size_t> colonnes;
  std::set<std::string> vues;
  size_t colPiece = SIZE_MAX;
  // The header's faults are bounded like the lines': past kErreursMax, they are only counted.
  size_t fautesEntete = 0;
  auto fauteEntete = [&](ErreurChargement e) {
    if (fautesEntete++ < kErreursMax) r.erreurs.push_back(std::move(e));
  };
  for (const auto& raw : cells) {
    std::string name = majuscules(raw);
    auto i = schema.index(name);
    if (!i || name == "IDENT" || name == "LIGNE_FICHIER") {
      fauteEntete({1, apercu(name), "", "colonne inconnue de la table " + table, ""});
      continue;
    }
    if (!vues.insert(name).second) {
      fauteEntete({1, name, "", "colonne nommée deux fois", ""});
      continue;
    }
    if (name == "NUMERO_DOC") colPiece = colonnes.size();
    colonnes.push_back(*i);
  }
  if (fautesEntete > kErreursMax) {
    r.erreurs.back().motif +=
        " (et " + std::to_string(fautesEntete - kErreursMax) + " autres colonnes refusées)";
  }
  if (r.erreurs.empty()) {
    for (const char* requise : colonnesRequises(table)) {
      if (vues.count(requise) == 0) {
        r.erreurs.push_back(
            {1, requise, "", "colonne absente : la première ligne doit la nommer", ""});
      }
    }
  }
  if (!r.erreurs.empty()) {
    ecrireErreurs(session, table, fichier, r.erreurs);
    return r;
  }

  size_t lignes = 0;
  {
    Transaction tx(session.db());
    Table staging(nullptr, "VOVOVA", table, "CHARGEMENT");
    staging.effacerCriteres();
    staging.supprimerTout();
    auto noter = [&](ErreurChargement e) {
      if (r.erreurs.size() < kErreursMax) r.erreurs.push_back(std::move(e));
    };
    while (r.erreurs.size() < kErreursMax && lecteur.suivante(cells, defaut)) {
      size_t no = lecteur.ligne();
      if (!defaut.empty()) {
        noter({no, "", "", defaut, ""});
        continue;
      }
      std::string piece = colPiece < cells.size() ? cells[colPiece] : std::string();
      if (cells.size() != colonnes.size()) {
        noter({no, "", "",
               std::to_string(cells.size()) + " valeurs pour " + std::to_string(colonnes.size()) +
                   " colonnes",
               piece});
        continue;
      }
      staging.preparer();
      bool saine = true;
      for (size_t k = 0; k < cells.size(); ++k) {
        const ColumnInfo& col = schema.columns()[colonnes[k]];
        if (!staging.ecrire(col.name, Valeur::chaine(cells[k]))) {
          noter({no, col.name, cells[k], attendu(col.kind), piece});
          saine = false;
        }
      }
      staging.ecrire("LIGNE_FICHIER", Valeur::entier(static_cast<int64_t>(no)));
      // Numbered here in file order (the table was just emptied), rather than by the table's
      // trigger, which would write every row a second time.
      staging.ecrire("IDENT", Valeur::chaine(identifiant(lignes + 1)));
      if (saine && r.erreurs.empty()) {
        if (staging.inserer() != 0) {
          noter({no, "", "", "ligne refusée par la base de données", piece});
        } else {
          ++lignes;
        }
      }
    }
    if (r.erreurs.size() >= kErreursMax) {
      r.erreurs.back().motif += " (trop d'erreurs : lecture arrêtée)";
    }
    if (r.erreurs.empty()) {
      tx.commit();
      r.charge = true;
      r.lignes = lignes;
      return r;
    }
  }  // the transaction rolls back: the staging table is as it was
  ecrireErreurs(session, table, fichier, r.erreurs);
  return r;
}

// ---------------------------------------------------------------------------------------------
// "COMMUN" labels

void ImportTexte::chargerTxt(Automate& commun, Evt* evt) {
  Field& flag = commun.entier("P_ERREUR_CHARGEMENT");
  evt->param(3, flag, 1);
  // A load that does not finish (the database refused it) is no load: the caller's flag says
  // so until the load has said otherwise.
  flag.set(int64_t{1});
  std::string table = evt->valeur(0).toChaine();
  std::string path = evt->valeur(1).toChaine();
  ResultatChargement r = charger(commun.session(), table, fs::path(path));
  flag.set(int64_t{r.charge ? 0 : 1});
  commun.erreurMethode(r.charge ? 0 : 1, evt);
}

void ImportTexte::consulterErreurs(Automate& commun, Evt* evt) {
  // One aligned table: its heading, then the first kAfficheMax rows, then their count.
  std::vector<std::vector<std::string>> rows{{"IDENT", "COMPOSANT", "CODE", "DESIG", "CMT"}};
  size_t total = 0;
  Table err(nullptr, "VOVOVA", "IMM_ERREUR", "CONSULTATION");
  err.effacerCriteres();
  err.ouvrir();
  while (err.lire(1) == 0) {
    if (++total > kAfficheMax) continue;
    rows.push_back({err.valeur("IDENT").toChaine(), err.valeur("COMPOSANT").toChaine(),
                    err.valeur("CODE").toChaine(), err.valeur("DESIG").toChaine(),
                    err.valeur("CMT").toChaine()});
  }
  std::string text = total == 0 ? "Aucune erreur." : tableauAligne(rows);
  if (!text.empty() && text.back() == '\n') text.pop_back();
  if (total > kAfficheMax) {
    text += "\n… et " + std::to_string(total - kAfficheMax) + " autres erreurs.";
  }
  commun.BoiteDialogue("Liste des erreurs d'import", text, 1, {"$1~OK"});
  commun.erreurMethode(0, evt);
}

void ImportTexte::sauverErreurs(Automate& commun, Evt* evt) {
  fs::path path(evt->valeur(0).toChaine());
  bool ajout = evt->valeur(1).toChaine() == "O";
  std::error_code ec;
  if (path.empty()) {
    commun.erreurMethode(1, evt);
    return;
  }
  if (path.has_parent_path()) fs::create_directories(path.parent_path(), ec);
  bool nouveau = !ajout || !fs::exists(path, ec) || fs::file_size(path, ec) == 0;
  std::ofstream out(path, std::ios::binary | (ajout ? std::ios::app : std::ios::trunc));
  if (!out) {
    commun.erreurMethode(1, evt);
    return;
  }
  if (nouveau) out << "IDENT\tCOMPOSANT\tCODE\tDESIG\tCMT\n";
  Table err(nullptr, "VOVOVA", "IMM_ERREUR", "SAUVEGARDE");
  err.effacerCriteres();
  err.ouvrir();
  while (err.lire(1) == 0) {
    out << enregistrementTsv({err.valeur("IDENT").toChaine(), err.valeur("COMPOSANT").toChaine(),
                              err.valeur("CODE").toChaine(), err.valeur("DESIG").toChaine(),
                              err.valeur("CMT").toChaine()})
        << '\n';
  }
  out.flush();
  commun.erreurMethode(out.good() ? 0 : 1, evt);
}

}  // namespace quarvo::suite
