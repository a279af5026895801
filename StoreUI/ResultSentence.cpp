#include "StoreUI/ResultSentence.h"

#include <map>

namespace StoreUI
{

std::string ResultSentence(NMX::IResult result)
{
  using enum NMX::EResult;
  static const std::map<std::uint32_t, const char*> sentences = []
  {
    const std::pair<NMX::EResult, const char*> table[] = {
        {FailedWithException, "Something went wrong inside the program; the log says more."},
        {NotImplemented, "This cannot be done yet."},
        {NotSupported, "This is not possible with that kind of subject."},
        {NotPermitted, "This is not permitted."},
        {NotAvailable, "This is not available at present."},
        {NotConnected, "The device is not connected."},
        {NotSet, "There is no value."},
        {NotFound, "It is no longer there."},
        {AlreadyPresent, "That name is in use already."},
        {AlreadyInProgress, "This is going on already."},
        {AlreadySet, "Something is there already."},
        {InvalidArgument, "This does not fit what is selected."},
        {InvalidIndex, "There is no such place."},
        {InvalidName, "That name is not allowed."},
        {InvalidId, "It is no longer there."},
        {InvalidType, "That is not of the right type."},
        {InvalidSession, "That calibration has ended."},
        {InvalidValue, "The value is not allowed."},
        {AllocationFailure, "There are not enough active marker patterns."},
        {SerialisationFailure, "The file does not have the right content; the log says more."},
        {FileIOFailure, "The file cannot be read or written."},
        {TimedOut, "It took too long."},
        {Conflict, "The store is in use by this program already."},
        {ShuttingDown, "The program is ending."},
        {DiskFull, "The disk is full."},
        {Canceled, "It was cancelled."},
        {FileNotFound, "There is no such file."},
    };
    std::map<std::uint32_t, const char*> made;
    for (const auto& [code, sentence] : table)
      made.emplace(static_cast<std::uint32_t>(code), sentence);
    return made;
  }();
  if (result.Succeeded())
    return {};
  const auto sentence = sentences.find(result.Code());
  return sentence != sentences.end() ? sentence->second : "It failed; the log may say more.";
}

std::string PatternSentence(NMX::IResult result)
{
  if (result == NMX::EResult::NotFound)
    return "A cluster is of a type that is not known here.";
  if (result == NMX::EResult::NotSupported)
    return "No set of patterns serves all these types of cluster together.";
  return ResultSentence(result);
}

}
