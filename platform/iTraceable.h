#ifndef QV_PLATFORM_ITRACEABLE_H
#define QV_PLATFORM_ITRACEABLE_H

namespace nQVTARN000 {

class tTrace;

// An object that can describe itself in a trace line.
class iTraceable {
  public:
    virtual ~iTraceable() = default;
    // Appends the object's description to the current line of `trace`.
    virtual void trace(tTrace& trace) const = 0;
};

}  // namespace nQVTARN000

#endif
