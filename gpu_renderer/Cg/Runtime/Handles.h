#ifndef CG_RUNTIME_HANDLES_H
#define CG_RUNTIME_HANDLES_H

#include <cstdint>
#include <unordered_map>

namespace cg {

/// A number that no handle has had before, of whatever kind.
inline std::uintptr_t newHandleNumber() {
    static std::uintptr_t last = 0;
    return ++last;
}

/// The living handles of one kind. A handle is a number in a pointer's clothes and is never given twice, so
/// that a handle of a destroyed object is told from every later one.
template <class Handle, class Object>
class HandleTable {
public:
    Handle add(Object& object) {
        const std::uintptr_t number = newHandleNumber();
        mObjects.emplace(number, &object);
        return reinterpret_cast<Handle>(number);
    }

    void remove(Handle handle) { mObjects.erase(reinterpret_cast<std::uintptr_t>(handle)); }

    /// Null for an invalid handle.
    Object* find(Handle handle) const {
        const auto found = mObjects.find(reinterpret_cast<std::uintptr_t>(handle));
        return found == mObjects.end() ? nullptr : found->second;
    }

private:
    std::unordered_map<std::uintptr_t, Object*> mObjects;
};

} // namespace cg

#endif
