// Binding-only methods of the fixture classes.
#include "fixture.h"

QC_ANNOTATE("extend:Fx::Error") inline std::string __str__(Fx::Error *self) { return self->GetText(); }
