#include "StandaloneHost/CommandLine/LongWork.h"

#include "StandaloneHost/CommandLine/Answers.h"
#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Layout.h"

#include <chrono>

namespace CommandLine
{

namespace
{

using enum Step::EState;
using Clock = std::chrono::steady_clock;

/// An output of an answer that is a number.
std::uint64_t NumberOutput(const std::string& result, std::string_view name)
{
  const auto number = NumberOf(Member(ReadObject(Member(ReadObject(result), "outputs")), name));
  if (!number)
    throw HostError("the host's answer is not as expected: it has no " + std::string(name));
  return *number;
}

class ObjectEvaluation final : public ILongWork
{
public:
  [[nodiscard]] std::string Hint() const override
  {
    return "the objects are compared from now on; --wait shows how far it is, as does "
           "ObjectEvaluationServices.Progress";
  }

  [[nodiscard]] std::string Callback() const override { return "ObjectEvaluationServices.EvaluationChangedCallback"; }

  void Begin(const std::string&) override { m_begun = Clock::now(); }

  void Hear(const Notification&) override {}

  [[nodiscard]] Step Look(Client& client) override
  {
    const Answer answer = client.Call("ObjectEvaluationServices.Progress", "[]");
    if (answer.failed)
      return {Failed, "object evaluation did not end: " + ErrorText(answer.json), {}};
    const Count count{NumberOutput(answer.json, "Done"), NumberOutput(answer.json, "Required")};
    if (count.required == 0)
      return LookAtNothing();
    const std::string text =
        std::to_string(count.done) + " of " + std::to_string(count.required) + " comparisons of objects";
    return {count.done >= count.required ? EndedWell : GoesOn, text, count};
  }

private:
  /// Nothing is required until the host has seen what there is to compare, and when there is nothing.
  [[nodiscard]] Step LookAtNothing() const
  {
    constexpr auto patience = std::chrono::seconds(2);
    if (Clock::now() - m_begun < patience)
      return {GoesOn, "looking for objects to compare", {}};
    return {EndedWell, "there is no object to compare", {}};
  }

  Clock::time_point m_begun;
};

class SubjectCalibration final : public ILongWork
{
public:
  [[nodiscard]] std::string Hint() const override
  {
    return "the calibration runs; --wait follows it, as does "
           "SubjectCalibrationServices.LatestSubjectCalibrationState";
  }

  [[nodiscard]] std::string Callback() const override
  {
    return "SubjectCalibrationServices.LatestSubjectCalibrationStateChangedCallback";
  }

  void Begin(const std::string& result) override { m_session = NumberOutput(result, "SubjectCalibrationSession"); }

  void Hear(const Notification& notification) override
  {
    const RawMembers params = ReadObject(notification.params);
    if (NumberOf(Member(params, "SessionId")) == m_session)
      Note(NumberOf(Member(params, "State")).value_or(none));
  }

  [[nodiscard]] Step Look(Client& client) override
  {
    if (!m_toldEnd)
      Ask(client);
    switch (m_state)
    {
    case tPose:
      return {GoesOn,
              "session " + std::to_string(m_session) + " looks for the T-pose; AcceptTPose " +
                  std::to_string(m_session) + " accepts it",
              {}};
    case calibrating:
      return {GoesOn, "session " + std::to_string(m_session) + " calibrates", {}};
    case completed:
      if (m_calibrated)
        return {EndedWell, "session " + std::to_string(m_session) + " has ended", {}};
      return {Failed, "session " + std::to_string(m_session) + " has ended without a T-pose that was accepted", {}};
    case cancelled:
      return {Failed, "session " + std::to_string(m_session) + " was cancelled", {}};
    default:
      return {GoesOn, "session " + std::to_string(m_session) + " begins", {}};
    }
  }

private:
  // Numbers of the enumeration ESubjectCalibrationState.
  static constexpr std::uint64_t none = 0;
  static constexpr std::uint64_t tPose = 1;
  static constexpr std::uint64_t calibrating = 2;
  static constexpr std::uint64_t completed = 3;
  static constexpr std::uint64_t cancelled = 4;

  void Note(std::uint64_t state)
  {
    m_state = state;
    m_calibrated = m_calibrated || state == calibrating;
    m_toldEnd = state == completed || state == cancelled;
  }

  /// Notifications tell of every state; this makes good for one that is late. An end that was not told of waits for
  /// its notification for a while, as that of a state before may come late, too.
  void Ask(Client& client)
  {
    constexpr int patience = 4;
    const Answer answer = client.Call("SubjectCalibrationServices.LatestSubjectCalibrationState", "[]");
    if (answer.failed)
      throw CommandError(EStatus::Failed, "the calibration cannot be followed: " + ErrorText(answer.json));
    if (NumberOutput(answer.json, "SessionId") != m_session)
      throw CommandError(EStatus::Failed, "session " + std::to_string(m_session) +
                                              " has ended and another calibration runs; how it ended is not known");
    const std::uint64_t state = NumberOutput(answer.json, "State");
    const bool end = state == completed || state == cancelled;
    if (!end || ++m_endsSeen == patience)
      Note(state);
  }

  std::uint64_t m_session = 0;
  std::uint64_t m_state = none;
  bool m_calibrated = false;
  bool m_toldEnd = false;
  int m_endsSeen = 0;
};

class CharacterCalibration final : public ILongWork
{
public:
  explicit CharacterCalibration(std::string name) : m_name(std::move(name)) {}

  [[nodiscard]] std::string Hint() const override
  {
    return "the calibration runs; --wait follows it, as does "
           "CharacterFromClustersServices.CharacterCalibrationState";
  }

  [[nodiscard]] std::string Callback() const override
  {
    return "CharacterFromClustersServices.CharacterChangedCallback";
  }

  void Begin(const std::string&) override {}

  void Hear(const Notification&) override {}

  [[nodiscard]] Step Look(Client& client) override
  {
    // Numbers of the enumeration ECharacterCalibrationState.
    constexpr std::uint64_t calibrating = 1;
    constexpr std::uint64_t calibrated = 2;
    const std::string name = Quoted(TextOf(m_name));
    const Answer answer = client.Call("CharacterFromClustersServices.CharacterCalibrationState", '[' + m_name + ']');
    if (answer.failed)
      return {Failed, name + " is not calibrated: " + ErrorText(answer.json), {}};
    const std::uint64_t state = NumberOutput(answer.json, "CalibrationState");
    if (state == calibrating)
      return {GoesOn, name + " is being calibrated", {}};
    if (state == calibrated)
      return {EndedWell, name + " is calibrated", {}};
    return {Failed, name + " is not calibrated: its calibration was cleared", {}};
  }

private:
  const std::string m_name; ///< raw JSON
};

}

std::unique_ptr<ILongWork> WorkBegunBy(std::string_view method, std::span<const std::string> inputs)
{
  if (method == "ObjectEvaluationServices.SetEnabled" && inputs.size() == 1 && inputs.front() == "true")
    return std::make_unique<ObjectEvaluation>();
  if (method == "SubjectCalibrationServices.StartSubjectCalibration" ||
      method == "SubjectCalibrationServices.StartSubjectRecalibration")
    return std::make_unique<SubjectCalibration>();
  if (method == "CharacterFromClustersServices.CalibrateCharacter" && inputs.size() == 1)
    return std::make_unique<CharacterCalibration>(inputs.front());
  return nullptr;
}

}
