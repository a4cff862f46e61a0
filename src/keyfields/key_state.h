// Module-internal control of the key-field state that outlives a call.
// Not exported; unit tests link the module objects and use it to start
// from a module that has just been loaded.
#pragma once

namespace camel {

// Forgets the stored initialisation result and the selected entry, as if
// the module had just been loaded: the next call initialises again.
void resetKeyInitForTests();

} // namespace camel
