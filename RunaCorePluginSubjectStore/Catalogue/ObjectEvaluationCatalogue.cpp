#include "RunaCorePluginSubjectStore/Catalogue/ObjectEvaluationCatalogue.h"

namespace Catalogue
{

using NMX::IObjectEvaluationServices;
using TerminalServer2::Callback;
using TerminalServer2::ELevel;
using TerminalServer2::Function;

namespace
{

constexpr TerminalServer2::FunctionRow<IObjectEvaluationServices> functions[] = {
    Function<&IObjectEvaluationServices::Enabled>(
        "ObjectEvaluationServices.Enabled", "Query if object evaluation is enabled.",
        {{"Enabled", "If object evaluation is enabled."}}, "Ok - On success.", ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::SetEnabled>(
        "ObjectEvaluationServices.SetEnabled",
        "Enable or disable object evaluation. Note that object evaluation can be computationally intensive, "
        "depending on the number and size of objects loaded. It is recommended to disable this feature during a live "
        "experience.",
        {{"Enabled", "If object evaluation should be enabled."}}, "Ok - On success.", ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::MaximumEvaluationStepCount>(
        "ObjectEvaluationServices.MaximumEvaluationStepCount",
        "Query the maximum number of steps to take per object pair.",
        {{"MaximumStepCount", "Maximum number of steps permitted per object pair."}}, "Ok - On success.",
        ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::SetMaximumEvaluationStepCount>(
        "ObjectEvaluationServices.SetMaximumEvaluationStepCount",
        "Set the maximum number of steps to take per object pair. Objects with a large number of markers will "
        "generally require more steps to fully evaluate.",
        {{"MaximumStepCount", "Maximum number of steps permitted per object pair."}}, "Ok - On success.",
        ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::WarningThreshold>(
        "ObjectEvaluationServices.WarningThreshold",
        "Query the distance threshold for warning about a match between two objects.",
        {{"Threshold", "Match distance in millimeters at which a warning is generated."}}, "Ok - On success.",
        ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::SetWarningThreshold>(
        "ObjectEvaluationServices.SetWarningThreshold",
        "Set the distance threshold for warning about a match between two objects. This relates to the closest "
        "average distance between markers when the two objects are aligned.",
        {{"Threshold", "Match distance in millimeters at which a warning is generated."}}, "Ok - On success.",
        ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::Progress>(
        "ObjectEvaluationServices.Progress",
        "Get progress for the current object evaluation update. Evaluation is finished when the required number of "
        "comparisons have been done. Object changes whilst evaluation is in progress will increase the number of "
        "comparisons required. If evaluation has finished, progress will reset to zero on any subsequent object "
        "changes.",
        {{"Done", "Number of object comparisons done so far in this update."},
         {"Required", "Number of object comparisons required to complete update."}},
        "Ok - On success.\n"
        "NotAvailable - If object evaluation is disabled.",
        ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::HighestStepCountReached>(
        "ObjectEvaluationServices.HighestStepCountReached",
        "Get the highest number of steps reached during object evaluation. If this equals the maximum step count, "
        "you need to increase the maximum in order to fully evaluate your objects.",
        {{"HighestStepCountReached", "Highest step count reached."}},
        "Ok - On success.\n"
        "NotAvailable - If object evaluation is disabled.",
        ELevel::ObjectEvaluation),
    Function<&IObjectEvaluationServices::MatchDistance>(
        "ObjectEvaluationServices.MatchDistance",
        "Check if the first object matches the second. This is provided for test purposes, as object confusion is "
        "reported via warnings. Note that matching depends on the entrance threshold of the first object. If this "
        "function is called before evaluation is finished, the objects may not have been compared yet and no match "
        "will be returned.",
        {{"FirstObjectName", "Name of the object being evaluated."},
         {"SecondObjectName", "Name of the object the first is being compared to."},
         {"Matches",
          "If the first object matches the second. If this is false, the match distance will be arbitrarily large. "},
         {"MatchDistance",
          "Approximate average displacement between the closest-matching object marker subsets (in millimeters). "
          "Zero distance means that the subset of markers allowed by the entrance threshold can be aligned "
          "identically and can't be distinguished. The larger this distance is, the less likely the object is to "
          "be confused with the other."}},
        "Ok - On success.\n"
        "NotAvailable - If object evaluation is disabled.\n"
        "NotFound - If either object name was not found or is not an object.\n"
        "NotRequired - If either object is disabled. Only enabled objects are evaluated.",
        ELevel::ObjectEvaluation)};

constexpr TerminalServer2::CallbackRow<IObjectEvaluationServices> callbacks[] = {
    Callback<&IObjectEvaluationServices::EvaluationChangedCallback>(
        "ObjectEvaluationServices.EvaluationChangedCallback", "Callback issued whenever object evaluation changes.",
        ELevel::ObjectEvaluation)};

}

const TerminalServer2::GroupTable<IObjectEvaluationServices>& ObjectEvaluationGroup()
{
  static constexpr TerminalServer2::GroupTable<IObjectEvaluationServices> table{
      {"ObjectEvaluationServices",
       "Services for object evaluation. This feature may be used to detect potential confusion between one object "
       "and another (basic or smart), or a different view of itself.",
       {}},
      {},
      ELevel::ObjectEvaluation,
      functions,
      callbacks};
  return table;
}

}
