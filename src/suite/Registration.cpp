// Registration of the sibling-module stand-ins: each module's "INTERFACE" automaton under the
// name "<MODULE>-INTERFACE". Table-backed modules share one implementation. The piece modules
// also register their documents' automata, "<MODULE>-GESTION", "-TRF" and "-SOLDER", each one
// implementation made for the kind (SortesPiece.h).
#include "host/automate/Automate.h"
#include "host/automate/Registry.h"
#include "suite/Action.h"
#include "suite/Afaffa.h"
#include "suite/Afdroi.h"
#include "suite/Afeffo.h"
#include "suite/Afmenu.h"
#include "suite/Afmouv.h"
#include "suite/Afpara.h"
#include "suite/Afpfst.h"
#include "suite/Afresu.h"
#include "suite/Afsoci.h"
#include "suite/Commun.h"
#include "suite/Gcpcompt.h"
#include "suite/Gcptva.h"
#include "suite/LignesPiece.h"
#include "suite/Parametres.h"
#include "suite/PieceAchat.h"
#include "suite/PieceGeneration.h"
#include "suite/PurchasingServices.h"
#include "suite/Settling.h"
#include "suite/SoldePiece.h"
#include "suite/SortesPiece.h"
#include "suite/Sysascii.h"
#include "suite/Sysdroit.h"
#include "suite/TableInterface.h"
#include "suite/TransformationPiece.h"
#include "suite/VuePiece.h"
#include "suite/Zumndoc.h"

namespace quarvo::suite {
namespace {

using host::fabriquer;
using host::Module;

const host::Global global("COMMUN", "SUITE");
const Module commun("", "COMMUN-INTERFACE", &fabriquer<Commun>, false, "");
const Module afsoci("", "AFSOCI-INTERFACE", &fabriquer<Afsoci>, false, "");
const Module afpara("", "AFPARA-INTERFACE", &fabriquer<Afpara>, false, "");
const Module zumndoc("", "ZUMNDOC-INTERFACE", &fabriquer<Zumndoc>, false, "");
const Module sysdroit("", "SYSDROIT-INTERFACE", &fabriquer<Sysdroit>, false, "");
const Module afmenu("", "AFMENU-INTERFACE", &fabriquer<Afmenu>, false, "");
const Module afresu("", "AFRESU-INTERFACE", &fabriquer<Afresu>, false, "");
const Module afmouv("", "AFMOUV-INTERFACE", &fabriquer<Afmouv>, false, "");
const Module afpfst("", "AFPFST-INTERFACE", &fabriquer<Afpfst>, false, "");

#define QUARVO_TABLE_MODULE(NAME) \
  const Module table_##NAME("", #NAME "-INTERFACE", &fabriquer<TableInterface>, false, "")
QUARVO_TABLE_MODULE(AFEBUD);
QUARVO_TABLE_MODULE(AFLBUD);
QUARVO_TABLE_MODULE(AFPRES);
QUARVO_TABLE_MODULE(AFCLIE);
QUARVO_TABLE_MODULE(AFCOMP);
QUARVO_TABLE_MODULE(AFFOUR);
QUARVO_TABLE_MODULE(AFSERV);
QUARVO_TABLE_MODULE(AFPERS);
QUARVO_TABLE_MODULE(AFVOCA);
QUARVO_TABLE_MODULE(GCPARTIC);
QUARVO_TABLE_MODULE(SVCCIVIL);
QUARVO_TABLE_MODULE(GAPAPPOR);
QUARVO_TABLE_MODULE(SYSAPPLI);
QUARVO_TABLE_MODULE(SYSCOMPO);
#undef QUARVO_TABLE_MODULE

const Module afaffa("", "AFAFFA-INTERFACE", &fabriquer<Afaffa>, false, "");
const Module gcpparam("", "GCPPARAM-INTERFACE", &fabriquer<Parametres>, false, "");
const Module cpparam("", "CPPARAM-INTERFACE", &fabriquer<Parametres>, false, "");
const Module gcpcompt("", "GCPCOMPT-INTERFACE", &fabriquer<Gcpcompt>, false, "");
const Module gcptcfg("", "GCPTCFG-INTERFACE", &fabriquer<Gcpcompt>, false, "");
const Module gcptva("", "GCPTVA-INTERFACE", &fabriquer<Gcptva>, false, "");
const Module sysascii("", "SYSASCII-INTERFACE", &fabriquer<Sysascii>, false, "");
const Module action("", "ACTION-INTERFACE", &fabriquer<Action>, false, "");
const Module afdroi("", "AFDROI-INTERFACE", &fabriquer<Afdroi>, false, "");
const Module afetab("", "AFETAB-INTERFACE", &fabriquer<TableInterface>, false, "");
const Module afrps1("", "AFRPS1-INTERFACE", &fabriquer<TableInterface>, false, "");
const Module afrps2("", "AFRPS2-INTERFACE", &fabriquer<TableInterface>, false, "");
const Module afcri1("", "AFCRI1-INTERFACE", &fabriquer<TableInterface>, false, "");
const Module afcri2("", "AFCRI2-INTERFACE", &fabriquer<TableInterface>, false, "");
const Module afcri3("", "AFCRI3-INTERFACE", &fabriquer<TableInterface>, false, "");
const Module afcri4("", "AFCRI4-INTERFACE", &fabriquer<TableInterface>, false, "");
const Module afcri5("", "AFCRI5-INTERFACE", &fabriquer<TableInterface>, false, "");
// Purchasing: suppliers and settling, depots, item-supplier links, due dates, piece modules.
const Module gcpfour("", "GCPFOUR-INTERFACE", &fabriquer<Gcpfour>, false, "");
const Module gcpstock("", "GCPSTOCK-INTERFACE", &fabriquer<Gcpstock>, false, "");
const Module gcpx("", "GCPX-INTERFACE", &fabriquer<Gcpx>, false, "");
const Module gaplot("", "GAPLOT-INTERFACE", &fabriquer<Gaplot>, false, "");
const Module gcpste("", "GCPSTE-INTERFACE", &fabriquer<Gcpste>, false, "");
const Module gcpdepot("", "GCPDEPOT-INTERFACE", &fabriquer<Gcpdepot>, false, "");
const Module gapartfo("", "GAPARTFO-INTERFACE", &fabriquer<Gapartfo>, false, "");
const Module gapech("", "GAPECH-INTERFACE", &fabriquer<Gapech>, false, "");
const Module gapedev("", "GAPEDEV-INTERFACE", &fabriquer<PieceGeneration>, false, "");
const Module gapecom("", "GAPECOM-INTERFACE", &fabriquer<PieceAchat>, false, "");
const Module gapebl("", "GAPEBL-INTERFACE", &fabriquer<PieceAchat>, false, "");
const Module gapefac("", "GAPEFAC-INTERFACE", &fabriquer<PieceAchat>, false, "");
const Module gaplcom("", "GAPLCOM-INTERFACE", &fabriquer<LignesPiece>, false, "");
const Module gaplbl("", "GAPLBL-INTERFACE", &fabriquer<LignesPiece>, false, "");
const Module gaplfac("", "GAPLFAC-INTERFACE", &fabriquer<LignesPiece>, false, "");
// The pieces' own documents: view, transformation, settling.
const Module gapecomGestion("", "GAPECOM-GESTION", &fabriquer<DeSorte<VuePiece, kCommandes>>, false,
                            "");
const Module gapeblGestion("", "GAPEBL-GESTION", &fabriquer<DeSorte<VuePiece, kReceptions>>, false,
                           "");
const Module gapefacGestion("", "GAPEFAC-GESTION", &fabriquer<DeSorte<VuePiece, kFactures>>, false,
                            "");
const Module gapecomTrf("", "GAPECOM-TRF", &fabriquer<DeSorte<TransformationPiece, kCommandes>>,
                        false, "");
const Module gapeblTrf("", "GAPEBL-TRF", &fabriquer<DeSorte<TransformationPiece, kReceptions>>,
                       false, "");
const Module gapefacTrf("", "GAPEFAC-TRF", &fabriquer<DeSorte<TransformationPiece, kFactures>>,
                        false, "");
const Module gapecomSolder("", "GAPECOM-SOLDER", &fabriquer<DeSorte<SoldePiece, kCommandes>>, false,
                           "");
const Module gapeblSolder("", "GAPEBL-SOLDER", &fabriquer<DeSorte<SoldePiece, kReceptions>>, false,
                          "");
const Module gapefacSolder("", "GAPEFAC-SOLDER", &fabriquer<DeSorte<SoldePiece, kFactures>>, false,
                           "");
// Time entries: their interface and their own document.
const Module afeffo("", "AFEFFO-INTERFACE", &fabriquer<Afeffo>, false, "");
const Module afeffoGestion("", "AFEFFO-GESTION", &fabriquer<DeSorte<VuePiece, kReleves>>, false,
                           "");
const host::Source source("SUITE", nullptr);

}  // namespace
}  // namespace quarvo::suite
