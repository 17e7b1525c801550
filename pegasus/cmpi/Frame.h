#pragma once

#include <utility>

namespace Pegasus::cmpi {

// Something that a provider holds and that goes away by itself: with its frame, unless it is taken out before.
class Owned
{
  public:
    Owned() = default;
    Owned(const Owned&) = delete;
    Owned& operator=(const Owned&) = delete;
    virtual ~Owned() { unlink(); }

    // Leaves the frame that holds it; does nothing when none does.
    void unlink();

  private:
    friend class Frame;
    Owned* fPrevious = nullptr;
    Owned* fNext = nullptr;
};

// The objects that a thread made since the frame was opened; its end frees those that the provider has not released.
//
// Frames of one thread nest as the calls do: an upcall that reaches another provider on this thread opens its own.
// A thread always has a frame: one that never opened any (a provider's own thread that did not attach) keeps its
// objects until it ends. Thread: a frame belongs to the thread that opened it; an object may be released by another
// thread only while the first
//     one does not touch the frame, as CMPI demands of providers.
class Frame
{
  public:
    // Opens a frame, which becomes the current one.
    Frame();
    // Frees the frame's objects, the newest first, and those of frames that were opened later and not closed.
    ~Frame();
    Frame(const Frame&) = delete;
    Frame& operator=(const Frame&) = delete;

    static Frame& current();

    // Ownership: the frame's, until release.
    template <class Object, class... Args> Object* make(Args&&... args)
    {
        auto* object = new Object(std::forward<Args>(args)...);
        adopt(*object);
        return object;
    }
    void adopt(Owned& object);

    // True when `frame` is this thread's and still open; for handles that come back from a provider.
    static bool isOpen(const Frame* frame);

  private:
    void drain();

    Owned fObjects; // the ring's fixed node
    Frame* fOuter;
};

} // namespace Pegasus::cmpi
