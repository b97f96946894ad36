#include "CallWatch.h"

#include <gtest/gtest.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>

namespace {

// A message that carries one descriptor.
struct Parcel {
  char byte = 0;
  iovec content{&byte, 1};
  alignas(cmsghdr) std::array<char, CMSG_SPACE(sizeof(int))> room{};
  msghdr header{};

  Parcel() {
    header.msg_iov = &content;
    header.msg_iovlen = 1;
    header.msg_control = room.data();
    header.msg_controllen = room.size();
  }
};

bool hasEnded(pid_t process) {
  siginfo_t info{};
  return ::waitid(P_PID, static_cast<id_t>(process), &info, WEXITED | WNOHANG | WNOWAIT) != 0 ||
         info.si_pid == process;
}

}  // namespace

CallWatch::CallWatch(std::vector<int> calls) : m_calls(std::move(calls)) {
  EXPECT_EQ(0, ::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, m_ends));
}

CallWatch::~CallWatch() {
  for (const int end : m_ends) {
    if (end >= 0) {
      ::close(end);
    }
  }
}

void CallWatch::begin() {
  // The leak checker's own calls would be among them.
  ::setenv("ASAN_OPTIONS", "detect_leaks=0", 1);
  std::vector<sock_filter> filter = {
      BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
  };
  for (const int call : m_calls) {
    filter.push_back(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, static_cast<std::uint32_t>(call), 0, 1));
    filter.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_USER_NOTIF));
  }
  filter.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW));
  const sock_fprog program{static_cast<unsigned short>(filter.size()), filter.data()};
  ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
  const long listener =
      ::syscall(SYS_seccomp, SECCOMP_SET_MODE_FILTER, SECCOMP_FILTER_FLAG_NEW_LISTENER, &program);
  if (listener < 0) {
    ::_exit(125);
  }
  const int descriptor = static_cast<int>(listener);
  Parcel parcel;
  cmsghdr* const control = CMSG_FIRSTHDR(&parcel.header);
  control->cmsg_level = SOL_SOCKET;
  control->cmsg_type = SCM_RIGHTS;
  control->cmsg_len = CMSG_LEN(sizeof descriptor);
  std::memcpy(CMSG_DATA(control), &descriptor, sizeof descriptor);
  if (::sendmsg(m_ends[1], &parcel.header, 0) != 1) {
    ::_exit(125);
  }
  ::close(descriptor);
}

int CallWatch::takeListener() {
  ::close(m_ends[1]);
  m_ends[1] = -1;
  Parcel parcel;
  int listener = -1;
  if (::recvmsg(m_ends[0], &parcel.header, MSG_CMSG_CLOEXEC) == 1 &&
      CMSG_FIRSTHDR(&parcel.header) != nullptr) {
    std::memcpy(&listener, CMSG_DATA(CMSG_FIRSTHDR(&parcel.header)), sizeof listener);
  }
  EXPECT_GE(listener, 0) << "system calls cannot be watched here";
  return listener;
}

int CallWatch::serve(pid_t process, const std::function<int(int, int)>& decide) {
  const int listener = takeListener();
  int number = 0;
  while (listener >= 0 && !hasEnded(process)) {
    constexpr int kMilliseconds = 20;
    pollfd waiting{listener, POLLIN, 0};
    if (::poll(&waiting, 1, kMilliseconds) <= 0 || (waiting.revents & POLLIN) == 0) {
      continue;
    }
    seccomp_notif call{};
    if (::ioctl(listener, SECCOMP_IOCTL_NOTIF_RECV, &call) != 0) {
      continue;
    }
    seccomp_notif_resp answer{};
    answer.id = call.id;
    answer.error = -decide(++number, call.data.nr);
    answer.flags = answer.error == 0 ? SECCOMP_USER_NOTIF_FLAG_CONTINUE : 0;
    ::ioctl(listener, SECCOMP_IOCTL_NOTIF_SEND, &answer);
  }
  if (listener >= 0) {
    ::close(listener);
  }
  return number;
}
