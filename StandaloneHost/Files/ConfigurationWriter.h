#pragma once

#include "StandaloneHost/Files/ConfigurationContent.h"
#include "StoreInterface/IEntryEditor.h"

namespace Files
{

/// What becomes of a device that the store has already.
enum class EKnownDevices
{
  Refuse,
  Keep ///< it stays as it is in the store
};

/// Adds the content to the edited store; does not commit. Throws ConfigurationError when parts of the content
/// contradict each other or what the store holds. [any]
void WriteConfiguration(const ConfigurationContent& content, NMX::IEntryEditor& editor,
                        EKnownDevices known = EKnownDevices::Refuse);

}
