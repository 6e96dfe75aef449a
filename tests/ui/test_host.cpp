// The one test host of the test program and the data folders it runs on.
#include "test_host.h"

#include "qorbase.h"
#include "test_support.h"

#include <gtest/gtest.h>

namespace qortest {

qorhost::CHost &shared_host() {
    static qorhost::CHost *sp_host = [] {
        qorhost::SHostOptions options;
        options.m_data = source_dir() + "/data";
        options.m_out = make_temp_dir();
        options.m_quiet = true;
        options.m_record = true;
        qorhost::CHost *p_host = new qorhost::CHost(options);
        if (!p_host->load_ui()) ADD_FAILURE() << "libqorui.so did not load";
        return p_host;
    }();
    return *sp_host;
}

void use_host_data_folders() {
    std::string const data = shared_host().options().m_data;
    qorbase::set_category_root(qorbase::FILE_CATEGORY_CONFIG, data.c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, (data + "/fonts").c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, (data + "/ui").c_str());
}

} // namespace qortest
