#ifndef CG_COMPILER_SCOPED_NAMES_H
#define CG_COMPILER_SCOPED_NAMES_H

#include <algorithm>
#include <cstddef>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace cg {

/// What names mean in the scopes around a place. A name has its innermost meaning; the ones around come back
/// when a scope ends. A program may declare as many as its text holds, so that each step takes the same time
/// whatever their number.
template <class Meaning>
class ScopedNames {
public:
    void declare(std::string_view name, const Meaning& meaning) {
        const auto [innermost, isNew] = mInnermost.try_emplace(name, mEntries.size());
        mEntries.push_back({name, meaning, isNew ? NONE : innermost->second});
        innermost->second = mEntries.size() - 1;
    }

    /// @return the innermost meaning, valid until the next change; or null
    const Meaning* find(std::string_view name) const {
        const auto found = mInnermost.find(name);
        return found == mInnermost.end() ? nullptr : &mEntries[found->second].meaning;
    }

    /// @return the name has that meaning here, or in a scope around
    template <class Comparable>
    bool hasMeaning(std::string_view name, const Comparable& meaning) const {
        const auto found = mInnermost.find(name);
        for (std::size_t i = found == mInnermost.end() ? NONE : found->second; i != NONE;
             i = mEntries[i].around)
            if (mEntries[i].meaning == meaning)
                return true;
        return false;
    }

    /// Where a scope starts: what endScope() needs.
    std::size_t size() const { return mEntries.size(); }

    /// Forgets what was declared since.
    void endScope(std::size_t start) {
        for (; mEntries.size() > start; mEntries.pop_back()) {
            const Entry& last = mEntries.back();
            if (last.around == NONE)
                mInnermost.erase(last.name);
            else
                mInnermost[last.name] = last.around;
        }
    }

    std::string_view nameAt(std::size_t position) const { return mEntries[position].name; }
    const Meaning& at(std::size_t position) const { return mEntries[position].meaning; }

private:
    static constexpr std::size_t NONE = static_cast<std::size_t>(-1);

    struct Entry {
        std::string_view name;
        Meaning meaning;
        std::size_t around; ///< position of the same name's meaning before; NONE
    };

    std::vector<Entry> mEntries;                                  ///< in the order of their declaration
    std::unordered_map<std::string_view, std::size_t> mInnermost; ///< positions
};

} // namespace cg

#endif
