// "QUARVO-INTERFACE": the module's entry point for menus and other modules.
//
// Its labels open the module's screens after the folder and rights checks, run its treatments,
// check a right of the current user, remove the links of a deleted piece, project or budget,
// and above all keep a budget line's follow-up figures in step with the pieces linked to it:
// "SUPPRESSION_MAJ" takes the links' contribution out of a budget line, "VALIDATION_MAJ" puts it
// back; run in that order around a change of the links, the pair leaves the line's committed and
// realised figures exactly as the links say. "LECTURE" with a link-row identifier (answered by the
// interface base) leaves the row in "I_QUARVO". Created per call; keeps only the application
// identifier read at "INIT".
#pragma once

#include "host/automate/Interface2.h"
#include "host/table/Champ.h"

namespace quarvo {

class QUARVOInterface : public host::Interface2 {
 public:
  explicit QUARVOInterface(host::Evt* evt);

  void init(host::Evt* evt) override;
  void gestion(host::Evt* evt) override;
  void analyser(host::Evt* evt);
  void annuler(host::Evt* evt);
  void imputer(host::Evt* evt);
  void seletat1(host::Evt* evt);
  void importer(host::Evt* evt);
  void importer_auto(host::Evt* evt);
  void verif_droits(host::Evt* evt);
  void validation_maj(host::Evt* evt);
  void suppression_maj(host::Evt* evt);
  void supprimer_piece(host::Evt* evt);
  void purger_afaffa(host::Evt* evt);
  void purger_afebud(host::Evt* evt);

 private:
  // Withdraws (sign -1) or adds back (sign +1) the links of a budget line; see the header note.
  void mettreAJour(host::Evt* evt, int sign);
  bool verifierDossier(host::Evt* evt);
  // Reads the current user's rights; shows message 36 when they cannot be read.
  bool lireDroits();
  // Folder check, then right `letter`, then launch of `automaton`.
  void ouvrir(host::Evt* evt, const std::string& letter, const std::string& automaton);
  bool droit(const std::string& letter, const std::string& refusal, const std::string& function);

  host::Field& vChoix_;
  host::Field& application_;
  host::Table sysappli_;
  host::Table aflbud_;
  host::Table quarvo_;
  host::Table resu_;
  host::Table afpres_;
  host::Table afsoci_;
  host::Table sysdroit_;
  host::Table syscompo_;
  host::Champ cleCompo2_;
};

}  // namespace quarvo
