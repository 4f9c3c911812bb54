#ifndef CG_RUNTIME_TEXTUREUNITS_H
#define CG_RUNTIME_TEXTUREUNITS_H

#include "Parameter.h"

#include <Cg/Compiler/Compiler.h>

#include <vector>

namespace cg {

/// Gives each sampler that the program uses its texture unit, and tells OpenGL.
///
/// A sampler with a TEXUNIT semantic has that unit. The others of a fragment program count from 0 in the
/// order of the source, those of a vertex program from the first unit above a fragment program's; both pass
/// over units that a semantic names in the same program or in a living program of the other stage.
/// @return the samplers that have a unit
std::vector<ProgramParameter*> assignTextureUnits(Stage stage, std::vector<ProgramParameter>& parameters);

/// The program of the samplers is no longer there: their units' names are free.
void releaseTextureUnits(Stage stage, const std::vector<ProgramParameter*>& samplers);

/// Binds the textures that the host has given the samplers, or leaves the samplers' targets without one.
void bindTextures(const std::vector<ProgramParameter*>& samplers);
void unbindTextures(const std::vector<ProgramParameter*>& samplers);

} // namespace cg

#endif
