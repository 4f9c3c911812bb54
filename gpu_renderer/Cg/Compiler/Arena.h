#ifndef CG_COMPILER_ARENA_H
#define CG_COMPILER_ARENA_H

#include <cstddef>
#include <memory_resource>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

namespace cg {

/// Owner of everything that one compilation builds: tree nodes, types and spellings. Objects are made one
/// after another in large blocks, refer to each other by plain pointers and all die with the arena.
class Arena {
public:
    Arena() = default;
    Arena(const Arena&) = delete;
    Arena& operator=(const Arena&) = delete;

    ~Arena() {
        for (auto it = mDestructors.rbegin(); it != mDestructors.rend(); ++it)
            it->destroy(it->object);
    }

    /// Makes a T from the arguments; the arena owns it.
    template <class T, class... Args>
    T* make(Args&&... args) {
        void* memory = mMemory.allocate(sizeof(T), alignof(T));
        T* object = ::new (memory) T(std::forward<Args>(args)...);
        if constexpr (!std::is_trivially_destructible_v<T>)
            mDestructors.push_back({object, [](void* dying) { static_cast<T*>(dying)->~T(); }});
        return object;
    }

    /// Copies a text; the result lives as long as the arena.
    std::string_view keep(std::string_view text) {
        if (text.empty())
            return {};
        char* copy = static_cast<char*>(mMemory.allocate(text.size(), 1));
        text.copy(copy, text.size());
        return {copy, text.size()};
    }

private:
    struct Destructor {
        void* object;
        void (*destroy)(void*);
    };

    static constexpr std::size_t FIRST_BLOCK_BYTES = 64 * 1024;

    std::pmr::monotonic_buffer_resource mMemory{FIRST_BLOCK_BYTES};
    std::vector<Destructor> mDestructors;
};

} // namespace cg

#endif
