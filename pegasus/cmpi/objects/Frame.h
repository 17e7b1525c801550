// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/ProviderValue.h"

#include <Pegasus/Common/CIMName.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

// Who frees what a provider holds, and when. CMPI lets a provider drop every object that the broker makes for it: the
// broker frees them when the provider's function returns.
//
// - Before each call into a provider the broker opens a Frame on the calling thread. Objects that table functions make
//   during the call (strings, paths, instances, memory blocks) enter the thread's current frame and are freed at its
//   end, the newest first.
// - The provider may release an object earlier; it leaves its frame then.
// - A clone stays outside of frames: the provider frees it by release, at any time and on any thread.
// - The arguments of a call (context, path, result, args) live on the broker's stack. A provider's release of them is
//   ignored.
// - A provider that loops over many objects may open a frame of its own by mark() and end it by release().
// - A provider's own thread gets a frame by attachThread() and ends it by detachThread().
namespace Pegasus::cmpi {

class Broker;
class ClassSchema;

// Whose request the objects of a frame are made for.
struct CallOrigin
{
    Broker* broker = nullptr; // null: outside of a request
    std::string provider;
    CIMNamespaceName nameSpace;
    unsigned depth = 0; // in upcalls of the module's own
};

// The class of the path that a provider made last, as it named it: most calls make paths of one class.
struct NamedClass
{
    std::string nameSpaceText;
    CIMNamespaceName nameSpace;
    const ClassSchema* schema = nullptr; // null: none yet
};

// Base of everything that a frame can free.
class Owned
{
  public:
    Owned() = default;
    Owned(const Owned&) = delete;
    Owned& operator=(const Owned&) = delete;
    virtual ~Owned() { unlink(); }

    // Leaves the frame that holds it, if any.
    void unlink();

  private:
    friend class Frame;
    Owned* fPrevious = nullptr; // the neighbours in the frame's ring; null outside of a frame
    Owned* fNext = nullptr;
};

// The objects that a thread made since the frame was opened; its end frees those that are left.
//
// Frames of one thread nest as the calls do: an upcall that reaches another provider on this thread opens its own.
// A thread always has a frame: that of a provider's own, unattached thread lasts until the thread ends.
//
// Thread: a frame belongs to the thread that opened it. CMPI demands that providers share objects between threads as
//     clones only, which is why the ring needs no lock.
class Frame
{
  public:
    // Opens a frame, which becomes the current one, for the same request as the frame around it.
    Frame();
    explicit Frame(std::shared_ptr<const CallOrigin> origin);
    // Frees the frame's objects, the newest first, and those of frames that were opened later and are still open.
    ~Frame();
    Frame(const Frame&) = delete;
    Frame& operator=(const Frame&) = delete;

    // Returns: the calling thread's innermost open frame.
    static Frame& current();

    const CallOrigin& origin() const;
    // Belongs to the origin's broker.
    NamedClass& lastClass() { return fLastClass; }

    // Returns: values that are not set, in the memory of an earlier instance where there is one.
    std::vector<ProviderValue> takeValues(std::size_t count);
    // Keeps the memory of an instance that ends for the next one of this call.
    static void leaveValues(std::vector<ProviderValue> values) noexcept;

    // Makes an object in this frame.
    // Ownership: the frame's, until the object is deleted or unlinked.
    template <typename Object, typename... Args> Object* make(Args&&... args)
    {
        auto* object = new Object(std::forward<Args>(args)...);
        adopt(*object);
        return object;
    }
    void adopt(Owned& object);

    // Returns: true when `frame` is an open frame of this thread. For handles that come back from a provider.
    static bool isOpen(const Frame* frame);

  private:
    void drain();

    Owned fObjects; // fixed node of the ring; the newest object comes first
    Frame* fOuter;
    std::shared_ptr<const CallOrigin> fOrigin; // may be null
    NamedClass fLastClass;
    std::vector<ProviderValue> fSpareValues; // none is set
};

} // namespace Pegasus::cmpi
