// The messages of remote calls. The first byte of an input says whose they are: those of a client, which a server reads
// one after the other, or the answers that a client gets to a call. Each message is a length in one byte and its bytes.
// A server comes through whatever it is sent and answers the call behind it, and where it asks for a token, it calls
// nothing before; a client's call ends with its values or an error, and no later answer finds what it waited with.

#include "kinds/remote.h"
#include "seeds.h"

namespace {

using Bytes = vesk::xvector<vesk::octet_t>;

struct Input {
  bool Next(Bytes& message) {
    if (m_at == m_end) return false;
    const std::size_t size = std::min<std::size_t>(*m_at++, m_end - m_at);
    message.assign(m_at, m_at + size);
    m_at += size;
    return true;
  }
  std::uint8_t const* m_at;
  std::uint8_t const* m_end;
};

void ServeMessages(Input input, bool asksForToken) {
  const vesk::xstring token = "of sixteen bytes or more";
  kinds::Calc calc;
  calc.onSwap = [](vesk::string8& text) {
    if (text.size() > 3) throw std::runtime_error(text);
  };
  vesk::LocalChannel channel;
  vesk::Server server(channel.Server());
  server.SetMessageLimit(1000);
  bool isCalled = false;
  server.Authorize([&](vesk::xstring, vesk::xstring, vesk::Peer const&) { return isCalled = true; });
  if (asksForToken) server.AddToken(token);
  const vesk::uint32 number = server.Export(vesk::ptr<kinds::ICalc>(&calc));
  for (Bytes message; input.Next(message);) channel.Client().Send(message);
  server.Serve();
  for (Bytes answer; channel.Client().Receive(answer);) {
  }
  Require(!asksForToken || !isCalled);
  vesk::ClientConnection client(channel.Client(), [&] { server.Serve(); });
  if (asksForToken) client.GiveToken(token);
  const auto stub = vesk::Import<kinds::ICalc>(client, number);
  vesk::int32 sum = 0;
  vesk::ptr<kinds::ICalc>(stub->Interface())->Add(3, "four", sum);
  Require(sum == 7);
}

void TakeAnswers(Input input) {
  vesk::LocalChannel channel;
  vesk::ClientConnection client(channel.Client(), [&] {
    Bytes answer;
    for (int i = 0; i < 3 && input.Next(answer); ++i) channel.Server().Send(answer);
  });
  const auto stub = vesk::Import<kinds::ICalc>(client, 1);
  const vesk::ptr<kinds::ICalc> far(stub->Interface());
  for (int i = 0; i < 4; ++i) {
    try {
      vesk::int32 n = 0;
      vesk::string8 text = "text";
      vesk::xvector<vesk::int32> in, out;
      if (i % 2 == 0) {
        far->Swap(text, n);
      } else {
        far->Vectors(in, out);
      }
    } catch (vesk::RemoteError const&) {
    } catch (vesk::ArchiveError const&) {  // no answer at all
    }
  }
}

template <typename... Values>
Bytes Message(std::initializer_list<vesk::uint32> numbers, Values const&... values) {
  vesk::Archive ar;
  for (vesk::uint32 number : numbers) vesk::SerialiseVariableLengthUint(ar, number);
  (void)(ar << ... << values);
  return ar.m_bytes;
}

// Messages, each behind its size.
Bytes Joined(std::initializer_list<Bytes> messages) {
  Bytes bytes;
  for (Bytes const& message : messages) {
    bytes.push_back(vesk::octet_t(message.size()));
    bytes.insert(bytes.end(), message.begin(), message.end());
  }
  return bytes;
}

std::vector<Bytes> Seeds() {
  const vesk::string8 text = "text";
  const vesk::xvector<vesk::int32> numbers = {1, 2, 3};
  return {Joined({Message({1, 0, 1}, vesk::int32(3), text), Message({1, 1, 2}, text, vesk::int32(3)),
                  Message({1, 2, 0}, vesk::int32(3)), Message({1, 3, 0}), Message({1, 4, 0}, kinds::Size(4)),
                  Message({1, 5, 3}, numbers)}),
          Joined({Message({1, 0}, text, vesk::int32(1)), Message({2, 0}, numbers), Message({3, 1}, text)})};
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int* count, char*** arguments) { return Begin(*count, *arguments, Seeds); }

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const Input input{data + 1, data + size};
  if (data[0] % 2 == 0) {
    ServeMessages(input, data[0] % 4 == 2);
  } else {
    TakeAnswers(input);
  }
  return 0;
}
