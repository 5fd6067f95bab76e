#pragma once

#include <memory>

// Objects handed across the product's interfaces end with their own Release(); holding them
// in a ReleasePtr releases them on every path.
template <class T> struct ReleaseDeleter {
    void operator()(T* object) const {
        if (object != nullptr)
            object->Release();
    }
};

template <class T> using ReleasePtr = std::unique_ptr<T, ReleaseDeleter<T>>;
