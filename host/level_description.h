// The host's description of the running level: four strings, the second being its name.
#pragma once
#include "qor_level.h"

#include <string>

namespace qorhost {

class CLevelDescription : public ILevelDescription {
public:
    SInterfaceUID get_uid() const override { return qor_uid::LEVEL_DESCRIPTION; }
    int get_version() const override { return 1; }

    void get_description(SLevelDescription &_out) override {
        _out.mp_file = m_file.c_str();
        _out.mp_name = m_name.c_str();
        _out.mp_title = m_title.c_str();
        _out.mp_comment = m_comment.c_str();
    }

    std::string m_file = "levels/demo.lvl";
    std::string m_name = "demo";
    std::string m_title = "Demo";
    std::string m_comment;
};

} // namespace qorhost
