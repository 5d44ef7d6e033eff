#include "Values/OvrinObjects.h"

namespace ovrin_yaml {

OvrinObjects* OvrinObjects::Clone() {
    auto copy = std::make_unique<OvrinObjects>();
    m_Root.ShareInto(copy->m_Root);
    copy->m_Text = m_Text;
    copy->m_Maker = m_Maker;
    return copy.release();
}

} // namespace ovrin_yaml
