// "AFMENU": the menus of the project module.
//
// Rule: "VERIF_DOSSIER" checks that the session's company folder is usable: it succeeds when
// the company ("AFSOCI" row whose "CODE" is the session's company) exists and has a current
// period ("MOIS_ANNEE" of six digits), and fails otherwise.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Afmenu : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Afmenu(host::Evt* evt);

 private:
  void verifDossier(host::Evt* evt);
};

}  // namespace quarvo::suite
