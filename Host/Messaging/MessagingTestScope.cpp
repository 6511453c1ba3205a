#include "Host/Messaging/MessagingTestScope.h"

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Messaging/Station.h"
#include "Host/Messaging/UsageLogger.h"

MessagingTestScope::MessagingTestScope() : mUsage(std::make_shared<InMemoryUsageLogSink>()) {
  ResetAll();
  UsageLogger::Instance().SetSink(mUsage);
  Preferences::SetApplication(std::make_unique<Preferences>());
}

MessagingTestScope::~MessagingTestScope() {
  ResetAll();
  UsageLogger::Instance().SetSink(nullptr);
  // In memory again, so nothing after the test writes to the user's preferences by accident.
  Preferences::SetApplication(std::make_unique<Preferences>());
}

void MessagingTestScope::ResetAll() {
  MessageLoop::Instance().DiscardPending();
  ResetStationsForTesting();
  ClearRecordedDebugAssertions();
  ResetTraceForTesting();
  ClearLocalizedStrings();
}
