#ifndef FWZEL_VERTEXBUFFERS_H
#define FWZEL_VERTEXBUFFERS_H

#include <FwZel/VertexList.h>

#include <cstdint>

// Private to the library: how its own shapes make their host arrays and fill their buffer objects.

/// Host arrays with every byte zero, aligned to 128 bytes, to be released with free(); null when memory is
/// short.
VertexList::VertexData* allocateVertices(unsigned int count);
unsigned int* allocateIndices(unsigned int count);

/// Specifies a buffer object's whole store again. Leaves GL_ARRAY_BUFFER or GL_ELEMENT_ARRAY_BUFFER unbound.
void uploadVertices(uint32_t buffer, const VertexList::VertexData* vertices, unsigned int count);
void uploadIndices(uint32_t buffer, const unsigned int* indices, unsigned int count);

#endif
