// The host's message manager.
#ifndef VORKEL_HOST_PORT_MSGMANDATA_H_
#define VORKEL_HOST_PORT_MSGMANDATA_H_

#include <memory>

// One message to the user, issued by a call of issueError.
class Port_MsgManData {
 public:
  // `category` names the area that speaks ("DesignEntry"), `source`, `line` and `revision`
  // the statement that reports. The texts must outlive the object. Never null.
  static std::unique_ptr<Port_MsgManData> createObject(const char* category, const char* source,
                                                       int line, const char* revision);

  virtual ~Port_MsgManData();

  // Issues the message as an error; `format` and what follows are those of printf.
  [[gnu::format(printf, 2, 3)]] virtual void issueError(const char* format, ...) = 0;

 protected:
  Port_MsgManData() = default;
  Port_MsgManData(const Port_MsgManData&) = delete;
  Port_MsgManData& operator=(const Port_MsgManData&) = delete;
};

#endif  // VORKEL_HOST_PORT_MSGMANDATA_H_
