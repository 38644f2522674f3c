// Registration of the sibling-module stand-ins: each module's "INTERFACE" automaton under the
// name "<MODULE>-INTERFACE". Table-backed modules share one implementation.
#include "host/automate/Automate.h"
#include "host/automate/Registry.h"
#include "suite/Afpara.h"
#include "suite/Afsoci.h"
#include "suite/Commun.h"
#include "suite/TableInterface.h"
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

#define QUARVO_TABLE_MODULE(NAME) \
  const Module table_##NAME("", #NAME "-INTERFACE", &fabriquer<TableInterface>, false, "")
QUARVO_TABLE_MODULE(AFAFFA);
QUARVO_TABLE_MODULE(AFEBUD);
QUARVO_TABLE_MODULE(AFLBUD);
QUARVO_TABLE_MODULE(AFPRES);
QUARVO_TABLE_MODULE(AFCLIE);
QUARVO_TABLE_MODULE(AFCOMP);
QUARVO_TABLE_MODULE(AFFOUR);
QUARVO_TABLE_MODULE(AFSERV);
QUARVO_TABLE_MODULE(AFPERS);
QUARVO_TABLE_MODULE(AFVOCA);
QUARVO_TABLE_MODULE(AFEFFO);
QUARVO_TABLE_MODULE(GCPARTIC);
QUARVO_TABLE_MODULE(GCPFOUR);
QUARVO_TABLE_MODULE(GCPSTE);
QUARVO_TABLE_MODULE(GCPPARAM);
QUARVO_TABLE_MODULE(SVCCIVIL);
QUARVO_TABLE_MODULE(GAPAPPOR);
QUARVO_TABLE_MODULE(GCPDEPOT);
QUARVO_TABLE_MODULE(GAPEDEV);
QUARVO_TABLE_MODULE(GAPECOM);
QUARVO_TABLE_MODULE(GAPEBL);
QUARVO_TABLE_MODULE(GAPEFAC);
QUARVO_TABLE_MODULE(GAPLCOM);
QUARVO_TABLE_MODULE(GAPLBL);
QUARVO_TABLE_MODULE(GAPLFAC);
QUARVO_TABLE_MODULE(SYSAPPLI);
QUARVO_TABLE_MODULE(SYSCOMPO);
#undef QUARVO_TABLE_MODULE

const host::Source source("SUITE", nullptr);

}  // namespace
}  // namespace quarvo::suite
