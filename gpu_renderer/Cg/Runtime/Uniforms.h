#ifndef CG_RUNTIME_UNIFORMS_H
#define CG_RUNTIME_UNIFORMS_H

#include "Parameter.h"

#include <vector>

namespace cg {

/// Gives the parameters, and their parts, the locations and types of their uniforms.
void findUniforms(unsigned int glProgram, std::vector<ProgramParameter>& parameters);

enum class Layout { ROW_BY_ROW, COLUMN_BY_COLUMN };

/// Sends values for a uniform that has a location, or for elements of an array from this one on, in one
/// OpenGL call.
/// @param count   number of elements
/// @param values  count times type->floats values
/// @param layout  how a matrix's values follow each other
void sendValues(const ProgramParameter& first, int count, const float* values,
                Layout layout = Layout::ROW_BY_ROW);

/// Sends the values that the source gives; a new OpenGL program's uniforms are 0.
void sendDefaults(const std::vector<ProgramParameter>& parameters);

} // namespace cg

#endif
