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
///
/// A short program can ask for a great deal, such as the elements of a hundred large arrays one by one. What
/// would take more than MAX_BYTES is given up.
class Arena {
public:
    static constexpr std::size_t MAX_BYTES = std::size_t{256} << 20;

    /// Thrown where a program asks for more than MAX_BYTES.
    class Full {};

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
        void* memory = allocate(sizeof(T), alignof(T));
        T* object = ::new (memory) T(std::forward<Args>(args)...);
        if constexpr (!std::is_trivially_destructible_v<T>)
            mDestructors.push_back({object, [](void* dying) { static_cast<T*>(dying)->~T(); }});
        return object;
    }

    /// Copies a text; the result lives as long as the arena.
    std::string_view keep(std::string_view text) {
        if (text.empty())
            return {};
        char* copy = static_cast<char*>(allocate(text.size(), 1));
        text.copy(copy, text.size());
        return {copy, text.size()};
    }

    /// Counts what an object of the arena holds elsewhere.
    void charge(std::size_t bytes) {
        mBytes += bytes;
        if (mBytes > MAX_BYTES)
            throw Full();
    }

private:
    void* allocate(std::size_t bytes, std::size_t alignment) {
        charge(bytes);
        return mMemory.allocate(bytes, alignment);
    }

    struct Destructor {
        void* object;
        void (*destroy)(void*);
    };

    static constexpr std::size_t FIRST_BLOCK_BYTES = 64 * 1024;

    std::pmr::monotonic_buffer_resource mMemory{FIRST_BLOCK_BYTES};
    std::vector<Destructor> mDestructors;
    std::size_t mBytes = 0;
};

} // namespace cg

#endif
