#pragma once

namespace NKOLVRX20 {

// Calls the visitor with each value of a map, in key order, until it returns false. The map is taken by value: the
// visitor may change or destroy the original.
template <typename TMap, typename TVisitor> void VisitInOrder(TMap map, const TVisitor& visitor)
{
    for (const auto& entry : map) {
        if (!visitor(entry.second)) {
            return;
        }
    }
}

} // namespace NKOLVRX20
