// Messages of the engine to the user, through the host's message manager.
#ifndef VORKEL_ENGINE_MESSAGES_H_
#define VORKEL_ENGINE_MESSAGES_H_

#include <memory>

#include "host/Port_MsgManData.h"

namespace Ip {

// A message object that names the calling statement; its issueError issues the message.
inline std::unique_ptr<Port_MsgManData> Message(int line = __builtin_LINE()) {
  return Port_MsgManData::createObject("DesignEntry", "../s/Ip_VorkelImp", line, "Ip_vorkel 1.1");
}

}  // namespace Ip

#endif  // VORKEL_ENGINE_MESSAGES_H_
