#include "StandaloneHost/Server/Admission.h"

#include <gtest/gtest.h>

using Server::EAdmission;

TEST(Admission, LetsInWhoMayComeIn)
{
  Server::ServerOptions open;
  Server::ServerOptions listed;
  listed.allowedOrigins = {"https://tools.example"};
  Server::ServerOptions guarded;
  guarded.token = "secret";
  const struct
  {
    const Server::ServerOptions& options;
    Server::Visitor visitor;
    EAdmission admission;
  } cases[] = {
      {open, {"", "", ""}, EAdmission::Welcome},
      {open, {"127.0.0.1:8420", "", ""}, EAdmission::Welcome},
      {open, {"[::1]:8420", "", ""}, EAdmission::Welcome},
      {open, {"localhost:8420", "http://localhost:8420", ""}, EAdmission::Welcome},
      {open, {"evil.example:8420", "", ""}, EAdmission::WrongHost},
      {open, {"localhost.evil.example", "", ""}, EAdmission::WrongHost},
      {open, {"[", "", ""}, EAdmission::WrongHost},
      {open, {"localhost:8420", "http://evil.example", ""}, EAdmission::WrongOrigin},
      {open, {"localhost:8420", "http://localhost:9999", ""}, EAdmission::WrongOrigin},
      {open, {"localhost:8420", "null", ""}, EAdmission::WrongOrigin},
      {listed, {"localhost:8420", "https://tools.example", ""}, EAdmission::Welcome},
      {listed, {"localhost:8420", "https://tools.example.evil", ""}, EAdmission::WrongOrigin},
      {guarded, {"stage.example:8420", "", "Bearer secret"}, EAdmission::Welcome},
      {guarded, {"localhost:8420", "", ""}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "", "Bearer"}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "", "Bearer "}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "", "Bearer secre"}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "", "Bearer secretsecret"}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "", "Basic secret"}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "http://evil.example", "Bearer secret"}, EAdmission::WrongOrigin},
      {guarded, {"localhost:8420", "http://localhost:8420", "", true}, EAdmission::Welcome},
      {guarded, {"localhost:8420", "http://evil.example", "", true}, EAdmission::WrongOrigin},
  };
  for (const auto& c : cases)
    EXPECT_EQ(Server::Admit(c.visitor, c.options), c.admission)
        << c.visitor.host << " | " << c.visitor.origin << " | " << c.visitor.authorisation;
}
