#pragma once

#include "Values/Arena.h"

#include <new>
#include <utility>

namespace ovrin_yaml {

/// Makes and takes back the containers and diff objects of type T.
///
/// The promise: `create` gives a fully initialised object whatever stood in its memory before, `free` accepts
/// null and releases everything the object holds (through T::ResetForAlloc, which makes the release of a tree
/// recursive), and both may be called from any thread at any time without a lock. Each thread keeps what it
/// was given back in a list of its own and hands the last one out first.
template <class T> class YAMLAlloc {
public:
    template <class... Arguments> static T* create(Arguments&&... arguments) {
        void* memory = t_Free ? t_Free : ArenaAllocate(kSize);
        if (t_Free) t_Free = t_Free->next;
        return new (memory) T(std::forward<Arguments>(arguments)...);
    }

    static void free(T* object) {
        if (!object) return;
        object->ResetForAlloc();
        object->~T();
        t_Free = new (static_cast<void*>(object)) FreeObject{t_Free};
    }

private:
    struct FreeObject {
        FreeObject* next;
    };
    static constexpr std::size_t kSize = sizeof(T) > sizeof(FreeObject) ? sizeof(T) : sizeof(FreeObject);

    static inline thread_local FreeObject* t_Free = nullptr;
};

} // namespace ovrin_yaml
