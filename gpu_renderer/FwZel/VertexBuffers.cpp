#include <FwZel/VertexBuffers.h>

#include <epoxy/gl.h>

#include <malloc.h>

#include <cstring>

namespace {

void* allocateZeroed(size_t bytes) {
    constexpr size_t ALIGNMENT = 128;
    void* const memory = memalign(ALIGNMENT, bytes);
    if (memory)
        std::memset(memory, 0, bytes);
    return memory;
}

void upload(GLenum target, GLuint buffer, const void* data, size_t bytes) {
    glBindBuffer(target, buffer);
    glBufferData(target, static_cast<GLsizeiptr>(bytes), data, GL_STATIC_DRAW);
    glBindBuffer(target, 0);
}

} // namespace

VertexList::VertexData* allocateVertices(unsigned int count) {
    return static_cast<VertexList::VertexData*>(allocateZeroed(count * sizeof(VertexList::VertexData)));
}

unsigned int* allocateIndices(unsigned int count) {
    return static_cast<unsigned int*>(allocateZeroed(count * sizeof(unsigned int)));
}

void uploadVertices(uint32_t buffer, const VertexList::VertexData* vertices, unsigned int count) {
    upload(GL_ARRAY_BUFFER, buffer, vertices, count * sizeof *vertices);
}

void uploadIndices(uint32_t buffer, const unsigned int* indices, unsigned int count) {
    upload(GL_ELEMENT_ARRAY_BUFFER, buffer, indices, count * sizeof *indices);
}
