#include "suite/Zumndoc.h"

#include <charconv>
#include <optional>

#include "host/session/Session.h"
#include "host/table/Table.h"
#include "host/value/Identifiant.h"

namespace quarvo::suite {

using namespace host;

namespace {
bool isNumber(const std::string& s, int64_t& out) {
  if (s.empty()) return false;
  auto [p, ec] = std::from_chars(s.data(), s.data() + s.size(), out);
  return ec == std::errc() && p == s.data() + s.size();
}
}  // namespace

int64_t avancerCompteur(Automate& caller, const std::string& base, const std::string& module,
                        const std::string& nom, const std::function<int64_t()>& premier) {
  Table counter(&caller, base, "ZUMNDOC", "COMPTEUR_" + nom);
  counter.effacerCriteres();
  counter.ajouterCritere("MODULE", '=', Valeur::chaine(module));
  counter.ajouterCritere("NOM", '=', Valeur::chaine(nom));
  counter.ajouterCritere("BASE", '=', Valeur::chaine(base));
  if (counter.lire(3) == 0) {
    int64_t next = toEntier(counter.valeur("DERNIER")) + 1;
    counter.ecrire("DERNIER", Valeur::entier(next));
    return counter.modifier() == 0 ? next : 0;
  }
  int64_t next = premier();
  counter.preparer();
  counter.ecrire("MODULE", Valeur::chaine(module));
  counter.ecrire("NOM", Valeur::chaine(nom));
  counter.ecrire("BASE", Valeur::chaine(base));
  counter.ecrire("DERNIER", Valeur::entier(next));
  return counter.inserer() == 0 ? next : 0;
}

Zumndoc::Zumndoc(Evt* evt) : Interface2(evt) {
  addBranch("ATTRIBUE_NUMERO", [this](Evt* e) { attribuer(e); });
  addBranch("VALIDE_NUMERO", [this](Evt* e) { valider(e); });
}

Zumndoc::Request Zumndoc::parse(const Evt* evt) {
  Request r;
  for (int i = 0; i + 1 < evt->nbParams(); ++i) {
    std::string v = evt->valeur(i).toChaine();
    int64_t n = 0;
    if (isNumber(v, n)) {
      r.width = static_cast<int>(n);
    } else if (v == "VOVOVA" || v == "GESCOM") {
      r.base = v;
    } else if (!v.empty() && v != "NUMEROS") {
      r.table = v;
    }
  }
  return r;
}

void Zumndoc::attribuer(Evt* evt) {
  Request r = parse(evt);
  Field& ident = chaine("P_IDENT");
  evt->param(evt->nbParams() - 1, ident, 1);
  if (r.table.empty() || r.width <= 0 || r.width > 18) {
    erreurMethode(1, evt);
    return;
  }
  // Read and advance the counter under the write lock. Inside a caller's transaction the lock
  // is already held and the single write below is atomic: no savepoint of its own is needed.
  std::optional<Transaction> tx;
  if (session().db().depth() == 0) tx.emplace(session().db());
  int64_t next = avancerCompteur(*this, r.base, r.table, "NUMEROS", [this, &r] {
    // Start above what the table already holds, so no identifier is ever given twice.
    int64_t premier = 1;
    Table numbered(this, r.base, r.table, "NUMEROTE");
    if (numbered.store().schema().index("IDENT")) {
      numbered.ouvrir();
      while (numbered.lire(1) == 0) {
        int64_t n = 0;
        if (isNumber(numbered.valeur("IDENT").toChaine(), n) && n >= premier) premier = n + 1;
      }
    }
    return premier;
  });
  if (next == 0) {
    erreurMethode(1, evt);
    return;
  }
  if (tx) tx->commit();
  ident.set(identifiant(next, r.width));
  erreurMethode(0, evt);
}

void Zumndoc::valider(Evt* evt) {
  Request r = parse(evt);
  int64_t n = 0;
  std::string given = evt->valeur(evt->nbParams() - 1).toChaine();
  Table counter(this, r.base, "ZUMNDOC", "COMPTEUR");
  counter.effacerCriteres();
  counter.ajouterCritere("MODULE", '=', Valeur::chaine(r.table));
  counter.ajouterCritere("NOM", '=', Valeur::chaine("NUMEROS"));
  counter.ajouterCritere("BASE", '=', Valeur::chaine(r.base));
  bool known = isNumber(given, n) && counter.lire(3) == 0 && n >= 1 &&
               n <= toEntier(counter.valeur("DERNIER"));
  erreurMethode(known ? 0 : 1, evt);
}

}  // namespace quarvo::suite
