// Standard output that could not be written ends the run with an error.
#pragma once

namespace Cli {

// Registers the check of standard output at exit. Called first in main, so
// that its handler runs after every exit handler and static destructor that
// comes later and sees every byte the run wrote.
void CheckOutputAtExit();

}  // namespace Cli
