// Messages go to the file that the environment variable TINY_MESSAGES names, with their origin.
#ifndef TINY_MSGMANDATA_H
#define TINY_MSGMANDATA_H

class Port_MsgManData {
  public:
    static Port_MsgManData& createObject(const char* id, const char* file, int line,
                                         const char* revision);
    void issueStatus(const char* format, ...);

  private:
    const char* m_origin[3];
};

#endif
