#ifndef QV_PTP_IMANAGEDCLOCK_H
#define QV_PTP_IMANAGEDCLOCK_H

namespace nQVPTP000 {

// The clock that the responder operations of the management TLVs read and change: a PTP
// node that embeds this codec implements it.
class iManagedClock {
  public:
    virtual ~iManagedClock() = default;
};

}  // namespace nQVPTP000

#endif
