// Not part of any target: a test makes sure that this does not compile.
#include "RunaCorePluginSubjectStore/BasicObjectServices/IBasicObjectServices.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

constexpr auto row = TerminalServer2::Function<&NMX::IBasicObjectServices::Rename>(
    "BasicObjectServices.Rename", "Update the basic object name.", {{"OldName", "Name of the basic object to update."}},
    "Ok - On success.");
