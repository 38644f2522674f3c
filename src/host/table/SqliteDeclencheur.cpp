#include "host/table/SqliteDeclencheur.h"

#include <cctype>

namespace quarvo::host {

namespace {

// A token of SQL text: a word (keyword or identifier, upper case) or one character of
// punctuation. A quoted identifier is a word that is never a keyword; a string literal is "'".
struct Jeton {
  std::string texte;
  bool mot = false;
  bool cite = false;
};

std::string majuscules(std::string_view s) {
  std::string out(s);
  for (char& c : out) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
  return out;
}

bool lettre(char c) {
  auto u = static_cast<unsigned char>(c);
  return std::isalnum(u) || c == '_' || c == '$' || u >= 0x80;
}

// The tokens of `sql`, comments left out; false when a quote or comment does not end.
bool decouper(std::string_view sql, std::vector<Jeton>& jetons) {
  size_t i = 0;
  while (i < sql.size()) {
    char c = sql[i];
    if (std::isspace(static_cast<unsigned char>(c))) {
      ++i;
    } else if (sql.substr(i, 2) == "--") {
      size_t fin = sql.find('\n', i);
      i = fin == std::string_view::npos ? sql.size() : fin + 1;
    } else if (sql.substr(i, 2) == "/*") {
      size_t fin = sql.find("*/", i + 2);
      if (fin == std::string_view::npos) return false;
      i = fin + 2;
    } else if (c == '\'' || c == '"' || c == '`' || c == '[') {
      const char fermante = c == '[' ? ']' : c;
      std::string contenu;
      size_t j = i + 1;
      while (true) {
        if (j >= sql.size()) return false;
        if (sql[j] == fermante) {
          // A doubled quote stands for itself (not inside brackets).
          if (fermante != ']' && j + 1 < sql.size() && sql[j + 1] == fermante) {
            contenu += fermante;
            j += 2;
            continue;
          }
          break;
        }
        contenu += sql[j++];
      }
      if (c == '\'') {
        jetons.push_back({"'", false, false});
      } else {
        jetons.push_back({majuscules(contenu), true, true});
      }
      i = j + 1;
    } else if (lettre(c)) {
      size_t j = i;
      while (j < sql.size() && lettre(sql[j])) ++j;
      jetons.push_back({majuscules(sql.substr(i, j - i)), true, false});
      i = j;
    } else {
      jetons.push_back({std::string(1, c), false, false});
      ++i;
    }
  }
  return true;
}

bool motCle(const Jeton& j, std::string_view mot) {
  return j.mot && !j.cite && j.texte == mot;
}

bool ponctuation(const Jeton& j, char c) {
  return !j.mot && j.texte.size() == 1 && j.texte[0] == c;
}

using Instruction = std::vector<Jeton>;

// "[schema .] table" from position i: the table, upper case; empty when it is not a name.
std::string nomTable(const Instruction& in, size_t& i) {
  if (i >= in.size() || !in[i].mot) return "";
  std::string nom = in[i++].texte;
  if (i + 1 < in.size() && ponctuation(in[i], '.') && in[i + 1].mot) {
    nom = in[i + 1].texte;
    i += 2;
  }
  return nom;
}

bool motRowid(const Jeton& j) {
  return j.mot && !j.cite && (j.texte == "ROWID" || j.texte == "_ROWID_" || j.texte == "OID");
}

// Whether the tokens from i on are exactly "WHERE rowid = NEW.rowid" (either way round), with
// no FROM clause before it: the update touches the row that fired the trigger and no other.
bool seulementLaLigneDeclencheuse(const Instruction& in, size_t i) {
  int profondeur = 0;
  for (; i < in.size(); ++i) {
    if (ponctuation(in[i], '(')) ++profondeur;
    if (ponctuation(in[i], ')')) --profondeur;
    if (profondeur != 0) continue;
    if (motCle(in[i], "FROM")) return false;
    if (motCle(in[i], "WHERE")) break;
  }
  if (i >= in.size()) return false;
  std::vector<const Jeton*> reste;
  for (size_t k = i + 1; k < in.size(); ++k) {
    // "==" is "=" in SQLite.
    if (ponctuation(in[k], '=') && !reste.empty() && ponctuation(*reste.back(), '=')) continue;
    reste.push_back(&in[k]);
  }
  if (reste.size() != 5) return false;
  auto nouvelle = [&](size_t k) {
    return motCle(*reste[k], "NEW") && ponctuation(*reste[k + 1], '.') && motRowid(*reste[k + 2]);
  };
  return (motRowid(*reste[0]) && ponctuation(*reste[1], '=') && nouvelle(2)) ||
         (nouvelle(0) && ponctuation(*reste[3], '=') && motRowid(*reste[4]));
}

// The table one statement of a trigger body writes; false when the statement is not understood.
bool lireInstruction(const Instruction& in, const std::string& propre, Declencheur& d) {
  const Jeton& premier = in.front();
  if (motCle(premier, "SELECT")) return true;  // reads only (RAISE included)
  size_t i = 1;
  auto ou = [&] {  // "OR REPLACE", "OR IGNORE", ...
    if (i < in.size() && motCle(in[i], "OR")) i += 2;
  };
  auto attendre = [&](std::string_view mot) { return i < in.size() && motCle(in[i++], mot); };
  if (motCle(premier, "UPDATE")) {
    ou();
  } else if (motCle(premier, "INSERT")) {
    ou();
    if (!attendre("INTO")) return false;
  } else if (motCle(premier, "REPLACE")) {
    if (!attendre("INTO")) return false;
  } else if (motCle(premier, "DELETE")) {
    if (!attendre("FROM")) return false;
  } else {
    return false;  // WITH ..., or anything a later SQLite may allow
  }
  std::string table = nomTable(in, i);
  if (table.empty()) return false;
  bool ligne = motCle(premier, "UPDATE") && table == propre && seulementLaLigneDeclencheuse(in, i);
  d.ecritures.push_back({table, ligne});
  return true;
}

}  // namespace

Declencheur lireDeclencheur(std::string_view sql, std::string_view table) {
  Declencheur d;
  std::vector<Jeton> jetons;
  if (!decouper(sql, jetons)) return d;
  // The body runs from BEGIN to the final END; its statements end with ';' (an END inside one
  // closes a CASE).
  size_t i = 0;
  while (i < jetons.size() && !motCle(jetons[i], "BEGIN")) ++i;
  if (i == jetons.size()) return d;
  const std::string propre = majuscules(table);
  Instruction courante;
  int profondeur = 0;
  for (++i; i < jetons.size(); ++i) {
    const Jeton& j = jetons[i];
    if (ponctuation(j, '(')) ++profondeur;
    if (ponctuation(j, ')')) --profondeur;
    if (profondeur == 0 && ponctuation(j, ';')) {
      if (!courante.empty() && !lireInstruction(courante, propre, d)) return d;
      courante.clear();
      continue;
    }
    courante.push_back(j);
  }
  if (courante.size() != 1 || !motCle(courante.front(), "END")) return d;
  d.compris = true;
  return d;
}

}  // namespace quarvo::host
