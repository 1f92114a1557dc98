#include "klv.h"

KLVMonitor::KLVMonitor(KLVHandler* handler) : KLVCountingFilter(handler) {}

const std::streampos& KLVMonitor::MonitoredLocator::getPosition() { return position_; }

Locator* KLVMonitor::getLocator() { return &locator_; }

unsigned KLVMonitor::getLengthOctets() const {
  check(count_.lengthOctets() != 0, "BER length form has been reported");
  return count_.lengthOctets();
}

// The position is computed, never told.
void KLVMonitor::setLocator(Locator*) {}

void KLVMonitor::startStream(bool hasAccurateLengths) {
  check(hasAccurateLengths, "accurate monitoring is possible");
  getHandler()->setLocator(&locator_);
  count_.reset();
  DullKLVFilter::startStream(hasAccurateLengths);
}

void KLVMonitor::endStream(bool aborted) {
  endElement();
  DullKLVFilter::endStream(aborted);
}

void KLVMonitor::setLengthForm(std::uint8_t form) {
  count_.setLengthForm(form);
  DullKLVFilter::setLengthForm(form);
}

void KLVMonitor::advance(std::streamoff octets) { locator_.advance(octets); }
