// A board that Verilator has made of Verilog, behind a remote_bitbang server: serve [PORT]. One client at a time; Ctrl-C
// ends it. The top module has the ports clk, tck, tms, tdi and tdo.
#include <arpa/inet.h>
#include <sys/socket.h>
#include <unistd.h>
#include <cstdio>
#include <cstdlib>
#include <string>

#include <Top.h>

namespace {

Top top;

// The design clock ticks once per TCK. What the design needs besides (a reset, a button) is set here.
void setPins(bool tck, bool tms, bool tdi) {
  const bool rises = tck && top.tck == 0;
  top.tms = tms;
  top.tdi = tdi;
  top.tck = tck;
  top.eval();
  for (const int level : {1, 0}) {
    if (!rises) break;
    top.clk = level;
    top.eval();
  }
}

// False when the client goes.
bool obey(char request, std::string& answers) {
  if (request >= '0' && request <= '7') setPins((request & 4) != 0, (request & 2) != 0, (request & 1) != 0);
  if (request == 'R') answers += top.tdo != 0 ? '1' : '0';
  return request != 'Q';
}

void serve(int client) {
  char block[1 << 16];
  std::string answers;
  for (ssize_t count = 0; (count = recv(client, block, sizeof block, 0)) > 0; answers.clear()) {
    for (ssize_t i = 0; i < count; ++i)
      if (!obey(block[i], answers)) return;
    for (std::size_t sent = 0; sent < answers.size();) {
      const ssize_t now = send(client, answers.data() + sent, answers.size() - sent, MSG_NOSIGNAL);
      if (now <= 0) return;
      sent += static_cast<std::size_t>(now);
    }
  }
}

}  // namespace

int main(int argc, char** argv) {
  const int listener = socket(AF_INET, SOCK_STREAM, 0), on = 1;
  setsockopt(listener, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  address.sin_port = htons(static_cast<std::uint16_t>(argc > 1 ? std::atoi(argv[1]) : 5555));
  if (bind(listener, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0 ||
      listen(listener, 1) != 0) {
    std::perror("serve");
    return 1;
  }
  std::printf("rbb:127.0.0.1:%u\n", unsigned{ntohs(address.sin_port)});
  std::fflush(stdout);
  for (;;) {
    const int client = accept(listener, nullptr, nullptr);
    if (client < 0) continue;
    serve(client);
    close(client);
  }
}
