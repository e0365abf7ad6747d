// Standard output that could not be written ends the run with an error.
#pragma once

namespace Cli {

// Registers the check of standard output at exit. Called first in main, so
// that its handler runs after every exit handler and static destructor that
// comes later and sees every byte the run wrote.
void CheckOutputAtExit();

// Leaves the rest of the run's output unchecked: the usage text is written
// as help, and after a usage error, whether or not it reaches the reader.
void SkipOutputCheck();

}  // namespace Cli
