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
  Server::ServerOptions padded;
  padded.token = "???~~"; // in Base64: Pz8/fn4=
  Server::ServerOptions encrypted;
  encrypted.tlsCertificate = "cert.pem";
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
      {guarded, {"localhost:8420", "http://localhost:8420", "", "", true}, EAdmission::Welcome},
      {guarded, {"localhost:8420", "http://evil.example", "", "", true}, EAdmission::WrongOrigin},
      {guarded, {"localhost:8420", "", "", "bearer.c2VjcmV0"}, EAdmission::Welcome},
      {guarded, {"localhost:8420", "", "", "subject-store ,\tbearer.c2VjcmV0 , x"}, EAdmission::Welcome},
      {guarded, {"localhost:8420", "", "", "bearer.c2VjcmV"}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "", "", "bearer.c2VjcmV0x,bearer.,,bearer,c2VjcmV0"}, EAdmission::NoToken},
      {guarded, {"localhost:8420", "", "Bearer wrong", "bearer.c2VjcmV0"}, EAdmission::NoToken},
      {padded, {"localhost:8420", "", "", "bearer.Pz8_fn4"}, EAdmission::Welcome},
      {encrypted, {"localhost:8420", "https://localhost:8420", ""}, EAdmission::Welcome},
      {encrypted, {"localhost:8420", "http://localhost:8420", ""}, EAdmission::WrongOrigin},
  };
  for (const auto& c : cases)
    EXPECT_EQ(Server::Admit(c.visitor, c.options), c.admission)
        << c.visitor.host << " | " << c.visitor.origin << " | " << c.visitor.authorisation;
}

TEST(Admission, FindsItsWebSocketProtocolAmongOthers)
{
  for (const char* offers : {"subject-store", "a, subject-store", " subject-store\t,b"})
    EXPECT_TRUE(Server::OffersProtocol(offers)) << offers;
  for (const char* offersNot : {"", ",", "subject-store2", "Subject-Store", "subject store"})
    EXPECT_FALSE(Server::OffersProtocol(offersNot)) << offersNot;
}
