#ifndef CG_COMPILER_RESOLVER_INSTANCES_H
#define CG_COMPILER_RESOLVER_INSTANCES_H

#include <Cg/Compiler/TypedTree.h>

#include <unordered_map>
#include <vector>

namespace cg {

class Declarations;
class Overloads;
class Recursion;
class SamplerPieces;
struct Resolution;

/// A method's object, as a call has it.
struct MethodObject {
    const Type* type = nullptr; ///< null where the function is no method
    bool isWritable = false;
};

/// The program's own functions as calls need them: each once for each size of its arrays and each kind of its
/// samplers.
class Instances {
public:
    Instances(Resolution& resolution, const Declarations& declarations, Recursion& recursion,
              Overloads& overloads, SamplerPieces& pieces)
        : mResolution(resolution), mDeclarations(declarations), mRecursion(recursion), mOverloads(overloads),
          mPieces(pieces) {}

    /// @param types  of the arguments
    /// @return null after an error
    Function* find(const FunctionDecl* declaration, const std::vector<const Type*>& types,
                   const MethodObject& object);

    /// The entry, which nothing calls.
    void addEntry(Function* function);

private:
    struct Instance {
        std::vector<const Type*> types;
        bool hasWritableObject;
        Function* function;
    };

    Function* make(const FunctionDecl* definition, const std::vector<const Type*>& types,
                   const MethodObject& object);
    void addObject(Function* function, const MethodObject& object);
    void addParameters(Function* function, const std::vector<const Type*>& types);
    void addSamplers(Function* function);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    Recursion& mRecursion;
    Overloads& mOverloads;
    SamplerPieces& mPieces;
    std::unordered_map<const FunctionDecl*, std::vector<Instance>> mInstances; ///< by definition
};

} // namespace cg

#endif
