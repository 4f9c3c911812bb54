#ifndef CG_RUNTIME_ERRORS_H
#define CG_RUNTIME_ERRORS_H

#include <Cg/cg.h>

namespace cg {

/// Makes this the error that the host reads next.
void setError(CGerror error);

/// Gives the last error and clears the state.
CGerror takeError();

} // namespace cg

#endif
