#pragma once
// The busy pointer: an operation holds a CMousePointer for its lifetime and
// the pointer from before comes back when it goes away, whatever path the
// operation leaves by.

#include "support/ports.h"

#include <Qt>

namespace quorvel {

class CMousePointer {
public:
    CMousePointer() = default;
    ~CMousePointer();
    CMousePointer(const CMousePointer&) = delete;
    CMousePointer& operator=(const CMousePointer&) = delete;

    // The first call keeps the pointer shown now; later calls only change it.
    void SetMousePointer(Qt::CursorShape shape);
    void SetHourglass() { SetMousePointer(Qt::WaitCursor); }

private:
    bool saved_ = false;
};

// The BusyPointer port over the application's override pointer. Pops without a
// matching push are ignored.
class OverrideBusyPointer : public BusyPointer {
public:
    ~OverrideBusyPointer() override;
    void Push() override;
    void Pop() override;
    int Depth() const { return depth_; }

private:
    int depth_ = 0;
};

} // namespace quorvel
