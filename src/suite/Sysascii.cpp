#include "suite/Sysascii.h"

#include "host/session/Session.h"

namespace quarvo::suite {

using namespace host;

Sysascii::Sysascii(Evt* evt) : Interface2(evt) {
  addBranch("REMPLACER", [this](Evt* e) { remplacer(e); });
  addBranch("CONVERSION_CHEMIN", [this](Evt* e) { conversionChemin(e); });
}

std::string Sysascii::remplacer(const std::string& text, const std::string& pattern,
                                const std::string& replacement) {
  if (pattern.empty()) return text;
  std::string out;
  size_t from = 0;
  for (size_t at = text.find(pattern); at != std::string::npos; at = text.find(pattern, from)) {
    out.append(text, from, at - from);
    out += replacement;
    from = at + pattern.size();
  }
  out.append(text, from, std::string::npos);
  return out;
}

void Sysascii::remplacer(Evt* evt) {
  Field& text = chaine("P_TEXTE");
  evt->param(0, text, 1);
  text.set(remplacer(text.text(), evt->valeur(1).toChaine(), evt->valeur(2).toChaine()));
  erreurMethode(0, evt);
}

void Sysascii::conversionChemin(Evt* evt) {
  Field resultat("P_CHEMIN", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  evt->param(1, resultat, 1);
  std::string alias = evt->nbParams() > 0 ? evt->valeur(0).toChaine() : std::string();
  if (alias == "[zumdev]") {
    std::string dir = session().dataDir().string();
    if (!dir.empty() && dir.back() != '/') dir += '/';
    resultat.set(dir);
  } else {
    resultat.set(alias);
  }
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
