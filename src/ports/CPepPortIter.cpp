#include "CPepPortIter.h"

#include "pep/PepExtractor.h"

namespace Vad {

CPepPortRequest::CPepPortRequest() = default;
CPepPortRequest::~CPepPortRequest() = default;

Prjrep::AutoRelease<IHdlPortIterator> CPepPortIter::New(std::shared_ptr<const CPepPortRequest> request) {
  std::vector<CPepPort*> ports;
  if (request) {
    ports.reserve(request->ports.size());
    for (const auto& port : request->ports) ports.push_back(port.get());
  }
  return Prjrep::AutoRelease<IHdlPortIterator>(new CPepPortIter(std::move(ports), std::move(request)));
}

Prjrep::AutoRelease<IHdlPortIterator> CPepPortIter::ForExtractor(std::unique_ptr<PepExtractor> extractor) {
  auto request = std::make_shared<CPepPortRequest>();
  if (extractor) {
    const std::vector<PepPort>& records = extractor->getPorts();
    request->ports.reserve(records.size());
    std::uint32_t position = 0;
    for (const PepPort& record : records)
      request->ports.push_back(std::make_unique<CPepPort>(&record, extractor.get(), ++position));
  }
  request->extractor = std::move(extractor);
  return New(std::move(request));
}

}  // namespace Vad
