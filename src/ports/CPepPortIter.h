// The iterator over the ports that one port request found.
#pragma once

#include <memory>
#include <vector>

#include "CPepPort.h"
#include "IHdlPort.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TListIter.h"

class PepExtractor;

namespace Vad {

// What one port request found: the extractor and a wrapper for each of its port records, in
// list order. The wrappers point into the extractor's records, so the two are kept together for
// as long as an iterator over them lives.
struct CPepPortRequest {
  std::unique_ptr<PepExtractor> extractor;
  std::vector<std::unique_ptr<CPepPort>> ports;

  CPepPortRequest();
  ~CPepPortRequest();
};

// Answers IHdlPortIterator and IInterface with itself and the reference-count interfaces with
// its counter. Current hands out the port's IHdlPort face without a reference: the port lives as
// long as the iterator.
class CPepPortIter final : public Prjrep::TListIter<IHdlPortIterator, CPepPort*> {
 public:
  // A new iterator on the first of the request's ports, carrying its one reference; it shares
  // the request, so the ports and their extractor go with the last iterator over them.
  static Prjrep::AutoRelease<IHdlPortIterator> New(std::shared_ptr<const CPepPortRequest> request);
  // Wraps every port record of `extractor`, which has found its unit, numbered from 1, and
  // answers the iterator over them. Allocation failures are thrown.
  static Prjrep::AutoRelease<IHdlPortIterator> ForExtractor(std::unique_ptr<PepExtractor> extractor);

 protected:
  IHdlPort* Convert(CPepPort*& port) override { return Prjrep::QueryAs<IHdlPort>(port->Face()); }

 private:
  CPepPortIter(std::vector<CPepPort*> ports, std::shared_ptr<const CPepPortRequest> request)
      : TListIter(std::move(ports)), request_(std::move(request)) {}

  std::shared_ptr<const CPepPortRequest> request_;
};

}  // namespace Vad
