#include "host/TexteTabule.h"

namespace quarvo::host {

namespace {

bool blanc(char c) {
  return c == ' ' || c == '\t';
}

}  // namespace

bool decouperTsv(std::string_view texte, std::vector<std::string>& cellules, char separateur) {
  cellules.clear();
  bool ouvert = false;
  size_t i = 0;
  while (true) {
    while (i < texte.size() && texte[i] == ' ') ++i;
    std::string valeur;
    if (i < texte.size() && texte[i] == '"') {
      ++i;
      ouvert = true;
      while (i < texte.size()) {
        if (texte[i] == '"') {
          if (i + 1 < texte.size() && texte[i + 1] == '"') {
            valeur += '"';
            i += 2;
            continue;
          }
          ++i;
          ouvert = false;
          break;
        }
        valeur += texte[i++];
      }
    }
    // What follows (the whole cell when it is not quoted) runs to the separator.
    size_t fin = ouvert ? texte.size() : texte.find(separateur, i);
    if (fin == std::string_view::npos) fin = texte.size();
    std::string_view reste = texte.substr(i, fin - i);
    while (!reste.empty() && blanc(reste.front())) reste.remove_prefix(1);
    while (!reste.empty() && blanc(reste.back())) reste.remove_suffix(1);
    valeur += reste;
    cellules.push_back(std::move(valeur));
    if (fin >= texte.size()) return !ouvert;
    i = fin + 1;
  }
}

std::string celluleTsv(std::string_view value, char separateur) {
  bool guillemets = !value.empty() && (blanc(value.front()) || blanc(value.back()));
  for (char c : value) {
    if (c == separateur || c == '\n' || c == '\r' || c == '"') guillemets = true;
  }
  if (!guillemets) return std::string(value);
  std::string out = "\"";
  for (char c : value) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + "\"";
}

std::string enregistrementTsv(const std::vector<std::string>& cellules, char separateur) {
  std::string out;
  for (size_t i = 0; i < cellules.size(); ++i) {
    if (i > 0) out += separateur;
    out += celluleTsv(cellules[i], separateur);
  }
  return out;
}

std::vector<std::string> cellulesTsv(std::string_view enregistrement, char separateur) {
  std::vector<std::string> cellules;
  decouperTsv(enregistrement, cellules, separateur);
  return cellules;
}

bool lireEnregistrementTsv(std::istream& in, std::string& enregistrement, size_t& lignes) {
  enregistrement.clear();
  lignes = 0;
  std::string ligne;
  std::vector<std::string> cellules;
  while (std::getline(in, ligne)) {
    if (!ligne.empty() && ligne.back() == '\r') ligne.pop_back();
    if (lignes > 0) enregistrement += '\n';
    enregistrement += ligne;
    ++lignes;
    if (decouperTsv(enregistrement, cellules)) return true;
  }
  return lignes > 0;
}

}  // namespace quarvo::host
