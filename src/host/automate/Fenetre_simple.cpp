#include "host/automate/Fenetre_simple.h"

namespace quarvo::host {

void Fenetre_simple::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "DEBUT"}) {
    if (termine()) break;
    raise(label, e);
  }
}

}  // namespace quarvo::host
